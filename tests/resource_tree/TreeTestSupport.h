// Helpers shared by the resource-tree tests: loading documents, scratch directories.
#pragma once

#include "resource_tree/ResTreeNode.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

namespace wbhw::test {

// A fresh untyped, unordered root, as the loader's callers make them.
inline std::unique_ptr<ResTreeNode> NewRoot() {
    return std::make_unique<ResTreeNode>(WString(), WString(), false);
}

// Loads TEXT into a fresh root; RESULT receives the status.
inline std::unique_ptr<ResTreeNode> Load(std::u16string_view text,
                                         const LoaderSettings* settings = nullptr,
                                         int32_t* result = nullptr) {
    auto root = NewRoot();
    const int32_t status = root->ParseText(text, false, nullptr, settings);
    if (result != nullptr)
        *result = status;
    return root;
}

// The names of NODE's entries in container order.
inline std::vector<std::u16string> Names(const ResTreeNode& node) {
    std::vector<std::u16string> names;
    for (ResTreePosition at = node.Begin(); at != node.End(); ++at)
        names.push_back(at->Name());
    return names;
}

// The text of entry NAME in NODE, or "<absent>".
inline std::u16string TextOf(ResTreeNode& node, std::u16string_view name) {
    const ResTreePosition at = node.Find(name);
    if (at == node.End() || at->Text() == nullptr)
        return u"<absent>";
    return *at->Text();
}

// The child node NAME of NODE, or null.
inline ResTreeNode* ChildOf(ResTreeNode& node, std::u16string_view name) {
    const ResTreePosition at = node.Find(name);
    return at == node.End() ? nullptr : at->Child();
}

// A directory of its own under the system's temporary directory, removed at the end.
class ScratchDirectory {
public:
    ScratchDirectory() {
        std::string pattern = (std::filesystem::temp_directory_path() / "restree-XXXXXX").string();
        path_ = mkdtemp(pattern.data());
    }
    ~ScratchDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    ScratchDirectory(const ScratchDirectory&) = delete;
    ScratchDirectory& operator=(const ScratchDirectory&) = delete;

    const std::string& path() const { return path_; }
    // Writes BYTES to the file NAME in the directory and answers its full path.
    std::string Write(const std::string& name, const std::string& bytes) const {
        const std::string full = path_ + "/" + name;
        std::ofstream(full, std::ios::binary) << bytes;
        return full;
    }

private:
    std::string path_;
};

} // namespace wbhw::test
