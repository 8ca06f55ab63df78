// A pipe that cannot be opened is arranged for in another way on each target: here there is no command processor.
#include <cstdlib>

#include "tests/hvdeploy/SideActionsTest.h"

namespace {

/// The runtime finds neither the command processor by its variable nor one in the search path while it lives.
class NoCommandProcessor {
public:
    NoCommandProcessor() {
        _putenv_s("COMSPEC", R"(C:\nowhere\none.exe)");
        _putenv_s("PATH", R"(C:\nowhere)");
    }
    ~NoCommandProcessor() {
        _putenv_s("COMSPEC", processor_.c_str());
        _putenv_s("PATH", path_.c_str());
    }
    NoCommandProcessor(const NoCommandProcessor&) = delete;
    NoCommandProcessor& operator=(const NoCommandProcessor&) = delete;

private:
    std::string processor_ = std::getenv("COMSPEC");
    std::string path_ = std::getenv("PATH");
};

class PipeTest : public SideActionsTest {
protected:
    HV::EngineResult Run(const HV::PayloadScript& script) {
        machine.HasFolder(R"(C:\Extracted)");
        const NoCommandProcessor none;
        return engine.RunPreOrPostflight(script, HV::Package{fs::path(R"(C:\Extracted)")});
    }
};

}  // namespace

TEST_F(PipeTest, ThatCannotBeOpenedFailsTheScript) {
    HV::PayloadScript script;
    script.source = "run.bat";
    EXPECT_EQ(Run(script), -2);
    EXPECT_TRUE(log.Has(ErrorLine("script returned -1")));
}

TEST_F(PipeTest, ThatCannotBeOpenedFailsTheCommand) {
    HV::PayloadScript script;
    script.command = "echo hello";
    EXPECT_EQ(Run(script), -2);
    EXPECT_TRUE(log.Has(ErrorLine("command returned -1")));
}

TEST_F(PipeTest, ThatCannotBeOpenedIsPassedOverWhereFailureIs) {
    HV::PayloadScript script;
    script.command = "echo hello";
    script.id = "setup";
    script.failOnError = false;
    EXPECT_EQ(Run(script), 0);
    EXPECT_TRUE(log.Has(WarnLine("setup execution returned -1. Continuing")));
}
