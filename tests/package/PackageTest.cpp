#include "package/Package.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <type_traits>

#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

const char* const kFolder = R"(C:\packages)";

std::string Error(const std::string& text) {
    return "ERROR hvdeploy-detail: " + text;
}
std::string Warning(const std::string& text) {
    return "WARN hvdeploy-detail: " + text;
}

/// A clean machine with one package on it.
class PackageTest : public testing::Test {
protected:
    bool Validate(bool metadataOnly = false) {
        HV::Package written(package.WriteTo(kFolder));
        return written.Validate(metadataOnly);
    }

    Machine machine;
    LogRecorder log;
    PackageBuilder package{"com.halvorn.glow"};
};

TEST_F(PackageTest, IsMadeOverAFileOfEitherExtension) {
    const HV::Package hvpkg(package.WriteTo(kFolder));
    EXPECT_EQ(hvpkg.zipPath.string(), R"(C:\packages\com.halvorn.glow.hvpkg)");
    EXPECT_TRUE(hvpkg.extractedPath.empty());
    EXPECT_FALSE(hvpkg.IsExtracted());
    const HV::Package zip(package.Named("glow.zip").WriteTo(kFolder));
    EXPECT_EQ(zip.zipPath.string(), R"(C:\packages\glow.zip)");
}

TEST_F(PackageTest, ThrowsForAMissingFile) {
    try {
        const HV::Package missing(fs::path(R"(C:\packages\a.hvpkg)"));
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), R"(File not found at path C:\packages\a.hvpkg)");
    }
}

TEST_F(PackageTest, ThrowsForAFolderWithThePackagesExtension) {
    machine.HasFolder(R"(C:\packages\a.zip)");
    EXPECT_THROW(HV::Package(fs::path(R"(C:\packages\a.zip)")), std::runtime_error);
}

TEST_F(PackageTest, TheExtensionIsComparedExactly) {
    const HV::Package upper(package.Named("a.HVPKG").WriteTo(kFolder));
    EXPECT_TRUE(upper.zipPath.empty());
    EXPECT_TRUE(upper.extractedPath.empty());
    HV::Package again = upper;
    EXPECT_FALSE(again.Validate(false));
    EXPECT_EQ(log.Lines(), std::vector{Warning("In HV::Package::Validate - zip does not exist at ")});
}

TEST_F(PackageTest, OverAFolderIsExtractedFromTheStart) {
    machine.HasFolder(R"(C:\unpacked)");
    HV::Package unpacked{fs::path(R"(C:\unpacked)")};
    EXPECT_TRUE(unpacked.zipPath.empty());
    EXPECT_TRUE(unpacked.IsExtracted());
    EXPECT_FALSE(unpacked.Validate(false));
    EXPECT_EQ(log.Lines(), std::vector{Warning("In HV::Package::Validate - zip does not exist at ")});
}

TEST_F(PackageTest, OverNothingIsNothingAndDoesNotThrow) {
    const HV::Package nothing{fs::path(R"(C:\nowhere)")};
    EXPECT_TRUE(nothing.zipPath.empty());
    EXPECT_TRUE(nothing.extractedPath.empty());
    EXPECT_FALSE(nothing.IsExtracted());
}

TEST_F(PackageTest, ASoundOneIsValidAndSilent) {
    package.Payload("plugin").File("plugins/Glow.aex", "bytes").Folder("empty");
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_TRUE(written.Validate(false)) << log.Text();
    EXPECT_EQ(written.zipFiles, (std::vector<std::string>{"_hvmanifest.xml", "plugins/Glow.aex"}));
    EXPECT_EQ(written.zipDirs, (std::vector<std::string>{"plugins/", "empty/"}));
    EXPECT_EQ(written.manifest.productId, "com.halvorn.glow");
    EXPECT_EQ(written.manifest.payloads.size(), 1U);
    EXPECT_TRUE(log.Lines().empty()) << log.Text();
}

TEST_F(PackageTest, ThatVanishedIsNotValid) {
    HV::Package written(package.WriteTo(kFolder));
    fs::remove(written.zipPath);
    EXPECT_FALSE(written.Validate(false));
    EXPECT_EQ(log.Lines(),
              std::vector{Warning("In HV::Package::Validate - zip does not exist at com.halvorn.glow.hvpkg")});
}

TEST_F(PackageTest, ThatIsNoArchiveIsNotValid) {
    machine.Has(R"(C:\packages\garbage.hvpkg)", "this is no archive");
    EXPECT_FALSE(HV::Package(fs::path(R"(C:\packages\garbage.hvpkg)")).Validate(false));
    EXPECT_EQ(log.Lines(), std::vector{Error("ReadZipEntries failed for garbage.hvpkg")});
}

TEST_F(PackageTest, ThatIsEmptyIsNotValid) {
    machine.Has(R"(C:\packages\empty.zip)", "");
    EXPECT_FALSE(HV::Package(fs::path(R"(C:\packages\empty.zip)")).Validate(false));
    EXPECT_EQ(log.Lines(), std::vector{Error("ReadZipEntries failed for empty.zip")});
}

TEST_F(PackageTest, WithTwoRootManifestsIsNotValidAndTheFirstHasBeenRead) {
    package.RawEntry("x_hvmanifest.xml", "no xml");
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_FALSE(written.Validate(false));
    EXPECT_EQ(
        log.Lines(),
        std::vector{Warning("In HV::Package::Validate - multiple root manifests found in com.halvorn.glow.hvpkg")});
    EXPECT_EQ(written.manifest.productId, "com.halvorn.glow");
}

TEST_F(PackageTest, WithTwoRootManifestsIsNotValidForItsMetadataEither) {
    package.RawEntry("x_hvmanifest.xml", "no xml");
    EXPECT_FALSE(Validate(true));
}

TEST_F(PackageTest, AManifestMayHaveAnyNameThatEndsRight) {
    const std::string manifest = package.Manifest();
    package.WithoutManifest().RawEntry("abc_hvmanifest.xml", manifest);
    EXPECT_TRUE(Validate());
}

TEST_F(PackageTest, ABackslashInANameMakesNoFolderOfIt) {
    const std::string manifest = package.Manifest();
    package.WithoutManifest().RawEntry("sub\\_hvmanifest.xml", manifest);
    EXPECT_TRUE(Validate()) << log.Text();
}

TEST_F(PackageTest, WithItsManifestInAFolderIsNotValid) {
    package.WithoutManifest().RawEntry("folder/_hvmanifest.xml", package.Manifest());
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(), std::vector{Error("No manifest XML file found in com.halvorn.glow.hvpkg")});
}

TEST_F(PackageTest, ManifestsBelowTheRootAreOrdinaryFiles) {
    package.Payload("plugin").File("history/com.halvorn.glow_v1.0_hvmanifest.xml", "not even xml");
    EXPECT_TRUE(Validate()) << log.Text();
}

TEST_F(PackageTest, WithAnEmptyManifestIsNotValid) {
    package.ManifestText("");
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(),
              std::vector{Error("Reading zip file byts of manifest.xml failed for com.halvorn.glow.hvpkg")});
}

TEST_F(PackageTest, WithABrokenManifestIsNotValid) {
    package.ManifestText("<wrong/>");
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(), (std::vector{Error("xml document - hvmanifest does not have expected document root."),
                                        Error("Manifest XML parsing failed for com.halvorn.glow.hvpkg")}));
}

TEST_F(PackageTest, ABrokenManifestDoesNotEndTheSearchForAnother) {
    package.ManifestText("<wrong/>").RawEntry("y_hvmanifest.xml", "");
    EXPECT_FALSE(Validate());
    EXPECT_TRUE(log.Has(Error("Manifest XML parsing failed for com.halvorn.glow.hvpkg")));
    EXPECT_TRUE(log.Has(Warning("In HV::Package::Validate - multiple root manifests found in com.halvorn.glow.hvpkg")));
}

TEST_F(PackageTest, TheManifestEndsAtItsFirstZero) {
    package.ManifestText(package.Manifest() + std::string(1, '\0') + "<garbage");
    EXPECT_TRUE(Validate()) << log.Text();
}

TEST_F(PackageTest, AMissingSourceIsNamed) {
    package.Payload("plugin").Id("glow").Source("plugins/Glow.aex");
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(), std::vector{Error("Error in package com.halvorn.glow.hvpkg- cannot find source for payload "
                                             R"(glow, source plugins\Glow.aex)")});
}

TEST_F(PackageTest, AMissingSourceDoesNotMatterToTheMetadata) {
    package.Payload("plugin").Source("plugins/Glow.aex");
    EXPECT_TRUE(Validate(true));
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(PackageTest, ABrokenManifestMattersToTheMetadata) {
    package.ManifestText("<wrong/>");
    EXPECT_FALSE(Validate(true));
}

TEST_F(PackageTest, AMacPayloadIsNotLookedFor) {
    package.Payload("plugin").Os("mac").Source("mac/Glow.plugin");
    EXPECT_TRUE(Validate()) << log.Text();
}

TEST_F(PackageTest, SourcesMayBeWildcardsOrFolders) {
    package.Folder("plugins").File("plugins/core.dll", "x");
    package.Payload("plugin").Source("plugins/*");
    package.Payload("plugin").Source("plugins/*.dll");
    package.Payload("plugin").Source("plugins");
    package.Payload("plugin").Source("plugins/");
    EXPECT_TRUE(Validate()) << log.Text();
    package.Payload("plugin").Id("no").Source("plugins/*.exe");
    EXPECT_FALSE(Validate());
}

TEST_F(PackageTest, SysDirWithoutAKeywordIsNamed) {
    package.Payload("help").Id("manual").Deployment("sysdir").File("manual.html", "x");
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(), std::vector{Error(
                               "Error in package com.halvorn.glow.hvpkg-  payload manual has deployment=sysdir with no "
                               "sysdir value set.")});
}

TEST_F(PackageTest, SysDirWithoutAKeywordIsMissedOnlyAfterTheSource) {
    package.Payload("help").Id("manual").Deployment("sysdir").Source("manual.html");
    EXPECT_FALSE(Validate());
    EXPECT_EQ(log.Lines(), std::vector{Error("Error in package com.halvorn.glow.hvpkg- cannot find source for payload "
                                             "manual, source manual.html")});
}

TEST_F(PackageTest, SysDirWithoutAKeywordDoesNotMatterToTheMetadata) {
    package.Payload("help").Deployment("sysdir").File("manual.html", "x");
    EXPECT_TRUE(Validate(true));
}

TEST_F(PackageTest, CanBeValidatedAgain) {
    package.Payload("plugin").File("a", "x");
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_TRUE(written.Validate(false));
    EXPECT_TRUE(written.Validate(false));
    EXPECT_EQ(written.zipFiles.size(), 2U);
    EXPECT_EQ(written.manifest.payloads.size(), 1U);
}

TEST_F(PackageTest, ItsNameIsThatOfTheFile) {
    HV::Package written(package.Named("preflight-glow.zip").WriteTo(kFolder));
    EXPECT_EQ(written.GetName(), "preflight-glow.zip");
    EXPECT_TRUE(written.Validate(true));
    EXPECT_EQ(written.GetName(), "preflight-glow.zip");
}

TEST_F(PackageTest, ItsNameIsTheProductWithoutAFile) {
    HV::Package unpacked{fs::path(kFolder)};
    EXPECT_EQ(unpacked.GetName(), "");
    unpacked.manifest.productId = "com.halvorn.glow";
    EXPECT_EQ(unpacked.GetName(), "com.halvorn.glow");
}

TEST_F(PackageTest, ItsNameIsTheComponentBeforeATrailingSeparator) {
    HV::Package written(package.WriteTo(kFolder));
    written.zipPath = fs::path(R"(C:\packages\a.zip\)");
    EXPECT_EQ(written.GetName(), "a.zip");
}

TEST_F(PackageTest, ExtractsToAFolderThatItMakes) {
    package.File("plugins/Glow.aex", "bytes");
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_TRUE(written.ExtractTo(fs::path(R"(C:\deep\down\here)")));
    EXPECT_TRUE(written.IsExtracted());
    EXPECT_EQ(written.extractedPath.string(), R"(C:\deep\down\here)");
    EXPECT_EQ(machine.Content(R"(C:\deep\down\here\plugins\Glow.aex)"), "bytes");
    EXPECT_EQ(machine.Content(R"(C:\deep\down\here\_hvmanifest.xml)"), package.Manifest());
}

TEST_F(PackageTest, ThatVanishedIsNotExtracted) {
    HV::Package written(package.WriteTo(kFolder));
    fs::remove(written.zipPath);
    EXPECT_FALSE(written.ExtractTo(fs::path(R"(C:\out)")));
    EXPECT_TRUE(written.extractedPath.empty());
    EXPECT_FALSE(machine.Exists(R"(C:\out)"));
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(PackageTest, AFailedExtractionLeavesThePathAsItWas) {
    package.RawEntry("../escape.txt", "x");
    HV::Package written(package.WriteTo(kFolder));
    written.extractedPath = fs::path(R"(C:\before)");
    EXPECT_FALSE(written.ExtractTo(fs::path(R"(C:\out)")));
    EXPECT_EQ(written.extractedPath.string(), R"(C:\before)");
}

TEST_F(PackageTest, IsNotExtractedOnceTheFolderIsGone) {
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_TRUE(written.ExtractTo(fs::path(R"(C:\out)")));
    fs::remove_all(fs::path(R"(C:\out)"));
    EXPECT_FALSE(written.IsExtracted());
}

TEST_F(PackageTest, CopiesAndMovesWithAllThatItHolds) {
    package.Payload("plugin").File("a", "x");
    HV::Package written(package.WriteTo(kFolder));
    EXPECT_TRUE(written.Validate(false));
    HV::Package copy = written;
    EXPECT_EQ(copy.zipFiles, written.zipFiles);
    EXPECT_EQ(copy.manifest.payloads.size(), 1U);
    const HV::Package moved = std::move(copy);
    EXPECT_EQ(moved.zipPath, written.zipPath);
    EXPECT_EQ(moved.manifest.payloads[0].id, "payload-1");
    static_assert(std::is_nothrow_move_constructible_v<HV::Package>, "a vector of packages would copy as it grows");
}

}  // namespace
