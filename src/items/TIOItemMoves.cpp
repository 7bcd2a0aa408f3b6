// A Tangent I/O item following its moves in the project tree: only a move that changes the
// target owning its resource tree makes it bind again.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"

using qv::host::CheckStatus;

HRESULT TIOInstanceItemUI::OnProjectItemEvents(uint32_t count, const WbProjectItemEvent* events) {
    if (count != 0 && events == nullptr)
        return E_POINTER;
    if (HostItem() == nullptr)
        return E_UNEXPECTED;
    for (uint32_t i = 0; i < count; ++i) {
        const WbProjectItemEvent& event = events[i];
        if (event.kind != wbproj::item_event::kMoved)
            continue;
        ItemResourceContext before;
        ItemResourceContext now;
        const HRESULT hr = qv::com::GuardCall([&]() -> HRESULT {
            CheckStatus(before.Fill(event.oldParent, true));
            CheckStatus(now.Fill(HostItem(), true));
            if (before.Owner() == now.Owner())
                return S_FALSE;
            // Every watch of the item goes with the old tree, not only those on the resource
            // node: a definition or signature watch left there would rebind the item on
            // changes of a target it no longer belongs to.
            LetGoOfTree(before.Root());
            return S_OK;
        });
        if (FAILED(hr))
            return hr;
        if (hr == S_OK) {
            if (const HRESULT bound = BindToResource(&now, 0, 0); FAILED(bound))
                return bound;
        }
    }
    return S_OK;
}
