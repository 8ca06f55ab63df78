// The script that deletes the installed files itself, byte for byte as it lies on disk.
#include <gtest/gtest.h>

#include "hvdeploy/src/ScriptMaker.h"
#include "hvdeploy/src/UninstallScripts.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

class StandaloneScriptTest : public testing::Test {
protected:
    static HV::Package PackageNamed(const std::string& product, const std::string& version = "2.0") {
        const PackageBuilder builder =
            PackageBuilder(product).Version(version).Payload("resource").To("temp").File("Glow.txt", "text");
        HV::Package package(builder.WriteTo(R"(C:\Packages)"));
        EXPECT_TRUE(package.Validate(false));
        return package;
    }

    bool Write(const std::vector<std::string>& files, const HV::Package& package, const std::string& extraPath = "") {
        return scripts.WriteStandaloneUninstallScript(path, files, package, product, extraPath);
    }

    std::string Script() const { return machine.Content(path); }

    Machine machine;
    HV::UninstallScripts scripts;
    HVL::ProductData product = Tessaly();
    std::string path;
    HV::Package glow = PackageNamed("com.halvorn.glow");
    HV::Package flare = PackageNamed("com.halvorn.flare", "1.5");
};

const std::string kGlowEcho = EchoOnDisk("com.halvorn.glow.hvpkg", "2.0");
const std::string kFlareEcho = EchoOnDisk("com.halvorn.flare.hvpkg", "1.5");
const std::string kSuiteEcho = EchoOnDisk("Tessaly Suite", "3.1");
const std::string kEntryRemoval = RegistryOnDisk("Tessaly Suite v3.1");

}  // namespace

TEST(ScriptMaker, MakesBatchFiles) {
    EXPECT_EQ(HV::ScriptMaker().GetScriptExtension(), ".bat");
}

TEST(ScriptMaker, BeginsWithBareCarriageReturnsAndWithoutAnEqualsSign) {
    EXPECT_EQ(HV::ScriptMaker().GetHeader(),
              "@echo off\rSET SCRIPT_NAME%0\rSET SCRIPT_DIR=%~dp0\rSET SCRIPT_PATH=%SCRIPT_DIR%%SCRIPT_NAME%\r");
}

TEST(ScriptMaker, QuotesPathsAndNoTexts) {
    EXPECT_EQ(HV::ScriptMaker().MakeEchoLine("a \"b\" & c"), "echo a \"b\" & c");
    EXPECT_EQ(HV::ScriptMaker().MakeDeleteLine(R"(C:\R&D\a.txt)"), R"(CALL DEL /S /F /Q "C:\R&D\a.txt")");
}

TEST(ScriptMaker, EndsLinesInLineFeeds) {
    HV::ScriptMaker script;
    script.AddLine("one");
    script.AddEmptyLine();
    script.AddLine("two");
    EXPECT_EQ(script.GetText(), "one\n\ntwo\n");
}

TEST_F(StandaloneScriptTest, IsNamedAfterTheProduct) {
    EXPECT_EQ(HV::GetUninstallScriptPath(glow, product), kScriptPath);
}

TEST_F(StandaloneScriptTest, IsNamedAfterThePackageWithoutAnIdentifierOrAVersion) {
    const std::string expected = R"(C:\ProgramData\Halvorn\uninstall\uninstall-com.halvorn.glow.hvpkg_v2.0.bat)";
    int seen = 0;
    for (const std::string key : {"identifier", "version"}) {
        HVL::ProductData without = Tessaly();
        without.SetValue(key, "");
        EXPECT_EQ(HV::GetUninstallScriptPath(glow, without), expected) << key;
        ++seen;
    }
    EXPECT_EQ(seen, 2);
}

TEST_F(StandaloneScriptTest, BeginsWithHeaderAndProduct) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)", R"(C:\b\Glow presets.ffx)"}, glow));
    EXPECT_EQ(path, kScriptPath);
    EXPECT_EQ(Script(), kHeaderOnDisk + kSuiteEcho + kGlowEcho + DeleteOnDisk(R"(C:\a\Glow.aex)") +
                            DeleteOnDisk(R"(C:\b\Glow presets.ffx)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, GrowsByASegmentForEachPackage) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    EXPECT_TRUE(Write({R"(C:\a\Flare.aex)"}, flare));
    EXPECT_EQ(Script(), kHeaderOnDisk + kSuiteEcho + kGlowEcho + DeleteOnDisk(R"(C:\a\Glow.aex)") + kEntryRemoval +
                            kFlareEcho + DeleteOnDisk(R"(C:\a\Flare.aex)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, RepeatsAllButTheDeleteLinesOfAPackageThatIsInIt) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    const std::string before = Script();
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)", R"(C:\a\New.aex)"}, glow));
    EXPECT_EQ(Script(), before + kGlowEcho + DeleteOnDisk(R"(C:\a\New.aex)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, IsReadAgainByALaterRun) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    const std::string before = Script();
    EXPECT_TRUE(HV::UninstallScripts().WriteStandaloneUninstallScript(path, {R"(C:\a\Glow.aex)", R"(C:\a\New.aex)"},
                                                                      glow, product, ""));
    EXPECT_EQ(Script(), before + kGlowEcho + DeleteOnDisk(R"(C:\a\New.aex)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, IsReadAgainWhenSomebodyElseHasTouchedIt) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    machine.Has(path, DeleteOnDisk(R"(C:\a\Other.aex)"));
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)", R"(C:\a\Other.aex)"}, glow));
    EXPECT_EQ(Script(),
              DeleteOnDisk(R"(C:\a\Other.aex)") + kGlowEcho + DeleteOnDisk(R"(C:\a\Glow.aex)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, BeginsAnewWhenItHasBeenDeleted) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    const std::string before = Script();
    EXPECT_EQ(fs::remove(fs::path(path)), true);
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    EXPECT_EQ(Script(), before);
}

TEST_F(StandaloneScriptTest, ComparesWithEarlierSegmentsAlone) {
    const std::string line = DeleteOnDisk(R"(C:\a\Glow.aex)");
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)", R"(C:\a\Glow.aex)"}, glow, R"(C:\a\Glow.aex)"));
    EXPECT_EQ(Script(), kHeaderOnDisk + kSuiteEcho + kGlowEcho + line + line + line + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, TellsPathsApartByEveryByte) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    const std::string before = Script();
    EXPECT_TRUE(Write({R"(C:\a\glow.aex)", R"(C:\a\Glow.ae)"}, glow));
    EXPECT_EQ(Script(),
              before + kGlowEcho + DeleteOnDisk(R"(C:\a\glow.aex)") + DeleteOnDisk(R"(C:\a\Glow.ae)") + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, TreatsTheExtraPathAsOneFileMore) {
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow, R"(C:\a\extra)"));
    const std::string before = Script();
    EXPECT_EQ(before, kHeaderOnDisk + kSuiteEcho + kGlowEcho + DeleteOnDisk(R"(C:\a\Glow.aex)") +
                          DeleteOnDisk(R"(C:\a\extra)") + kEntryRemoval);
    EXPECT_TRUE(Write({}, flare, R"(C:\a\extra)"));
    EXPECT_EQ(Script(), before + kFlareEcho + kEntryRemoval);
}

TEST_F(StandaloneScriptTest, KeepsAnAmpersandInsideTheQuotes) {
    EXPECT_TRUE(Write({R"(C:\R&D\Glow.aex)"}, glow));
    EXPECT_NE(Script().find("\r\nCALL DEL /S /F /Q \"C:\\R&D\\Glow.aex\"\r\n"), std::string::npos);
}

TEST_F(StandaloneScriptTest, HasNoProductSegmentWithoutADisplayName) {
    product.SetValue("display_name", "");
    EXPECT_TRUE(Write({}, glow));
    EXPECT_EQ(Script(), kHeaderOnDisk + kGlowEcho + RegistryOnDisk(" v3.1"));
}

TEST_F(StandaloneScriptTest, GoesWhereItsCallerSays) {
    path = R"(C:\Scripts\of\mine.bat)";
    EXPECT_TRUE(Write({}, glow));
    EXPECT_EQ(path, R"(C:\Scripts\of\mine.bat)");
    EXPECT_EQ(Script(), kHeaderOnDisk + kSuiteEcho + kGlowEcho + kEntryRemoval);
    EXPECT_FALSE(machine.Exists(kScriptPath));
}

TEST_F(StandaloneScriptTest, CountsAsWrittenWhereItCannotBeWritten) {
    machine.Has(R"(C:\ProgramData\Halvorn\uninstall)", "a file in the folder's place");
    const auto before = machine.Files();
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(StandaloneScriptTest, CountsAsWrittenWhereAFolderHasItsName) {
    machine.HasFolder(kScriptPath);
    EXPECT_TRUE(Write({R"(C:\a\Glow.aex)"}, glow));
    EXPECT_FALSE(machine.HasFile(kScriptPath));
}

TEST_F(StandaloneScriptTest, NamesEachOfManyFilesOnce) {
    constexpr int count = 20000;
    std::vector<std::string> files;
    std::string deletes;
    for (int i = 0; i < count; ++i) {
        files.push_back(R"(C:\Program Files\Halvorn\presets\)" + std::to_string(i) + ".ffx");
        deletes += DeleteOnDisk(files.back());
    }
    EXPECT_TRUE(Write(files, glow));
    EXPECT_TRUE(Write(files, flare));
    EXPECT_EQ(Script(), kHeaderOnDisk + kSuiteEcho + kGlowEcho + deletes + kEntryRemoval + kFlareEcho + kEntryRemoval);
}
