// The Tangent I/O item: a named use of one FPGA I/O resource of the item's target. It is
// constructed empty (resource status 1, missing, and no attribute bag) and receives its bag by
// creation or when a project is opened.
#pragma once

#include "framework/CqxProjectItemUI.h"

#include <memory>

class TIOAttrBag;

class TIOInstanceItemUI : public CqxProjectItemUI {
public:
    // 0 bound, 1 missing, 2 held by another item.
    int32_t resourceStatus() const { return resourceStatus_; }
    // The item's attribute bag; null until the item is loaded.
    const TIOAttrBag* attributeBag() const { return attrBag_.get(); }

protected:
    TIOInstanceItemUI();
    ~TIOInstanceItemUI() override;

private:
    std::unique_ptr<TIOAttrBag> attrBag_;
    int32_t resourceStatus_ = 1;
};
