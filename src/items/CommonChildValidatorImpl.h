// The common child validation of hardware items: whether an item of a type may be placed below
// a parent, walking up through folders to the parent that decides, and whether a target may be
// placed below a host whose FPGA it supports.
#pragma once

#include "framework/IwbChildValidator.h"
#include "host/contracts/IwbProjectItem.h"

namespace wbhw {

// Item types the common answer knows.
namespace item_type {
inline constexpr GUID kAlwaysAllows = qv::com::ParseGuid("D60740D6-F254-4BBC-9975-8858F35B810E");
inline constexpr GUID kFolder = qv::com::ParseGuid("D60740D6-F254-4BBC-5675-8858F35B820E");
inline constexpr GUID kPassThrough = qv::com::ParseGuid("AB0740D6-F254-4BBC-5675-8858F35B820E");
inline constexpr GUID kTarget = qv::com::ParseGuid("B824FFC7-1B3E-4521-A49E-679E3411987D");
inline constexpr GUID kRestricted = qv::com::ParseGuid("CEFE1B10-1732-4678-A70A-299293455410");
inline constexpr GUID kRestrictedChild = qv::com::ParseGuid("4F9A00C0-4AAC-4924-86DE-18B4D950F9D9");
} // namespace item_type

class CommonChildValidatorImpl : public IwbChildValidator {
public:
    HRESULT ValidateChild(IwbProjectItem* parent, const GUID& type) override;
    // Nothing to check in the common part: 0.
    HRESULT CheckItem(IwbProjectItem*) override { return S_OK; }
    HRESULT ValidateChildInScope(IwbProjectItem* parent, const GUID& type) override;
    HRESULT RecheckItem(IwbProjectItem* item) override { return CheckItem(item); }
    HRESULT Reserved() override { return S_OK; }
    HRESULT CheckPlacement(IwbProjectItem* parent, IUnknown* candidate, int32_t* allowed) override;

protected:
    CommonChildValidatorImpl() = default;
    virtual ~CommonChildValidatorImpl() = default;
};

} // namespace wbhw
