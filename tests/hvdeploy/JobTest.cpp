// The job: one line on a thread of its own, told to whoever polls.
#include "hvdeploy/src/DeployJob.h"

#include <boost/thread/condition_variable.hpp>

#include "tests/hvdeploy/CommandLineTest.h"

namespace {

/// A job that also keeps all its reports, and can hold its thread at one of them.
class RecordingJob : public HV::DeployJob {
public:
    using HV::DeployJob::DeployJob;

    void update(std::uint32_t newPercent, const char* message, std::int32_t newError) override {
        HV::DeployJob::update(newPercent, message, newError);
        boost::mutex::scoped_lock guard(gate_);
        reports_.push_back({newPercent, message, newError});
        threads_.push_back(boost::this_thread::get_id());
        changed_.notify_all();
        while (reports_.back().message == holdAt_) {
            changed_.wait(guard);
        }
    }

    /// From now on the thread stops inside the report of this message.
    void HoldAt(const std::string& message) {
        const boost::mutex::scoped_lock guard(gate_);
        holdAt_ = message;
        changed_.notify_all();
    }
    void WaitUntilHeld() {
        boost::mutex::scoped_lock guard(gate_);
        while (reports_.empty() || reports_.back().message != holdAt_) {
            changed_.wait(guard);
        }
    }
    void LetGo() { HoldAt("nowhere"); }

    std::vector<Report> Reports() {
        const boost::mutex::scoped_lock guard(gate_);
        return reports_;
    }
    std::vector<boost::thread::id> Threads() {
        const boost::mutex::scoped_lock guard(gate_);
        return threads_;
    }

private:
    boost::mutex gate_;
    boost::condition_variable changed_;
    std::vector<Report> reports_;
    std::vector<boost::thread::id> threads_;
    std::string holdAt_ = "nowhere";
};

class JobTest : public testing::Test {
protected:
    static PackageBuilder Glow() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("Glow.txt", "new");
    }
    static constexpr const char* kGlow = R"(C:\ProgramData\Halvorn\Glow.txt)";
    static constexpr const char* kLine = R"(dir=C:\Packages)";

    static std::vector<Report> RunToTheEnd(RecordingJob& job) {
        job.Start();
        job.thread->join();
        return job.Reports();
    }

    Machine machine;
    LogRecorder log;
};

TEST_F(JobTest, HasNothingBeforeItStarts) {
    const HV::DeployJob job("--verbose");
    EXPECT_EQ(job.commandLine, "--verbose");
    EXPECT_EQ(job.cli, nullptr);
    EXPECT_EQ(job.thread, nullptr);
    EXPECT_EQ(job.percent, 0U);
}

TEST_F(JobTest, InstallsOnItsThreadAndTellsItsListener) {
    (void)Glow().WriteTo(R"(C:\Packages)");
    RecordingJob job(kLine);
    const std::vector<Report> reports = RunToTheEnd(job);
    ASSERT_FALSE(reports.empty());
    EXPECT_EQ(reports.front(), (Report{1, "Preparing to install...", 0}));
    EXPECT_EQ(reports.back(), (Report{100, "Installation complete.", 0}));
    EXPECT_EQ(machine.Content(kGlow), "new");
    const boost::mutex::scoped_lock guard(job.lock);
    EXPECT_EQ(job.text, "Installation complete.");
    EXPECT_EQ(job.percent, 100U);
    EXPECT_EQ(job.error, 0);
}

TEST_F(JobTest, PreparesOnTheCallersThreadAndDoesTheRestOnItsOwn) {
    machine.HasFolder(R"(C:\Packages)");
    RecordingJob job(kLine);
    const std::vector<Report> reports = RunToTheEnd(job);
    const std::vector<boost::thread::id> threads = job.Threads();
    ASSERT_EQ(threads.size(), 4U) << log.Text();
    EXPECT_EQ(threads[0], boost::this_thread::get_id());
    EXPECT_NE(threads[1], boost::this_thread::get_id());
    EXPECT_EQ(threads[3], threads[1]);
}

TEST_F(JobTest, IsItsFrontEndsListener) {
    RecordingJob job("list=");
    (void)RunToTheEnd(job);
    EXPECT_EQ(job.cli->Listener(), &job);
}

TEST_F(JobTest, TellsOnceOfALineThatDoesNotParse) {
    RecordingJob job("help=me");
    EXPECT_EQ(RunToTheEnd(job),
              (std::vector<Report>{{1, "Preparing to install...", 0}, {kFailureMark, kFailureMessage, -1}}));
    EXPECT_FALSE(log.Has("INFO hvdeploy-detail: HV::DeployCLI::HV::DeployCLI::Run"));
}

TEST_F(JobTest, TellsOnceOfABlankLine) {
    RecordingJob job("  ");
    EXPECT_EQ(RunToTheEnd(job),
              (std::vector<Report>{{1, "Preparing to install...", 0}, {kFailureMark, kFailureMessage, -1}}));
}

TEST_F(JobTest, TellsTwiceOfARunThatFails) {
    RecordingJob job(R"(dir=C:\Nothing)");
    EXPECT_EQ(RunToTheEnd(job), (std::vector<Report>{{1, "Preparing to install...", 0},
                                                     {kFailureMark, kFailureMessage, -1},
                                                     {kFailureMark, kFailureMessage, -1}}));
    EXPECT_EQ(job.percent, kFailureMark);
    EXPECT_EQ(job.error, -1);
    EXPECT_EQ(job.text, kFailureMessage);
}

TEST_F(JobTest, TellsOnceOfACodeThatIsNoFailureOfTheRun) {
    // An exception may carry the code 1, which the run keeps to itself; to the job everything but 0 is an error.
    class ThrowingJob : public RecordingJob {
    public:
        using RecordingJob::RecordingJob;
        void update(std::uint32_t newPercent, const char* message, std::int32_t newError) override {
            RecordingJob::update(newPercent, message, newError);
            if (std::string(message) == "Checking packages to install...") {
                throw std::runtime_error("ERROR(1)");
            }
        }
    };
    machine.HasFolder(R"(C:\Packages)");
    ThrowingJob job(kLine);
    EXPECT_EQ(RunToTheEnd(job), (std::vector<Report>{{1, "Preparing to install...", 0},
                                                     {2, "Checking packages to install...", 0},
                                                     {kFailureMark, kFailureMessage, 1}}));
}

TEST_F(JobTest, ShowsAHundredJustBeforeTheFailureOfAFolder) {
    // The order is fixed; whoever polls must not take that hundred for a success.
    (void)Glow().Payload("resource").File("x.dll", "x").To("nowhere").WriteTo(R"(C:\Packages)");
    RecordingJob job(kLine);
    const std::vector<Report> reports = RunToTheEnd(job);
    ASSERT_GE(reports.size(), 5U);
    const std::vector<Report> end(reports.end() - 5, reports.end());
    EXPECT_EQ(end, (std::vector<Report>{{end[0].percent, "An error has occured", 0},
                                        {98, "Completing installation.", 0},
                                        {100, "Installation complete.", 0},
                                        {kFailureMark, kFailureMessage, -1},
                                        {kFailureMark, kFailureMessage, -1}}));
    EXPECT_LE(end[0].percent, 92U);
}

TEST_F(JobTest, IsCancelledFromAnotherThreadBeforeTheFirstPackage) {
    machine.Has(kGlow, "old");
    (void)Glow().WriteTo(R"(C:\Packages)");
    const auto before = machine.Files();
    RecordingJob job(kLine);
    job.HoldAt("Checking packages to install...");
    job.Start();
    job.WaitUntilHeld();
    job.cli->Cancel();
    job.LetGo();
    job.thread->join();
    EXPECT_TRUE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
    EXPECT_TRUE(log.Has("WARN hvdeploy-detail: Installation cancelled, rolling back..."));
    EXPECT_EQ(job.Reports(), (std::vector<Report>{{1, "Preparing to install...", 0},
                                                  {2, "Checking packages to install...", 0},
                                                  {2, "Installing packages...", 0},
                                                  {2, "Cancelling install...", 0},
                                                  {98, "Completing installation.", 0},
                                                  {100, "Installation complete.", 0},
                                                  {kFailureMark, kFailureMessage, -1},
                                                  {kFailureMark, kFailureMessage, -1}}));
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(JobTest, PutsTheOldFileBackWhenItIsCancelledInAPackage) {
    machine.Has(kGlow, "old");
    (void)Glow().WriteTo(R"(C:\Packages)");
    const auto before = machine.FilesWithoutFolders();
    RecordingJob job(kLine);
    job.HoldAt("Installing com.halvorn.glow.hvpkg...");
    job.Start();
    job.WaitUntilHeld();
    job.cli->Cancel();
    job.LetGo();
    job.thread->join();
    EXPECT_TRUE(log.Has("INFO hvdeploy-detail: Installation cancelled")) << log.Text();
    EXPECT_EQ(machine.FilesWithoutFolders(), before);
}

TEST_F(JobTest, CanBeReadWhileItRuns) {
    machine.HasFolder(R"(C:\Packages)");
    RecordingJob job(kLine);
    job.HoldAt("Checking packages to install...");
    job.Start();
    job.WaitUntilHeld();
    {
        const boost::mutex::scoped_lock guard(job.lock);
        EXPECT_EQ(job.text, "Checking packages to install...");
        EXPECT_EQ(job.percent, 2U);
    }
    job.LetGo();
    job.thread->join();
}

TEST_F(JobTest, MakesItsFrontEndAnewWhenItIsStartedAgain) {
    RecordingJob job("list=");
    (void)RunToTheEnd(job);
    EXPECT_EQ(machine.TempEntries().size(), 1U) << "the stash of the first engine";
    EXPECT_EQ(RunToTheEnd(job),
              (std::vector<Report>{{1, "Preparing to install...", 0}, {1, "Preparing to install...", 0}}));
    EXPECT_EQ(machine.TempEntries().size(), 1U) << "the first stash went with its engine";
}

TEST_F(JobTest, TakesItsEngineAlongAndLeavesItsThread) {
    boost::thread* thread = nullptr;
    {
        RecordingJob job("list=");
        job.Start();
        thread = job.thread;
        // The thread is done with the job, which may go; its handle belongs to the process.
        thread->join();
    }
    EXPECT_TRUE(machine.TempEntries().empty());
    EXPECT_FALSE(thread->joinable());
}

TEST_F(JobTest, RunsBesideAnotherJob) {
    (void)Glow().WriteTo(R"(C:\Packages)");
    RecordingJob first(kLine);
    RecordingJob second("list=");
    first.Start();
    second.Start();
    first.thread->join();
    second.thread->join();
    EXPECT_EQ(first.Reports().back(), (Report{100, "Installation complete.", 0}));
    EXPECT_EQ(second.Reports().size(), 1U);
}

}  // namespace
