// The model of the sample release, in a program with that release's own table.
#include <gtest/gtest.h>

#include <set>

#include "hvframework/FileUtils.h"
#include "installer/InstallerModel.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kPackages = R"(C:\Setup\packages)";
const std::string kGlow = R"(C:\Setup\packages\com.halvorn.tessaly.glow.zip)";

class ReleaseModelTest : public testing::Test {
protected:
    ReleaseModelTest() { EXPECT_EQ(HVL::FileUtils::CopyFileOrDirectory(HV_RELEASE_PACKAGES, kPackages), 0); }

    void IsMachine(const std::string& name) {
        std::string registry;
        const std::string file = "Z:" HV_SAMPLE_MACHINES "/" + name + ".reg";
        ASSERT_EQ(HVL::FileUtils::ReadFileToString(file, registry), 0) << file;
        machine.Loads(registry);
    }

    HV::InstallerModel& Load() {
        const CapturedStreams streams;  // the detector of EDIUS speaks on standard output
        model_.Load();
        return model_;
    }

    Machine machine;
    LogRecorder log;

private:
    HV::InstallerModel model_{{kPackages}};
};

TEST_F(ReleaseModelTest, EveryPackageIsGood) {
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(model.packages.size(), 14U);
    EXPECT_EQ(model.suite.GetDisplayName(), "Tessaly Suite");
    EXPECT_EQ(model.GetString("installer.title"), "Tessaly Suite 4.2.0 Installer");
    EXPECT_EQ(log.LinesStartingWith("ERROR"), std::vector<std::string>{});
}

TEST_F(ReleaseModelTest, TheUserSeesTheProductsByName) {
    const HV::InstallerModel& model = Load();
    std::vector<std::string> names;
    for (const std::string& identifier : model.ShownIdentifiers()) {
        names.push_back(model.FindPackage(identifier).displayName);
    }
    EXPECT_EQ(names.size(), 10U) << "nine products and the presets";
    EXPECT_TRUE(std::ranges::is_sorted(names));
}

TEST_F(ReleaseModelTest, NothingIsOutOfReachWhereEveryHostIsThere) {
    IsMachine("everything");
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_FALSE(model.SomeProductLacksHost());
    EXPECT_FALSE(model.AllProductsLackHosts());
}

TEST_F(ReleaseModelTest, AMachineWithoutHostsTakesTheProductsThatNeedNone) {
    IsMachine("clean");
    const HV::InstallerModel& model = Load();
    std::set<std::string> offered;
    for (const std::string& identifier : model.ShownIdentifiers()) {
        const HV::PackageInfo info = model.FindPackage(identifier);
        if (!info.requiresHost) {
            offered.insert(identifier);
        }
    }
    EXPECT_TRUE(offered.contains("com.halvorn.tessaly.viewer"));
    EXPECT_FALSE(offered.contains("com.halvorn.tessaly.scriptkit"));
    EXPECT_TRUE(model.SomeProductLacksHost());
    EXPECT_FALSE(model.AllProductsLackHosts());
}

TEST_F(ReleaseModelTest, AChangedByteIsRefused) {
    std::string content = machine.Content(kGlow);
    content.back() = static_cast<char>(content.back() ^ 1);
    machine.Has(kGlow, content);
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(log.LinesStartingWith("ERROR"),
              std::vector<std::string>{"ERROR hvdeploy-detail: validation of com.halvorn.tessaly.glow.zip failed."});
}

TEST_F(ReleaseModelTest, AnUnknownFileIsRefused) {
    machine.Has(R"(C:\Setup\packages\more.zip)", machine.Content(kGlow));
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(log.LinesStartingWith("ERROR"),
              std::vector<std::string>{"ERROR hvdeploy-detail: ERROR: more.zip is not valid payload."});
}

TEST_F(ReleaseModelTest, ARenamedFileIsRefused) {
    ASSERT_TRUE(HVL::FileUtils::MoveFileOrDirectory(kGlow, R"(C:\Setup\packages\glow.zip)"));
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(log.LinesStartingWith("ERROR"),
              std::vector<std::string>{"ERROR hvdeploy-detail: ERROR: glow.zip is not valid payload."});
}

TEST_F(ReleaseModelTest, APackageMayBeMissing) {
    ASSERT_EQ(HVL::FileUtils::DeleteFileOrDirectory(kGlow), 0);
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(model.packages.size(), 13U);
}

}  // namespace
