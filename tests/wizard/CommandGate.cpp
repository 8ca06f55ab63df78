#include "tests/wizard/CommandGate.h"

#include <gtest/gtest.h>
#include <windows.h>

namespace {

constexpr const char* kProcessor = R"(C:\windows\system32\cmd.exe)";
constexpr const char* kRealProcessor = R"(C:\windows\system32\cmd-real.exe)";

// Wine runs its own program of that name, whatever the file holds, unless it is told not to.
constexpr const char* kOverrides = R"(Software\Wine\DllOverrides)";

}  // namespace

CommandGate::CommandGate() {
    EXPECT_TRUE(MoveFileA(kProcessor, kRealProcessor));
    EXPECT_TRUE(CopyFileA("Z:" HV_PROGRAM_FOLDER "/script_gate.exe", kProcessor, TRUE));
    const char native[] = "native";
    EXPECT_EQ(RegSetKeyValueA(HKEY_CURRENT_USER, kOverrides, "cmd.exe", REG_SZ, native, sizeof native), ERROR_SUCCESS);
}

CommandGate::~CommandGate() {
    RegDeleteKeyValueA(HKEY_CURRENT_USER, kOverrides, "cmd.exe");
    EXPECT_TRUE(MoveFileExA(kRealProcessor, kProcessor, MOVEFILE_REPLACE_EXISTING)) << GetLastError();
}
