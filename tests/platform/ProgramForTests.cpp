// A program to be run by a test: says what it was given, and changes the machine when asked to.

#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "platform/win32.h"

namespace {

void ChangeTheMachine() {
    FILE* file = nullptr;
    if (fopen_s(&file, R"(C:\ProgramData\made.txt)", "wb") == 0) {
        std::fputs("made", file);
        std::fclose(file);
    }
    RegSetKeyValueA(HKEY_CURRENT_USER, R"(Software\Halvorn)", "after", REG_SZ, "1", 2);
}

}  // namespace

/// The last argument is the exit status.
int main(int count, char** arguments) {
    for (int at = 1; at < count; ++at) {
        std::printf("[%s]\n", arguments[at]);
        if (std::strcmp(arguments[at], "--change") == 0) {
            ChangeTheMachine();
        }
    }
    const char* value = std::getenv("HV_TEST");
    std::printf("%s\n", value != nullptr ? value : "");
    std::fputs("to standard error\n", stderr);
    return count > 1 ? std::atoi(arguments[count - 1]) : 0;
}
