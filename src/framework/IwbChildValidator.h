// Asked by the host whether an item of a given type may be placed under a given parent. Answers
// are 0 (allowed) and 1 (refused) unless a failure status.
#pragma once

#include "com/IUnknown.h"

struct IwbProjectItem;

struct IwbChildValidator : IUnknown {
    static constexpr IID iid = qv::com::ParseGuid("C6D9E2A4-0B7F-4A13-9E58-3F1A7B2C8D60");

    // Whether an item of TYPE may go under PARENT (the common answer, walking up through
    // folders to the first parent that decides).
    virtual HRESULT ValidateChild(IwbProjectItem* parent, const GUID& type) = 0;
    // The validator's own check of ITEM (a place an item would go); 0 unless replaced.
    virtual HRESULT CheckItem(IwbProjectItem* item) = 0;
    // The common answer, only when PARENT and its own parent are both within a sub-scope that
    // accepts children; 1 otherwise.
    virtual HRESULT ValidateChildInScope(IwbProjectItem* parent, const GUID& type) = 0;
    // Answers what CheckItem answers for ITEM.
    virtual HRESULT RecheckItem(IwbProjectItem* item) = 0;
    // Nothing to check: 0.
    virtual HRESULT Reserved() = 0;
    // Whether CANDIDATE (an item's object) may be placed under PARENT: 1 allowed, with ALLOWED
    // (optional) left as it was; E_FAIL refused, with ALLOWED cleared.
    virtual HRESULT CheckPlacement(IwbProjectItem* parent, IUnknown* candidate,
                                   int32_t* allowed) = 0;
};
