// Filling a name control's list through the host's variant functions.
#include "provider/TIONameList.h"

#include "host/HostVariant.h"
#include "host/binding/HostFunctions.h"
#include "host/contracts/IwbProjectNameProvider.h"
#include "kern/CodePage.h"

#include <cstring>
#include <string>

namespace tio {
namespace {

constexpr size_t kHeader = 8;
constexpr size_t kSlot = 8;
// A name is a host string of at most this many bytes (the block holds the count and them).
constexpr size_t kMaxNameBytes = 255;

} // namespace

NameList::NameList(WBHandle* slot, uint32_t capacity, int32_t* status)
    : capacity_(capacity), status_(status) {
    handle_ = qv::host::rt::DSNewHClr(kHeader + kSlot * static_cast<size_t>(capacity));
    *slot = handle_;
    if (handle_ == nullptr)
        *status_ = kNameControlNoMemory;
}

void NameList::StoreCount() {
    const auto count = static_cast<int32_t>(count_);
    std::memcpy(*handle_, &count, sizeof count);
}

bool NameList::Append(std::u16string_view name, bool placeholder) {
    if (!Usable() || count_ >= capacity_)
        return true;
    const std::string bytes = qv::kern::WideToAnsi(name);
    // A name cut to fit would name another resource, or none: it is left out instead.
    if (bytes.size() > kMaxNameBytes)
        return false;
    WBHandle text = qv::host::rt::DSNewHandle(sizeof(int32_t) + kMaxNameBytes);
    if (text == nullptr) {
        *status_ = kNameControlNoMemory;
        return true;
    }
    const auto length = static_cast<int32_t>(bytes.size());
    std::memcpy(*text, &length, sizeof length);
    std::memcpy(static_cast<char*>(*text) + sizeof length, bytes.data(), bytes.size());
    // The element is the variant slot inside the list's block; the host makes the variant there.
    auto* element =
        reinterpret_cast<WBVariant>(static_cast<char*>(*handle_) + kHeader + kSlot * count_);
    bool taken = qv::host::rt::WbVariantPStrSetStringAttr(element, qv::host::PascalName("n").get(),
                                                          text) == kWBNoErr;
    if (placeholder && taken)
        taken = qv::host::rt::WbVariantPStrSetUI32Attr(element, qv::host::PascalName("f").get(),
                                                       1) == kWBNoErr;
    qv::host::rt::DSDisposeHandle(text);
    if (!taken)
        *status_ = kNameControlNoMemory;
    ++count_;
    StoreCount();
    return true;
}

} // namespace tio
