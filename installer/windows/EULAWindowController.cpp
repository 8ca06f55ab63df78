#include "installer/windows/EULAWindowController.h"

#include <cstdio>
#include <memory>

#include "installer/windows/EULAWindow.h"
#include "platform/command_processor.h"
#include "platform/utf8.h"
#include "platform/windows/wtl.h"

namespace HV {

namespace {

// Explorer style, resizable, with a hook, without a read-only box, asking before it overwrites.
constexpr DWORD kSaveFlags = 0x880026;

}  // namespace

void EULAWindowController::ShowAgreement() {
    auto viewer = std::make_unique<EULAWindow>(*this);
    if (!viewer->CreateCentered()) {
        return;
    }
    // From here on the window owns itself.
    window_ = viewer.release();
    ::ShowWindow(*window_, SW_SHOW);
}

void EULAWindowController::SaveAgreement(const std::string& text, const ATL::CWindow& viewer) {
    WTL::CFileDialog dialog(L"rtf", L"Halvorn Software License", kSaveFlags, viewer);
    const INT_PTR answer = dialog.DoModal();
    // The dialogue makes the folder that the user looks into the current one, which may be anybody's.
    platform::EnterSystemFolder();
    if (answer == IDOK) {
        WriteAgreement(platform::Utf8FromWide(dialog.GetFilePath()), text);
    }
}

void EULAWindowController::Forget(const EULAWindow& viewer) {
    if (window_ == &viewer) {
        window_ = nullptr;
    }
}

void WriteAgreement(const std::string& path, const std::string& text) {
    FILE* file = nullptr;
    if (fopen_s(&file, path.c_str(), "w") != 0) {
        return;
    }
    std::fwrite(text.data(), 1, text.size(), file);
    std::fclose(file);
}

}  // namespace HV
