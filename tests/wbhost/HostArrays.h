// Host arrays built as a host builds them for a call: the block sized with NumericArrayResize, the
// count stored in front, and for string arrays one host string of its own per element.
#pragma once

#include "cli/HostText.h"
#include "runtime/Runtime.h"

#include <cstdint>
#include <cstring>
#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace hostarrays {

// A host array handle that gives back its block, and for a string array each element's string.
class HostArray {
public:
    HostArray() = default;
    ~HostArray() { Release(); }
    HostArray(const HostArray&) = delete;
    HostArray& operator=(const HostArray&) = delete;

    // A string array of TEXTS (bytes in the host's code page).
    static void Strings(HostArray& array, const std::vector<std::string>& texts) {
        array.Release();
        array.strings_ = true;
        ASSERT_EQ(NumericArrayResize(kWBTypeU64, 1, &array.handle_, texts.size()), kWBNoErr);
        array.SetCount(static_cast<int32_t>(texts.size()));
        for (size_t i = 0; i < texts.size(); ++i) {
            WBHandle element = wbhost::cli::NewHostString(texts[i]).release();
            std::memcpy(array.Data() + 8 + 8 * i, &element, sizeof element);
        }
    }
    // An array of 32-bit refnums: the count, then the numbers.
    static void Refnums(HostArray& array, const std::vector<WBRefNum>& refnums) {
        array.Release();
        array.strings_ = false;
        ASSERT_EQ(NumericArrayResize(kWBTypeU32, 1, &array.handle_, refnums.size()), kWBNoErr);
        array.SetCount(static_cast<int32_t>(refnums.size()));
        if (!refnums.empty())
            std::memcpy(array.Data() + 4, refnums.data(), refnums.size() * sizeof(WBRefNum));
    }

    // The handle, by reference as host arrays are passed.
    WBHandle* Ref() { return &handle_; }
    // The texts of a string array as they are now (a null element reads as "<null>").
    std::vector<std::string> Texts() const {
        std::vector<std::string> texts;
        if (handle_ == nullptr)
            return texts;
        int32_t count = 0;
        std::memcpy(&count, Data(), sizeof count);
        for (int32_t i = 0; i < count; ++i) {
            WBHandle element = nullptr;
            std::memcpy(&element, Data() + 8 + 8 * i, sizeof element);
            texts.push_back(element ? wbhost::cli::HostStringBytes(element) : "<null>");
        }
        return texts;
    }

private:
    unsigned char* Data() const { return static_cast<unsigned char*>(*handle_); }
    void SetCount(int32_t count) { std::memcpy(Data(), &count, sizeof count); }
    void Release() {
        if (handle_ == nullptr)
            return;
        if (strings_) {
            int32_t count = 0;
            std::memcpy(&count, Data(), sizeof count);
            for (int32_t i = 0; i < count; ++i) {
                WBHandle element = nullptr;
                std::memcpy(&element, Data() + 8 + 8 * i, sizeof element);
                if (element != nullptr)
                    DSDisposeHandle(element);
            }
        }
        DSDisposeHandle(handle_);
        handle_ = nullptr;
    }

    WBHandle handle_ = nullptr;
    bool strings_ = true; // an array an export made is a string array
};

} // namespace hostarrays
