// The host's own folder.
#include "runtime/HostFolder.h"

#include <filesystem>
#include <mutex>

namespace wbhost::runtime {
namespace {

namespace fs = std::filesystem;

struct Setting {
    std::mutex lock;
    std::string folder;
};

Setting& TheSetting() {
    static Setting setting;
    return setting;
}

} // namespace

std::string HostFolder() {
    Setting& setting = TheSetting();
    {
        const std::lock_guard hold(setting.lock);
        if (!setting.folder.empty())
            return setting.folder;
    }
    std::error_code error;
    const fs::path executable = fs::read_symlink("/proc/self/exe", error);
    return error ? std::string() : executable.parent_path().string();
}

void SetHostFolder(const std::string& folder) {
    std::error_code error;
    const fs::path absolute = fs::absolute(folder, error);
    Setting& setting = TheSetting();
    const std::lock_guard hold(setting.lock);
    setting.folder = error ? folder : absolute.lexically_normal().string();
    // "dir/" normalises to "dir/"; the folder is kept without its trailing separator.
    while (setting.folder.size() > 1 && setting.folder.back() == '/')
        setting.folder.pop_back();
}

} // namespace wbhost::runtime
