// The walk over a package's payloads: what is passed over, what a cancel and the points do.
#include "tests/hvdeploy/engine/EngineTest.h"

namespace {

constexpr const char* kThere = R"(C:\Data\there.txt)";
constexpr const char* kMissing = R"(C:\Data\missing.txt)";
constexpr const char* kKey = R"(HKEY_LOCAL_MACHINE\SOFTWARE\Halvorn\Glow)";

class PayloadWalkTest : public EngineTest {
protected:
    PayloadWalkTest() {
        machine.Has(kThere, "x");
        machine.Loads("REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\Glow]\n");
    }
    static HV::Precondition Condition(HV::PreconditionType type, HV::MatchPolicy policy, const std::string& target) {
        HV::Precondition condition;
        condition.type = type;
        condition.matchPolicy = policy;
        condition.target = target;
        return condition;
    }
    static HV::Precondition File(HV::MatchPolicy policy, const std::string& target) {
        return Condition(HV::PreconditionType::File, policy, target);
    }
    static HV::Precondition Key(HV::MatchPolicy policy, const std::string& target) {
        return Condition(HV::PreconditionType::RegKey, policy, target);
    }
    int Decide(const std::vector<HV::Precondition>& conditions) const {
        HV::Payload payload;
        payload.preconditions = conditions;
        return engine.CheckPayloadPreconditions(payload);
    }
    static constexpr HV::MatchPolicy skip = HV::MatchPolicy::Skip;
    static constexpr HV::MatchPolicy force = HV::MatchPolicy::Force;
};

}  // namespace

TEST_F(PayloadWalkTest, DecidesNothingWithoutConditions) {
    EXPECT_EQ(Decide({}), -1);
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::CheckPayloadPreconditions")));
}
TEST_F(PayloadWalkTest, DecidesNothingWhenNoConditionHolds) {
    EXPECT_EQ(Decide({File(skip, kMissing), File(force, kMissing), Key(skip, std::string(kKey) + "\\None")}), -1);
}
TEST_F(PayloadWalkTest, SkipsForAFileThatIsThere) {
    EXPECT_EQ(Decide({File(skip, kThere)}), 0);
}
TEST_F(PayloadWalkTest, SkipsForAKeyThatIsThere) {
    EXPECT_EQ(Decide({Key(skip, kKey)}), 0);
}
TEST_F(PayloadWalkTest, DoesNotTakeAFolderForAFile) {
    EXPECT_EQ(Decide({File(skip, R"(C:\Data)")}), -1);
}
TEST_F(PayloadWalkTest, ForcesForAFileThatIsThere) {
    EXPECT_EQ(Decide({File(force, kThere)}), 1);
}
TEST_F(PayloadWalkTest, ForcesForAKeyThatIsThere) {
    EXPECT_EQ(Decide({Key(force, kKey)}), 1);
}
TEST_F(PayloadWalkTest, LetsForceWinBeforeSkip) {
    EXPECT_EQ(Decide({File(force, kThere), File(skip, kThere)}), 1);
}
TEST_F(PayloadWalkTest, LetsForceWinAfterSkip) {
    EXPECT_EQ(Decide({File(skip, kThere), File(force, kThere)}), 1);
}
TEST_F(PayloadWalkTest, KeepsSkipWhenALaterForceDoesNotHold) {
    EXPECT_EQ(Decide({File(skip, kThere), File(force, kMissing)}), 0);
}
TEST_F(PayloadWalkTest, TakesAKeyOfNoRootForAMissingOne) {
    EXPECT_EQ(Decide({Key(skip, R"(NOWHERE\Halvorn)")}), -1);
}

TEST_F(PayloadWalkTest, PassesOverAPayloadWhoseConditionSkipsIt) {
    EXPECT_EQ(Install({Placing("glow").Condition("file", "skip", kThere)}), 0);
    EXPECT_TRUE(log.Has(DebugLine("Precondition negative result: skipping payload payload-1"))) << log.Text();
    EXPECT_FALSE(machine.Exists(Placed("glow")));
}

TEST_F(PayloadWalkTest, PlacesAPayloadWhoseConditionForcesIt) {
    EXPECT_EQ(Install({Placing("glow").Condition("file", "skip", kThere).Condition("regkey", "force", kKey)}), 1);
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}

TEST_F(PayloadWalkTest, RunsNoPreflightOfAPayloadThatIsPassedOver) {
    EXPECT_EQ(Install({Placing("glow").Condition("file", "skip", kThere).Preflight("exit 512")}), 0) << log.Text();
}

TEST_F(PayloadWalkTest, APayloadThatIsPassedOverDoesNotCountForTheResult) {
    EXPECT_EQ(
        Install({Placing("glow").Payload("resource").To("nowhere").File("a", "b").Condition("file", "skip", kThere)}),
        1);
}

TEST_F(PayloadWalkTest, PassesOverPayloadsOfAnotherSystem) {
    EXPECT_EQ(Install({Placing("glow").Payload("resource").Id("other").Os("mac").To("nowhere").File("a", "b")}), 1);
    EXPECT_TRUE(log.Has(DebugLine("Skipping Payload (reason: non-supported OS): other "))) << log.Text();
}

// 90 points; a quarter for the first report; 29.916 for each of three payloads of this system. That of the payload
// that is passed over comes in the end, with no report of its own.
TEST_F(PayloadWalkTest, SpendsTheShareOfAPayloadThatIsPassedOverInTheEnd) {
    Ships(Placing("glow")
              .Condition("file", "skip", kThere)
              .Payload("resource")
              .Os("mac")
              .To("ofx")
              .File("mac", "x")
              .Payload("resource")
              .To("programdata", "Halvorn")
              .File("a.dll", "x")
              .Payload("resource")
              .To("programdata", "Halvorn")
              .File("b.dll", "x"));
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_EQ(
        std::vector<std::string>(listener.reports.begin() + 4, listener.reports.end() - 2),
        (std::vector<std::string>{"2 Installing com.halvorn.glow.hvpkg...", "32 Installing com.halvorn.glow.hvpkg...",
                                  "62 Installing com.halvorn.glow.hvpkg...", "92 Verifying installation...",
                                  "92 Checking product dependencies..."}));
}

TEST_F(PayloadWalkTest, SpendsWhatIsLeftWhenAPayloadFails) {
    Ships(Failing("glow").Payload("resource").To("programdata").File("a", "b"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(HasReported("92 An error has occured")) << log.Text();
}

TEST_F(PayloadWalkTest, AFailedPayloadEndsTheWalkAndGoesBack) {
    machine.Has(Placed("glow"), "old");
    EXPECT_EQ(Install({Placing("glow")
                           .Payload("resource")
                           .To("nowhere")
                           .File("a", "b")
                           .Payload("resource")
                           .To("programdata", "Halvorn")
                           .File("never.dll", "x")}),
              -2);
    EXPECT_TRUE(log.Has(ErrorLine("Installation cannot complete, rolling back; error value is -2")));
    EXPECT_EQ(machine.Content(Placed("glow")), "old");
    EXPECT_FALSE(log.Has(DebugLine("HV::Deploy::DeployPayload payload-3 fromPackage com.halvorn.glow.hvpkg")));
}

TEST_F(PayloadWalkTest, ACancelIsSeenAfterThePayload) {
    machine.Has(Placed("glow"), "old");
    listener.onReport = [this](std::size_t) {
        if (listener.reports.back() == "1 Installing com.halvorn.glow.hvpkg...") {
            engine.Cancel();
        }
    };
    EXPECT_EQ(Install({Placing("glow").Postflight("exit 512").Payload("resource").To("programdata").File("a", "b")}),
              -2);
    EXPECT_TRUE(log.Has(InfoLine("Installation cancelled"))) << log.Text();
    EXPECT_TRUE(log.Has(ErrorLine("Installation cannot complete, rolling back; error value is -2")));
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Postflight command")).size(), 0U);
    EXPECT_EQ(machine.Content(Placed("glow")), "old");
    EXPECT_EQ(listener.reports.back(), "1 Cancelling install...");
}

TEST_F(PayloadWalkTest, APayloadThatIsThereForItsScriptsPlacesNothing) {
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow").Payload("script").Deployment("run").File("a", "b")}), 0);
}
