// Loading files in blocks, includes and deferred files, and the limits on nested loads.
#include "TreeTestSupport.h"
#include "resource_tree/LoaderText.h"
#include "resource_tree/ResTreeNode.h"

#include <filesystem>
#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);

// A document whose entries run across several 4096-byte blocks, with multibyte characters and
// an element name cut at every offset near a block boundary depending on PAD.
std::string BlockDocument(size_t pad, size_t items) {
    std::string doc = "<Top>\n<Pad>" + std::string(pad, 'p') + "</Pad>\n";
    for (size_t i = 0; i < items; ++i) {
        doc += "<IOResource name=\"R" + std::to_string(i) + "\"><Label>\xC3\xA9t\xC3\xA9 " +
               std::to_string(i) + "</Label><Direction>in</Direction></IOResource>\n";
    }
    return doc + "</Top>\n";
}

TEST(ResTreeLoader, FilesLoadAlikeWhereverTheBlocksEndAndTheirErrorsNameThem) {
    ScratchDirectory dir;
    for (size_t pad = 4000; pad < 4100; pad += 7) {
        const std::string bytes = BlockDocument(pad, 150);
        const std::string file = dir.Write("doc.xml", bytes);
        auto fromFile = NewRoot();
        ASSERT_EQ(fromFile->ParseFile(file, false), 0) << pad;
        auto fromText = Load(FromUtf8Lenient(bytes));
        ASSERT_EQ(fromFile->EntryCount(), 151u);
        EXPECT_EQ(TextOf(*ChildOf(*fromFile, u"R149"), u"Label"), u"\u00E9t\u00E9 149");
        EXPECT_EQ(TextOf(*ChildOf(*fromText, u"R77"), u"Label"), u"\u00E9t\u00E9 77");
    }
    // A file of exactly one block ends with an empty final block.
    std::string exact = "<Top><V>";
    exact += std::string(4096 - exact.size() - 11, 'x') + "</V></Top>\n";
    ASSERT_EQ(exact.size(), 4096u);
    auto root = NewRoot();
    EXPECT_EQ(root->ParseFile(dir.Write("exact.xml", exact), false), 0);
    EXPECT_EQ(TextOf(*root, u"V").size(), 4096u - 8 - 11);
    // A token of many blocks makes the blocks grow; what follows it still loads whole.
    const std::string huge =
        "<Top><A v=\"" + std::string(300000, 'v') + "\"/>" + BlockDocument(10, 150).substr(5);
    auto grown = NewRoot();
    ASSERT_EQ(grown->ParseFile(dir.Write("huge.xml", huge), false), 0);
    EXPECT_EQ(grown->EntryCount(), 152u);
    EXPECT_EQ(TextOf(*ChildOf(*grown, u"R149"), u"Label"), u"\u00E9t\u00E9 149");
    // Errors name the file.
    root = NewRoot();
    EXPECT_EQ(root->ParseFile(dir.Path() + "/missing.xml", false), kFail);
    EXPECT_EQ(root->Find(u"XMLParseErrors"), root->End());
    EXPECT_EQ(root->ParseFile(dir.Path(), false), kFail); // a directory is no document
    const std::string bad = dir.Write("bad.xml", std::string(5000, ' ') + "\n<Top>\n<A>\n</B>\n");
    EXPECT_EQ(root->ParseFile(bad, false), kFail);
    EXPECT_EQ(TextOf(*root, u"XMLParseErrors"), u"Error on line 4 at column 2 of file " +
                                                    FromUtf8Lenient(bad) +
                                                    u"\n   mismatched tag\n   \n<A>\n</B>\n\n");
}

TEST(ResTreeLoader, IncludesLoadAsAChildOrIntoTheNodeAndLoopsStopWithAMessage) {
    ScratchDirectory dir;
    dir.Write("child.xml", "<Module name='inc'><Where>#{site}</Where></Module>");
    dir.Write("children.xml", "<Anything><Merged>yes</Merged></Anything>");
    LoaderSettings settings;
    settings.includeDirectory = dir.Path();
    auto root = Load(uR"(<Top site="lab">
        <:Include>child.xml</:Include>
        <:Include what="children">./children.xml</:Include>
        <:Include>missing.xml</:Include>
    </Top>)",
                     &settings);
    ResTreeNode* inc = ChildOf(*root, u"inc");
    ASSERT_NE(inc, nullptr);
    EXPECT_EQ(TextOf(*inc, u"Where"), u"lab");
    EXPECT_EQ(TextOf(*root, u"Merged"), u"yes");
    EXPECT_EQ(root->Type(), u"Top");
    EXPECT_NE(TextOf(*root, u"XMLParseErrors")
                  .find(u"Unable to find include file node: " + FromUtf8Lenient(dir.Path()) +
                        u"/missing.xml"),
              std::u16string::npos);
    // Includes that come back around stop with a message.
    dir.Write("a.xml", "<A><:Include what='children'>b.xml</:Include></A>");
    dir.Write("b.xml", "<B><:Include what='children'>a.xml</:Include></B>");
    settings.maxNestedLoads = 8;
    int32_t result = -1;
    root = Load(u"<Top><:Include what='children'>a.xml</:Include></Top>", &settings, &result);
    EXPECT_EQ(result, 0);
    EXPECT_NE(TextOf(*root, u"XMLParseErrors").find(u"Loads are nested deeper than 8 levels"),
              std::u16string::npos);
}

TEST(ResTreeLoader, DeferredFilesLoadOnTheFirstMissOnce) {
    ScratchDirectory dir;
    dir.Write("late.xml", "<Module><Group name='Late'/></Module>");
    dir.Write("parent.xml", "<Top><FromParent>p</FromParent></Top>");
    LoaderSettings settings;
    settings.deferredDirectory = dir.Path();
    // The link's lookup misses in m and loads m's files: late.xml, then the parent's, then
    // missing.xml fails and never.xml is not tried.
    auto root = Load(uR"(<Top>
        <:DeferredLoadPath>parent.xml</:DeferredLoadPath>
        <Group name="m"><:DeferredLoadPath>late.xml, .., missing.xml, never.xml</:DeferredLoadPath></Group>
        <:Link name="l">m/Late</:Link>
    </Top>)",
                     &settings);
    ResTreeNode* m = ChildOf(*root, u"m");
    ASSERT_NE(m, nullptr);
    EXPECT_NE(ChildOf(*m, u"Late"), nullptr);
    EXPECT_EQ(root->Find(u"l")->Kind(), EntryKind::Link);
    EXPECT_EQ(TextOf(*root, u"FromParent"), u"p");
    EXPECT_EQ(m->Find(u":DeferredLoadPath"), m->End());
    EXPECT_EQ(root->Find(u":DeferredLoadPath"), root->End());
    EXPECT_EQ(m->LoadDeferred(), 0);
}

TEST(ResTreeLoader, FilesOutsideTheirDirectoryAreRefusedAndNeverQuoted) {
    ScratchDirectory dir;
    std::filesystem::create_directory(dir.Path() + "/descriptions");
    std::filesystem::create_directory(dir.Path() + "/private");
    const std::string secret = dir.Write("private/secret.xml", "root:x:0:0:SECRET\nmore\n");
    dir.Write("descriptions/notes.txt", "token=SECRET\n");
    dir.Write("descriptions/ok.xml", "<Module name='ok'/>");
    std::filesystem::create_directory_symlink(dir.Path() + "/private",
                                              dir.Path() + "/descriptions/out");
    std::filesystem::create_symlink(secret, dir.Path() + "/descriptions/leak.xml");
    LoaderSettings settings;
    settings.includeDirectory = dir.Path() + "/descriptions";
    settings.deferredDirectory = settings.includeDirectory;
    const std::u16string outside = u"The file lies outside the directory ";
    const std::u16string absolute = u"Absolute paths are not read";
    auto root = Load(u"<Top><:Include>" + FromUtf8Lenient(secret) +
                         u"</:Include><:Include>../private/secret.xml</:Include>"
                         u"<:Include>out/secret.xml</:Include><:Include>leak.xml</:Include>"
                         u"<:Include>notes.txt</:Include><:Include>ok.xml</:Include>"
                         u"<Group name='g'><:DeferredLoadPath>../private/secret.xml"
                         u"</:DeferredLoadPath></Group><:Link name='l'>g/Any</:Link></Top>",
                     &settings);
    EXPECT_NE(ChildOf(*root, u"ok"), nullptr);
    const std::u16string errors =
        TextOf(*root, u"XMLParseErrors") + TextOf(*ChildOf(*root, u"g"), u"XMLParseErrors");
    EXPECT_EQ(errors.find(u"SECRET"), std::u16string::npos);
    EXPECT_NE(errors.find(absolute), std::u16string::npos);
    size_t refused = 0;
    for (size_t at = errors.find(outside); at != std::u16string::npos;
         at = errors.find(outside, at + 1))
        ++refused;
    EXPECT_EQ(refused, 4u); // "..", a folder link, a file link, the deferred ".."
    EXPECT_NE(errors.find(u"notes.txt"), std::u16string::npos);
}

TEST(ResTreeLoader, LookupsOutsideALoadUseTheDefaultSettings) {
    ScratchDirectory dir;
    dir.Write("late.xml", "<Module><Late>1</Late></Module>");
    const LoaderSettings saved = DefaultLoaderSettings();
    LoaderSettings settings = saved;
    settings.deferredDirectory = dir.Path();
    SetDefaultLoaderSettings(settings);
    ResTreeNode root(u"", u"Module", false);
    root.SetText(u":DeferredLoadPath", u"late.xml");
    EXPECT_EQ(root.Find(u"Late"), root.End());
    EXPECT_EQ(*root.TextAt(u"Late"), u"1");
    SetDefaultLoaderSettings(saved);
}

} // namespace
} // namespace wbhw
