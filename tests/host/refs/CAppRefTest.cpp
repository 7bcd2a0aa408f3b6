// Application and program references over a run-time engine's function table. The test program
// itself is the engine: it exports GetCInterfaceFunctionTable, which the default application
// reference (the running process) finds in the main executable.
#include "host/refs/CAppRef.h"

#include "host/binding/runtime_api.h"
#include "host/refs/ProgramCalls.h"

#include <array>
#include <cstring>
#include <gtest/gtest.h>
#include <string>

namespace {

using namespace qv::host::refs;

// The fake engine's state: one program at a time with four terminals.
struct Engine {
    int connections = 0;
    int openPrograms = 0;
    int runs = 0;
    int classQueries = 0;
    int32_t runResult = 0;
    uint32_t revision = 40;
    std::array<uint8_t, 8> u8Type{0, 5};
    std::array<uint8_t, 8> boolType{0, 33};
    std::array<uint8_t, 8> stringType{0, 48};
    std::array<uint8_t, 8> i32Type{0, 3};
    unsigned char data[4][8] = {};
    WBTerminal terminals[4] = {};
};
Engine engine;

int32_t Open(void** connection, int32_t, int32_t) {
    ++engine.connections;
    *connection = &engine;
    return 0;
}
int32_t Close(void*) {
    --engine.connections;
    return 0;
}
int32_t Start(void*) {
    return 0;
}
int32_t OpenProgram(void*, const char* path, uint32_t, uint32_t, void** program) {
    if (std::string(path) == "missing.gx") {
        return kWBFileNotFound;
    }
    ++engine.openPrograms;
    *program = &engine;
    return 0;
}
int32_t CloseProgram(void*) {
    --engine.openPrograms;
    return 0;
}
int32_t Prepare(void*, int32_t* count, WBTerminal** terminals) {
    const uint8_t* types[4] = {engine.u8Type.data(), engine.boolType.data(),
                               engine.stringType.data(), engine.i32Type.data()};
    for (int i = 0; i < 4; ++i) {
        engine.terminals[i] = WBTerminal{engine.data[i], 0, 0, types[i]};
    }
    *count = 4;
    *terminals = engine.terminals;
    return 0;
}
int32_t RunProgram(void*, int32_t) {
    ++engine.runs;
    return engine.runResult;
}
int32_t ClassOfType(const uint8_t* type) {
    ++engine.classQueries;
    return static_cast<int32_t>(NumericClassOfTypeCode(type[1]));
}

std::array<const void*, 110> table;

} // namespace

extern "C" __attribute__((visibility("default"))) const void* const* GetCInterfaceFunctionTable() {
    table.fill(nullptr);
    table[0] = reinterpret_cast<const void*>(static_cast<uintptr_t>(engine.revision));
    table[1] = reinterpret_cast<const void*>(&Open);
    table[2] = reinterpret_cast<const void*>(&Close);
    table[3] = reinterpret_cast<const void*>(&Start);
    table[kOpenProgramSlot] = reinterpret_cast<const void*>(&OpenProgram);
    table[kCloseProgramSlot] = reinterpret_cast<const void*>(&CloseProgram);
    table[kPrepareProgramSlot] = reinterpret_cast<const void*>(&Prepare);
    table[kRunProgramSlot] = reinterpret_cast<const void*>(&RunProgram);
    table[kNumericClassSlot] = reinterpret_cast<const void*>(&ClassOfType);
    return table.data();
}

namespace {

class RefTest : public ::testing::Test {
protected:
    void SetUp() override {
        engine = Engine{};
        int32_t error = -1;
        ASSERT_EQ(OpenDefaultAppRef(&app_, &error), S_OK);
        EXPECT_EQ(error, 0);
    }
    void TearDown() override {
        if (app_) {
            app_->Release();
        }
        // Every reference was released: the program and the shared connection are closed.
        EXPECT_EQ(engine.openPrograms, 0);
        EXPECT_EQ(engine.connections, 0);
    }
    I_GXRef* OpenForRunning(const char* path = "qvFpgaIONameControlOnMutation.gx") {
        I_GXRef* ref = nullptr;
        int32_t error = -1;
        EXPECT_EQ(app_->OpenProgramRef(path, 0, 0x10000, 1, &ref, &error), S_OK);
        EXPECT_EQ(error, 0);
        return ref;
    }
    I_AppRef* app_ = nullptr;
};

TEST_F(RefTest, SetsRunsAndReadsTerminalsThroughOneSharedConnection) {
    I_GXRef* ref = OpenForRunning();
    ASSERT_NE(ref, nullptr);
    EXPECT_EQ(engine.connections, 1); // the program reference shares the application's
    int32_t error = -1;
    EXPECT_EQ(ref->SetControlValueByIndex(0, 300.0, &error), S_OK);
    EXPECT_EQ(engine.data[0][0], 44);
    EXPECT_EQ(ref->SetControlValueByIndex(1, -0.0, &error), S_OK);
    EXPECT_EQ(engine.data[1][0], 0);
    EXPECT_GT(engine.classQueries, 0); // a recent table answers the classes itself
    EXPECT_EQ(ref->Run(&error, 0, 0, 1), S_OK);
    EXPECT_EQ(engine.runs, 1);
    void* data = nullptr;
    const uint8_t* type = nullptr;
    EXPECT_EQ(ref->GetControlValueByIndex(3, &data, &type, &error), S_OK);
    EXPECT_EQ(data, engine.data[3]);
    EXPECT_EQ(type[1], 3);
    EXPECT_EQ(ref->Release(), 0u);
}

TEST_F(RefTest, UnsettableTerminalsAndRefsNotOpenedForRunningFailAndErrorsStayInTheRef) {
    I_GXRef* ref = OpenForRunning();
    int32_t error = 0;
    EXPECT_EQ(ref->SetControlValueByIndex(2, 1.0, &error), E_UNEXPECTED); // not numeric
    EXPECT_EQ(error, 1);
    EXPECT_EQ(ref->SetControlValueByIndex(4, 1.0, &error), E_UNEXPECTED); // no such terminal
    EXPECT_EQ(ref->SetControlValueByIndex(-1, 1.0, &error), E_UNEXPECTED);
    EXPECT_EQ(ref->GetControlValueByIndex(0, nullptr, nullptr, &error), E_UNEXPECTED);
    EXPECT_EQ(error, 1);
    ref->Release();

    // A reference not opened for running cannot run.
    ASSERT_EQ(app_->OpenProgramRef("x.gx", 0, 0, 0, &ref, &error), S_OK);
    EXPECT_EQ(ref->Run(&error, 0, 0, 1), E_UNEXPECTED);
    EXPECT_EQ(error, 1);
    EXPECT_EQ(engine.runs, 0);
    ref->Release();
    // Host errors stay in the reference.
    ref = reinterpret_cast<I_GXRef*>(8);
    error = 0;
    EXPECT_EQ(app_->OpenProgramRef("missing.gx", 0, 0, 1, &ref, &error), E_UNEXPECTED);
    EXPECT_EQ(error, kWBFileNotFound);
    EXPECT_EQ(ref, nullptr);

    ref = OpenForRunning();
    engine.runResult = kWBGenericErr;
    EXPECT_EQ(ref->Run(&error, 0, 0, 1), E_UNEXPECTED);
    EXPECT_EQ(error, kWBGenericErr);
    engine.runResult = 0;
    EXPECT_EQ(ref->Run(&error, 0, 0, 1), E_UNEXPECTED); // answered without calling the engine
    EXPECT_EQ(ref->SetControlValueByIndex(0, 1.0, &error), E_UNEXPECTED);
    EXPECT_EQ(error, kWBGenericErr);
    EXPECT_EQ(engine.runs, 1);
    ref->Release();
}

TEST(OldTables, RefuseToRunAndAreAskedForNoClasses) {
    engine = Engine{};
    engine.revision = 18; // below the revisions that answer classes and that run freely
    I_AppRef* app = nullptr;
    int32_t error = -1;
    ASSERT_EQ(OpenDefaultAppRef(&app, &error), S_OK);
    I_GXRef* ref = nullptr;
    ASSERT_EQ(app->OpenProgramRef("x.gx", 0, 0, 1, &ref, &error), S_OK);
    EXPECT_EQ(ref->SetControlValueByIndex(0, 300.0, &error), S_OK);
    EXPECT_EQ(engine.data[0][0], 44);
    EXPECT_EQ(engine.classQueries, 0);
    EXPECT_EQ(ref->Run(&error, 0, 0, 1), E_UNEXPECTED);
    EXPECT_EQ(error, kWBNotSupported);
    EXPECT_EQ(engine.runs, 0);
    ref->Release();
    app->Release();
    EXPECT_EQ(engine.connections, 0);
}

} // namespace
