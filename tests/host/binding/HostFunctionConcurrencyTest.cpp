// Eight threads racing for the eight cache entries of one host function while the runtime modules
// behind them are loaded and unloaded: each thread loads a module, calls through the cache, lets
// the module go and takes the next, so entries are claimed, rebound and taken over from unloaded
// modules all at once. Every call must reach the calling thread's own module.
#include "FakeRuntimes.h"
#include "host/binding/BoundFunction.h"
#include "host/binding/FatalError.h"
#include "host/binding/RuntimeSelection.h"

#include <atomic>
#include <gtest/gtest.h>
#include <latch>
#include <pthread.h>
#include <stdexcept>
#include <thread>
#include <vector>

namespace rt = qv::host::rt;
using qv::kern::osdep::DynamicModule;

namespace {

using AnswerFn = int32_t();

[[noreturn]] void ThrowMessage(const char* message) {
    throw std::runtime_error(message);
}

// A closed handle may be handed out again by the next load (of the same file at another address,
// or of another file): the cache must tell such a load from the module it had bound.
TEST(HostFunctionConcurrency, ThreadsClaimEntriesWhileModulesLoadAndUnload) {
    static rt::BoundFunction<AnswerFn> answer{"FakeAnswer"};
    constexpr int kThreads = static_cast<int>(rt::HostFunction::kSlotCount);
    constexpr int kModules = 9; // one more than there are entries
    constexpr int kRounds = 150;
    pthread_key_t key;
    ASSERT_EQ(pthread_key_create(&key, nullptr), 0);
    rt::SetRuntimeTlsIndex(static_cast<uint32_t>(key));
    rt::SetFatalErrorHook(ThrowMessage);
    std::latch start(kThreads);
    std::atomic<int> wrong{0};
    std::atomic<int> failed{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
        threads.emplace_back([&, t] {
            start.arrive_and_wait();
            for (int round = 0; round < kRounds; ++round) {
                const int n = 1 + (t + round) % kModules;
                DynamicModule module(hostrt_test::FakePath(n));
                if (!module) {
                    ++failed;
                    continue;
                }
                pthread_setspecific(key, module.handle());
                try {
                    for (int call = 0; call < 20; ++call)
                        wrong += answer() != n;
                } catch (const std::runtime_error&) {
                    ++failed;
                }
                pthread_setspecific(key, nullptr);
                // The module is unloaded here unless another thread holds it too.
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    rt::SetFatalErrorHook(nullptr);
    rt::SetRuntimeTlsIndex(rt::kNoRuntimeTlsIndex);
    pthread_key_delete(key);
    EXPECT_EQ(wrong.load(), 0);
    EXPECT_EQ(failed.load(), 0) << "every thread must find an entry: at most eight modules live";
}

} // namespace
