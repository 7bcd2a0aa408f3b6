// The Tangent I/O item receiving its attribute bag at creation.
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemProperties.h"

HRESULT TIOInstanceItemUI::LoadCreatedBag(std::u16string_view text) {
    return qv::com::GuardCall([&] {
        const std::u16string stored(text);
        qv::host::CheckStatus(Properties()->SetString(tio::kAttrBagProperty, stored.c_str(), 1));
        return Load();
    });
}
