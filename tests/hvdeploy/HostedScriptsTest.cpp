// A pipe that cannot be opened is arranged for in another way on each target: here no more files can be opened.
#include <sys/resource.h>

#include "tests/hvdeploy/SideActionsTest.h"

namespace {

class NoMoreFiles {
public:
    NoMoreFiles() {
        getrlimit(RLIMIT_NOFILE, &before_);
        rlimit none = before_;
        none.rlim_cur = 0;
        setrlimit(RLIMIT_NOFILE, &none);
    }
    ~NoMoreFiles() { setrlimit(RLIMIT_NOFILE, &before_); }
    NoMoreFiles(const NoMoreFiles&) = delete;
    NoMoreFiles& operator=(const NoMoreFiles&) = delete;

private:
    rlimit before_{};
};

class PipeTest : public SideActionsTest {
protected:
    HV::EngineResult Run(const HV::PayloadScript& script) {
        machine.HasFolder(R"(C:\Extracted)");
        const HV::Package package{fs::path(R"(C:\Extracted)")};
        const NoMoreFiles limit;
        return engine.RunPreOrPostflight(script, package);
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
