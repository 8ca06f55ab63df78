// The listener that keeps the last report, and the arithmetic of the percentage.
#include "tests/hvdeploy/CommandLineTest.h"

#include <algorithm>

namespace {

using HV::ProgressListener;

TEST(ProgressListener, BeginsEmpty) {
    const ProgressListener listener;
    EXPECT_EQ(listener.text, "");
    EXPECT_EQ(listener.percent, 0U);
    EXPECT_EQ(listener.error, 0);
}

TEST(ProgressListener, KeepsTheLatestReport) {
    ProgressListener listener;
    listener.update(12, "first", 0);
    listener.update(13, "second", -4);
    EXPECT_EQ(listener.text, "second");
    EXPECT_EQ(listener.percent, 13U);
    EXPECT_EQ(listener.error, -4);
}

TEST(ProgressListener, ClearsTheTextForAnEmptyMessageAndKeepsTheNumbersCurrent) {
    ProgressListener listener;
    listener.update(12, "first", 0);
    listener.update(50, "", 3);
    EXPECT_EQ(listener.text, "");
    EXPECT_EQ(listener.percent, 50U);
    EXPECT_EQ(listener.error, 3);
}

TEST(ProgressListener, ClearsTheTextForANullMessage) {
    ProgressListener listener;
    listener.update(12, "first", 0);
    listener.update(50, nullptr, 3);
    EXPECT_EQ(listener.text, "");
    EXPECT_EQ(listener.percent, 50U);
    EXPECT_EQ(listener.error, 3);
}

TEST(ProgressListener, KeepsAMessageOf4096Characters) {
    ProgressListener listener;
    const std::string message(4096, 'm');
    listener.update(12, message.c_str(), 0);
    EXPECT_EQ(listener.text, message);
}

TEST(ProgressListener, PassesOverAMessageOf4097CharactersButNotItsNumbers) {
    ProgressListener listener;
    listener.update(12, "first", 0);
    listener.update(13, std::string(4097, 'm').c_str(), 5);
    EXPECT_EQ(listener.text, "first");
    EXPECT_EQ(listener.percent, 13U);
    EXPECT_EQ(listener.error, 5);
}

TEST(ProgressListener, KeepsTheMarkOfAFailedRun) {
    ProgressListener listener;
    listener.update(kFailureMark, kFailureMessage, -1);
    EXPECT_EQ(listener.percent, 0xFFFFFFFFU);
    EXPECT_EQ(listener.error, -1);
}

/// An engine with a recording listener, past its first report.
class ProgressTest : public testing::Test {
protected:
    ProgressTest() {
        log.Clear();
        listener.reports.clear();
    }

    std::uint32_t Percent() {
        engine.ReportProgress("where?", 0);
        return listener.reports.back().percent;
    }

    static PackageBuilder Product(const std::string& name, std::size_t bytes) {
        // Stored as it is, so that packages differ in size as told.
        return PackageBuilder("com.halvorn." + name)
            .Payload("resource")
            .To("programdata", "Halvorn")
            .Source(name + ".txt")
            .RawEntry(ArchiveEntry{.name = name + ".txt", .bytes = std::string(bytes, 'b'), .method = 0});
    }

    Machine machine;
    LogRecorder log;
    RecordingListener listener;
    HV::Deploy engine{&listener};
};

TEST_F(ProgressTest, BeginsAtOneWithAListener) {
    RecordingListener first;
    const HV::Deploy other(&first);
    EXPECT_EQ(first.reports, (std::vector<Report>{{1, "Preparing to install...", 0}}));
}

TEST_F(ProgressTest, BeginsAtZeroWithoutAListener) {
    HV::Deploy silent(nullptr);
    EXPECT_FALSE(log.Has("INFO hvdeploy-detail: Preparing to install..."));
    silent.SetListener(&listener);
    silent.ReportProgress("now", 0);
    EXPECT_EQ(listener.reports, (std::vector<Report>{{0, "now", 0}}));
}

TEST_F(ProgressTest, IsTruncatedToWholePercents) {
    engine.AddProgress(0.99F);
    EXPECT_EQ(Percent(), 1U);
    engine.AddProgress(0.02F);
    EXPECT_EQ(Percent(), 2U);
}

TEST_F(ProgressTest, StopsAddingAt97) {
    engine.AddProgress(96.0F);
    EXPECT_EQ(Percent(), 97U);
    engine.AddProgress(0.5F);
    EXPECT_EQ(Percent(), 97U);
    EXPECT_TRUE(log.Has("DEBUG hvdeploy-detail: Reporting progress: 97 msg: where? error: 0")) << log.Text();
    engine.AddProgress(1000.0F);
    EXPECT_EQ(Percent(), 97U);
}

TEST_F(ProgressTest, LogsWhatItReports) {
    engine.AddProgress(0.5F);
    engine.ReportProgress("a message", 0);
    EXPECT_EQ(log.Lines(),
              (std::vector<std::string>{"DEBUG hvdeploy-detail: Reporting progress: 1.5 msg: a message error: 0",
                                        "INFO hvdeploy-detail: a message"}));
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "a message", 0}}));
}

TEST_F(ProgressTest, LogsAnErrorWithItsMessage) {
    engine.ReportProgress("a message", -7);
    EXPECT_EQ(log.Lines(),
              (std::vector<std::string>{"DEBUG hvdeploy-detail: Reporting progress: 1 msg: a message error: -7",
                                        "ERROR hvdeploy-detail: a message - error: -7"}));
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "a message", -7}}));
}

TEST_F(ProgressTest, LogsAnErrorWithoutAMessageAsItsNumber) {
    engine.ReportProgress(nullptr, 9);
    EXPECT_EQ(log.Count("ERROR hvdeploy-detail: 9"), 1U) << log.Text();
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "(null)", 9}}));
}

TEST_F(ProgressTest, LogsNothingMoreWithNeither) {
    engine.ReportProgress(nullptr, 0);
    EXPECT_EQ(log.Lines().size(), 1U) << log.Text();
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "(null)", 0}}));
}

TEST_F(ProgressTest, LogsWithoutAListenerToo) {
    engine.SetListener(nullptr);
    engine.ReportProgress("a message", 0);
    EXPECT_TRUE(log.Has("INFO hvdeploy-detail: a message"));
}

TEST_F(ProgressTest, HasNoPointsForAPackageBeforeAFolderWasCounted) {
    EXPECT_EQ(engine.PackageProgressPoints(Product("glow", 100).WriteTo(R"(C:\Packages)")), 0.0F);
}

TEST_F(ProgressTest, SharesNinetyPointsByTheSizesOfTheFiles) {
    const fs::path small = Product("small", 1000).WriteTo(R"(C:\Packages)");
    const fs::path large = Product("large", 9000).WriteTo(R"(C:\Packages)");
    machine.Has(R"(C:\Packages\not-a-package.txt)", std::string(5000, 'n'));
    ASSERT_FALSE(HV::IsFailure(engine.DeployPackagesFromDirectory(fs::path(R"(C:\Packages)"), {}))) << log.Text();
    const auto total = static_cast<float>(fs::file_size(small) + fs::file_size(large));
    const auto share = [&](const fs::path& path) {
        return static_cast<float>(static_cast<double>(static_cast<float>(fs::file_size(path)) / total) * 90.0);
    };
    EXPECT_EQ(engine.PackageProgressPoints(small), share(small));
    EXPECT_EQ(engine.PackageProgressPoints(large), share(large));
    EXPECT_NEAR(share(small) + share(large), 90.0F, 0.001F);
}

TEST_F(ProgressTest, HasNoPointsForAnEmptyFile) {
    (void)Product("glow", 100).WriteTo(R"(C:\Packages)");
    ASSERT_FALSE(HV::IsFailure(engine.DeployPackagesFromDirectory(fs::path(R"(C:\Packages)"), {}))) << log.Text();
    machine.Has(R"(C:\empty.hvpkg)", "");
    EXPECT_EQ(engine.PackageProgressPoints(fs::path(R"(C:\empty.hvpkg)")), 0.0F);
}

TEST_F(ProgressTest, ReachesAtMost92BeforeTheLastTwoSteps) {
    for (const char* name : {"a", "b", "c", "d", "e"}) {
        (void)Product(name, 1000).WriteTo(R"(C:\Packages)");
    }
    ASSERT_FALSE(HV::IsFailure(engine.DeployPackagesFromDirectory(fs::path(R"(C:\Packages)"), {}))) << log.Text();
    const std::size_t count = listener.reports.size();
    ASSERT_GT(count, 10U);
    EXPECT_EQ(listener.reports[count - 2], (Report{98, "Completing installation.", 0}));
    EXPECT_EQ(listener.reports[count - 1], (Report{100, "Installation complete.", 0}));
    // 2 and five times 18, subject to rounding.
    EXPECT_GE(listener.reports[count - 3].percent, 91U);
    EXPECT_LE(listener.reports[count - 3].percent, 92U);
    EXPECT_TRUE(std::is_sorted(listener.reports.begin(), listener.reports.end(),
                               [](const Report& a, const Report& b) { return a.percent < b.percent; }));
}

TEST_F(ProgressTest, SpendsTheShareOfASkippedPackageAtOnce) {
    (void)Product("glow", 1000).WriteTo(R"(C:\Packages)");
    ASSERT_EQ(engine.DeployPackagesFromDirectory(fs::path(R"(C:\Packages)"), {"com.halvorn.glow"}), 0) << log.Text();
    EXPECT_EQ(listener.reports, (std::vector<Report>{{2, "Checking packages to install...", 0},
                                                     {2, "Installing packages...", 0},
                                                     {2, "Installing com.halvorn.glow.hvpkg", 0},
                                                     {92, "Installing packages...", 0},
                                                     {92, "Verifying installation...", 0},
                                                     {92, "Checking product dependencies...", 0},
                                                     {98, "Completing installation.", 0},
                                                     {100, "Installation complete.", 0}}));
}

TEST_F(ProgressTest, SaysNothingOfASkippedPackageThatHasNoPoints) {
    machine.Has(R"(C:\ProgramData\Halvorn\.hvdeploy\history\com.halvorn.glow_v9.0_hvmanifest.xml)", "newer");
    ASSERT_EQ(engine.DeployPackages({Product("glow", 1000).WriteTo(R"(C:\Packages)")}), 0) << log.Text();
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "Installing packages...", 0},
                                                     {1, "Verifying installation...", 0},
                                                     {1, "Checking product dependencies...", 0}}));
}

TEST_F(ProgressTest, StaysAtOneForASingleFile) {
    ASSERT_EQ(engine.DeployPackages({Product("glow", 1000).WriteTo(R"(C:\Packages)")}), 1) << log.Text();
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "Installing packages...", 0},
                                                     {1, "Installing com.halvorn.glow.hvpkg...", 0},
                                                     {1, "Verifying installation...", 0},
                                                     {1, "Checking product dependencies...", 0}}));
}

TEST_F(ProgressTest, StaysCancelledOnceCancelled) {
    engine.Cancel();
    EXPECT_TRUE(log.Has("DEBUG hvdeploy-detail: HV::Deploy::HV::Deploy::Cancel"));
    const fs::path package = Product("glow", 1000).WriteTo(R"(C:\Packages)");
    EXPECT_EQ(engine.DeployPackages({package}), -2);
    EXPECT_EQ(engine.DeployPackages({package}), -2);
    EXPECT_EQ(log.Count("INFO hvdeploy-detail: Cancelling install..."), 2U);
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn)"));
}

}  // namespace
