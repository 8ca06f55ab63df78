// How long a user waits for the wizard's window, beyond what reading and digesting the packages takes.
//
// start_up_time FOLDER [RUNS]: starts hvinstaller.exe in FOLDER several times, in turn with a program that does nothing
// but show a window, and digests the packages of FOLDER each time. Prints the medians in milliseconds.

#include <windows.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "hvframework/FileUtils.h"

namespace {

constexpr const char* kEmptyWindow = "An empty window";
constexpr double kMinute = 60000;

double Now() {
    LARGE_INTEGER ticks;
    LARGE_INTEGER perSecond;
    QueryPerformanceCounter(&ticks);
    QueryPerformanceFrequency(&perSecond);
    return 1000.0 * static_cast<double>(ticks.QuadPart) / static_cast<double>(perSecond.QuadPart);
}

double Median(std::vector<double> times) {
    std::sort(times.begin(), times.end());
    return times[times.size() / 2];
}

/// Milliseconds from the start of a program until a window with this title is to be seen and answers.
double TimeToWindow(std::string line, const char* title) {
    STARTUPINFOA start{};
    start.cb = sizeof start;
    PROCESS_INFORMATION process{};
    const double begin = Now();
    if (!CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, DETACHED_PROCESS, nullptr, nullptr, &start,
                        &process)) {
        std::fprintf(stderr, "cannot start %s\n", line.c_str());
        std::exit(1);
    }
    HWND window = nullptr;
    while ((window = FindWindowA(nullptr, title)) == nullptr || !IsWindowVisible(window)) {
        if (Now() - begin > kMinute) {
            std::fprintf(stderr, "no window \"%s\"\n", title);
            std::exit(1);
        }
        Sleep(1);
    }
    DWORD_PTR answer = 0;
    SendMessageTimeoutA(window, WM_NULL, 0, 0, SMTO_NORMAL, static_cast<UINT>(kMinute), &answer);
    const double time = Now() - begin;
    TerminateProcess(process.hProcess, 0);
    WaitForSingleObject(process.hProcess, static_cast<DWORD>(kMinute));
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
    return time;
}

double TimeToDigest(const std::string& folder) {
    const double begin = Now();
    for (const auto& entry : std::filesystem::directory_iterator(folder + "\\packages")) {
        if (HVL::FileUtils::GetFileMD5(entry.path().string()).empty()) {
            std::fprintf(stderr, "%s cannot be read\n", entry.path().string().c_str());
            std::exit(1);
        }
    }
    return Now() - begin;
}

int ShowEmptyWindow() {
    const HWND window = CreateWindowExA(0, "STATIC", kEmptyWindow, WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 600, 430,
                                        nullptr, nullptr, nullptr, nullptr);
    UpdateWindow(window);
    MSG message;
    while (GetMessageA(&message, nullptr, 0, 0) > 0) {
        DispatchMessageA(&message);
    }
    return 0;
}

}  // namespace

int main(int count, char** arguments) {
    if (count == 2 && std::strcmp(arguments[1], "--empty-window") == 0) {
        return ShowEmptyWindow();
    }
    if (count < 2) {
        std::fputs("usage: start_up_time FOLDER [RUNS]\n", stderr);
        return 1;
    }
    const std::string folder = arguments[1];
    const int runs = count > 2 ? std::max(std::atoi(arguments[2]), 1) : 9;
    std::vector<double> wizard;
    std::vector<double> digests;
    std::vector<double> empty;
    for (int run = 0; run < runs; ++run) {
        wizard.push_back(TimeToWindow("\"" + folder + "\\hvinstaller.exe\"", "Tessaly Suite Installer"));
        digests.push_back(TimeToDigest(folder));
        empty.push_back(TimeToWindow(std::string("\"") + arguments[0] + "\" --empty-window", kEmptyWindow));
    }
    const double beyond = Median(wizard) - Median(digests);
    std::printf("until the wizard's window answers   %7.1f ms, the median of %d\n", Median(wizard), runs);
    std::printf("reading and digesting its packages  %7.1f ms\n", Median(digests));
    std::printf("until an empty window answers       %7.1f ms\n", Median(empty));
    std::printf("start-up beyond the digests         %7.1f ms, %.2f times an empty window's\n", beyond,
                beyond / Median(empty));
    return 0;
}
