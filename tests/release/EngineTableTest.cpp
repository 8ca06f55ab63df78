// The engine of a build with a release's rows. It can reach the table and does not ask it.
#include "hvframework/FileUtils.h"
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/RunProgram.h"

namespace {

using EngineTableTest = EngineTest;

const std::string kGlow = "com.halvorn.tessaly.glow.zip";

/// A package that has the name of one of the release's, and is another.
PackageBuilder ImpostorOfGlow() {
    return PackageBuilder("com.halvorn.tessaly.glow")
        .Named(kGlow)
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("impostor.dll", "other bytes");
}

TEST_F(EngineTableTest, FillsTheTableWhenTheEngineIsMade) {
    const HV::Deploy another(nullptr);
    EXPECT_EQ(log.Count(DebugLine("HV::Deploy::HV::Deploy::LoadValidationInfo")), 1U) << log.Text();
    ASSERT_EQ(another.KnownPackages().size(), 14U);
    const HV::ValidationInfo& glow = another.KnownPackages().at(kGlow);
    EXPECT_EQ(glow.displayName, "Tessaly Glow");
    EXPECT_EQ(glow.productId, "com.halvorn.tessaly.glow");
    EXPECT_EQ(glow.version, "4.2.0");
    EXPECT_EQ(glow.md5, HVL::FileUtils::GetFileMD5(HV_RELEASE_PACKAGES "/" + kGlow));
}

TEST_F(EngineTableTest, HoldsEveryRowUnderItsName) {
    std::vector<std::string> names;
    HV::GetValidationFileNames(names);
    std::size_t compared = 0;
    for (const std::string& name : names) {
        HV::ValidationInfo info;
        HV::GetValidationInfo(name, info);
        EXPECT_EQ(engine.KnownPackages().at(name).md5, info.md5);
        ++compared;
    }
    EXPECT_EQ(compared, engine.KnownPackages().size());
}

TEST_F(EngineTableTest, InstallsAPackageThatIsNotInTheTable) {
    ASSERT_FALSE(engine.KnownPackages().contains("com.halvorn.glow.hvpkg"));
    EXPECT_EQ(Install({Placing("glow")}), 1) << log.Text();
    EXPECT_EQ(machine.Content(Placed("glow")), "new");
}

TEST_F(EngineTableTest, InstallsAPackageWithAnotherDigestThanTheTableHas) {
    const PackageBuilder package = ImpostorOfGlow();
    ASSERT_TRUE(engine.KnownPackages().contains(kGlow));
    EXPECT_EQ(Install({package}), 1) << log.Text();
    EXPECT_EQ(machine.Content(InProgramData(R"(Halvorn\impostor.dll)")), "other bytes");
}

TEST_F(EngineTableTest, ValidatesAnUnknownPackageByItsContentsAlone) {
    HV::Package package(Placing("glow").WriteTo(kPackages));
    EXPECT_EQ(engine.ValidatePackage(package), 0);
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::Deploy::HV::Deploy::ValidatePackage")});
}

TEST_F(EngineTableTest, RefusesAKnownNameWhosePackageIsNotSound) {
    HV::Package package(PackageBuilder("com.halvorn.tessaly.glow").Named(kGlow).WithoutManifest().WriteTo(kPackages));
    EXPECT_EQ(engine.ValidatePackage(package), -1);
    EXPECT_TRUE(log.Has(ErrorLine("package.Validate() failed for " + kGlow))) << log.Text();
}

TEST_F(EngineTableTest, ValidationLooksAtThePayloadsToo) {
    HV::Package package(PackageBuilder("com.halvorn.glow").Payload("plugin").Source("not there").WriteTo(kPackages));
    EXPECT_EQ(engine.ValidatePackage(package), -1);
}

TEST(ProgramAndTable, TheShippedProgramInstallsAPackageThatIsNotInTheTable) {
    const Machine machine;
    (void)PackageBuilder("com.example.stranger")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("stranger.dll", "hello")
        .WriteTo(R"(C:\Packages)");
    const ProgramResult result = RunProgram("hvdeploy", {R"(dir=C:\Packages)"});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\stranger.dll)"), "hello");
}

}  // namespace
