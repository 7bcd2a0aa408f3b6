// Texts on host variants as a host sets and reads them: attribute names as Pascal strings, values
// in host strings the caller makes and gives back.
#pragma once

#include "runtime/HostStrings.h"
#include "runtime/Runtime.h"

#include <gtest/gtest.h>
#include <string>
#include <string_view>

namespace varianttext {

// A Pascal-string attribute name.
struct Name {
    explicit Name(std::string_view text) : bytes(1, static_cast<unsigned char>(text.size())) {
        bytes.insert(bytes.end(), text.begin(), text.end());
    }
    const unsigned char* get() const { return bytes.data(); }
    std::basic_string<unsigned char> bytes;
};

inline WBErr SetText(WBVariant variant, std::string_view name, std::string_view text) {
    WBHandle value = nullptr;
    EXPECT_EQ(wbhost::runtime::StoreHostString(&value, text), kWBNoErr);
    const WBErr err = WbVariantPStrSetStringAttr(variant, Name(name).get(), value);
    DSDisposeHandle(value);
    return err;
}

inline std::string GetText(WBVariant variant, std::string_view name, WBErr expected = kWBNoErr) {
    WBHandle value = nullptr;
    EXPECT_EQ(WbVariantPStrGetStringAttr(variant, Name(name).get(), &value), expected);
    std::string text = wbhost::runtime::ReadHostString(value).value_or("<none>");
    DSDisposeHandle(value);
    return text;
}

} // namespace varianttext
