// The framework's create-new wizard base: keeps the provider, the parent item and the
// description list, and calls the bind, run and describe hooks a concrete wizard overrides.
#pragma once

#include "com/ComPtr.h"
#include "com/InterfaceList.h"
#include "framework/IqxBindable.h"
#include "framework/IqxCreateNewWizard.h"
#include "framework/IqxProvider.h"
#include "host/contracts/IwbProjectItem.h"

#include <string>
#include <vector>

// A new-item description as wizards build it; handed out as QxNewItemDescription.
struct CqxNewItemDescription {
    GUID itemType = GUID_NULL;
    int32_t position = -1;
    std::u16string displayName;
    uint64_t icon = 0;
};

class CqxCreateNewWizard : public IqxCreateNewWizard, public IqxBindable {
public:
    using Interfaces = qv::com::InterfaceList<IqxCreateNewWizard, IqxBindable>;

    // Keeps PARENT as the parent item and answers what OnBind answers.
    HRESULT Bind(IwbProjectItem* parent) override;
    HRESULT Run(const QxCreateNewRequest* request) override;
    // Rebuilds the description list through OnDescribe and hands out a copy of it.
    HRESULT GetNewItemDescriptions(const QxCreateNewRequest* request, uint32_t* count,
                                   QxNewItemDescription** descriptions) override;

    // Records the provider that created the wizard (a reference is kept); null is ignored.
    void AttachProvider(IqxProvider* provider);

protected:
    CqxCreateNewWizard() = default;
    virtual ~CqxCreateNewWizard() = default;

    IqxProvider* Provider() const { return provider_.Get(); }
    // The parent item given to Bind (no reference added); null before.
    IwbProjectItem* ParentItem() const { return parent_.Get(); }

    // Reads what the wizard needs from PARENT; the base needs nothing.
    virtual HRESULT OnBind(IwbProjectItem* parent);
    // Runs the wizard; the base creates nothing.
    virtual HRESULT OnRun(const QxCreateNewRequest& request);
    // Appends the descriptions of the items the wizard offers; the base offers none.
    virtual HRESULT OnDescribe(std::vector<CqxNewItemDescription>& list,
                               const QxCreateNewRequest& request);

private:
    qv::com::ComPtr<IqxProvider> provider_;
    qv::com::ComPtr<IwbProjectItem> parent_;
    std::vector<CqxNewItemDescription> descriptions_;
};
