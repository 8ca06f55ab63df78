// An error in the wizard's first moments, from the program's own entry.
#include "installer/windows/WizardEntry.h"

#include <gtest/gtest.h>

#include <log4cpp/LayoutAppender.hh>

#include <stdexcept>

#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

namespace {

/// Known to the log library, as any appender is, and not to be closed. Its name puts it before those of the wizard.
class Stubborn : public log4cpp::LayoutAppender {
public:
    Stubborn() : LayoutAppender("a") {}
    void close() override { throw std::runtime_error("this log cannot be closed"); }

protected:
    void _append(const log4cpp::LoggingEvent& /*event*/) override {}
};

TEST(WizardEntry, LogsAnErrorOfTheStartOfLoggingAndPassesItOn) {
    const Machine machine;
    {
        const Stubborn stubborn;
        CapturedStreams streams;
        EXPECT_THROW((void)HV::RunWizard(GetModuleHandleA(nullptr), SW_HIDE), std::runtime_error);
    }
    log4cpp::Appender::closeAll();
    const std::string log = machine.Content(R"(C:\ProgramData\Halvorn\Logs\Tessaly Suite Installer.log)");
    EXPECT_NE(
        log.find(" [FATAL] hvdeploy-detail: The installer ends because of an error that nothing catches: this log "
                 "cannot be closed"),
        std::string::npos)
        << log;
}

}  // namespace
