// Where the fake runtimes were built, and how to read their counters.
#include "FakeRuntimes.h"

namespace hostrt_test {

std::string FakePath(int n) {
    const std::string name = "hostrt_fake" + std::to_string(n);
    return std::string(HOSTRT_FAKE_DIR) + "/" + name + "/lib" + name + ".so";
}

std::string FakeWbrtPath() {
    return std::string(HOSTRT_FAKE_DIR) + "/hostrt_fake_wbrt/libwbrt.so";
}

std::string FakeWbffrtPath() {
    return std::string(HOSTRT_FAKE_DIR) + "/hostrt_fake_wbffrt/libwbffrt.so";
}

FakeCounters CountersOf(void* module) {
    using Read = void(int32_t*);
    auto* read = reinterpret_cast<Read*>(qv::kern::osdep::ModuleExport(module, "FakeCounters"));
    int32_t values[4] = {-1, -1, -1, -1};
    if (read != nullptr) {
        read(values);
    }
    return {values[0], values[1], values[2], values[3]};
}

} // namespace hostrt_test
