// Host string arrays. Element handles are read and written with memcpy: the block is the host's,
// and nothing guarantees it suits our alignment.
#include "host/HostStringArray.h"

#include "host/binding/HostFunctions.h"
#include "host/errors/ThrowIfWBError.h"

#include <cstring>
#include <limits>

namespace qv::host {

namespace {

constexpr size_t kHeaderSize = 8;
constexpr size_t kElementSize = 8;

char* Block(HostStringArray array) {
    return static_cast<char*>(*array);
}

int32_t StoredCount(HostStringArray array) {
    int32_t count = 0;
    std::memcpy(&count, Block(array), sizeof count);
    return count;
}

void StoreCount(HostStringArray array, int32_t count) {
    std::memcpy(Block(array), &count, sizeof count);
}

HostString LoadElement(HostStringArray array, int32_t index) {
    HostString element = nullptr;
    std::memcpy(&element, Block(array) + kHeaderSize + kElementSize * static_cast<size_t>(index),
                sizeof element);
    return element;
}

void StoreElement(HostStringArray array, int32_t index, HostString element) {
    std::memcpy(Block(array) + kHeaderSize + kElementSize * static_cast<size_t>(index), &element,
                sizeof element);
}

size_t BlockSize(int32_t count) {
    return kHeaderSize + kElementSize * static_cast<size_t>(count);
}

void ReleaseElements(HostStringArray array, int32_t from, int32_t to) {
    for (int32_t i = from; i < to; ++i) {
        // A null element holds no string: there is nothing to hand back to the host.
        if (HostString element = LoadElement(array, i)) {
            errors::ThrowIfWBError(rt::DSDisposeHandle(element));
            StoreElement(array, i, nullptr);
        }
    }
}

} // namespace

int32_t HostStringArrayCount(HostStringArray array) {
    if (array == nullptr || *array == nullptr) {
        return 0;
    }
    const int32_t count = StoredCount(array);
    return count > 0 ? count : 0;
}

HostString HostStringArrayElement(HostStringArray array, int32_t index) {
    errors::CheckArrayIndex(index, HostStringArrayCount(array));
    return LoadElement(array, index);
}

std::string ReadHostStringArrayElement(HostStringArray array, int32_t index) {
    return ReadHostString(HostStringArrayElement(array, index));
}

void WriteHostStringArrayElement(HostStringArray array, int32_t index, std::string_view bytes) {
    HostString element = HostStringArrayElement(array, index);
    const bool wasNull = element == nullptr;
    WriteHostString(element, bytes);
    if (wasNull) {
        StoreElement(array, index, element);
    }
}

std::vector<std::string> ReadHostStringArray(HostStringArray array) {
    const int32_t count = HostStringArrayCount(array);
    std::vector<std::string> texts;
    texts.reserve(static_cast<size_t>(count));
    for (int32_t i = 0; i < count; ++i) {
        texts.push_back(ReadHostString(LoadElement(array, i)));
    }
    return texts;
}

void ResizeHostStringArray(HostStringArray& array, int32_t newSize) {
    errors::CheckNewArraySize(newSize);
    const bool absent = array == nullptr || *array == nullptr;
    const int32_t current = absent ? -1 : StoredCount(array);
    if (current == newSize) {
        return;
    }
    if (current > newSize) {
        ReleaseElements(array, newSize, current);
    }
    if (array == nullptr) {
        array = rt::DSNewHClr(BlockSize(newSize));
        errors::ThrowIfNoHandle(array);
    } else {
        errors::ThrowIfWBError(rt::DSSetHSzClr(array, BlockSize(newSize)));
    }
    // An absent array, or one whose stored count is negative, has no elements to keep. The count
    // follows every element added, so a failure part way leaves a consistent, shorter array.
    const int32_t kept = current < 0 ? 0 : (current < newSize ? current : newSize);
    StoreCount(array, kept);
    for (int32_t i = kept; i < newSize; ++i) {
        HostString element = nullptr;
        WriteHostString(element, {});
        StoreElement(array, i, element);
        StoreCount(array, i + 1);
    }
}

void WriteHostStringArray(HostStringArray& array, const std::vector<std::string>& texts) {
    if (texts.size() > static_cast<size_t>(std::numeric_limits<int32_t>::max())) {
        errors::CheckNewArraySize(-1);
    }
    ResizeHostStringArray(array, static_cast<int32_t>(texts.size()));
    for (size_t i = 0; i < texts.size(); ++i) {
        WriteHostStringArrayElement(array, static_cast<int32_t>(i), texts[i]);
    }
}

} // namespace qv::host
