// Host string arrays made by this host.
#include "cli/HostStringList.h"

#include "cli/HostText.h"
#include "runtime/Runtime.h"

#include <cstring>

namespace wbhost::cli {

namespace {
constexpr size_t kHeaderSize = 8;
constexpr size_t kElementSize = 8;

char* Block(WBHandle handle) {
    return static_cast<char*>(*handle);
}
} // namespace

HostStringList::HostStringList(const std::vector<std::string>& texts) {
    handle_ = DSNewHandle(kHeaderSize + kElementSize * texts.size());
    if (handle_ == nullptr)
        return;
    int32_t count = 0;
    std::memcpy(Block(handle_), &count, sizeof count);
    for (const std::string& text : texts) {
        WBHandle element = NewHostString(text).release();
        if (element == nullptr)
            break;
        std::memcpy(Block(handle_) + kHeaderSize + kElementSize * static_cast<size_t>(count),
                    &element, sizeof element);
        ++count;
        std::memcpy(Block(handle_), &count, sizeof count);
    }
    if (static_cast<size_t>(count) != texts.size())
        Release();
}

HostStringList::~HostStringList() {
    Release();
}

void HostStringList::Release() noexcept {
    if (handle_ == nullptr)
        return;
    // The module may have resized the array: its elements are whatever the block holds now.
    int32_t count = 0;
    std::memcpy(&count, Block(handle_), sizeof count);
    for (int32_t i = 0; i < count; ++i) {
        WBHandle element = nullptr;
        std::memcpy(&element, Block(handle_) + kHeaderSize + kElementSize * static_cast<size_t>(i),
                    sizeof element);
        DSDisposeHandle(element);
    }
    DSDisposeHandle(handle_);
    handle_ = nullptr;
}

} // namespace wbhost::cli
