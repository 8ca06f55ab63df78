#pragma once

#include <string>

#include "platform/windows/atl.h"

namespace HV {

class EULAWindow;

/// Opens viewers of the licence agreement, any number of them, and saves the agreement for them.
class EULAWindowController {
public:
    EULAWindowController() = default;
    virtual ~EULAWindowController() = default;

    EULAWindowController(const EULAWindowController&) = delete;
    EULAWindowController& operator=(const EULAWindowController&) = delete;

    /// Opens one more viewer, and remembers it in place of an earlier one, which stays open.
    void ShowAgreement();

    /// Asks for a file on behalf of `viewer` and writes the text to it in text mode. Nothing is written when the user
    /// cancels; a failure is not reported.
    void SaveAgreement(const std::string& text, const ATL::CWindow& viewer);

    /// `viewer` has been closed.
    void Forget(const EULAWindow& viewer);

private:
    EULAWindow* window_ = nullptr;  // the viewer that was opened last, unless it has been closed
};

/// Writes the agreement to the file `path` in text mode, replacing it. A failure is not reported.
void WriteAgreement(const std::string& path, const std::string& text);

}  // namespace HV
