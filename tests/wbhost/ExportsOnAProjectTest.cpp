// The module's tree and item exports called as a host program calls them: through dlopen, with
// refnums, host strings and host arrays, on a real target's tree and real items of a project;
// the dump export's answer allocated by the host functions of this executable.
#include "ProjectTestSupport.h"
#include "cli/HostStringList.h"
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "framework/IqxProvider.h"
#include "runtime/FailureInjection.h"
#include "runtime/RefnumTable.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace projecttest;
using qv::com::ComPtr;
using wbhost::cli::HostStringBytes;
using wbhost::cli::HostStringList;
using wbhost::cli::NewHostString;
using wbhost::runtime::FailingCall;
using wbhost::runtime::FailNthCall;

namespace {

using HS = WBHandle;
using DumpFn = int32_t(const WBRefNum*, HS, HS, uint8_t*);
using IsReservedFn = int32_t(const WBRefNum*, HS, HS, uint8_t, uint32_t*, uint8_t*);
using ProtocolsFn = int32_t(const WBRefNum*, HS, WBHandle*, uint8_t*);
using EditFn = int32_t(const WBRefNum*, HS, HS, uint8_t*);
using SetAttributesFn = int32_t(const WBRefNum*, const WBHandle*);
using SetOnMultipleFn = int32_t(const WBHandle*, const WBHandle*);
using GetResourceFn = int32_t(const WBRefNum*, void*, HS, HS, int32_t*);

constexpr const char* kBoard = R"(<Target>
  <Connector name="C0">
    <Line name="DIO0"><Protocols>IOResource, Digital</Protocols><Speed>slow</Speed></Line>
    <Line name="DIO1"><Protocols>IOResource</Protocols><NameDecoration>Front LED</NameDecoration></Line>
    <Line name="DIO2"><Note>café</Note></Line>
  </Connector>
</Target>
)";

// The texts of the host string array HANDLE as they are now (a null element reads as "<null>").
inline std::vector<std::string> Texts(WBHandle handle) {
    std::vector<std::string> texts;
    if (handle == nullptr)
        return texts;
    const auto* data = static_cast<const unsigned char*>(*handle);
    int32_t count = 0;
    std::memcpy(&count, data, sizeof count);
    for (int32_t i = 0; i < count; ++i) {
        WBHandle element = nullptr;
        std::memcpy(&element, data + 8 + 8 * i, sizeof element);
        texts.push_back(element ? wbhost::cli::HostStringBytes(element) : "<null>");
    }
    return texts;
}

// An array of 32-bit refnums (the count, then the numbers) sized as a host sizes it, given back
// when it goes.
class RefnumArray {
public:
    explicit RefnumArray(const std::vector<WBRefNum>& refnums) {
        EXPECT_EQ(NumericArrayResize(kWBTypeU32, 1, &handle_, refnums.size()), kWBNoErr);
        const auto count = static_cast<int32_t>(refnums.size());
        auto* data = static_cast<unsigned char*>(*handle_);
        std::memcpy(data, &count, sizeof count);
        if (!refnums.empty())
            std::memcpy(data + 4, refnums.data(), refnums.size() * sizeof(WBRefNum));
    }
    ~RefnumArray() { DSDisposeHandle(handle_); }
    RefnumArray(const RefnumArray&) = delete;
    RefnumArray& operator=(const RefnumArray&) = delete;
    // The handle, by reference as host arrays are passed.
    WBHandle* Ref() { return &handle_; }

private:
    WBHandle handle_ = nullptr;
};

std::string Cluster(std::string_view name, std::string_view value) {
    return "<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>" +
           std::string(name) + "</Val></String><String><Name>value</Name><Val>" +
           std::string(value) + "</Val></String></Cluster>";
}

class ExportsOnAProject : public ModuleProjectTest {
protected:
    void SetUp() override {
        Open(kBoard);
        tree = Target().Target().refnum;
    }
    void TearDown() override {
        for (WBRefNum refnum : refnums_)
            wbhost::runtime::RefnumTable::Instance().Remove(refnum);
    }

    std::u16string Attribute(std::u16string_view path, std::u16string_view name) {
        const wbhw::WString* text = Tree().Find(path)->TextAt(name);
        return text != nullptr ? std::u16string(*text) : u"<none>";
    }
    // A new item bound to RESOURCE and the refnum a host program would hold for it.
    WBRefNum AddItem(std::u16string name, const char16_t* resource) {
        items_.push_back(ModuleProjectTest::AddItem(std::move(name), resource));
        refnums_.push_back(wbhost::runtime::RefnumTable::Instance().Add(items_.back()->Object()));
        return refnums_.back();
    }
    std::u16string Resource(size_t item) { return ModuleProjectTest::Resource(items_[item]); }
    // FN (an edit export) on the tree, or on ON, with host strings PATH and TEXT (none when
    // null): its status and what it left in *FOUND, which starts as 7.
    std::pair<HRESULT, uint8_t> Edit(EditFn* fn, const char* path, const char* text,
                                     WBRefNum on = 0) {
        uint8_t found = 7;
        const WBRefNum refnum = on != 0 ? on : tree;
        const HRESULT status = fn(&refnum, NewHostString(path).get(),
                                  text != nullptr ? NewHostString(text).get() : nullptr, &found);
        return {status, found};
    }

    WBRefNum tree = 0;
    std::vector<ProjectItem*> items_;
    std::vector<WBRefNum> refnums_;
    wbhost::runtime::FailureScope failures_;
};

TEST_F(ExportsOnAProject, QueriesAnswerReservationsAndProtocolsAndLeaveOutputsAloneOffTheTree) {
    auto* isReserved = Export<IsReservedFn>("TIOResTree_IsReserved");
    auto* protocols = Export<ProtocolsFn>("TIOResTree_GetSupportedProtocols");
    AddItem(u"Valve", u"/C0/DIO0");

    struct Case {
        const char* path;
        const char* protocol;
        uint32_t reserved;
        uint8_t found;
    };
    // Any protocol, one the node supports (case aside), one it does not; a free node; no node.
    for (const Case& c :
         {Case{"C0/DIO0", "", 1, 1}, Case{"C0/DIO0", "digital", 1, 1},
          Case{"C0/DIO0", "Serial", 0, 1}, Case{"C0/DIO1", "", 0, 1}, Case{"C0/DIO9", "", 0, 0}}) {
        uint32_t reserved = 7;
        uint8_t found = 7;
        EXPECT_EQ(isReserved(&tree, NewHostString(c.path).get(), NewHostString(c.protocol).get(), 1,
                             &reserved, &found),
                  S_OK)
            << c.path;
        EXPECT_EQ(reserved, c.reserved) << c.path << " " << c.protocol;
        EXPECT_EQ(found, c.found) << c.path;
    }

    // The caller's array is resized to the protocols, in the node's order; one that held more
    // elements gives the extra ones back.
    HostStringList list({"a", "b", "c"});
    uint8_t found = 7;
    ASSERT_EQ(protocols(&tree, NewHostString("C0/DIO0").get(), &list.Handle(), &found), S_OK);
    EXPECT_EQ(found, 1);
    EXPECT_EQ(Texts(list.Handle()), (std::vector<std::string>{"IOResource", "Digital"}));
    // A null handle (the list's own block given back first) is allocated for the caller; a path
    // off the tree leaves the array alone.
    HostStringList fresh({});
    DSDisposeHandle(fresh.Handle());
    fresh.Handle() = nullptr;
    ASSERT_EQ(protocols(&tree, NewHostString("C0/DIO1").get(), &fresh.Handle(), &found), S_OK);
    EXPECT_EQ(Texts(fresh.Handle()), std::vector<std::string>{"IOResource"});
    EXPECT_EQ(protocols(&tree, NewHostString("C0/DIO2/X").get(), &list.Handle(), &found), S_OK);
    EXPECT_EQ(found, 0);
    EXPECT_EQ(Texts(list.Handle()), (std::vector<std::string>{"IOResource", "Digital"}));

    // A refnum of something that is no tree: its status, outputs as cleared.
    uint32_t reserved = 7;
    found = 7;
    const WBRefNum item = refnums_.front();
    EXPECT_EQ(isReserved(&item, NewHostString("").get(), nullptr, 0, &reserved, &found),
              E_NOINTERFACE);
    EXPECT_EQ(reserved, 0u);
    EXPECT_EQ(found, 0);
}

TEST_F(ExportsOnAProject, EditsInsertRemoveAndSetPropertiesWhereThePathLeavesTheTree) {
    auto* insert = Export<EditFn>("TIO_InsertSubTree");
    auto* remove = Export<EditFn>("TIO_RemoveSubTree");
    auto* setProperty = Export<EditFn>("TIOResTree_SetProperty");
    const WBRefNum item = AddItem(u"Late", u"/C0/DIO7");
    EXPECT_EQ(Resource(0), u"/C0/DIO7");

    using Answer = std::pair<HRESULT, uint8_t>;
    // A part inserted under the connector: the item waiting for it binds.
    const char* const line = "<Line name=\"DIO7\"><Protocols>IOResource</Protocols></Line>";
    ASSERT_EQ(Edit(insert, "C0", line), Answer(S_OK, 1));
    ASSERT_NE(Tree().Find(u"/C0/DIO7"), nullptr);
    EXPECT_EQ(Tree().QueryReservation(*Tree().Find(u"/C0/DIO7"), items_[0]), S_OK);
    // Under a path naming nothing, nothing is inserted; a document that does not load fails.
    EXPECT_EQ(Edit(insert, "C9", line), Answer(S_OK, 0));
    EXPECT_EQ(Edit(insert, "C0", "<Line"), Answer(E_FAIL, 1));

    // The last piece of the path names no node: it is the property of the deepest node. An
    // existing text entry is changed the same way.
    ASSERT_EQ(Edit(setProperty, "C0/DIO0/Colour", "red"), Answer(S_OK, 1));
    EXPECT_EQ(Attribute(u"/C0/DIO0", u"Colour"), u"red");
    ASSERT_EQ(Edit(setProperty, "/C0/DIO0/Speed", "fast"), Answer(S_OK, 1));
    EXPECT_EQ(Attribute(u"/C0/DIO0", u"Speed"), u"fast");
    // Paths whose rest is no single property set nothing and say so: two pieces missing, a path
    // naming a node, a name of a child. *FOUND is written only at the end: a failure before it
    // leaves the caller's value.
    for (const char* path : {"C0/DIO9/Colour", "C0/DIO0", "C0/DIO0/..", "C0"})
        EXPECT_EQ(Edit(setProperty, path, "x"), Answer(S_OK, 0)) << path;
    EXPECT_EQ(Attribute(u"/C0", u"DIO9"), u"<none>");
    EXPECT_EQ(Edit(setProperty, "C0/X", nullptr, item), Answer(E_NOINTERFACE, 7));

    // The part goes again: the item is missing its resource.
    ASSERT_EQ(Edit(remove, "C0", "DIO7"), Answer(S_OK, 1));
    EXPECT_EQ(Tree().Find(u"/C0/DIO7"), nullptr);
    EXPECT_EQ(Status(items_[0]), 1);
}

TEST_F(ExportsOnAProject, AttributesReachOneItemOrOneTextEachOfSeveral) {
    auto* setAttributes = Export<SetAttributesFn>("TIO_SetAttributes");
    auto* setOnMultiple = Export<SetOnMultipleFn>("TIO_SetAttributesOnMultiple");
    const WBRefNum a = AddItem(u"A", u"/C0/DIO0");
    const WBRefNum b = AddItem(u"B", u"/C0/DIO1");

    // A new resource through the attributes: the item binds to it.
    HostStringList texts({Cluster("resource", "/C0/DIO2"), Cluster("Colour", "red")});
    ASSERT_EQ(setAttributes(&a, &texts.Handle()), S_OK);
    EXPECT_EQ(Resource(0), u"/C0/DIO2");
    EXPECT_EQ(Tree().QueryReservation(*Tree().Find(u"/C0/DIO2"), items_[0]), S_OK);
    // A text that does not parse is reported, and what came before it is applied and bound.
    HostStringList bad({Cluster("resource", "/C0/DIO0"), "<Cluster>", Cluster("x", "y")});
    EXPECT_TRUE(FAILED(setAttributes(&a, &bad.Handle())));
    EXPECT_EQ(Resource(0), u"/C0/DIO0");
    EXPECT_EQ(Tree().QueryReservation(*Tree().Find(u"/C0/DIO0"), items_[0]), S_OK);

    // Text i to item i. Fewer refnums than texts is refused before any item changes: the
    // caller's count is the end of its block.
    RefnumArray both({a, b});
    RefnumArray one({b});
    HostStringList two({Cluster("resource", "/C0/DIO1"), Cluster("resource", "/C0/DIO2")});
    EXPECT_EQ(setOnMultiple(one.Ref(), &two.Handle()), E_INVALIDARG);
    EXPECT_EQ(Resource(1), u"/C0/DIO1");
    ASSERT_EQ(setOnMultiple(both.Ref(), &two.Handle()), S_OK);
    EXPECT_EQ(Resource(0), u"/C0/DIO1");
    EXPECT_EQ(Resource(1), u"/C0/DIO2");
    // No texts touch no refnum at all, not even a missing array of them.
    HostStringList none({});
    EXPECT_EQ(setOnMultiple(nullptr, &none.Handle()), S_OK);
    // A refnum that is no item stops the walk with its status; the items before it stay changed.
    RefnumArray withTree({a, tree});
    EXPECT_EQ(setOnMultiple(withTree.Ref(), &two.Handle()), E_NOINTERFACE);
    EXPECT_EQ(Resource(0), u"/C0/DIO1");
}

TEST_F(ExportsOnAProject, AnItemsResourceShowsWithItsDisplayNameAndStatus) {
    auto* getResource = Export<GetResourceFn>("TIOAttributeSet_GetResource");
    const WBRefNum bound = AddItem(u"A", u"/C0/DIO0");
    const WBRefNum conflict = AddItem(u"B", u"/C0/DIO0");
    const WBRefNum decorated = AddItem(u"C", u"/C0/DIO1");
    const WBRefNum missing = AddItem(u"D", u"/C0/DIO9");
    const WBRefNum none = AddItem(u"E", u"");
    struct Case {
        WBRefNum refnum;
        int32_t answer;
        const char* resource;
        const char* shown;
        int32_t status;
    };
    for (const Case& c :
         {Case{bound, S_OK, "/C0/DIO0", "DIO0", 0}, Case{conflict, S_OK, "/C0/DIO0", "DIO0", 2},
          Case{decorated, S_OK, "/C0/DIO1", "Front LED", 0},
          Case{missing, S_OK, "/C0/DIO9", "/C0/DIO9", 1}, Case{none, S_OK, "", "", 1},
          // Not an item: the texts are emptied all the same.
          Case{tree, E_NOINTERFACE, "", "", 3}}) {
        const auto resource = NewHostString("old");
        const auto shown = NewHostString("old");
        int32_t status = -1;
        EXPECT_EQ(getResource(&c.refnum, nullptr, resource.get(), shown.get(), &status), c.answer)
            << c.resource;
        EXPECT_EQ(HostStringBytes(resource.get()), c.resource);
        EXPECT_EQ(HostStringBytes(shown.get()), c.shown) << c.resource;
        EXPECT_EQ(status, c.status) << c.resource;
    }
}

TEST_F(ExportsOnAProject, DumpsTheNodeInTheHostsCodePageAndBadArgumentsAnswerFailures) {
    auto* dump = Export<DumpFn>("TIOResTree_Dump");
    const auto text = NewHostString("old");
    uint8_t found = 7;
    EXPECT_EQ(dump(&tree, NewHostString("C0/DIO9").get(), text.get(), &found), S_OK);
    EXPECT_EQ(found, 0);
    EXPECT_EQ(HostStringBytes(text.get()), "old");
    ASSERT_EQ(dump(&tree, NewHostString("C0/DIO2").get(), text.get(), &found), S_OK);
    EXPECT_EQ(found, 1);
    // "\xE9" is e-acute in the default single-byte code page.
    EXPECT_EQ(HostStringBytes(text.get()),
              "<Line name=\"DIO2\">\n  <Note>caf\xE9</Note>\n</Line>\n");

    const auto path = NewHostString("");
    const WBRefNum unknown = 0xFFFFFFF0u;
    EXPECT_EQ(dump(&unknown, path.get(), text.get(), &found), E_INVALIDARG);
    EXPECT_EQ(found, 0);
    EXPECT_EQ(dump(nullptr, path.get(), text.get(), &found), E_POINTER);
    EXPECT_EQ(dump(&tree, path.get(), text.get(), nullptr), E_POINTER);
    EXPECT_EQ(dump(&tree, path.get(), nullptr, &found), E_POINTER);
    EXPECT_EQ(HostStringBytes(text.get()),
              "<Line name=\"DIO2\">\n  <Note>caf\xE9</Note>\n</Line>\n");
    // A handle the host never made cannot be written: its host error comes back as a status,
    // with the node already found.
    void* notAHostBlock = nullptr;
    EXPECT_EQ(dump(&tree, path.get(), &notAHostBlock, &found), E_INVALIDARG);
    EXPECT_EQ(found, 1);
    // A null path handle reads as the empty path: the root.
    EXPECT_EQ(dump(&tree, nullptr, text.get(), &found), S_OK);
    EXPECT_EQ(found, 1);
    EXPECT_EQ(HostStringBytes(text.get()).substr(0, 8), "<Target ");
}

TEST_F(ExportsOnAProject, TheProviderExportHandsOutTheProviderTheSessionWorksWith) {
    using GetProviderFn = HRESULT(int32_t, void**);
    auto* getProvider = Export<GetProviderFn>("qxGetProvider");
    void* current = nullptr;
    ASSERT_EQ(getProvider(0, &current), S_OK);
    const auto held = ComPtr<IqxProvider>::Adopt(static_cast<IqxProvider*>(current));
    EXPECT_EQ(held.Get(), session.Provider());
    EXPECT_EQ(getProvider(0, nullptr), E_POINTER);
}

TEST_F(ExportsOnAProject, AHostErrorWhileWritingComesBackMappedWithTheOutputUnchanged) {
    auto* dump = Export<DumpFn>("TIOResTree_Dump");
    auto* protocols = Export<ProtocolsFn>("TIOResTree_GetSupportedProtocols");
    auto* getResource = Export<GetResourceFn>("TIOAttributeSet_GetResource");
    const WBRefNum item = AddItem(u"A", u"/C0/DIO0");
    const struct {
        WBErr error;
        int32_t status;
    } mappings[] = {{kWBMemFullErr, E_OUTOFMEMORY},
                    {kWBNotSupported, E_NOTIMPL},
                    {kWBFileNotFound, static_cast<int32_t>(0x80030002)},
                    {kWBArgErr, E_INVALIDARG},
                    {kWBGenericErr, E_FAIL}};
    // Everything the caller hands in is made before the failure is armed.
    const auto connector = NewHostString("C0");
    const auto line = NewHostString("C0/DIO0");
    for (const auto& m : mappings) {
        const auto text = NewHostString("old");
        HostStringList list({"x", "y"});
        uint8_t found = 0;
        FailNthCall(FailingCall::NumericArrayResize, 1, m.error);
        EXPECT_EQ(dump(&tree, connector.get(), text.get(), &found), m.status);
        EXPECT_EQ(HostStringBytes(text.get()), "old");
        FailNthCall(FailingCall::NumericArrayResize, 1, m.error);
        EXPECT_EQ(protocols(&tree, line.get(), &list.Handle(), &found), m.status);
        EXPECT_EQ(Texts(list.Handle()), (std::vector<std::string>{"x", "y"}));
        // The texts are emptied before anything else: that first write fails, the status stays 3.
        int32_t status = -1;
        const auto shown = NewHostString("old");
        FailNthCall(FailingCall::NumericArrayResize, 1, m.error);
        EXPECT_EQ(getResource(&item, nullptr, text.get(), shown.get(), &status), m.status);
        EXPECT_EQ(HostStringBytes(text.get()), "old");
        EXPECT_EQ(HostStringBytes(shown.get()), "old");
        EXPECT_EQ(status, 3);
    }
}

} // namespace
