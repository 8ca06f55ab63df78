#include <gtest/gtest.h>

#include <chrono>
#include <thread>

#include "platform/utf8.h"
#include "tests/support/HostLink.h"
#include "tests/support/HostProgramWindows.h"

namespace {

/// Until there is something at `path` or, as told, nothing.
void WaitUntil(bool isThere, const std::string& path) {
    using namespace std::chrono_literals;
    const std::wstring name = platform::WideFromUtf8(path);
    const auto deadline = std::chrono::steady_clock::now() + 60s;
    while ((GetFileAttributesW(name.c_str()) != INVALID_FILE_ATTRIBUTES) != isThere) {
        if (std::chrono::steady_clock::now() > deadline) {
            ADD_FAILURE() << "the host has not done it: " << path;
            return;
        }
        std::this_thread::sleep_for(5ms);
    }
}

}  // namespace

HostLink::HostLink(const Machine&, const std::string& path, const std::string& target) : path_(path) {
    if (StartOnHost(L"ln", L"ln -sT \"" + NameOnHost(target) + L"\" \"" + NameOnHost(path) + L"\"", nullptr)) {
        WaitUntil(true, path);
    }
}

HostLink::~HostLink() {
    if (StartOnHost(L"rm", L"rm -f \"" + NameOnHost(path_) + L"\"", nullptr)) {
        WaitUntil(false, path_);
    }
}
