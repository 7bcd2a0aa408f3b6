// COM objects that tests hand to the resource service: an observer that records what it hears
// and a project item that only has an identity; and the text of a BSTR handed out.
#pragma once

#include "com/Bstr.h"
#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "host/contracts/IwbhwResourceTreeNodeObserver.h"

#include <functional>
#include <string>
#include <vector>

namespace test {

// The text of a BSTR an interface handed out, which is freed.
inline std::u16string TakeText(BSTR text) {
    const qv::com::UniqueBstr held(text);
    return qv::com::BstrToString(text);
}

struct Heard {
    std::u16string path; // the node's path when it was told
    uint32_t events;
    uint32_t kind;
    bool operator==(const Heard&) const = default;
};

class RecordingObserverImpl : public IwbhwResourceTreeNodeObserver {
public:
    using Interfaces = qv::com::InterfaceList<IwbhwResourceTreeNodeObserver>;
    virtual ~RecordingObserverImpl() = default;

    HRESULT OnNodeEvent(IUnknown* node, uint32_t events, uint32_t kind) override {
        auto asNode = qv::com::QueryAs<IwbhwResourceTreeNode>(node);
        BSTR path = nullptr;
        if (asNode)
            asNode->GetPath(&path);
        heard.push_back({TakeText(path), events, kind});
        if (onEvent)
            onEvent(asNode.Get(), events);
        return S_OK;
    }

    std::vector<Heard> heard;
    // Runs inside each call, for tests of observers that call back into the tree.
    std::function<void(IwbhwResourceTreeNode*, uint32_t)> onEvent;
};
using RecordingObserver = CQVComObject<RecordingObserverImpl>;

inline qv::com::ComPtr<RecordingObserver> NewObserver() {
    RecordingObserver* made = nullptr;
    RecordingObserver::CreateInstance(&made);
    return qv::com::ComPtr<RecordingObserver>::Adopt(made);
}

class StubItemImpl : public IwbProjectItem {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItem>;
    virtual ~StubItemImpl() = default;
    HRESULT GetName(BSTR*) override { return E_NOTIMPL; }
    HRESULT SetName(const char16_t*) override { return E_NOTIMPL; }
    HRESULT GetTypeGuid(GUID*) override { return E_NOTIMPL; }
    HRESULT GetParent(IwbProjectItem**) override { return E_NOTIMPL; }
    HRESULT FindChild(const char16_t*, IwbProjectItem**) override { return E_NOTIMPL; }
    HRESULT CreateChild(const GUID&, const char16_t*, IwbProjectItem**) override {
        return E_NOTIMPL;
    }
    HRESULT GetObject(IUnknown**) override { return E_NOTIMPL; }
    HRESULT GetPropertyBag(IwbProjectPropertyBag**) override { return E_NOTIMPL; }
    HRESULT Refresh(uint32_t) override { return E_NOTIMPL; }
    HRESULT Select() override { return E_NOTIMPL; }
    HRESULT Show(int32_t) override { return E_NOTIMPL; }
    HRESULT GetFlags(uint32_t*) override { return E_NOTIMPL; }
    HRESULT SetFlags(uint32_t) override { return E_NOTIMPL; }
    HRESULT EnumerateItems(IwbProjectItemSelector*, IwbProjectItem**) override { return E_NOTIMPL; }
    HRESULT GetInfoRecord(QxItemInfoRecord*) override { return E_NOTIMPL; }
    HRESULT GetItemUIMap(IwbProjectItemUIMap**) override { return E_NOTIMPL; }
};
using StubItem = CQVComObject<StubItemImpl>;

inline qv::com::ComPtr<IwbProjectItem> NewItem() {
    StubItem* made = nullptr;
    StubItem::CreateInstance(&made);
    return qv::com::ComPtr<IwbProjectItem>::Adopt(made);
}

} // namespace test
