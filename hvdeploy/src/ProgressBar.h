#pragma once

#include <iosfwd>
#include <memory>

#include "hvdeploy/src/ProgressListener.h"

namespace HV {

/// A bar on the last line of a terminal, below whatever else the run prints there.
///
/// While it lives, what is written to `terminal` goes through it: a text that comes pushes the bar away, and the bar
/// returns below the text's last line. Texts and reports may come from several threads. The bar's last state stays on
/// the terminal, on a line of its own.
class ProgressBar : public ProgressListenerInterface {
public:
    explicit ProgressBar(std::ostream& terminal);
    ~ProgressBar() override;

    ProgressBar(const ProgressBar&) = delete;
    ProgressBar& operator=(const ProgressBar&) = delete;

    void update(std::uint32_t percent, const char* message, std::int32_t error) override;

private:
    class Screen;
    std::ostream& terminal;
    std::unique_ptr<Screen> screen;
};

}  // namespace HV
