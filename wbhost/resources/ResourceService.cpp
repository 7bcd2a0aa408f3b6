// The host's hardware-resource service.
#include "resources/ResourceService.h"

#include "kern/Collate.h"
#include "resources/HostResourceNode.h"
#include "resources/TargetHardware.h"
#include "runtime/RefnumTable.h"

namespace wbhost::resources {
namespace {

constexpr std::u16string_view kParseErrors = u"XMLParseErrors";

// An untyped, unnamed root: the document element gives it its name and type.
std::unique_ptr<wbhw::ResTreeNode> NewRoot() {
    return std::make_unique<wbhw::ResTreeNode>(u"", u"", false);
}

} // namespace

std::vector<ParseProblem> CollectParseProblems(wbhw::ResTreeNode& node) {
    std::vector<ParseProblem> problems;
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (wbhw::IsTextKind(entry->Kind()) && qv::kern::EqualsNoCase(entry->Name(), kParseErrors))
            problems.push_back({node.Path(), *entry->Text()});
    }
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (entry->Child() != nullptr) {
            auto below = CollectParseProblems(*entry->Child());
            problems.insert(problems.end(), below.begin(), below.end());
        }
    }
    return problems;
}

ResourceService::~ResourceService() {
    for (const auto& target : targets_) {
        wbhost::runtime::RefnumTable::Instance().Remove(target->refnum);
        target->tree->Shutdown();
    }
}

Target* ResourceService::LoadTargetFile(const std::string& path, int32_t* status) {
    auto root = NewRoot();
    const int32_t loaded = root->ParseFile(path, false);
    if (status != nullptr)
        *status = loaded;
    // A file that cannot be opened leaves no message and no tree; a document that failed part
    // way still has a tree whose problems are worth showing.
    if (loaded != 0 && root->IsEmpty())
        return nullptr;
    return Adopt(std::move(root));
}

Target* ResourceService::LoadTargetText(std::u16string_view xml, int32_t* status) {
    auto root = NewRoot();
    const int32_t loaded = root->ParseText(xml, false);
    if (status != nullptr)
        *status = loaded;
    if (loaded != 0 && root->IsEmpty())
        return nullptr;
    return Adopt(std::move(root));
}

Target* ResourceService::Adopt(std::unique_ptr<wbhw::ResTreeNode> root) {
    auto target = std::make_unique<Target>();
    target->problems = CollectParseProblems(*root);
    target->tree = ResourceTree::Create(std::move(root));
    CQVComObject<TargetHardware>* hardware = nullptr;
    if (FAILED(CQVComObject<TargetHardware>::CreateInstance(&hardware, target->tree)))
        return nullptr;
    target->hardware = qv::com::ComPtr<IwbhwTargetResources>::Adopt(hardware);
    qv::com::ComPtr<IwbhwResourceTreeNode> rootObject;
    if (FAILED(target->tree->NodeObject(&target->tree->Root(), rootObject.Put())))
        return nullptr;
    target->refnum = wbhost::runtime::RefnumTable::Instance().Add(rootObject.Get());
    if (target->refnum == 0)
        return nullptr;
    targets_.push_back(std::move(target));
    return targets_.back().get();
}

} // namespace wbhost::resources
