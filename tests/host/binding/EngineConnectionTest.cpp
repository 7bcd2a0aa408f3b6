// Connections to run-time engines through their function tables, the shared connection list, the
// table version classes, and the shortened version names tried after the full text.
#include "host/binding/EngineConnection.h"

#include "FakeRuntimes.h"
#include "host/binding/ConnectionList.h"
#include "host/binding/VersionName.h"
#include "host/binding/WBCIntFunctions.h"
#include "support/ScratchFolder.h"

#include <array>
#include <filesystem>
#include <gtest/gtest.h>

namespace fs = std::filesystem;
namespace rt = qv::host::rt;
using hostrt_test::CountersOf;
using hostrt_test::FakePath;
using qv::kern::osdep::DynamicModule;

namespace {

std::array<const void*, 110> TableOfRevision(uintptr_t revision) {
    std::array<const void*, 110> table{};
    table[0] = reinterpret_cast<const void*>(revision);
    table[109] = &table; // something non-null in the open-by-name slot
    return table;
}

TEST(WBCIntFunctions, TheNewestValidVersionWrapsATable) {
    EXPECT_EQ(rt::WrapFunctionTable(nullptr), nullptr);
    const auto zero = TableOfRevision(0);
    EXPECT_EQ(rt::WrapFunctionTable(zero.data()), nullptr);

    const std::pair<uintptr_t, const char*> cases[] = {{17, "base"}, {18, "80"}, {19, "80"},
                                                       {20, "82"},   {29, "82"}, {30, "90"}};
    for (const auto& [revision, expected] : cases) {
        const auto table = TableOfRevision(revision);
        const auto wrapper = rt::WrapFunctionTable(table.data());
        ASSERT_NE(wrapper, nullptr) << revision;
        const char* kind = dynamic_cast<rt::WBCIntFunctions90*>(wrapper.get())   ? "90"
                           : dynamic_cast<rt::WBCIntFunctions82*>(wrapper.get()) ? "82"
                           : dynamic_cast<rt::WBCIntFunctions80*>(wrapper.get()) ? "80"
                                                                                 : "base";
        EXPECT_STREQ(kind, expected) << revision;
    }
    const auto t29 = TableOfRevision(29);
    EXPECT_FALSE(rt::WBCIntFunctions90(t29.data()).IsValid());
    EXPECT_TRUE(rt::WBCIntFunctions861(t29.data()).IsValid());
    EXPECT_EQ(rt::WBCIntFunctions(t29.data()).OpenByName(), nullptr) << "only from revision 40";
    // Only the low 32 bits of the pointer-sized field are the revision.
    const auto high = TableOfRevision((uintptr_t{1} << 32) | 30);
    EXPECT_EQ(rt::WBCIntFunctions(high.data()).Revision(), 30u);
}

TEST(EngineConnection, OpensStartsAndClosesThroughTheTableNamedOnesFromRevisionForty) {
    DynamicModule observer(FakePath(4)); // keeps the counters readable after the close
    ASSERT_TRUE(observer);
    rt::EngineConnection connection("8.6", rt::kProcessRuntime);
    ASSERT_TRUE(connection.Open(DynamicModule(FakePath(4)), ""));
    EXPECT_TRUE(connection.IsOpen());
    EXPECT_NE(connection.handle(), nullptr);
    EXPECT_EQ(connection.functions()->Revision(), 27u);
    EXPECT_EQ(CountersOf(observer.handle()).opens, 1);
    EXPECT_EQ(CountersOf(observer.handle()).starts, 1);
    connection.Close();
    EXPECT_EQ(CountersOf(observer.handle()).closes, 1);
    EXPECT_EQ(connection.library(), nullptr);
    connection.Close();
    EXPECT_EQ(CountersOf(observer.handle()).closes, 1) << "closing twice closes once";
    const rt::EngineSearchEnvironment env;
    EXPECT_EQ(rt::OpenEngineConnection(rt::kProcessRuntime, FakePath(1), "Host", env), nullptr);
    EXPECT_EQ(qv::kern::osdep::LoadedModule(FakePath(1).c_str()), nullptr);

    const auto named = rt::OpenEngineConnection(rt::kProcessRuntime, FakePath(9), "Host", env);
    ASSERT_NE(named, nullptr);
    EXPECT_EQ(CountersOf(named->library()).openByNames, 1);
    EXPECT_EQ(CountersOf(named->library()).opens, 0);
}

TEST(EngineConnection, InstalledEnginesAreFoundUnderTheShortenedVersionExplicitDirectoriesAsGiven) {
    const test::ScratchFolder scratch;
    const fs::path root = scratch.Path();
    const fs::path versionDir = root / "pf/Quorvane/Shared/Wirebench Run-Time/16.0";
    fs::create_directories(versionDir);
    fs::create_directories(root / "bin");
    fs::copy_file(hostrt_test::FakeWbrtPath(), versionDir / rt::kRunTimeEngineLibrary,
                  fs::copy_options::overwrite_existing);
    rt::EngineSearchEnvironment env;
    env.executablePath = (root / "bin" / "host").string();
    env.variable = [&](const std::string& name) -> std::optional<std::string> {
        return name == "ProgramFiles" ? std::optional((root / "pf").string()) : std::nullopt;
    };

    auto connection = rt::OpenEngineConnection(rt::kRunTimeEngine, "16.0.0f1", "", env);
    ASSERT_NE(connection, nullptr);
    EXPECT_EQ(connection->versionName(), "16.0");
    EXPECT_EQ(connection->kind(), rt::kRunTimeEngine);
    connection.reset();
    EXPECT_EQ(rt::OpenEngineConnection(rt::kRunTimeEngine, "17.0f1", "", env), nullptr);
    // An explicit directory is used as given; kind two needs an existing executable.
    const rt::EngineSearchEnvironment bare;
    const std::string directory = fs::path(hostrt_test::FakeWbrtPath()).parent_path().string();
    const DynamicModule loaded = rt::LoadRuntime(rt::kRunTimeEngine, "99.0", directory, bare);
    ASSERT_TRUE(loaded);
    EXPECT_EQ(rt::RuntimeVersionOf(loaded.handle()), "16.0");
    EXPECT_FALSE(rt::LoadRuntime(rt::kFFRunTimeEngine, "", directory, bare))
        << "that directory has no libwbffrt.so";

    rt::EngineSearchEnvironment noExecutable;
    noExecutable.executablePath = "/nonexistent/host";
    EXPECT_FALSE(rt::LoadRuntime(rt::kProcessRuntime, "", "", noExecutable));
    const auto self = rt::EngineSearchEnvironment::FromProcess();
    EXPECT_EQ(rt::LoadRuntime(rt::kProcessRuntime, "", "", self).handle(),
              qv::kern::osdep::MainModule());
}

class ConnectionListTest : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(observer_); }

    std::unique_ptr<rt::EngineConnection> OpenFake() {
        ++opened_;
        auto connection = std::make_unique<rt::EngineConnection>("8.6", rt::kProcessRuntime);
        return connection->Open(DynamicModule(FakePath(5)), "") ? std::move(connection) : nullptr;
    }
    int Closes() const { return CountersOf(observer_.handle()).closes; }

    DynamicModule observer_{FakePath(5)};
    rt::ConnectionList list_;
    int opened_ = 0;
};

TEST_F(ConnectionListTest, SharedPerVersionAndKindUntilTheLastRelease) {
    rt::EngineConnection* first = list_.Acquire("8.6", 2, [&] { return OpenFake(); });
    rt::EngineConnection* second = list_.Acquire("8.6", 2, [&] { return OpenFake(); });
    ASSERT_NE(first, nullptr);
    EXPECT_EQ(first, second);
    EXPECT_EQ(opened_, 1);
    EXPECT_EQ(list_.UseCount(first), 2);

    rt::EngineConnection* other = list_.Acquire("8.6", 0, [&] { return OpenFake(); });
    EXPECT_NE(other, first) << "the kind is part of the key";
    list_.Release(other);

    const int closesBefore = Closes();
    list_.Release(first);
    EXPECT_EQ(Closes(), closesBefore);
    list_.Release(second);
    EXPECT_EQ(Closes(), closesBefore + 1);
    EXPECT_EQ(list_.UseCount(first), 0);
}

TEST_F(ConnectionListTest, ALateDuplicateIsDiscardedAndAFailedOpenCountsNothing) {
    rt::EngineConnection* inner = nullptr;
    // The opener runs outside the lock: another caller can add the same pair meanwhile.
    rt::EngineConnection* outer = list_.Acquire("8.6", 2, [&] {
        inner = list_.Acquire("8.6", 2, [&] { return OpenFake(); });
        return OpenFake();
    });
    EXPECT_EQ(outer, inner);
    EXPECT_EQ(list_.UseCount(outer), 2);
    EXPECT_EQ(opened_, 2);
    EXPECT_EQ(Closes(), 1) << "the duplicate was closed";
    list_.Release(outer);
    list_.Release(outer);

    EXPECT_EQ(list_.Acquire("9.0", 2, [] { return std::unique_ptr<rt::EngineConnection>(); }),
              nullptr);
}

TEST(VersionName, ReleaseSuffixesShortenToMajorMinorAndLongNamesAreNotKept) {
    EXPECT_EQ(rt::ShortVersionName("16.0.0f1"), "16.0");
    EXPECT_EQ(rt::ShortVersionName("8.6b3"), "8.6");
    EXPECT_EQ(rt::ShortVersionName("2020.1.3"), "2020.1");
    // Texts without a shortening point have none.
    EXPECT_EQ(rt::ShortVersionName(""), std::nullopt);
    EXPECT_EQ(rt::ShortVersionName("16.0"), std::nullopt);
    EXPECT_EQ(rt::ShortVersionName("8.2f"), std::nullopt) << "the suffix digit must be in the text";
    EXPECT_EQ(rt::ShortVersionName("8.2x1"), std::nullopt);
    EXPECT_EQ(rt::ShortVersionName("1234567890.1.2"), std::nullopt)
        << "the point lies past the scan";
    EXPECT_EQ(rt::StoredVersionName("12345678901"), "12345678901");
    EXPECT_EQ(rt::StoredVersionName("123456789012"), "");
}

} // namespace
