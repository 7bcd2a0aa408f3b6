// Module stamps, liveness and lookups that must not hold modules in memory.
#include "kern/osdep/DynamicModule.h"

#include "FakeRuntimes.h"

#include <cstring>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <vector>

using qv::kern::osdep::DynamicModule;
using qv::kern::osdep::IsModuleLoaded;
using qv::kern::osdep::LoadedModule;
using qv::kern::osdep::MainModule;
using qv::kern::osdep::ModuleStamp;

namespace {

// The first 32 bits of the GNU build-id note, read from the file on disk.
uint32_t BuildIdPrefixOnDisk(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    const std::vector<char> bytes((std::istreambuf_iterator<char>(in)), {});
    // namesz 4, descsz 20 (sha1), type 3 (NT_GNU_BUILD_ID), "GNU\0"
    const char header[] = {4, 0, 0, 0, 20, 0, 0, 0, 3, 0, 0, 0, 'G', 'N', 'U', 0};
    for (size_t i = 0; i + sizeof header + 4 <= bytes.size(); ++i) {
        if (std::memcmp(&bytes[i], header, sizeof header) == 0) {
            uint32_t prefix = 0;
            std::memcpy(&prefix, &bytes[i + sizeof header], sizeof prefix);
            return prefix;
        }
    }
    return 0;
}

TEST(DynamicModule, StampsAreBuildIdPrefixesAndClosedOrFailedModulesKeepNoReference) {
    DynamicModule one(hostrt_test::FakePath(1));
    DynamicModule two(hostrt_test::FakePath(2));
    ASSERT_TRUE(one && two);
    const uint32_t expected = BuildIdPrefixOnDisk(hostrt_test::FakePath(1));
    ASSERT_NE(expected, 0u) << "the fakes are linked with a build id";
    EXPECT_EQ(ModuleStamp(one.handle()), expected);
    EXPECT_NE(ModuleStamp(one.handle()), ModuleStamp(two.handle()));
    EXPECT_NE(ModuleStamp(MainModule()), 0u);
    EXPECT_EQ(ModuleStamp(nullptr), 1u);
    // A closed or failed module is not loaded and keeps no reference.
    DynamicModule wbrt(hostrt_test::FakeWbrtPath());
    ASSERT_TRUE(wbrt) << wbrt.error();
    void* const handle = wbrt.handle();
    EXPECT_TRUE(IsModuleLoaded(handle));
    EXPECT_EQ(LoadedModule("libwbrt.so"), handle) << "found by its soname";
    EXPECT_EQ(LoadedModule("libwbrt.so"), handle);
    wbrt.Reset();
    EXPECT_FALSE(IsModuleLoaded(handle)) << "a lookup by name must not have kept it loaded";
    EXPECT_EQ(LoadedModule("libwbrt.so"), nullptr);
    EXPECT_EQ(ModuleStamp(handle), 1u);
    EXPECT_TRUE(IsModuleLoaded(MainModule()));
    // A failed load is empty, with the linker's text.
    const DynamicModule missing("/nonexistent/libnothing.so");
    EXPECT_FALSE(missing);
    EXPECT_FALSE(missing.error().empty());
}

} // namespace
