// The COM object that stands for one node of a host resource tree: the node interface that items
// use, the access interface that exports use, and the reservation query.
#pragma once

#include "com/ComObject.h"
#include "host/contracts/IwbhwResourceReservation.h"
#include "host/contracts/IwbhwResourceTreeAccess.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "resources/ResourceTree.h"

#include <memory>

namespace wbhost::resources {

// Every method locks the tree and fails with E_FAIL once the node has been removed; none throws.
class HostResourceNode : public IwbhwResourceTreeNode,
                         public IwbhwResourceTreeAccess,
                         public IwbhwResourceReservation {
public:
    using Interfaces = qv::com::InterfaceList<IwbhwResourceTreeNode, IwbhwResourceTreeAccess,
                                              IwbhwResourceReservation>;

    // The object of the node that STATE describes in TREE.
    HostResourceNode(std::shared_ptr<ResourceTree> tree, std::shared_ptr<NodeState> state);
    virtual ~HostResourceNode();
    HostResourceNode(const HostResourceNode&) = delete;
    HostResourceNode& operator=(const HostResourceNode&) = delete;

    // IwbhwResourceTreeNode
    HRESULT GetName(BSTR* name) override;
    HRESULT GetPath(BSTR* path) override;
    HRESULT GetElementType(BSTR* type) override;
    HRESULT GetAttribute(const char16_t* name, BSTR* value) override;
    HRESULT GetAttributeAt(uint32_t index, BSTR* name, BSTR* value) override;
    HRESULT SetAttribute(const char16_t* name, const char16_t* value) override;
    HRESULT GetParent(IwbhwResourceTreeNode** parent) override;
    HRESULT GetChildren(uint32_t* count, IwbhwResourceTreeNode*** children) override;
    HRESULT GetChildrenOfType(const char16_t* type, uint32_t* count,
                              IwbhwResourceTreeNode*** children) override;
    HRESULT FindNode(const char16_t* path, uint32_t* matched,
                     IwbhwResourceTreeNode** node) override;
    HRESULT AddObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t mask,
                        uint32_t kind) override;
    HRESULT RemoveObserver(IwbhwResourceTreeNodeObserver* observer, uint32_t kind,
                           int32_t wholeSubtree) override;
    HRESULT SaveNotificationState(uint32_t* state) override;
    HRESULT RestoreNotificationState(uint32_t state) override;
    HRESULT GetValue(BSTR* value) override;
    HRESULT Reserve(IwbProjectItem* item, uint32_t mode) override;
    HRESULT QueryReservation(IwbProjectItem* item) override;
    HRESULT ReleaseReservation(IwbProjectItem* item) override;
    HRESULT GetReservingItems(IwbProjectItem* except, uint32_t* count,
                              IwbProjectItem*** items) override;

    // IwbhwResourceTreeAccess
    HRESULT FindNode(const char16_t* path, uint32_t* matched, uint32_t reserved,
                     IwbhwResourceTreeAccess** node) override;
    // The node's subtree as a resource-tree document (the canonical writer's form).
    HRESULT Dump(BSTR* text) override;
    // The protocols named by the node's "Protocols" list, in order.
    HRESULT GetSupportedProtocols(uint32_t* count, BSTR** protocols) override;
    HRESULT SetProperty(const char16_t* name, const char16_t* value) override;
    HRESULT InsertSubTree(const char16_t* xml) override;
    HRESULT RemoveSubTree(const char16_t* name) override;

    // IwbhwResourceReservation: *reserved is 1 when some item holds the node (for PROTOCOL, when
    // given, only if the node supports it), else 0. The flag is not used by this host.
    HRESULT IsReserved(const char16_t* protocol, int32_t flag, uint32_t* reserved) override;

private:
    // Runs BODY(node) under the tree's lock; E_FAIL when the node is gone, E_OUTOFMEMORY or
    // E_FAIL for what BODY throws.
    template <class Body> HRESULT WithNode(Body&& body);
    HRESULT Children(const char16_t* type, uint32_t* count, IwbhwResourceTreeNode*** children);

    std::shared_ptr<ResourceTree> tree_;
    std::shared_ptr<NodeState> state_;
};

// The protocols named by NODE's "Protocols" list (comma-separated, blanks trimmed).
std::vector<std::u16string> SupportedProtocols(wbhw::ResTreeNode& node);

} // namespace wbhost::resources
