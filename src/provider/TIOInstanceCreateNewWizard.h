// The create-new wizard of Tangent I/O items. It starts out describing nothing: the type name
// it offers comes from the target it is bound to.
#pragma once

#include "framework/CqxCreateNewWizard.h"

#include <string>

class TIOInstanceCreateNewWizard : public CqxCreateNewWizard {
public:
    // The display name of the item type for the bound target (empty until bound).
    const std::u16string& typeName() const { return typeName_; }
    // The icon file name for new items.
    const std::u16string& iconName() const { return iconName_; }

protected:
    TIOInstanceCreateNewWizard() = default;

    // Offers one new Tangent I/O item named typeName; nothing while typeName is empty.
    HRESULT OnDescribe(std::vector<CqxNewItemDescription>& list,
                       const QxCreateNewRequest& request) override;

private:
    std::u16string typeName_;
    std::u16string iconName_;
};
