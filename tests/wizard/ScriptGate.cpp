// A command processor that lets a test hold a run between two scripts (CommandGate.h). While C:\hold.txt names a part
// of the command line, the command waits, two minutes at most; then the system's own processor runs it.

#include <windows.h>

#include <cstdio>
#include <string>

namespace {

std::string Held() {
    char text[256] = {};
    if (FILE* const file = std::fopen("C:\\hold.txt", "rb")) {
        std::fread(text, 1, sizeof text - 1, file);
        std::fclose(file);
    }
    return text;
}

bool IsHeld(const std::string& line) {
    const std::string held = Held();
    return !held.empty() && line.find(held) != std::string::npos;
}

/// And by which number it can be waited for.
void SayThatItWaits() {
    if (FILE* const file = std::fopen("C:\\held.txt", "wb")) {
        std::fprintf(file, "%lu", GetCurrentProcessId());
        std::fclose(file);
    }
}

/// What stands after the program's own name.
std::string Arguments(const std::string& line) {
    const std::size_t end = line[0] == '"' ? line.find('"', 1) + 1 : line.find(' ');
    return end < line.size() ? line.substr(end) : "";
}

}  // namespace

int main() {
    const std::string line = GetCommandLineA();
    if (IsHeld(line)) {
        SayThatItWaits();
    }
    for (int polls = 0; IsHeld(line) && polls < 6000; ++polls) {
        Sleep(20);
    }
    std::string command = R"(C:\windows\system32\cmd-real.exe)" + Arguments(line);
    STARTUPINFOA start{};
    start.cb = sizeof start;
    PROCESS_INFORMATION process{};
    if (!CreateProcessA(nullptr, command.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &process)) {
        return 1;
    }
    WaitForSingleObject(process.hProcess, INFINITE);
    DWORD status = 1;
    GetExitCodeProcess(process.hProcess, &status);
    return static_cast<int>(status);
}
