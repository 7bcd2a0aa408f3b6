// The resolver against real shared objects: per-module caching, the thread-local and module
// selection, reuse of entries of unloaded modules, and the two ways the process ends.
#include "FakeRuntimes.h"
#include "host/binding/BoundFunction.h"
#include "host/binding/FatalError.h"
#include "host/binding/RuntimeSelection.h"

#include <dlfcn.h>
#include <gtest/gtest.h>
#include <pthread.h>
#include <set>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

namespace rt = qv::host::rt;
using hostrt_test::FakePath;
using qv::kern::osdep::DynamicModule;
using qv::kern::osdep::ModuleStamp;

namespace {

using AnswerFn = int32_t();

class HostFunctionTest : public ::testing::Test {
protected:
    void SetUp() override { ResetSelection(); }
    void TearDown() override {
        ResetSelection();
        rt::SetFatalErrorHook(nullptr);
    }
    static void ResetSelection() {
        rt::SetRuntimeModule(nullptr);
        rt::SetRuntimeTlsIndex(rt::kNoRuntimeTlsIndex);
    }

    static std::vector<DynamicModule> LoadFakes(int first, int last) {
        std::vector<DynamicModule> modules;
        for (int n = first; n <= last; ++n) {
            modules.emplace_back(FakePath(n));
            EXPECT_TRUE(modules.back()) << modules.back().error();
        }
        return modules;
    }

    // Answers from `function` in `module`.
    static int32_t AnswerIn(const rt::BoundFunction<AnswerFn>& function, void* module) {
        rt::SetRuntimeModule(module);
        return function();
    }
};

// Empties a test function's cache, so repeated runs in one process start alike.
void ClearCache(const rt::BoundFunction<AnswerFn>& function) {
    for (rt::HostFunctionSlot& slot : function.descriptor().slots) {
        slot.module.store(nullptr);
        slot.stamp.store(0);
        slot.address.store(nullptr);
    }
}

[[noreturn]] void ThrowMessage(const char* message) {
    throw std::runtime_error(message);
}

TEST_F(HostFunctionTest, EachModuleGetsItsOwnEntryAndKeepsItWhileTheThreadSlotDecidesIfItHoldsOne) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    ClearCache(answer);
    const auto fakes = LoadFakes(1, 2);
    EXPECT_EQ(AnswerIn(answer, fakes[0].handle()), 1);
    EXPECT_EQ(AnswerIn(answer, fakes[1].handle()), 2);
    EXPECT_EQ(AnswerIn(answer, fakes[0].handle()), 1);

    const rt::HostFunction& cache = answer.descriptor();
    EXPECT_EQ(cache.slots[0].module.load(), fakes[0].handle());
    EXPECT_EQ(cache.slots[0].stamp.load(), ModuleStamp(fakes[0].handle()));
    EXPECT_EQ(cache.slots[1].module.load(), fakes[1].handle());
    EXPECT_EQ(cache.slots[2].stamp.load(), 0u);
    // The thread slot decides only when it holds a module.
    pthread_key_t key;
    ASSERT_EQ(pthread_key_create(&key, nullptr), 0);
    rt::SetRuntimeTlsIndex(static_cast<uint32_t>(key));
    rt::SetRuntimeModule(fakes[0].handle());
    EXPECT_EQ(answer(), 1) << "an empty thread slot falls back to the named module";

    pthread_setspecific(key, fakes[1].handle());
    EXPECT_EQ(answer(), 2);
    int32_t otherThread = 0;
    std::thread([&] { otherThread = answer(); }).join();
    EXPECT_EQ(otherThread, 1) << "the slot is per thread";
    pthread_setspecific(key, nullptr);
    pthread_key_delete(key);
}

TEST_F(HostFunctionTest, ThreadsOfDifferentModulesClaimDifferentEntries) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    ClearCache(answer);
    const auto fakes = LoadFakes(1, 8);
    pthread_key_t key;
    ASSERT_EQ(pthread_key_create(&key, nullptr), 0);
    rt::SetRuntimeTlsIndex(static_cast<uint32_t>(key));
    std::vector<int32_t> wrong(fakes.size(), 0);
    std::vector<std::thread> threads;
    for (size_t t = 0; t < fakes.size(); ++t) {
        threads.emplace_back([&, t] {
            pthread_setspecific(key, fakes[t].handle());
            for (int i = 0; i < 2000; ++i) {
                wrong[t] += answer() != static_cast<int32_t>(t + 1);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    pthread_key_delete(key);
    EXPECT_EQ(wrong, std::vector<int32_t>(fakes.size(), 0));
    std::set<void*> cached;
    for (const rt::HostFunctionSlot& slot : answer.descriptor().slots) {
        cached.insert(slot.module.load());
    }
    EXPECT_EQ(cached.size(), fakes.size()) << "one entry per module";
}

TEST_F(HostFunctionTest, ModulesWithOneStampShareAnEntryYetEachAnswersForItself) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    ClearCache(answer);
    const auto twins = LoadFakes(11, 12);
    ASSERT_EQ(ModuleStamp(twins[0].handle()), ModuleStamp(twins[1].handle()));
    EXPECT_EQ(AnswerIn(answer, twins[0].handle()), 11);
    EXPECT_EQ(AnswerIn(answer, twins[1].handle()), 12);
    EXPECT_EQ(AnswerIn(answer, twins[0].handle()), 11);
    EXPECT_EQ(answer.descriptor().slots[1].stamp.load(), 0u) << "the second twin rebinds entry 0";

    // Two threads switching the shared entry back and forth must never get the other's answer.
    pthread_key_t key;
    ASSERT_EQ(pthread_key_create(&key, nullptr), 0);
    rt::SetRuntimeTlsIndex(static_cast<uint32_t>(key));
    int32_t wrong[2] = {0, 0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 2; ++t) {
        threads.emplace_back([&, t] {
            pthread_setspecific(key, twins[t].handle());
            for (int i = 0; i < 5000; ++i) {
                wrong[t] += answer() != 11 + t;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    pthread_key_delete(key);
    EXPECT_EQ(wrong[0] + wrong[1], 0);
}

TEST_F(HostFunctionTest, EngineLibrariesAreFoundByTheirNamesWhenNothingIsNamed) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    EXPECT_EQ(rt::CurrentRuntimeModule(), nullptr);
    EXPECT_EQ(answer.TryAddress(), nullptr) << "probing without a runtime must not end the process";

    DynamicModule ff(hostrt_test::FakeWbffrtPath());
    ASSERT_TRUE(ff) << ff.error();
    EXPECT_EQ(answer(), 200);
    DynamicModule wbrt(hostrt_test::FakeWbrtPath());
    ASSERT_TRUE(wbrt) << wbrt.error();
    EXPECT_EQ(answer(), 100) << "libwbrt.so comes before libwbffrt.so";
    const auto fakes = LoadFakes(3, 3);
    EXPECT_EQ(AnswerIn(answer, fakes[0].handle()), 3) << "a named module comes before both";
}

TEST_F(HostFunctionTest, EntryOfAnUnloadedModuleIsReused) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    ClearCache(answer);
    auto fakes = LoadFakes(1, 8);
    for (int n = 1; n <= 8; ++n) {
        ASSERT_EQ(AnswerIn(answer, fakes[n - 1].handle()), n);
    }
    fakes[2].Reset(); // the entry of module 3 now belongs to nobody
    const auto ninth = LoadFakes(9, 9);
    EXPECT_EQ(AnswerIn(answer, ninth[0].handle()), 9);
    EXPECT_EQ(answer.descriptor().slots[2].module.load(), ninth[0].handle());
    EXPECT_EQ(answer.descriptor().slots[2].stamp.load(), ModuleStamp(ninth[0].handle()));
    EXPECT_EQ(AnswerIn(answer, fakes[7].handle()), 8) << "the other entries are untouched";
}

TEST_F(HostFunctionTest, MissingExportsGoThroughTheFatalHookAndThoseOfDependenciesDoNotCount) {
    static rt::BoundFunction<AnswerFn> missing{"NoSuchHostFunction"};
    const auto fakes = LoadFakes(1, 1);
    rt::SetRuntimeModule(fakes[0].handle());
    rt::SetFatalErrorHook(ThrowMessage);
    try {
        missing();
        FAIL() << "a missing export must not return";
    } catch (const std::runtime_error& error) {
        EXPECT_EQ(std::string(error.what()),
                  "wirebenchv.lib was unable to locate a suitable location to resolve "
                  "\"NoSuchHostFunction\". This may happen when too many instances of Wirebench "
                  "have been loaded into the same process.");
    }
    EXPECT_EQ(missing.TryAddress(), nullptr);
    ASSERT_NE(dlsym(fakes[0].handle(), "strlen"), nullptr) << "found in the C library";
    EXPECT_EQ(qv::kern::osdep::ModuleExport(fakes[0].handle(), "strlen"), nullptr);
    EXPECT_NE(qv::kern::osdep::ModuleExport(fakes[0].handle(), "FakeAnswer"), nullptr);
}

using HostFunctionDeathTest = HostFunctionTest;

TEST_F(HostFunctionDeathTest, NinthLiveModuleEndsTheProcess) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    EXPECT_EXIT(
        {
            auto fakes = LoadFakes(1, 9);
            for (auto& fake : fakes) {
                AnswerIn(answer, fake.handle());
            }
        },
        ::testing::ExitedWithCode(1),
        "^Fatal Error: wirebenchv.lib was unable to locate a suitable location to resolve "
        "\"FakeAnswer\"\\. This may happen when too many instances of Wirebench have been loaded "
        "into the same process\\.");
}

TEST_F(HostFunctionDeathTest, NoRuntimeEndsTheProcess) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    EXPECT_EXIT(answer(), ::testing::ExitedWithCode(1),
                "^Fatal Error: wirebenchv.lib was not called from a Wirebench process\\.");
}

} // namespace
