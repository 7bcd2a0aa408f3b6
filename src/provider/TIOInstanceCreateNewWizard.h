// The create-new wizard of Tangent I/O items. It starts out describing nothing: the type name
// it offers comes from the target it is bound to. Running it runs the wizard program, whose
// answer is one attribute-set text per item to create.
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

    // Reads the type and icon names from the root of the resource tree PARENT belongs to.
    HRESULT OnBind(IwbProjectItem* parent) override;
    // Runs the wizard program for the parent item REQUEST names and creates what it answers;
    // S_OK when the user cancels.
    HRESULT OnRun(const QxCreateNewRequest& request) override;
    // Offers one new Tangent I/O item named typeName; nothing while typeName is empty.
    HRESULT OnDescribe(std::vector<CqxNewItemDescription>& list,
                       const QxCreateNewRequest& request) override;

private:
    // The framework's root object of the provider that made the wizard; null without one.
    qv::com::ComPtr<IUnknown> RootObject() const;

    std::u16string typeName_;
    std::u16string iconName_;
};
