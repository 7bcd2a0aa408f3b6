// The path functions of the host runtime. Paths are this host's own '/' paths; the text form
// and the file-system form are the same text. Output slots hold null (a new object is made) or
// a live object of the right kind (it is reused); anything else is refused with kWBArgErr.
#include "runtime/HostFolder.h"
#include "runtime/HostStrings.h"
#include "runtime/PathTable.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <filesystem>
#include <new>
#include <system_error>

namespace {

using wbhost::runtime::PathTable;
namespace fs = std::filesystem;

// The file-system path behind a live, non-empty PATH; false otherwise.
bool FileSystemPath(WBPath path, fs::path* out) {
    if (!PathTable::Instance().IsLive(path) || path->text.empty()) {
        return false;
    }
    *out = fs::path(path->text);
    return true;
}

// A host error code for a failed file operation.
WBErr FileError(const std::error_code& error) {
    if (error == std::errc::no_such_file_or_directory) {
        return kWBFileNotFound;
    }
    if (error == std::errc::file_exists || error == std::errc::directory_not_empty) {
        return kWBFileExists;
    }
    if (error == std::errc::permission_denied || error == std::errc::operation_not_permitted) {
        return kWBAccessDenied;
    }
    if (error == std::errc::no_space_on_device) {
        return kWBDiskFull;
    }
    return kWBIOErr;
}

// Checks FROM and TO of a copy or move: FROM exists, TO does not.
WBErr CheckTransfer(WBPath from, WBPath to, fs::path* source, fs::path* target) {
    if (!FileSystemPath(from, source) || !FileSystemPath(to, target)) {
        return kWBArgErr;
    }
    std::error_code error;
    if (!fs::exists(fs::symlink_status(*source, error))) {
        return kWBFileNotFound;
    }
    if (fs::exists(fs::symlink_status(*target, error))) {
        return kWBFileExists;
    }
    return kWBNoErr;
}

} // namespace

WBPath FEmptyPath(WBPath reuse) {
    if (reuse == nullptr) {
        return PathTable::Instance().Create("");
    }
    return PathTable::Instance().Store(&reuse, "") == kWBNoErr ? reuse : nullptr;
}

WBErr FTextToPath(const char* text, int32_t length, WBPath* path) {
    if (length < 0 || (text == nullptr && length > 0)) {
        return kWBArgErr;
    }
    const std::string_view view(text ? text : "", static_cast<size_t>(length));
    // A zero byte would cut the path short wherever it is used as C text.
    if (view.find('\0') != std::string_view::npos) {
        return kWBArgErr;
    }
    return PathTable::Instance().Store(path, view);
}

WBErr FFileSystemCStrToPath(const char* text, WBPath* path) {
    if (text == nullptr) {
        return kWBArgErr;
    }
    return PathTable::Instance().Store(path, text);
}

WBErr FPathToPath(WBPath source, WBPath* copy) {
    if (!PathTable::Instance().IsLive(source)) {
        return kWBArgErr;
    }
    if (copy != nullptr && *copy == source) {
        return kWBNoErr;
    }
    try {
        const std::string text = source->text;
        return PathTable::Instance().Store(copy, text);
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

WBErr FDestroyPath(WBPath* path) {
    if (path == nullptr) {
        return kWBArgErr;
    }
    if (*path == nullptr) {
        return kWBNoErr;
    }
    if (!PathTable::Instance().Destroy(*path)) {
        return kWBArgErr;
    }
    *path = nullptr;
    return kWBNoErr;
}

WBErr FDirName(WBPath path, WBPath* directory) {
    if (!PathTable::Instance().IsLive(path)) {
        return kWBArgErr;
    }
    try {
        const std::string text = path->text;
        // The empty path and the root have no directory above them.
        if (text.empty() || text == "/") {
            return kWBArgErr;
        }
        const size_t slash = text.rfind('/');
        const std::string parent = slash == std::string::npos ? std::string()
                                   : slash == 0               ? std::string("/")
                                                              : text.substr(0, slash);
        return PathTable::Instance().Store(directory, parent);
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

WBErr FNamePtr(WBPath path, const char** name) {
    if (name == nullptr || !PathTable::Instance().IsLive(path)) {
        return kWBArgErr;
    }
    const std::string& text = path->text;
    const size_t slash = text.rfind('/');
    *name = text.c_str() + (slash == std::string::npos ? 0 : slash + 1);
    return kWBNoErr;
}

int32_t FExists(WBPath path) {
    fs::path target;
    if (!FileSystemPath(path, &target)) {
        return kWBPathAbsent;
    }
    std::error_code error;
    const fs::file_status status = fs::status(target, error);
    if (error || !fs::exists(status)) {
        return kWBPathAbsent;
    }
    return fs::is_directory(status) ? kWBPathIsDirectory : kWBPathIsFile;
}

int32_t FIsAPathOfType(WBPath path, int32_t type) {
    if (!PathTable::Instance().IsLive(path)) {
        return 0;
    }
    const std::string& text = path->text;
    switch (type) {
    case kWBAbsolutePath:
        return !text.empty() && text.front() == '/' ? 1 : 0;
    case kWBRelativePath:
        return !text.empty() && text.front() != '/' ? 1 : 0;
    case kWBEmptyPath:
        return text.empty() ? 1 : 0;
    default:
        return 0;
    }
}

int32_t FileInArchive(WBPath) {
    return 0; // this host keeps no programs in archives
}

int32_t FileInWBLibp(WBPath) {
    return 0; // nor in program libraries
}

WBErr FPathToDSString(WBPath path, WBHandle* text) {
    if (!PathTable::Instance().IsLive(path)) {
        return kWBArgErr;
    }
    try {
        const std::string copy = path->text;
        return wbhost::runtime::StoreHostString(text, copy);
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

WBErr FPathToFileSystemDSString(WBPath path, WBHandle* text) {
    return FPathToDSString(path, text);
}

WBErr FGetSpecialDir(int32_t kind, WBPath* directory) {
    if (kind != kWBHostFolder) {
        return kWBArgErr;
    }
    const std::string folder = wbhost::runtime::HostFolder();
    if (folder.empty()) {
        return kWBFileNotFound;
    }
    try {
        return PathTable::Instance().Store(directory, folder);
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

WBErr FCopy(WBPath from, WBPath to) {
    fs::path source, target;
    if (const WBErr err = CheckTransfer(from, to, &source, &target); err != kWBNoErr) {
        return err;
    }
    std::error_code error;
    fs::copy(source, target, fs::copy_options::recursive | fs::copy_options::copy_symlinks, error);
    return error ? FileError(error) : kWBNoErr;
}

WBErr FMove(WBPath from, WBPath to) {
    fs::path source, target;
    if (const WBErr err = CheckTransfer(from, to, &source, &target); err != kWBNoErr) {
        return err;
    }
    std::error_code error;
    fs::rename(source, target, error);
    return error ? FileError(error) : kWBNoErr;
}

WBErr FRemove(WBPath path) {
    fs::path target;
    if (!FileSystemPath(path, &target)) {
        return kWBArgErr;
    }
    std::error_code error;
    // One file or one empty folder: a host program never wipes a whole tree by accident.
    if (!fs::remove(target, error)) {
        return error ? FileError(error) : kWBFileNotFound;
    }
    return kWBNoErr;
}
