// The program runner as the module reaches it: root object, runner service, runner, programs;
// and unique names as the unique-name program makes them.
#include "TestObjects.h"
#include "com/Bstr.h"
#include "com/TaskMem.h"
#include "runner/HostProgram.h"
#include "runner/ProgramFile.h"
#include "runner/RunnerService.h"
#include "runner/UniqueName.h"
#include "runtime/Runtime.h"
#include "support/ScratchFolder.h"

#include <filesystem>
#include <gtest/gtest.h>

namespace {

using namespace wbhost::runner;
using qv::com::ComPtr;

// The programs the build installs next to the module.
std::u16string Shipped(const char* name) {
    const auto path =
        std::filesystem::path(WBT_MODULE_PATH).parent_path() / "wbtio" / "private" / name;
    const std::string text = path.string();
    return std::u16string(text.begin(), text.end());
}

class RunnerProgram : public ::testing::Test {
protected:
    void SetUp() override {
        // The module only holds the root and asks it for the service, as here.
        const auto service = qv::com::QueryAs<IwbProgramRunnerService>(root->GetUnknown());
        ASSERT_TRUE(service);
        ASSERT_EQ(service->CreateInstance(wbproj::kProgramRunnerClass, IwbProgramRunner::iid,
                                          reinterpret_cast<void**>(runner.Put())),
                  S_OK);
    }

    ComPtr<IwbProgram> Open(const char* name) {
        ComPtr<IwbProgram> program;
        EXPECT_EQ(runner->OpenProgram(Shipped(name).c_str(), program.Put()), S_OK) << name;
        return program;
    }

    std::shared_ptr<ProgramSession> session = std::make_shared<ProgramSession>();
    ComPtr<RunnerService> root = NewRunnerService(session);
    ComPtr<IwbProgramRunner> runner;
    // The service as callers see it (the object template's own CreateInstance hides it).
    IwbProgramRunnerService* Service() { return root.Get(); }
};

std::u16string ReadString(IwbProgram* program, uint32_t index) {
    BSTR text = nullptr;
    EXPECT_EQ(program->GetOutputString(index, &text), S_OK);
    return test::TakeText(text);
}

std::vector<std::u16string> ReadList(IwbProgram* program, uint32_t index) {
    BSTR* array = nullptr;
    uint32_t count = 99;
    EXPECT_EQ(program->GetOutputStringList(index, &array, &count), S_OK);
    std::vector<std::u16string> result;
    for (uint32_t i = 0; i < count; ++i)
        result.push_back(test::TakeText(array[i]));
    CoTaskMemFree(array);
    return result;
}

TEST_F(RunnerProgram, UniqueNameProgramComputesAndLogsItsRun) {
    auto program = Open("TIOGenUniqueName.gx");
    ASSERT_TRUE(program);
    const char16_t* taken[] = {u"DIO0", u"dio1", nullptr};
    ASSERT_EQ(program->SetInputString(0, u"DIO0"), S_OK);
    ASSERT_EQ(program->SetInputStringArray(1, taken, 3), S_OK);
    // Outputs exist only after a run.
    int32_t number = 0;
    EXPECT_EQ(program->GetOutputInt32(4, &number), E_INVALIDARG);
    ASSERT_EQ(program->Run(), S_OK);
    EXPECT_EQ(ReadString(program.Get(), 4), u"DIO2");
    // A text output is not a number, and an index the program never wrote is no output.
    EXPECT_EQ(program->GetOutputInt32(4, &number), E_INVALIDARG);
    BSTR text = nullptr;
    EXPECT_EQ(program->GetOutputString(7, &text), E_INVALIDARG);
    EXPECT_EQ(program->SetInputInt32(HostProgramImpl::kTerminalCount, 1), E_INVALIDARG);

    const auto runs = session->Runs();
    ASSERT_EQ(runs.size(), 1u);
    EXPECT_EQ(runs[0].behaviour, "unique-name");
    EXPECT_TRUE(runs[0].path.ends_with("wbtio/private/TIOGenUniqueName.gx"));
    EXPECT_EQ(runs[0].inputs.at(0), ProgramValue(std::u16string(u"DIO0")));
    EXPECT_EQ(runs[0].inputs.at(1),
              ProgramValue(std::vector<std::u16string>{u"DIO0", u"dio1", u""}));
}

TEST_F(RunnerProgram, DialogsAnswerFromTheSessionElseAsIfClosed) {
    auto wizard = Open("TIONewInstanceWizard.gx");
    ASSERT_TRUE(wizard);
    ASSERT_EQ(wizard->SetInputInt32(1, 3), S_OK);
    ASSERT_EQ(wizard->Run(), S_OK);
    int32_t cancelled = 0, choice = 0;
    EXPECT_EQ(wizard->GetOutputInt32(0, &cancelled), S_OK);
    EXPECT_EQ(cancelled, 1);
    EXPECT_EQ(wizard->GetOutputInt32(1, &choice), S_OK);
    EXPECT_EQ(choice, 3);
    EXPECT_TRUE(ReadList(wizard.Get(), 3).empty());

    session->SetAnswer("new-item-wizard", 0, 0);
    ASSERT_TRUE(session->SetAnswerFromText("new-item-wizard:3=list:<a/>|<b/>"));
    ASSERT_EQ(wizard->Run(), S_OK);
    EXPECT_EQ(wizard->GetOutputStatus(0, &cancelled), S_OK);
    EXPECT_EQ(cancelled, 0);
    EXPECT_EQ(ReadList(wizard.Get(), 3), (std::vector<std::u16string>{u"<a/>", u"<b/>"}));

    auto select = Open("TIOSelectResourceDialog.gx");
    ASSERT_TRUE(select);
    ASSERT_EQ(select->SetInputString(9, u"Connector0/DIO0"), S_OK);
    ASSERT_EQ(select->SetInputReference(11, 0x1234'0000'0001ULL), S_OK);
    ASSERT_EQ(select->Run(), S_OK);
    EXPECT_EQ(ReadString(select.Get(), 1), u"Connector0/DIO0");
    EXPECT_EQ(session->Runs().back().inputs.at(11),
              ProgramValue(HostReference{0x1234'0000'0001ULL}));

    for (const char* name : {"TIOPropertyMain.gx", "TIOExplainErrorDialog.gx", "TIODragAndDrop.gx",
                             "TIOIONameControlConfigDialog.gx", "TIOIONameControlOnSelect.gx"}) {
        auto program = Open(name);
        ASSERT_TRUE(program);
        EXPECT_EQ(program->Run(), S_OK) << name;
    }
    EXPECT_EQ(session->Runs().size(), 8u);
}

TEST(RunnerProgramFile, KeysAreTrimmedAndCommentsSkipped) {
    const auto file = ParseProgramFile("\xEF\xBB\xBF# made elsewhere\r\n"
                                       "  behaviour :  unique-name \r\n\r\ntitle: a: b\n");
    ASSERT_TRUE(file);
    EXPECT_EQ(file->behaviour, "unique-name");
    EXPECT_EQ(file->keys.at("title"), "a: b");
    EXPECT_FALSE(ParseProgramFile("behaviour:\n"));
    EXPECT_FALSE(ParseProgramFile(": unique-name\nbehaviour: unique-name\n"));
}

TEST_F(RunnerProgram, MissingAndMalformedProgramsDoNotOpenAndHostReferencesItemsAndIconsAnswer) {
    ComPtr<IwbProgram> program;
    EXPECT_EQ(runner->OpenProgram(u"/nonexistent/TIOGenUniqueName.gx", program.Put()),
              static_cast<HRESULT>(0x80070002));
    EXPECT_FALSE(program);
    EXPECT_EQ(runner->OpenProgram(nullptr, program.Put()), E_POINTER);

    const test::ScratchFolder dir;
    const auto open = [&](const std::string& path) {
        return runner->OpenProgram(std::u16string(path.begin(), path.end()).c_str(), program.Put());
    };
    for (const auto& [name, text] : {std::pair{"unknown.gx", "behaviour: launch-rockets\n"},
                                     {"nobehaviour.gx", "# nothing\ntitle: x\n"},
                                     {"garbage.gx", "behaviour: unique-name\nnot a key line\n"}})
        EXPECT_EQ(open(dir.Write(name, text)), E_FAIL) << name;
    EXPECT_EQ(open(dir.Path()), E_FAIL); // a directory is not a program either
    EXPECT_TRUE(session->Runs().empty());
    // Host references, items and icons.
    auto item = test::NewItem();
    uint64_t reference = 0;
    ASSERT_EQ(runner->MakeHostReference(item.Get(), &reference), S_OK);
    const WBRefNum refnum = static_cast<WBRefNum>(reference);
    void* object = nullptr;
    ASSERT_EQ(QueryInterfaceForWBRefNum(&refnum, &IwbProjectItem::iid, &object), S_OK);
    EXPECT_EQ(object, item.Get());
    static_cast<IUnknown*>(object)->Release();
    EXPECT_EQ(runner->ReleaseHostReference(reference), S_OK);
    EXPECT_EQ(runner->ReleaseHostReference(reference), S_FALSE);
    EXPECT_EQ(runner->ReleaseHostReference(uint64_t{1} << 40), S_FALSE);
    EXPECT_EQ(runner->MakeHostReference(nullptr, &reference), E_POINTER);

    // Without a project no item is found; with one, the finder answers.
    ComPtr<IwbProjectItem> found;
    EXPECT_EQ(runner->FindProjectItem(GUID{}, found.Put()), S_FALSE);
    EXPECT_FALSE(found);
    root->SetItemFinder([&](const GUID&, IwbProjectItem** out) {
        *out = item.Get();
        item->AddRef();
        return S_OK;
    });
    ComPtr<IwbProgramRunner> second;
    ASSERT_EQ(Service()->CreateInstance(wbproj::kProgramRunnerClass, IUnknown::iid,
                                        reinterpret_cast<void**>(second.Put())),
              S_OK);
    EXPECT_EQ(second->FindProjectItem(GUID{}, found.Put()), S_OK);
    EXPECT_EQ(found.Get(), item.Get());

    uint64_t icon = 0;
    EXPECT_EQ(runner->LoadIcon(u"NonFile.png", &icon), S_OK);
    EXPECT_NE(icon, 0u);
    EXPECT_EQ(session->Icons(), std::vector<std::u16string>{u"NonFile.png"});
    void* other = nullptr;
    EXPECT_EQ(Service()->CreateInstance(IwbProgram::iid, IwbProgramRunner::iid, &other),
              E_NOINTERFACE);
    EXPECT_EQ(other, nullptr);
}

TEST(RunnerUniqueName, AFreeNameIsKeptElseTheSmallestFreeNumberFollowsTheStem) {
    EXPECT_EQ(UniqueName(u"Line", {u"Line1", u"Lines"}), u"Line");
    EXPECT_EQ(UniqueName(u"Line", {u"LINE", u"line1", u"Line2", u"Line4"}), u"Line3");
    // Trailing digits are the old number, not part of the stem; a gap below is filled.
    EXPECT_EQ(UniqueName(u"DIO7", {u"DIO7", u"DIO2"}), u"DIO1");
    EXPECT_EQ(UniqueName(u"12", {u"12", u"121"}), u"122");
    EXPECT_EQ(UniqueName(u"", {u"1"}), u"2");
    std::vector<std::u16string> taken{u"A"};
    for (int i = 1; i <= 200; ++i) {
        const std::string number = std::to_string(i);
        taken.push_back(u"A");
        taken.back().append(number.begin(), number.end());
    }
    EXPECT_EQ(UniqueName(u"A", taken), u"A201");
}

} // namespace
