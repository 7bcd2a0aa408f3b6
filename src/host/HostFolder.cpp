// The host's own folder, asked of the host runtime.
#include "host/HostFolder.h"

#include "host/HostString.h"
#include "host/binding/HostFunctions.h"

namespace qv::host {

std::optional<std::string> AskHostFolder() noexcept {
    // Bound without the fatal path: a process without a host runtime (a tool, a test) simply
    // has no host folder to tell.
    auto* const special = rt::FGetSpecialDir.TryAddress();
    auto* const toText = rt::FPathToFileSystemDSString.TryAddress();
    auto* const destroy = rt::FDestroyPath.TryAddress();
    auto* const dispose = rt::DSDisposeHandle.TryAddress();
    if (special == nullptr || toText == nullptr || destroy == nullptr || dispose == nullptr)
        return std::nullopt;
    WBPath folder = nullptr;
    if (special(kWBHostFolder, &folder) != kWBNoErr || folder == nullptr) {
        if (folder != nullptr)
            destroy(&folder);
        return std::nullopt;
    }
    WBHandle text = nullptr;
    const WBErr converted = toText(folder, &text);
    destroy(&folder);
    // A plain string rather than an optional<string> carried across the try block: gcc 12
    // reports a false "may be used uninitialized" for the optional's move at -O2.
    std::string answer;
    try {
        if (converted == kWBNoErr && text != nullptr)
            answer = ReadHostString(text);
    } catch (...) {
        answer.clear();
    }
    if (text != nullptr)
        dispose(text);
    if (answer.empty())
        return std::nullopt;
    return answer;
}

} // namespace qv::host
