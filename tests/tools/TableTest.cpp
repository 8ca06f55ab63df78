#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <sstream>

#include "hvframework/FileUtils.h"
#include "package/HeldFile.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/tools/HvpackRun.h"
#include "tools/hvpack/ReleaseTable.h"

// What hvpack table says of a release with odd texts, compiled: the rows of this program. A test below makes the
// release and compares.
#include "tests/tools/OddRows.inc"

namespace {

constexpr const char* kFolder = R"(C:\packages)";
constexpr const char* kOut = R"(C:\out\rows.cpp)";

const std::string kOddFile =
    "Gr\xC3\xB6\xC3\x9F"
    "e, 100 (1)$x;y.zip";
const std::string kOddName = R"("Glow\Flare" ??/ 50% %s )"
                             "\xC3\xBC"
                             "2";
const std::string kOddVersion = "1.0 'b', \xC3\xA4";

PackageBuilder Product(const std::string& name) {
    return PackageBuilder("com.halvorn." + name)
        .Policy("show", "true")
        .DisplayName(name)
        .Payload("plugin")
        .File(name + ".aex", "bytes");
}

/// A machine with a folder of packages, and a folder for the table.
class TableTest : public HvpackRun {
protected:
    TableTest() {
        machine.HasFolder(kFolder);
        machine.HasFolder(R"(C:\out)");
    }

    int Table(const std::vector<std::string>& more = {}) {
        std::vector<std::string> arguments{"table", kFolder};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return Run(arguments);
    }
    static fs::path Ships(const PackageBuilder& package) { return package.WriteTo(kFolder); }
    /// The rows as they stand, without what is around them.
    std::string Rows() const {
        const std::size_t start = out.find("kRows{{\n") + 8;
        return out.substr(start, out.find("}};") - start);
    }
    static std::string Row(const std::string& texts, const fs::path& package) {
        return "    {" + texts + ",\n     \"" + HVL::FileUtils::GetFileMD5(package.string()) + "\"},\n";
    }

    Machine machine;
};

TEST_F(TableTest, HasARowForEachPackageSortedByFileName) {
    const fs::path glow = Ships(Product("glow").Version("2.0.1"));
    const fs::path core = Ships(Product("core").Named("b.zip"));
    const fs::path blur = Ships(Product("blur").Named("Z.hvpkg"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_EQ(Rows(), Row(R"("Z.hvpkg", "blur", "com.halvorn.blur", "1.0")", blur) +
                          Row(R"("b.zip", "core", "com.halvorn.core", "1.0")", core) +
                          Row(R"("com.halvorn.glow.hvpkg", "glow", "com.halvorn.glow", "2.0.1")", glow));
    EXPECT_NE(out.find("std::array<HV::ValidationRow, 3> kRows"), std::string::npos) << out;
    EXPECT_EQ(err, "");
}

TEST_F(TableTest, HasASecondDigestForEachPackageInTheSameOrder) {
    const fs::path glow = Ships(Product("glow"));
    const fs::path core = Ships(Product("core").Named("b.zip"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_NE(out.find("constexpr std::array<HV::ReleaseDigest, 2> kDigests{{\n"
                       "    {\"b.zip\",\n     \"" +
                       HV::HeldFile(core).Digests().sha256 +
                       "\"},\n"
                       "    {\"com.halvorn.glow.hvpkg\",\n     \"" +
                       HV::HeldFile(glow).Digests().sha256 + "\"},\n}};\n"),
              std::string::npos)
        << out;
}

TEST_F(TableTest, CallsAPackageThatIsNotShownNone) {
    const fs::path hidden = Ships(PackageBuilder("com.halvorn.core").Policy("show", "false").DisplayName("Core"));
    const fs::path silent = Ships(PackageBuilder("com.halvorn.lib").DisplayName("Library"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_EQ(Rows(), Row(R"("com.halvorn.core.hvpkg", "None", "com.halvorn.core", "1.0")", hidden) +
                          Row(R"("com.halvorn.lib.hvpkg", "None", "com.halvorn.lib", "1.0")", silent));
}

TEST_F(TableTest, CallsAShownPackageWithoutADisplayNameByItsIdentifier) {
    const fs::path plain = Ships(PackageBuilder("com.halvorn.plain").Policy("show", "1"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_EQ(Rows(), Row(R"("com.halvorn.plain.hvpkg", "com.halvorn.plain", "com.halvorn.plain", "1.0")", plain));
}

// The wizard shows the version of the product data. The table names what the manifest itself says.
TEST_F(TableTest, TakesTheVersionOfTheManifestAndNotOfTheProductData) {
    const fs::path glow = Ships(Product("glow").Version("4.2").Property("version", "4.2 RC"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_EQ(Rows(), Row(R"("com.halvorn.glow.hvpkg", "glow", "com.halvorn.glow", "4.2")", glow));
}

TEST_F(TableTest, PassesOverOtherFilesAndFolders) {
    (void)Ships(Product("glow"));
    (void)Product("flare").WriteTo(R"(C:\packages\below)");
    machine.HasFolder(R"(C:\packages\folder.zip)");
    machine.Has(R"(C:\packages\suite.json)",
                R"({"identifier": "com.halvorn.suite", "version": "1", "display_name": "Suite", "product_type": "0"})");
    machine.Has(R"(C:\packages\notes.txt)", "no package");
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_NE(out.find("std::array<HV::ValidationRow, 1> kRows"), std::string::npos) << out;
}

TEST_F(TableTest, OfTheSamePackagesInAnotherFolderIsTheSame) {
    (void)Ships(Product("glow"));
    (void)Ships(Product("flare"));
    ASSERT_EQ(Table(), 0) << err;
    const std::string first = out;
    fs::rename(fs::path(kFolder), fs::path(R"(C:\moved)"));
    std::ostringstream again;
    std::ostringstream errors;
    ASSERT_EQ(HVPack::RunCommand({"table", R"(C:\moved)"}, again, errors), 0) << errors.str();
    EXPECT_EQ(again.str(), first);
}

TEST_F(TableTest, TellsAChangedByteByTheDigestAlone) {
    (void)Ships(Product("glow").File("more", "a"));
    ASSERT_EQ(Table(), 0) << err;
    const std::string first = out;
    (void)Ships(Product("glow").File("more", "b"));
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_NE(out, first);
    EXPECT_EQ(out.size(), first.size());
}

TEST_F(TableTest, IsTheSourceThatIsCompiledIntoThisProgram) {
    (void)Ships(PackageBuilder("com.halvorn. {odd}")
                    .Named(kOddFile)
                    .Version(kOddVersion)
                    .Policy("show", "true")
                    .DisplayName(kOddName));
    (void)Ships(PackageBuilder("com.halvorn.plain"));
    std::string compiled;
    ASSERT_EQ(HVL::FileUtils::ReadFileToString(HV_ODD_ROWS, compiled), 0);
    ASSERT_EQ(Table(), 0) << err;
    EXPECT_EQ(out, compiled);
}

TEST_F(TableTest, KeepsOddTextsThroughTheCompiler) {
    std::vector<std::string> names;
    HV::GetValidationFileNames(names);
    EXPECT_EQ(names, (std::vector<std::string>{kOddFile, "com.halvorn.plain.hvpkg"}));
    HV::ValidationInfo info;
    HV::GetValidationInfo(kOddFile, info);
    EXPECT_EQ(info.displayName, kOddName);
    EXPECT_EQ(info.productId, "com.halvorn. {odd}");
    EXPECT_EQ(info.version, kOddVersion);
    EXPECT_EQ(HV::SecondDigestOf(kOddFile).size(), 64U);
}

TEST_F(TableTest, EscapesEveryByteThatIsNoPlainCharacter) {
    const std::string text = std::string(
                                 "a\0"
                                 "1\n\t\x7F\xFF",
                                 7) +
                             "9~ ";
    const std::string source = HVPack::TableSource({{"x.zip", {text, "id", "1.0", "0"}, "1"}});
    EXPECT_NE(source.find(R"({"x.zip", "a\0001\012\011\177\3779~ ", "id", "1.0",)"), std::string::npos) << source;
}

TEST_F(TableTest, GoesIntoAFileWhenOneIsNamed) {
    (void)Ships(Product("glow"));
    ASSERT_EQ(Table(), 0) << err;
    const std::string source = out;
    ASSERT_EQ(Table({kOut}), 0) << err;
    EXPECT_EQ(out, "OK C:\\out\\rows.cpp\n");
    EXPECT_EQ(err, "");
    EXPECT_EQ(machine.Content(kOut), source);
    EXPECT_FALSE(machine.Exists(R"(C:\out\rows.cpp.part)"));
}

TEST_F(TableTest, TouchesNoFileThatIsUpToDate) {
    (void)Ships(Product("glow"));
    ASSERT_EQ(Table({kOut}), 0) << err;
    const std::filesystem::path file(machine.HostName(kOut));
    const auto longAgo = std::filesystem::last_write_time(file) - std::chrono::hours(48);
    std::filesystem::last_write_time(file, longAgo);
    const auto before = std::filesystem::last_write_time(file);
    ASSERT_EQ(Table({kOut}), 0) << err;
    EXPECT_EQ(std::filesystem::last_write_time(file), before);
    (void)Ships(Product("flare"));
    ASSERT_EQ(Table({kOut}), 0) << err;
    EXPECT_NE(std::filesystem::last_write_time(file), before);
    EXPECT_NE(machine.Content(kOut).find("com.halvorn.flare"), std::string::npos);
}

TEST_F(TableTest, NamesEveryPackageThatIsNotSoundAndKeepsTheOlderTable) {
    (void)Ships(Product("glow"));
    machine.Has(R"(C:\packages\bad.zip)", "garbage");
    (void)Ships(PackageBuilder("com.halvorn.gap").Payload("plugin").Source("none"));
    machine.Has(kOut, "the older one");
    EXPECT_EQ(Table({kOut}), 1);
    EXPECT_EQ(out, "");
    EXPECT_EQ(err,
              "ERROR: ReadZipEntries failed for bad.zip\n"
              "hvpack: C:\\packages\\bad.zip is not a sound package\n"
              "ERROR: Error in package com.halvorn.gap.hvpkg- cannot find source for payload payload-1, source none\n"
              "hvpack: C:\\packages\\com.halvorn.gap.hvpkg is not a sound package\n");
    EXPECT_EQ(machine.Content(kOut), "the older one");
}

TEST_F(TableTest, IsNotPrintedWhenAPackageIsNotSound) {
    (void)Ships(Product("glow"));
    machine.Has(R"(C:\packages\bad.zip)", "garbage");
    EXPECT_EQ(Table(), 1);
    EXPECT_EQ(out, "");
}

// Nobody else would say so: the wizard passes such a file over, and an argument line fails on it.
TEST_F(TableTest, RefusesAPackageNamedInUpperCase) {
    (void)Ships(Product("glow"));
    (void)Ships(Product("flare").Named("FLARE.HVPKG"));
    EXPECT_EQ(Table({kOut}), 1);
    EXPECT_EQ(err, "hvpack: C:\\packages\\FLARE.HVPKG is not named .hvpkg or .zip\n");
    EXPECT_FALSE(machine.Exists(kOut));
}

TEST_F(TableTest, RefusesAFolderWithoutPackages) {
    machine.Has(R"(C:\packages\suite.json)", "{}");
    EXPECT_EQ(Table({kOut}), 1);
    EXPECT_EQ(err, "hvpack: no packages in C:\\packages\n");
    EXPECT_FALSE(machine.Exists(kOut));
}

TEST_F(TableTest, RefusesWhatIsNoFolder) {
    fs::remove(fs::path(kFolder));
    EXPECT_EQ(Table(), 1);
    EXPECT_EQ(err, "hvpack: C:\\packages is not a folder\n");
}

TEST_F(TableTest, SaysSoWhenItCannotWrite) {
    (void)Ships(Product("glow"));
    EXPECT_EQ(Table({R"(C:\no folder\rows.cpp)"}), 1);
    EXPECT_EQ(err, "hvpack: cannot write C:\\no folder\\rows.cpp\n");
    EXPECT_EQ(out, "");
}

TEST_F(TableTest, LeavesNothingBesideAFolderThatIsInItsWay) {
    (void)Ships(Product("glow"));
    machine.Has(R"(C:\out\rows.cpp\inside)", "x");
    EXPECT_EQ(Table({kOut}), 1);
    EXPECT_EQ(err, "hvpack: cannot write C:\\out\\rows.cpp\n");
    EXPECT_FALSE(machine.Exists(R"(C:\out\rows.cpp.part)"));
}

TEST_F(TableTest, NeverTakesThePlaceOfAPackage) {
    const fs::path glow = Ships(Product("glow"));
    const std::string before = machine.Content(glow.string());
    EXPECT_EQ(Table({glow.string()}), 1);
    EXPECT_EQ(err, "hvpack: a table is not named as a package is: C:\\packages\\com.halvorn.glow.hvpkg\n");
    EXPECT_EQ(machine.Content(glow.string()), before);
}

TEST_F(TableTest, FailsWhenWhatItPrintsIsLost) {
    (void)Ships(Product("glow"));
    std::ostringstream lost;
    lost.setstate(std::ios::badbit);
    std::ostringstream errors;
    EXPECT_EQ(HVPack::RunCommand({"table", kFolder}, lost, errors), 1);
    EXPECT_EQ(errors.str(), "hvpack: cannot write the table\n");
}

}  // namespace
