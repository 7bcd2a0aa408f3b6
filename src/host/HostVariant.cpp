// Host variant attributes.
#include "host/HostVariant.h"

#include "host/HostString.h"
#include "host/binding/HostFunctions.h"

#include <algorithm>
#include <cstring>

namespace qv::host {

PascalName::PascalName(std::string_view name) {
    const size_t length = std::min<size_t>(name.size(), bytes_.size() - 1);
    bytes_[0] = static_cast<unsigned char>(length);
    std::memcpy(bytes_.data() + 1, name.data(), length);
}

OwnedVariant::~OwnedVariant() {
    if (variant_ != nullptr)
        rt::WbVariantDestroy(variant_);
}

std::optional<std::string> VariantStringAttribute(WBVariant variant, std::string_view name) {
    WBHandle text = nullptr;
    const WBErr error = rt::WbVariantPStrGetStringAttr(variant, PascalName(name).get(), &text);
    std::optional<std::string> answer;
    if (error == kWBNoErr && text != nullptr)
        answer = ReadHostString(text);
    if (text != nullptr)
        rt::DSDisposeHandle(text);
    return answer;
}

bool VariantAttribute(WBVariant variant, std::string_view name, OwnedVariant& held) {
    return rt::WbVariantPStrGetWbVariantAttr(variant, PascalName(name).get(), held.Put()) ==
               kWBNoErr &&
           held.get() != nullptr;
}

} // namespace qv::host
