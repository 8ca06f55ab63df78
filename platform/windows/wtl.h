#pragma once

#include <string>
#include <vector>

#include "platform/windows/window.h"

/// The small part of WTL that the wizard needs, written for a compiler that has none.
namespace WTL {

/// The message loop of a thread.
class CMessageLoop {
public:
    /// Serves the windows of the calling thread until somebody calls PostQuitMessage, and gives the exit value of that
    /// call. Throws what a message handler of a window has thrown: an error that nothing catches ends a program with
    /// windows as it ends any other, and no window stays open that half works.
    int Run();

private:
    [[nodiscard]] static bool PreTranslateMessage(MSG& message);
};

/// The system's dialogue for the name of a file to save.
class CFileDialog {
public:
    /// `flags` are those of the platform. There is no filter of file types. `owner` may be null.
    CFileDialog(const wchar_t* defaultExtension, const wchar_t* fileName, DWORD flags, HWND owner);

    CFileDialog(const CFileDialog&) = delete;
    CFileDialog& operator=(const CFileDialog&) = delete;

    /// Asks the user. Gives IDOK, or IDCANCEL when there is no name to save under.
    [[nodiscard]] INT_PTR DoModal();

    /// The full path that the user has confirmed.
    [[nodiscard]] std::wstring GetFilePath() const { return path_.data(); }

    OPENFILENAMEW m_ofn{};

private:
    std::vector<wchar_t> path_;
};

}  // namespace WTL
