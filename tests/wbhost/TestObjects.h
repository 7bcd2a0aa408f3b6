// COM objects that tests hand to the resource service: an observer that records what it hears
// and a project item of no project; and the text of a BSTR handed out.
#pragma once

#include "com/Bstr.h"
#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbhwResourceTreeNode.h"
#include "host/contracts/IwbhwResourceTreeNodeObserver.h"
#include "project/ProjectItem.h"

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

// A host project item of no project: an identity to reserve with or to hand out.
inline qv::com::ComPtr<IwbProjectItem> NewItem() {
    wbhost::project::ProjectItemObject* made = nullptr;
    wbhost::project::ProjectItemObject::CreateInstance(&made, nullptr, GUID_NULL, GUID_NULL,
                                                       u"item");
    return qv::com::ComPtr<IwbProjectItem>::Adopt(made);
}

} // namespace test
