// The script that calls the separate uninstaller, byte for byte as it lies on disk.
#include <gtest/gtest.h>

#include "hvdeploy/src/UninstallScripts.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

std::string CallOnDisk(const std::string& identifier, const std::string& version) {
    return R"(CALL "C:\Program Files\Halvorn\Services\hvuninstaller" command=uninstall identifier=)" + identifier +
           " version=" + version + "\r\n";
}

class ServiceScriptTest : public testing::Test {
protected:
    static HV::Package PackageNamed(const std::string& product, const std::string& version) {
        HV::Package package(PackageBuilder(product).Version(version).WriteTo(R"(C:\Packages)"));
        EXPECT_TRUE(package.Validate(false));
        return package;
    }

    /// Gives what is printed meanwhile.
    std::string Write(const HV::Package& package) { return Write(scripts, package); }
    std::string Write(HV::UninstallScripts& writer, const HV::Package& package) {
        CapturedStreams streams;
        EXPECT_TRUE(writer.WriteServiceUninstallScript(path, package, product));
        return streams.Output();
    }

    std::string Script() const { return machine.Content(path); }

    static std::string Segment(const std::string& product, const std::string& version) {
        return EchoOnDisk(product + ".hvpkg", version) + CallOnDisk(product, version) +
               RegistryOnDisk("Tessaly Suite v3.1");
    }
    static std::string Start() {
        return kHeaderOnDisk + EchoOnDisk("Tessaly Suite", "3.1") + CallOnDisk("com.halvorn.tessaly", "3.1") + "\r\n";
    }

    Machine machine;
    HV::UninstallScripts scripts;
    HVL::ProductData product = Tessaly();
    std::string path;
    HV::Package glow = PackageNamed("com.halvorn.glow", "2.0");
};

}  // namespace

TEST_F(ServiceScriptTest, BeginsWithHeaderAndProduct) {
    EXPECT_EQ(Write(glow),
              "DEBUG uninstall script does not exist at " + std::string(kScriptPath) + ", creating it...\n");
    EXPECT_EQ(path, kScriptPath);
    EXPECT_EQ(Script(), Start() + Segment("com.halvorn.glow", "2.0"));
}

TEST_F(ServiceScriptTest, GrowsByASegmentForEachPackage) {
    (void)Write(glow);
    EXPECT_EQ(Write(PackageNamed("com.halvorn.flare", "1.5")), "");
    EXPECT_EQ(Script(), Start() + Segment("com.halvorn.glow", "2.0") + Segment("com.halvorn.flare", "1.5"));
}

TEST_F(ServiceScriptTest, HoldsAPackageOnce) {
    (void)Write(glow);
    const std::string before = Script();
    EXPECT_EQ(Write(glow), "");
    EXPECT_EQ(Script(), before);
    HV::UninstallScripts ofALaterRun;
    EXPECT_EQ(Write(ofALaterRun, glow), "");
    EXPECT_EQ(Script(), before);
}

TEST_F(ServiceScriptTest, HoldsTwoVersionsOfAPackage) {
    (void)Write(glow);
    (void)Write(PackageNamed("com.halvorn.glow", "2.1"));
    EXPECT_EQ(Script(), Start() + Segment("com.halvorn.glow", "2.0") + Segment("com.halvorn.glow", "2.1"));
}

TEST_F(ServiceScriptTest, TakesAVersionThatAnotherBeginsWithForKnown) {
    // The search is for a text, and "version=2" is in "version=2.0".
    (void)Write(glow);
    const std::string before = Script();
    (void)Write(PackageNamed("com.halvorn.glow", "2"));
    EXPECT_EQ(Script(), before);
}

TEST_F(ServiceScriptTest, TakesTheSuitesOwnCallForThePackageOfThatName) {
    (void)Write(glow);
    const std::string before = Script();
    (void)Write(PackageNamed("com.halvorn.tessaly", "3.1"));
    EXPECT_EQ(Script(), before);
}

TEST_F(ServiceScriptTest, HasNoProductSegmentWithoutADisplayName) {
    product.SetValue("display_name", "");
    (void)Write(glow);
    EXPECT_EQ(Script(), kHeaderOnDisk + EchoOnDisk("com.halvorn.glow.hvpkg", "2.0") +
                            CallOnDisk("com.halvorn.glow", "2.0") + RegistryOnDisk(" v3.1"));
}

TEST_F(ServiceScriptTest, CountsAsWrittenWhereItCannotBeWritten) {
    machine.Has(R"(C:\ProgramData\Halvorn\uninstall)", "a file in the folder's place");
    const auto before = machine.Files();
    (void)Write(glow);
    EXPECT_EQ(machine.Files(), before);
}
