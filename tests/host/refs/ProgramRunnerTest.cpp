// Opening host programs through the runner of the framework's root object.
#include "host/runner/ProgramRunner.h"

#include "com/ComObject.h"
#include "host/contracts/IwbProgramRunnerService.h"
#include "support/ScratchFolder.h"

#include <cstdio>
#include <gtest/gtest.h>

namespace {

using qv::com::ComPtr;

// A runner that records what it was asked to do.
class FakeRunner : public IwbProgramRunner {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgramRunner>;
    HRESULT MakeHostReference(IUnknown*, uint64_t* reference) override {
        *reference = ++made;
        return S_OK;
    }
    HRESULT FindProjectItem(const GUID&, IwbProjectItem**) override { return S_FALSE; }
    HRESULT OpenProgram(const char16_t* path, IwbProgram** program) override {
        opened.push_back(path);
        *program = nullptr;
        return E_ACCESSDENIED; // a status of its own, so the test sees it passed through
    }
    HRESULT ReleaseHostReference(uint64_t reference) override {
        released.push_back(reference);
        return S_OK;
    }
    HRESULT LoadIcon(const char16_t*, uint64_t* icon) override {
        *icon = 0;
        return S_OK;
    }
    uint64_t made = 0;
    std::vector<std::u16string> opened;
    std::vector<uint64_t> released;
};

// A framework root object whose runner service makes one FakeRunner.
class FakeRoot : public IwbProgramRunnerService {
public:
    using Interfaces = qv::com::InterfaceList<IwbProgramRunnerService>;
    HRESULT CreateInstance(const CLSID& clsid, const IID& iid, void** object) override {
        if (!IsEqualGUID(clsid, wbproj::kProgramRunnerClass)) {
            return E_NOINTERFACE;
        }
        return runner->QueryInterface(iid, object);
    }
    ComPtr<CQVComObject<FakeRunner>> runner;
};

class ProgramRunnerTest : public ::testing::Test {
protected:
    void SetUp() override {
        CQVComObject<FakeRoot>* root = nullptr;
        ASSERT_EQ(CQVComObject<FakeRoot>::CreateInstance(&root), S_OK);
        root_ = ComPtr<CQVComObject<FakeRoot>>::Adopt(root);
        CQVComObject<FakeRunner>* runner = nullptr;
        ASSERT_EQ(CQVComObject<FakeRunner>::CreateInstance(&runner), S_OK);
        root_->runner = ComPtr<CQVComObject<FakeRunner>>::Adopt(runner);
    }
    ComPtr<CQVComObject<FakeRoot>> root_;
};

TEST_F(ProgramRunnerTest, OnlyAnExistingFileIsOpenedAndHostReferencesGoBackThroughTheRunner) {
    ComPtr<IwbProgram> program;
    ComPtr<IwbProgramRunner> runner;
    EXPECT_EQ(qv::host::runner::OpenHostProgram(root_->GetUnknown(),
                                                u"/nonexistent/wbtio/private/TIOPropertyMain.gx",
                                                program.Put(), runner.Put()),
              E_FAIL);
    EXPECT_TRUE(runner); // the runner was obtained first, and is the caller's to release
    EXPECT_FALSE(program);
    EXPECT_TRUE(root_->runner->opened.empty());
    EXPECT_EQ(
        qv::host::runner::OpenHostProgram(root_->GetUnknown(), u"", program.Put(), runner.Put()),
        E_FAIL);
    const test::ScratchFolder scratch;
    const std::string narrow = scratch.Write("p.gx", "program\n");
    const std::u16string wide(narrow.begin(), narrow.end());
    EXPECT_EQ(
        qv::host::runner::OpenHostProgram(root_->GetUnknown(), wide, program.Put(), runner.Put()),
        E_ACCESSDENIED);
    ASSERT_EQ(root_->runner->opened.size(), 1u);
    EXPECT_EQ(root_->runner->opened[0], wide);
    // Host references are released through the runner, which needs a root with the service.
    // A provider asked before the framework gave it its root object.
    EXPECT_EQ(qv::host::runner::OpenHostProgram(nullptr, u"x", program.Put(), runner.Put()),
              E_POINTER);
    EXPECT_EQ(qv::host::runner::GetProgramRunner(root_->runner->GetUnknown(), runner.Put()),
              E_NOINTERFACE);
    {
        qv::host::runner::RunnerReference first(root_->runner.Get(), root_->GetUnknown());
        qv::host::runner::RunnerReference none(root_->runner.Get(), nullptr);
        EXPECT_EQ(first.status(), S_OK);
        EXPECT_EQ(first.value(), 1u);
        EXPECT_EQ(none.status(), E_POINTER);
    }
    EXPECT_EQ(root_->runner->released, (std::vector<uint64_t>{1}));
}

} // namespace
