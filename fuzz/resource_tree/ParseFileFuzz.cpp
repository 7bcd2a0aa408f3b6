// Loading a description from a file that includes others and names deferred files, all written
// from the input into a directory of their own; the load is confined to that directory as the
// host confines it. Beside the directory lie files it must never read: a secret text, and links
// inside it that lead to them. Nothing may crash or run away, and no secret may reach the tree
// (its messages included) unless the input wrote it itself.
#include "FuzzCheck.h"
#include "FuzzSupport.h"
#include "resource_tree/ResTreeWriter.h"

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr std::string_view kSecret = "SECRET-OUTSIDE";

// The files a document is split into, in input order; missing parts leave no file behind.
constexpr const char* kParts[] = {"main.xml", "a.xml", "sub/b.xml", "late.xml"};

// A directory made once per process: "desc" holds the documents, beside it lie the secrets, and
// links inside "desc" lead out to them.
const fs::path& Root() {
    static const fs::path root = [] {
        std::string pattern = (fs::temp_directory_path() / "restree-file-fuzz-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr)
            std::abort();
        const fs::path made(pattern);
        fs::create_directories(made / "desc" / "sub");
        std::ofstream(made / "secret.txt") << kSecret << " line one\n" << kSecret << " two\n";
        std::ofstream(made / "secret.xml") << "<Secret>" << kSecret << "</Secret>\n";
        fs::create_directory_symlink("..", made / "desc" / "up");
        fs::create_symlink("../secret.xml", made / "desc" / "link.xml");
        return made;
    }();
    return root;
}

// Writes the parts of the input (separated by NUL bytes, which no XML document holds).
void WriteParts(std::string_view rest) {
    const fs::path desc = Root() / "desc";
    for (const char* part : kParts) {
        const size_t end = rest.find('\0');
        if (rest.empty() && end == std::string_view::npos) {
            fs::remove(desc / part);
            continue;
        }
        std::ofstream(desc / part, std::ios::binary) << rest.substr(0, end);
        rest = end == std::string_view::npos ? std::string_view() : rest.substr(end + 1);
    }
}

// Loads what nodes defer, as lookups would. A deferred file may defer again at every level, each
// load with a budget of its own, so the walk stops after a few loads or once the tree is large.
class DeferredWalk {
public:
    explicit DeferredWalk(wbhw::ResTreeNode& root) : root_(root) {}

    void Visit(wbhw::ResTreeNode& node, int depth) {
        if (depth > 100 || stopped_)
            return;
        if (node.Find(u":DeferredLoadPath") != node.End()) {
            node.LoadDeferred();
            stopped_ =
                ++loads_ == kMaxLoads || wbhw::fuzz::CountEntries(root_, kLargest) > kLargest;
        }
        std::vector<wbhw::ResTreeNode*> children;
        for (wbhw::ResTreePosition at = node.Begin(); at != node.End(); ++at) {
            if (at->Kind() == wbhw::EntryKind::Child && at->Child() != nullptr)
                children.push_back(at->Child());
        }
        for (wbhw::ResTreeNode* child : children)
            Visit(*child, depth + 1);
    }

private:
    static constexpr int kMaxLoads = 16;
    static constexpr size_t kLargest = wbhw::fuzz::kLargestWalkedTree;
    wbhw::ResTreeNode& root_;
    int loads_ = 0;
    bool stopped_ = false;
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    const std::string_view rest(reinterpret_cast<const char*>(data) + 1, size - 1);
    WriteParts(rest);
    wbhw::LoaderSettings settings =
        wbhw::fuzz::FuzzSettings(wbhw::fuzz::WantsProductionLimits(data, size));
    settings.includeDirectory = (Root() / "desc").string();
    settings.deferredDirectory = settings.includeDirectory;
    // Deferred files that a lookup loads later use the defaults, as the host sets them.
    wbhw::SetDefaultLoaderSettings(settings);
    wbhw::ResTreeNode root(wbhw::WString(), wbhw::WString(), false);
    wbhw::ResTreeNode* out = nullptr;
    const bool asChild = (data[0] & 4) != 0;
    const int32_t result =
        root.ParseFile((Root() / "desc" / kParts[0]).string(), asChild, &out, &settings);
    // A failure hands out no node. A success hands out the root itself, or, loaded as a child,
    // the node the document element made: none when that element was only a text ("<Top/>"),
    // and the root itself when it had no type yet, as the element then describes the root.
    if (result != 0)
        wbt::fuzz::Check(out == nullptr);
    else if (!asChild)
        wbt::fuzz::Check(out == &root);
    else
        wbt::fuzz::Check(out == nullptr || out == &root || out->Parent() == &root);
    if (wbhw::fuzz::CheckWithinBudget(root, settings) > wbhw::fuzz::kLargestWalkedTree)
        return 0;
    DeferredWalk walk(root);
    walk.Visit(root, 0);
    if (wbhw::fuzz::CountEntries(root, wbhw::fuzz::kLargestWalkedTree) >
        wbhw::fuzz::kLargestWalkedTree)
        return 0;
    const std::u16string written = wbhw::WriteResTree(root, settings.language).xml;
    const std::u16string secret(kSecret.begin(), kSecret.end());
    if (written.find(secret) != std::u16string::npos && rest.find(kSecret) == std::string::npos)
        std::abort();
    return 0;
}
