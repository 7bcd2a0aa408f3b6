// Selectors the item hands the host's item enumeration to find resource items below a name
// scope: by name (is a name taken?) and all of them (which names are taken?).
#pragma once

#include "com/ComObject.h"
#include "com/ComPtr.h"
#include "host/contracts/IwbProjectItem.h"
#include "host/contracts/IwbProjectItemSelector.h"
#include "items/TIOItemInterfaces.h"
#include "kern/Collate.h"

#include <set>
#include <string>

namespace wbhw {

// Item names, compared without regard to case.
using NameSet = std::set<std::u16string, qv::kern::LessNoCase>;

// Hands each resource item (one whose object offers IwbhwResourceItemUI) to Select; other
// items are passed over.
class ResourceItemUISelector : public IwbProjectItemSelector {
public:
    using Interfaces = qv::com::InterfaceList<IwbProjectItemSelector>;

    HRESULT SelectItem(IwbProjectItem* item) override;

protected:
    ResourceItemUISelector() = default;
    virtual ~ResourceItemUISelector() = default;
    // S_OK selects ITEM (the walk ends), S_FALSE goes on. Exceptions are turned into statuses.
    virtual HRESULT Select(IwbProjectItem& item, IwbhwResourceItemUI& resourceItem) = 0;
};

// A resource-item selector that looks for one name.
class ResourceItemUIByNameSelector : public ResourceItemUISelector {
protected:
    explicit ResourceItemUIByNameSelector(std::u16string name) : name_(std::move(name)) {}
    const std::u16string& Name() const noexcept { return name_; }

private:
    std::u16string name_;
};

} // namespace wbhw

// Selects the first resource item whose name equals the held one (case aside) and keeps it,
// with a reference, in the caller's FOUND.
class ExistingItemSelector : public wbhw::ResourceItemUIByNameSelector {
public:
    ExistingItemSelector(std::u16string name, qv::com::ComPtr<IwbProjectItem>& found)
        : ResourceItemUIByNameSelector(std::move(name)), found_(found) {}

protected:
    HRESULT Select(IwbProjectItem& item, IwbhwResourceItemUI& resourceItem) override;

private:
    qv::com::ComPtr<IwbProjectItem>& found_;
};

// Collects the names of every resource item into the caller's NAMES; it never selects, so the
// walk visits them all.
class ExistingNamesBuilder : public wbhw::ResourceItemUISelector {
public:
    explicit ExistingNamesBuilder(wbhw::NameSet& names) : names_(names) {}

protected:
    HRESULT Select(IwbProjectItem& item, IwbhwResourceItemUI& resourceItem) override;

private:
    wbhw::NameSet& names_;
};
