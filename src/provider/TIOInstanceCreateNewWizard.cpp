// The wizard's description of the items it offers.
#include "provider/TIOInstanceCreateNewWizard.h"

#include "provider/TIOIdentifiers.h"

HRESULT TIOInstanceCreateNewWizard::OnDescribe(std::vector<CqxNewItemDescription>& list,
                                               const QxCreateNewRequest&) {
    if (typeName_.empty()) {
        return S_OK;
    }
    list.push_back(CqxNewItemDescription{tio::kIOItemType, -1, typeName_, 0});
    return S_OK;
}
