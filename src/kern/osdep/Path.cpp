// Module and executable paths through the dynamic linker and /proc; file search with fnmatch.
#include "kern/osdep/Path.h"

#include "kern/Path.h"
#include "kern/osdep/DynamicModule.h"
#include "kern/osdep/OSException.h"

#include <algorithm>
#include <cerrno>
#include <dlfcn.h>
#include <filesystem>
#include <fnmatch.h>
#include <link.h>
#include <system_error>
#include <unistd.h>

namespace qv::kern::osdep {
namespace {

constexpr uint32_t kModuleNotFound = 126;

// The directory part of an absolute file path, normalised, with a trailing "/".
std::string DirectoryOf(const std::string& file) {
    std::error_code ec;
    std::filesystem::path full = std::filesystem::absolute(file, ec);
    if (ec)
        full = file;
    return AddTrailingSeparator(full.lexically_normal().parent_path().string());
}

// The module's file path; the main executable has no name in the linker's list.
std::string ModuleFile(const link_map* module) {
    if (module == nullptr || module->l_name == nullptr || module->l_name[0] == '\0')
        return GetExePath();
    return module->l_name;
}

// A Windows search pattern as an fnmatch pattern: only "*" and "?" are wildcards.
std::string ToFnmatchPattern(std::string_view name) {
    if (name == "*.*")
        return "*";
    std::string out;
    for (const char c : name) {
        if (c == '[' || c == ']' || c == '\\')
            out += '\\';
        out += c;
    }
    return out;
}

} // namespace

std::string GetExePath() {
    std::error_code ec;
    const std::filesystem::path exe = std::filesystem::read_symlink("/proc/self/exe", ec);
    if (ec) {
        errno = ec.value();
        QV_THROW(WinError());
    }
    return exe.string();
}

std::string GetModuleDirectory(void* moduleHandle) {
    if (moduleHandle == nullptr)
        return DirectoryOf(GetExePath());
    // The handle is only looked into once the linker still lists it.
    if (!IsModuleLoaded(moduleHandle))
        QV_THROW(WinError(kModuleNotFound));
    link_map* module = nullptr;
    if (dlinfo(moduleHandle, RTLD_DI_LINKMAP, &module) != 0)
        QV_THROW(WinError(kModuleNotFound));
    return DirectoryOf(ModuleFile(module));
}

std::string GetModuleDirectoryOf(const void* address) {
    Dl_info info{};
    link_map* module = nullptr;
    if (address == nullptr ||
        dladdr1(address, &info, reinterpret_cast<void**>(&module), RTLD_DL_LINKMAP) == 0)
        QV_THROW(WinError(kModuleNotFound));
    return DirectoryOf(ModuleFile(module));
}

std::vector<std::string> FindFiles(std::string_view pattern) {
    std::vector<std::string> found;
    const size_t slash = pattern.rfind('/');
    const std::string_view dirPart =
        slash == std::string_view::npos ? std::string_view() : pattern.substr(0, slash + 1);
    const std::string_view namePart =
        slash == std::string_view::npos ? pattern : pattern.substr(slash + 1);
    if (namePart.empty())
        return found;
    const std::string match = ToFnmatchPattern(namePart);
    std::error_code ec;
    std::filesystem::directory_iterator it(dirPart.empty() ? "." : std::string(dirPart), ec);
    if (ec == std::errc::no_such_file_or_directory || ec == std::errc::not_a_directory)
        return found;
    for (; !ec && it != std::filesystem::directory_iterator(); it.increment(ec)) {
        const std::string name = it->path().filename().string();
        if (fnmatch(match.c_str(), name.c_str(), 0) == 0)
            found.push_back(std::string(dirPart) + name);
    }
    if (ec) {
        errno = ec.value();
        QV_THROW(WinError());
    }
    std::sort(found.begin(), found.end());
    return found;
}

} // namespace qv::kern::osdep
