// The run-time engine search. The order is the one installers and users have always relied on: a
// profile next to the executable beats everything, the executable's own directory comes next, and
// only then the installed versions.
#include "host/binding/EngineSearch.h"

#include "host/binding/IniFile.h"

#include <cstdlib>
#include <filesystem>
#include <system_error>

namespace qv::host::rt {

namespace {

namespace fs = std::filesystem;

constexpr const char kMachineHive[] = "HKEY_LOCAL_MACHINE\\";
constexpr const char kWindowsCurrentVersionKey[] = "Software\\Microsoft\\Windows\\CurrentVersion";
constexpr size_t kMaxExpandedLength = 259;

std::string Join(const std::string& directory, const std::string& name) {
    if (directory.empty() || directory.back() == '/') {
        return directory + name;
    }
    return directory + "/" + name;
}

bool HoldsLibrary(const std::string& file) {
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    return !error && fs::exists(status) && !fs::is_directory(status);
}

bool StartsWith(const std::string& text, std::string_view prefix) {
    return text.compare(0, prefix.size(), prefix) == 0;
}

// Tries one candidate directory; fills `result` when it holds the library.
bool Try(const std::string& directory, const std::string& library, EngineSearchResult& result) {
    const std::string candidate = Join(directory, library);
    if (!HoldsLibrary(candidate)) {
        return false;
    }
    result = {true, candidate};
    return true;
}

bool TryDirectoryWalk(const std::string& library, const EngineSearchRecord& record,
                      const std::string& executableDirectory, EngineSearchResult& result) {
    if (record.directoryWalkName.empty() || executableDirectory.empty()) {
        return false;
    }
    for (fs::path dir = executableDirectory;; dir = dir.parent_path()) {
        if (Try(Join(dir.string(), record.directoryWalkName), library, result)) {
            return true;
        }
        if (dir == dir.parent_path() || dir.parent_path().empty()) {
            return false;
        }
    }
}

bool TryInstalledVersions(const std::string& library, const EngineSearchRecord& record,
                          const EngineSearchEnvironment& env, EngineSearchResult& result) {
    const std::string& version = record.versionDirectory;
    if (const auto path = env.RegistryValue(record.registryKey + "\\" + version, "Path")) {
        if (!path->empty() && Try(*path, library, result)) {
            return true;
        }
    }
    const std::string expanded = env.Expand(record.expandedPath);
    if (!expanded.empty() && expanded.size() <= kMaxExpandedLength && expanded.front() != '%' &&
        Try(Join(expanded, version), library, result)) {
        return true;
    }
    if (const auto programFiles = env.RegistryValue(kWindowsCurrentVersionKey, "ProgramFilesDir")) {
        if (!programFiles->empty() &&
            Try(Join(Join(*programFiles, record.pathUnderProgramFiles), version), library,
                result)) {
            return true;
        }
    }
    return !record.fixedPath.empty() && Try(Join(record.fixedPath, version), library, result);
}

} // namespace

EngineSearchRecord EngineSearchRecord::ForKind(int kind, const std::string& version) {
    EngineSearchRecord record;
    record.versionDirectory = version;
    record.expandedPath = "%ProgramFiles%/Quorvane/Shared/Wirebench Run-Time";
    record.fixedPath = "/opt/Quorvane/Shared/Wirebench Run-Time";
    record.pathUnderProgramFiles = "Quorvane/Shared/Wirebench Run-Time";
    record.registryKey = kind == 1 ? "SOFTWARE\\Quorvane\\Wirebench FF Run-Time"
                                   : "SOFTWARE\\Quorvane\\Wirebench Run-Time";
    record.profileSection = kind == 1 ? "WBFFRT" : "WBRT";
    return record;
}

EngineSearchEnvironment EngineSearchEnvironment::FromProcess() {
    EngineSearchEnvironment env;
    std::error_code error;
    env.executablePath = fs::read_symlink("/proc/self/exe", error).string();
    if (const char* registry = std::getenv("WB_REGISTRY_FILE")) {
        env.registryFile = registry;
    }
    env.variable = [](const std::string& name) -> std::optional<std::string> {
        const char* value = std::getenv(name.c_str());
        return value != nullptr ? std::optional<std::string>(value) : std::nullopt;
    };
    return env;
}

std::string EngineSearchEnvironment::ProfileFile() const {
    if (executablePath.empty()) {
        return {};
    }
    constexpr std::string_view exe = ".exe";
    if (executablePath.size() >= exe.size() &&
        executablePath.compare(executablePath.size() - exe.size(), exe.size(), exe) == 0) {
        return executablePath.substr(0, executablePath.size() - exe.size()) + ".ini";
    }
    return executablePath + ".ini";
}

std::string EngineSearchEnvironment::Expand(const std::string& text) const {
    std::string out;
    size_t pos = 0;
    while (pos < text.size()) {
        const size_t open = text.find('%', pos);
        const size_t close = open == std::string::npos ? open : text.find('%', open + 1);
        if (close == std::string::npos) {
            out.append(text, pos, std::string::npos);
            break;
        }
        out.append(text, pos, open - pos);
        const std::string name = text.substr(open + 1, close - open - 1);
        const auto value = name.empty() || !variable ? std::nullopt : variable(name);
        if (value) {
            out += *value;
            pos = close + 1;
        } else {
            // An unset name stays as written; its closing "%" may open the next reference.
            out.append(text, open, close - open);
            pos = close;
        }
    }
    return out;
}

std::optional<std::string> EngineSearchEnvironment::RegistryValue(const std::string& key,
                                                                  const std::string& value) const {
    if (registryFile.empty()) {
        return std::nullopt;
    }
    auto text = ReadIniValue(registryFile, kMachineHive + key, value);
    if (!text) {
        return std::nullopt;
    }
    if (StartsWith(*text, "REG_EXPAND_SZ:")) {
        return Expand(text->substr(14));
    }
    if (StartsWith(*text, "REG_SZ:")) {
        return text->substr(7);
    }
    return text;
}

EngineSearchResult FindRunTimeEngine(const std::string& library, const EngineSearchRecord& record,
                                     const EngineSearchEnvironment& env) {
    EngineSearchResult result{false, library};
    const std::string executableDirectory = fs::path(env.executablePath).parent_path().string();
    if (TryDirectoryWalk(library, record, executableDirectory, result)) {
        return result;
    }
    if (!record.profileSection.empty()) {
        const auto dllPath = ReadIniValue(env.ProfileFile(), record.profileSection, "DLLPath");
        if (dllPath && !dllPath->empty() && Try(*dllPath, library, result)) {
            return result;
        }
    }
    if (!executableDirectory.empty() && Try(executableDirectory, library, result)) {
        return result;
    }
    if (record.versionDirectory.empty()) {
        return result;
    }
    TryInstalledVersions(library, record, env, result);
    return result;
}

} // namespace qv::host::rt
