// A host string array built as a host program builds the lists it hands the module, and given
// back to the host, elements and all, when it goes.
#pragma once

#include "host/binding/runtime_api.h"

#include <string>
#include <vector>

namespace wbhost::cli {

class HostStringList {
public:
    // An array of one host string per text of TEXTS (bytes in the host's code page); Handle()
    // is null when the host is out of memory.
    explicit HostStringList(const std::vector<std::string>& texts);
    ~HostStringList();
    HostStringList(const HostStringList&) = delete;
    HostStringList& operator=(const HostStringList&) = delete;

    // The array's handle; exports take arrays by reference, so this is the handle itself.
    WBHandle& Handle() noexcept { return handle_; }

private:
    // Gives the elements and the array back to the host.
    void Release() noexcept;

    WBHandle handle_ = nullptr;
};

} // namespace wbhost::cli
