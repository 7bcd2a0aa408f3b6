// The host's hardware-resource service: the targets' resource trees, loaded from resource-tree
// documents, each reachable through a refnum as host programs reach it.
#pragma once

#include "com/ComPtr.h"
#include "host/binding/runtime_api.h"
#include "host/contracts/IwbhwTargetResources.h"
#include "resources/ResourceTree.h"

#include <memory>
#include <string>
#include <vector>

namespace wbhost::resources {

// A problem the loader recorded in a node's "XMLParseErrors" entry.
struct ParseProblem {
    std::u16string path;    // the node that holds the entry
    std::u16string message; // the entry's text
};

// One target of the service.
struct Target {
    std::shared_ptr<ResourceTree> tree;
    // The refnum of the tree's root: its IwbhwResourceTreeAccess and IwbhwResourceTreeNode.
    WBRefNum refnum = 0;
    // The target's hardware object (IwbhwTargetResources, IwbhwResourceTreeProvider).
    qv::com::ComPtr<IwbhwTargetResources> hardware;
    // What loading left in "XMLParseErrors" entries, in tree order.
    std::vector<ParseProblem> problems;
};

class ResourceService {
public:
    ResourceService() = default;
    // Gives back the targets' refnums and drops their observers and reservations.
    ~ResourceService();
    ResourceService(const ResourceService&) = delete;
    ResourceService& operator=(const ResourceService&) = delete;

    // Loads the resource-tree document in the file PATH as a new target. Null (and *STATUS
    // negative) when the file cannot be read or no tree results; a document that loads with
    // problems still gives a target, with the problems listed. STATUS may be null.
    Target* LoadTargetFile(const std::string& path, int32_t* status = nullptr);
    // The same for a document held in XML.
    Target* LoadTargetText(std::u16string_view xml, int32_t* status = nullptr);
    // The targets in the order they were loaded.
    const std::vector<std::unique_ptr<Target>>& Targets() const noexcept { return targets_; }

private:
    Target* Adopt(std::unique_ptr<wbhw::ResTreeNode> root);
    std::vector<std::unique_ptr<Target>> targets_;
};

// Every "XMLParseErrors" text in the subtree of NODE, in tree order.
std::vector<ParseProblem> CollectParseProblems(wbhw::ResTreeNode& node);

} // namespace wbhost::resources
