// The test of the packages list: what a release may hold, and what stands in the wizard's list afterwards.
#include <algorithm>

#include "hvframework/Md5.h"
#include "package/HeldFile.h"
#include "platform/sha256.h"
#include "tests/installer/ModelTest.h"

namespace {

const std::string kNoData = "d41d8cd98f00b204e9800998ecf8427e";

class ValidationTest : public ModelTest {
protected:
    ValidationTest() { setup.HasSuite(); }

    /// The model refuses the folder, offers nothing, and gives this as its only reason.
    void ExpectRefused(const std::string& reason) {
        const HV::InstallerModel& model = Load();
        EXPECT_FALSE(model.valid);
        EXPECT_TRUE(model.packages.empty());
        EXPECT_EQ(Problems(), Texts{reason}) << log.Text();
        EXPECT_EQ(errors, "");
    }

    [[nodiscard]] Texts Problems() const {
        Texts problems;
        for (const std::string& line : log.Lines()) {
            if (line.starts_with("ERROR") || line.starts_with("WARN")) {
                problems.push_back(line);
            }
        }
        return problems;
    }

    static Texts DisplayNames(const HV::InstallerModel& model) {
        Texts names;
        for (const HV::PackageInfo& package : model.packages) {
            names.push_back(package.displayName);
        }
        return names;
    }
};

TEST_F(ValidationTest, ABuildWithoutATableRefusesEverything) {
    setup.Has(Product("glow"));
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_TRUE(model.packages.empty());
    EXPECT_EQ(errors, "Fatal error - this installer build does not include validation information.\n");
    EXPECT_EQ(Problems(), Texts{});
}

TEST_F(ValidationTest, AnUnknownFileIsRefused) {
    setup.Knows("com.halvorn.other.hvpkg", kNoData);
    setup.Has(Product("glow"));
    ExpectRefused(DetailError("ERROR: com.halvorn.glow.hvpkg is not valid payload."));
}

TEST_F(ValidationTest, AnUnknownFileIsRefusedAmongGoodOnes) {
    setup.Ships(Product("a"));
    setup.Ships(Product("z"));
    setup.Has(Product("glow"));
    ExpectRefused(DetailError("ERROR: com.halvorn.glow.hvpkg is not valid payload."));
}

TEST_F(ValidationTest, ARenamedFileFailsByItsNameAndNotByItsDigest) {
    setup.Ships(Product("glow"));
    const std::string content = machine.Content(InPackages("com.halvorn.glow.hvpkg"));
    ASSERT_EQ(HVL::FileUtils::DeleteFileOrDirectory(InPackages("com.halvorn.glow.hvpkg")), 0);
    machine.Has(InPackages("renamed.hvpkg"), content);
    ExpectRefused(DetailError("ERROR: renamed.hvpkg is not valid payload."));
}

TEST_F(ValidationTest, NamesAreComparedInTheirCase) {
    setup.Ships(Product("glow").Named("glow.hvpkg"));
    setup.Ships(Product("blur").Named("blur.hvpkg"));
    const std::string content = machine.Content(InPackages("glow.hvpkg"));
    ASSERT_EQ(HVL::FileUtils::DeleteFileOrDirectory(InPackages("glow.hvpkg")), 0);
    machine.Has(InPackages("Glow.hvpkg"), content);
    ExpectRefused(DetailError("ERROR: Glow.hvpkg is not valid payload."));
}

TEST_F(ValidationTest, AChangedByteIsRefused) {
    const std::string name = setup.Ships(Product("glow"));
    std::string content = machine.Content(InPackages(name));
    content[content.size() / 2] = static_cast<char>(content[content.size() / 2] ^ 1);
    machine.Has(InPackages(name), content);
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, AnUpperCaseDigitInTheTableNeverMatches) {
    const std::string name = setup.Has(Product("glow"));
    std::string digest = HVL::FileUtils::GetFileMD5(InPackages(name));
    const std::size_t letter = digest.find_first_of("abcdef");
    ASSERT_NE(letter, std::string::npos);
    digest[letter] = static_cast<char>(digest[letter] - 'a' + 'A');
    setup.Knows(name, digest);
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, OnlySomeOfTheTablesPackagesWillDo) {
    setup.Knows("com.halvorn.first.hvpkg", kNoData);
    setup.Ships(Product("glow"));
    setup.Knows("com.halvorn.last.hvpkg", kNoData);
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(model.packages.size(), 1U);
}

TEST_F(ValidationTest, TheFirstBadFileEndsTheTest) {
    setup.Ships(Product("good"));
    // Both are bad; which comes first is the folder's business, and the other is not looked at.
    for (const char* name : {"bad", "worse"}) {
        setup.Knows(setup.Has(Product(name)), kNoData);
    }
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_TRUE(model.packages.empty());
    const Texts problems = Problems();
    ASSERT_EQ(problems.size(), 1U) << log.Text();
    const bool badComesFirst = model.packageFiles.size() == 3 &&
                               std::ranges::find(model.packageFiles, InPackages("com.halvorn.bad.hvpkg")) <
                                   std::ranges::find(model.packageFiles, InPackages("com.halvorn.worse.hvpkg"));
    EXPECT_EQ(problems.front(), DetailError(std::string("validation of com.halvorn.") +
                                            (badComesFirst ? "bad" : "worse") + ".hvpkg failed."));
}

TEST_F(ValidationTest, ABrokenArchiveIsRefusedThoughItsDigestIsRight) {
    const std::string bytes = "no archive";
    machine.Has(InPackages("broken.hvpkg"), bytes);
    HVL::Md5 md5;
    md5.Update(bytes.data(), bytes.size());
    platform::Sha256 sha256;
    sha256.Update(bytes.data(), bytes.size());
    setup.Knows("broken.hvpkg", md5.Finish(), sha256.Finish());
    ExpectRefused(DetailError("ReadZipEntries failed for broken.hvpkg"));
}

TEST_F(ValidationTest, APackageWithoutAPayloadsSourceIsRefusedThoughItsDigestIsRight) {
    setup.Ships(PackageBuilder("com.halvorn.glow").Payload("plugin").Source("not there"));
    ExpectRefused(DetailError(
        "Error in package com.halvorn.glow.hvpkg- cannot find source for payload payload-1, source not there"));
}

// An attacker that can make another file for an MD5 cannot make it for both.
TEST_F(ValidationTest, APackageIsRefusedWhoseFirstDigestAloneIsRight) {
    const std::string name = setup.Has(Product("glow"));
    const HV::FileDigests digests = HV::HeldFile(fs::path(InPackages(name))).Digests();
    setup.Knows(name, digests.md5, std::string(64, '0'));
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, APackageIsRefusedThatHasNoSecondDigest) {
    const std::string name = setup.Has(Product("glow"));
    setup.Knows(name, HV::HeldFile(fs::path(InPackages(name))).Digests().md5, "");
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, APackageIsRefusedWhoseSecondDigestIsInUpperCase) {
    const std::string name = setup.Has(Product("glow"));
    HV::FileDigests digests = HV::HeldFile(fs::path(InPackages(name))).Digests();
    std::ranges::transform(digests.sha256, digests.sha256.begin(),
                           [](char c) { return c >= 'a' ? static_cast<char>(c - 'a' + 'A') : c; });
    setup.Knows(name, digests.md5, digests.sha256);
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, APackageThatGoesAfterTheScanIsRefused) {
    const std::string name = setup.Ships(Product("glow"));
    setup.WhenTheTableIsAsked([&] { HVL::FileUtils::DeleteFileOrDirectory(InPackages(name)); });
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, APackageThatGoesIsRefusedEvenWhereNoDataHasTheRightDigest) {
    const std::string name = setup.Has(Product("glow"));
    setup.Knows(name, kNoData);
    setup.WhenTheTableIsAsked([&] { HVL::FileUtils::DeleteFileOrDirectory(InPackages(name)); });
    ExpectRefused(DetailError("File not found at path " + InPackages(name)));
}

TEST_F(ValidationTest, AFolderThatGoesAfterTheScanIsRefused) {
    setup.Ships(Product("glow"));
    setup.WhenTheTableIsAsked([] { HVL::FileUtils::DeleteFileOrDirectory(kPackages); });
    ExpectRefused(DetailError("validation of com.halvorn.glow.hvpkg failed."));
}

TEST_F(ValidationTest, APackageThatPassesIsDescribedByItsManifest) {
    const std::string name =
        setup.Ships(Product("glow").Version("2.0").DisplayName("Tessaly Glow").Property("version", "2.0.1 beta"));
    const HV::InstallerModel& model = Load();
    ASSERT_EQ(model.packages.size(), 1U) << log.Text();
    const HV::PackageInfo& info = model.packages.front();
    EXPECT_EQ(info.identifier, "com.halvorn.glow");
    EXPECT_EQ(info.path, InPackages(name));
    EXPECT_EQ(info.displayName, "Tessaly Glow");
    EXPECT_EQ(info.version, "2.0.1 beta");
    EXPECT_TRUE(info.show);
    EXPECT_FALSE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{});
}

TEST_F(ValidationTest, APackageWithoutPropertiesIsNamedByItsProduct) {
    setup.Ships(PackageBuilder("com.halvorn.core").Version("3.1"));
    const HV::InstallerModel& model = Load();
    ASSERT_EQ(model.packages.size(), 1U) << log.Text();
    EXPECT_EQ(model.packages.front().displayName, "com.halvorn.core");
    EXPECT_EQ(model.packages.front().version, "3.1");
    EXPECT_FALSE(model.packages.front().show);
}

TEST_F(ValidationTest, AnEmptyPropertyIsNotAMissingOne) {
    setup.Ships(Product("glow").Version("3.1").DisplayName("").Property("version", ""));
    const HV::InstallerModel& model = Load();
    ASSERT_EQ(model.packages.size(), 1U) << log.Text();
    EXPECT_EQ(model.packages.front().displayName, "");
    EXPECT_EQ(model.packages.front().version, "");
}

TEST_F(ValidationTest, ShownPackagesComeFirstAndEachGroupIsInTheOrderOfItsBytes) {
    int shipped = 0;
    for (const char* name : {"alpha", "Zeta", "\xC3\x84pfel", "Alpha 2", "Alpha"}) {
        const std::string number = std::to_string(++shipped);
        setup.Ships(Product("shown" + number).DisplayName(name));
        setup.Ships(PackageBuilder("com.halvorn.hidden" + number).DisplayName(std::string("hidden ") + name));
    }
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(DisplayNames(model), (Texts{"Alpha", "Alpha 2", "Zeta", "alpha", "\xC3\x84pfel", "hidden Alpha",
                                          "hidden Alpha 2", "hidden Zeta", "hidden alpha", "hidden \xC3\x84pfel"}));
}

TEST_F(ValidationTest, PackagesOfOneNameStayInTheOrderOfTheFolder) {
    // More of them than a sort moves one by one.
    for (int number = 0; number < 40; ++number) {
        setup.Ships(Product("twin" + std::to_string(number)).DisplayName("Twin"));
    }
    const HV::InstallerModel& model = Load();
    Texts paths;
    for (const HV::PackageInfo& package : model.packages) {
        paths.push_back(package.path);
    }
    EXPECT_EQ(paths, model.packageFiles);
    EXPECT_EQ(paths.size(), 40U);
}

}  // namespace
