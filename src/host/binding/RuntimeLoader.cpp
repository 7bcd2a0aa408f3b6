// Run-time selection. A host process that already is the wanted runtime is preferred to loading a
// second copy of it: two copies of one runtime in a process do not share their state.
#include "host/binding/RuntimeLoader.h"

#include <cstring>
#include <filesystem>
#include <system_error>

namespace qv::host::rt {

namespace {

using kern::osdep::DynamicModule;

constexpr size_t kMaxVersionText = 256;

bool SameRuntimeVersion(void* module, const std::string& version) {
    const auto text = RuntimeVersionOf(module);
    return text && *text == version;
}

DynamicModule LoadInstalledEngine(int kind, const std::string& version,
                                  const std::string& directory,
                                  const EngineSearchEnvironment& env) {
    const std::string library =
        kind == kFFRunTimeEngine ? kFFRunTimeEngineLibrary : kRunTimeEngineLibrary;
    void* const main = kern::osdep::MainModule();
    if (!directory.empty()) {
        DynamicModule loaded((std::filesystem::path(directory) / library).string());
        const auto loadedVersion = loaded ? RuntimeVersionOf(loaded.handle()) : std::nullopt;
        if (loadedVersion && SameRuntimeVersion(main, *loadedVersion)) {
            return DynamicModule::OpenMain();
        }
        return loaded;
    }
    if (!version.empty() && SameRuntimeVersion(main, version)) {
        return DynamicModule::OpenMain();
    }
    const EngineSearchResult found =
        FindRunTimeEngine(library, EngineSearchRecord::ForKind(kind, version), env);
    return found.found ? DynamicModule(found.path) : DynamicModule();
}

} // namespace

std::optional<std::string> RuntimeVersionOf(void* module) {
    const auto* text = static_cast<const char*>(kern::osdep::ModuleExport(module, "gWBRTVersion"));
    if (text == nullptr) {
        return std::nullopt;
    }
    return std::string(text, strnlen(text, kMaxVersionText));
}

DynamicModule LoadRuntime(int kind, const std::string& name, const std::string& directory,
                          const EngineSearchEnvironment& environment) {
    if (kind == kRunTimeEngine || kind == kFFRunTimeEngine) {
        return LoadInstalledEngine(kind, name, directory, environment);
    }
    if (!name.empty()) {
        return DynamicModule(name);
    }
    std::error_code error;
    const auto status = std::filesystem::status(environment.executablePath, error);
    if (error || !std::filesystem::exists(status) || std::filesystem::is_directory(status)) {
        return {};
    }
    return DynamicModule::OpenMain();
}

} // namespace qv::host::rt
