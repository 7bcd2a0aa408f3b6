// The hardware object of a target: its resource tree's root and the resources that fit an I/O
// interface.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbhwResourceTreeProvider.h"
#include "host/contracts/IwbhwTargetResources.h"
#include "resources/ResourceTree.h"

#include <memory>

namespace wbhost::resources {

class TargetHardware : public IwbhwTargetResources, public IwbhwResourceTreeProvider {
public:
    using Interfaces = qv::com::InterfaceList<IwbhwTargetResources, IwbhwResourceTreeProvider>;

    // The hardware object of the target whose tree is TREE.
    explicit TargetHardware(std::shared_ptr<ResourceTree> tree) : tree_(std::move(tree)) {}
    virtual ~TargetHardware() = default;

    // The paths of the nodes whose "IOInterface" text equals IOINTERFACE (any node when it is
    // empty or null) and whose protocols pass PROTOCOLFILTER, in tree order.
    HRESULT ListResourceNames(const char16_t* ioInterface, const char16_t* protocolFilter,
                              BSTR** names, uint32_t* count) override;
    HRESULT GetResourceTreeRoot(IwbhwResourceTreeNode** root) override;

private:
    std::shared_ptr<ResourceTree> tree_;
};

// A protocol filter such as "include_protocols=IOResource,exclude_protocols=": a node passes
// when it supports every included protocol and none of the excluded ones. Pieces without "="
// continue the list of the key before them; unknown keys are ignored.
struct ProtocolFilter {
    std::vector<std::u16string> include;
    std::vector<std::u16string> exclude;

    static ProtocolFilter Parse(std::u16string_view text);
    bool Passes(const std::vector<std::u16string>& supported) const;
};

} // namespace wbhost::resources
