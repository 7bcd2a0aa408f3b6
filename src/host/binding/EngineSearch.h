// Finding an installed run-time engine library on disk: the executable's profile file, its own
// directory, the registry file, the Program Files locations and the version directory.
#pragma once

#include <functional>
#include <optional>
#include <string>

namespace qv::host::rt {

// Library file names of the two run-time engine kinds.
inline constexpr const char kRunTimeEngineLibrary[] = "libwbrt.so";
inline constexpr const char kFFRunTimeEngineLibrary[] = "libwbffrt.so";

// Where one kind of engine is looked for. Empty fields are "not given".
struct EngineSearchRecord {
    std::string versionDirectory;      // the version name, a directory under the install roots
    std::string expandedPath;          // an install root with %VAR% references
    std::string fixedPath;             // an install root used as it stands
    std::string pathUnderProgramFiles; // an install root below the Program Files directory
    std::string registryKey;           // key path (below HKEY_LOCAL_MACHINE) holding "Path" values
    std::string profileSection;        // section of the executable's profile holding "DLLPath"
    std::string directoryWalkName;     // a folder looked for from the executable's folder upwards

    // The record for kind 0 (run-time engine) or 1 (FF run-time engine) and a version name.
    static EngineSearchRecord ForKind(int kind, const std::string& version);
};

// What the search reads of the process; tests substitute their own.
struct EngineSearchEnvironment {
    std::string executablePath; // the main executable's path
    std::string registryFile;   // the INI file standing in for the registry; empty: none
    std::function<std::optional<std::string>(const std::string&)> variable; // environment lookup

    // The running process: /proc/self/exe, WB_REGISTRY_FILE and getenv.
    static EngineSearchEnvironment FromProcess();

    // The profile file of the executable: a trailing ".exe" replaced by ".ini", else ".ini"
    // appended. Empty when the executable path is empty.
    std::string ProfileFile() const;
    // `text` with every %NAME% whose variable is set replaced by its value; other text, and
    // references to unset variables, are kept as written.
    std::string Expand(const std::string& text) const;
    // A registry value: `value` in the section named "HKEY_LOCAL_MACHINE\<key>" of the registry
    // file. A value written "REG_EXPAND_SZ:text" is an expandable string and is expanded; one
    // written "REG_SZ:text" or plain text is used as it stands. nullopt when absent.
    std::optional<std::string> RegistryValue(const std::string& key,
                                             const std::string& value) const;
};

// The outcome of a search: the library's full path when found, else the bare library name.
struct EngineSearchResult {
    bool found = false;
    std::string path;
};

// Searches for `library` as `record` says, in this order: the directory walk (when named), the
// profile's "DLLPath", the executable's directory, then (only with a version directory) the
// registry "Path", the expanded path, the Program Files directory from the registry and the fixed
// path, each joined with the version directory. A candidate directory counts when it holds
// `library` as something other than a directory.
EngineSearchResult FindRunTimeEngine(const std::string& library, const EngineSearchRecord& record,
                                     const EngineSearchEnvironment& environment);

} // namespace qv::host::rt
