// The binding inside a host process: the executable exports the runtime, so it is the runtime
// module, and the host's own functions answer through the resolver.
#include "host/UiLanguage.h"
#include "host/binding/HostFunctions.h"
#include "host/binding/RuntimeLoader.h"
#include "host/binding/RuntimeSelection.h"
#include "kern/osdep/DynamicModule.h"

#include <cstdlib>
#include <gtest/gtest.h>

namespace rt = qv::host::rt;
using qv::kern::osdep::MainModule;

namespace {

TEST(HostProcess, TheExecutableIsTheRuntimeModuleAndAnswersHostFunctionsAndTheLanguage) {
    EXPECT_EQ(rt::CurrentRuntimeModule(), MainModule());
    EXPECT_EQ(rt::RuntimeVersionOf(MainModule()), "26.0");

    const rt::EngineSearchEnvironment env = rt::EngineSearchEnvironment::FromProcess();
    const auto same = rt::LoadRuntime(rt::kRunTimeEngine, "26.0", "", env);
    EXPECT_EQ(same.handle(), MainModule()) << "the process already is that runtime";
    WBHandle block = rt::DSNewHClr(16);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(rt::NumericArrayResize(kWBTypeU64, 1, &block, 4), kWBNoErr);
    EXPECT_EQ(rt::NumericArrayResize(99, 1, &block, 4), kWBArgErr);
    EXPECT_EQ(rt::DSDisposeHandle(block), kWBNoErr);
    EXPECT_EQ(rt::DSDisposeHandle(block), kWBArgErr) << "a released handle is refused, not reused";

    WBHandle text = nullptr;
    ASSERT_NE(rt::GGetOneErrorCode(2, &text), 0);
    char buffer[9];
    EXPECT_EQ(rt::LToCStrN(*text, buffer, sizeof buffer), 8);
    EXPECT_STREQ(buffer, "The host") << "cut to the buffer and terminated";
    rt::DSDisposeHandle(text);
    text = nullptr;
    EXPECT_EQ(rt::GGetOneErrorCode(-77, &text), 0);
    EXPECT_EQ(text, nullptr);
    setenv("WBHOST_LANGUAGE", "deu", 1);
    EXPECT_EQ(qv::host::UserInterfaceLanguage(), u"deu");
    setenv("WBHOST_LANGUAGE", "fra", 1);
    EXPECT_EQ(qv::host::UserInterfaceLanguage(), u"deu") << "asked once and kept";
    unsetenv("WBHOST_LANGUAGE");
}

} // namespace
