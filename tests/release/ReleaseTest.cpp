// What a build makes of the sample release: the packages beside the programs, and the rows that the programs link.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"
#include "package/HeldFile.h"
#include "package/Package.h"
#include "package/ValidationTable.h"
#include "tests/support/Machine.h"
#include "tools/hvpack/Commands.h"

namespace {

constexpr std::size_t kPackageCount = 14;

class ReleaseTest : public testing::Test {
protected:
    ReleaseTest() { HV::GetValidationFileNames(names); }

    static HV::ValidationInfo Row(const std::string& name) {
        HV::ValidationInfo info;
        HV::GetValidationInfo(name, info);
        return info;
    }
    static std::string Path(const std::string& name) { return HV_RELEASE_PACKAGES "/" + name; }
    static std::vector<std::string> PackageFiles() {
        std::vector<std::string> files;
        for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(HV_RELEASE_PACKAGES))) {
            if (entry.path().extension().string() != ".json") {
                files.push_back(entry.path().filename().string());
            }
        }
        std::ranges::sort(files);
        return files;
    }

    Machine machine;
    std::vector<std::string> names;
};

TEST_F(ReleaseTest, HasARowForEveryPackageInOrderOfTheirNames) {
    EXPECT_EQ(names.size(), kPackageCount);
    EXPECT_EQ(names, PackageFiles());
}

TEST_F(ReleaseTest, NamesPackagesByTheirIdentifierAndTheGroupTheyAreInstalledWith) {
    std::set<std::string> prefixes;
    for (const std::string& name : names) {
        const std::string own = Row(name).productId + ".zip";
        ASSERT_TRUE(HVL::StringUtils::EndsWith(name, own)) << name;
        prefixes.insert(name.substr(0, name.size() - own.size()));
    }
    EXPECT_EQ(prefixes, (std::set<std::string>{"", "preflight-", "postflight-"}));
}

TEST_F(ReleaseTest, KnowsNineProductsAndOnePresetsPackageByName) {
    std::map<std::string, std::string> products;
    for (const std::string& name : names) {
        if (Row(name).displayName != "None") {
            products[name] = Row(name).displayName;
        }
    }
    EXPECT_EQ(products, (std::map<std::string, std::string>{
                            {"com.halvorn.tessaly.denoise.zip", "Tessaly Denoise"},
                            {"com.halvorn.tessaly.glow.zip", "Tessaly Glow"},
                            {"com.halvorn.tessaly.grain.zip", "Tessaly Grain"},
                            {"com.halvorn.tessaly.keyer.zip", "Tessaly Keyer"},
                            {"com.halvorn.tessaly.presets.zip", "Tessaly Preset Collection"},
                            {"com.halvorn.tessaly.scriptkit.zip", "Tessaly Script Kit"},
                            {"com.halvorn.tessaly.steady.zip", "Tessaly Steady"},
                            {"com.halvorn.tessaly.titler.zip", "Tessaly Titler"},
                            {"com.halvorn.tessaly.transitions.zip", "Tessaly Transitions"},
                            {"com.halvorn.tessaly.viewer.zip", "Tessaly Viewer"},
                        }));
}

TEST_F(ReleaseTest, CallsOneSupportPackageAndThreeLibrariesNone) {
    std::set<std::string> others;
    for (const std::string& name : names) {
        if (Row(name).displayName == "None") {
            others.insert(name);
        }
    }
    EXPECT_EQ(others, (std::set<std::string>{
                          "com.halvorn.tessaly.colorscience.zip",
                          "com.halvorn.tessaly.imagecore.zip",
                          "postflight-com.halvorn.tessaly.support.zip",
                          "preflight-com.halvorn.tessaly.runtime.zip",
                      }));
}

TEST_F(ReleaseTest, SaysOfEachPackageWhatItsManifestSays) {
    std::size_t compared = 0;
    for (const std::string& name : names) {
        HV::Package package{fs::path(Path(name))};
        ASSERT_TRUE(package.Validate(false)) << name;
        EXPECT_EQ(Row(name).productId, package.manifest.productId);
        EXPECT_EQ(Row(name).version, package.manifest.productVersion);
        ++compared;
    }
    EXPECT_EQ(compared, kPackageCount);
}

TEST_F(ReleaseTest, HasTheDigestOfEachPackageFileInLowerCase) {
    std::set<std::string> digests;
    for (const std::string& name : names) {
        const std::string digest = Row(name).md5;
        EXPECT_EQ(digest, HVL::FileUtils::GetFileMD5(Path(name))) << name;
        EXPECT_EQ(digest.size(), 32U);
        EXPECT_EQ(digest.find_first_not_of("0123456789abcdef"), std::string::npos) << digest;
        digests.insert(digest);
    }
    EXPECT_EQ(digests.size(), kPackageCount);
}

TEST_F(ReleaseTest, HasTheSecondDigestOfEachPackageFileInLowerCase) {
    std::set<std::string> digests;
    for (const std::string& name : names) {
        const std::string digest = HV::SecondDigestOf(name);
        EXPECT_EQ(digest, HV::HeldFile(fs::path(Path(name))).Digests().sha256) << name;
        EXPECT_EQ(digest.size(), 64U);
        EXPECT_EQ(digest.find_first_not_of("0123456789abcdef"), std::string::npos) << digest;
        digests.insert(digest);
    }
    EXPECT_EQ(digests.size(), kPackageCount);
}

// The build packs on the system that it runs on, whatever it builds for: this is the packer of the target itself.
TEST_F(ReleaseTest, IsTheSameWhenThisTargetPacksTheSources) {
    std::size_t packed = 0;
    machine.HasFolder(R"(C:\again)");
    for (const std::string& name : names) {
        std::ostringstream out;
        std::ostringstream err;
        const std::string folder = HV_RELEASE_SOURCES "/" + fs::path(name).stem().string();
        ASSERT_EQ(HVPack::RunCommand({"make", folder, R"(C:\again\)" + name}, out, err), 0) << err.str();
        EXPECT_EQ(HVL::FileUtils::GetFileMD5(R"(C:\again\)" + name), Row(name).md5) << name;
        ++packed;
    }
    EXPECT_EQ(packed, kPackageCount);
}

TEST_F(ReleaseTest, IsKnownToTheShippedProgram) {
    std::string program;
    ASSERT_EQ(HVL::FileUtils::ReadFileToString(HV_PROGRAM, program), 0);
    std::size_t found = 0;
    for (const std::string& name : names) {
        EXPECT_NE(program.find(Row(name).md5), std::string::npos) << name;
        ++found;
    }
    EXPECT_EQ(found, kPackageCount);
}

TEST_F(ReleaseTest, HasNoRowForAnotherSpellingOfAName) {
    for (const std::string name : {"com.halvorn.tessaly.Glow.zip", "com.halvorn.tessaly.glow.hvpkg", "glow.zip"}) {
        EXPECT_EQ(Row(name).md5, "") << name;
    }
}

}  // namespace
