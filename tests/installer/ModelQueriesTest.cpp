// What the wizard asks the model, and that there is one model.
#include "installer/StartUp.h"
#include "tests/installer/ModelTest.h"

namespace {

/// A package as far as the questions about hosts go.
HV::PackageInfo Info(bool show, bool requiresHost, bool hostFound, const std::string& identifier = "") {
    HV::PackageInfo info;
    info.identifier = identifier;
    info.show = show;
    info.requiresHost = requiresHost;
    info.hostFound = hostFound;
    return info;
}

const HV::PackageInfo kFree = Info(true, false, false);
const HV::PackageInfo kFound = Info(true, true, true);
const HV::PackageInfo kLacking = Info(true, true, false);
const HV::PackageInfo kHiddenFree = Info(false, false, false);
const HV::PackageInfo kHiddenLacking = Info(false, true, false);

using ModelQueriesTest = ModelTest;

TEST_F(ModelQueriesTest, TellWhetherProductsLackTheirHosts) {
    struct Case {
        std::vector<HV::PackageInfo> packages;
        bool all;
        bool some;
    };
    const std::vector<Case> cases{
        {{}, false, false},
        {{kHiddenFree}, false, false},
        {{kHiddenLacking}, false, false},
        {{kFree}, false, false},
        {{kFound}, false, false},
        {{kLacking}, true, true},
        {{kLacking, kLacking}, true, true},
        {{kLacking, kHiddenFree}, true, true},
        {{kHiddenFree, kLacking}, true, true},
        {{kLacking, kFree}, false, true},
        {{kFree, kLacking}, false, true},
        {{kLacking, kFound}, false, true},
        {{kFree, kFound}, false, false},
        {{kFree, kHiddenLacking}, false, false},
        {{kLacking, kFound, kHiddenLacking}, false, true},
    };
    HV::InstallerModel& model = Load();
    std::size_t compared = 0;
    for (const Case& each : cases) {
        model.packages = each.packages;
        EXPECT_EQ(model.AllProductsLackHosts(), each.all) << compared;
        EXPECT_EQ(model.SomeProductLacksHost(), each.some) << compared;
        ++compared;
    }
    EXPECT_EQ(compared, 15U);
}

TEST_F(ModelQueriesTest, NameTheShownProductsInOrder) {
    HV::InstallerModel& model = Load();
    model.packages = {Info(true, false, false, "b"), Info(true, true, false, "a"), Info(false, false, false, "c")};
    EXPECT_EQ(model.ShownIdentifiers(), (Texts{"b", "a"}));
    model.packages.clear();
    EXPECT_EQ(model.ShownIdentifiers(), Texts{});
}

TEST_F(ModelQueriesTest, FindAPackageByItsExactIdentifier) {
    HV::InstallerModel& model = Load();
    model.packages = {Info(true, true, false, "com.halvorn.glow"), Info(false, true, true, "com.halvorn.core")};
    EXPECT_TRUE(model.FindPackage("com.halvorn.core").hostFound);
    std::size_t missing = 0;
    for (const char* other : {"com.halvorn.Core", "com.halvorn", "com.halvorn.core ", ""}) {
        EXPECT_EQ(model.FindPackage(other).identifier, "");
        EXPECT_FALSE(model.FindPackage(other).requiresHost);
        ++missing;
    }
    EXPECT_EQ(missing, 4U);
}

TEST_F(ModelQueriesTest, GoToOneModelThatIsLoadedOnce) {
    const CapturedStreams streams;
    HV::InstallerModel& first = HV::InstallerModel::Instance();
    EXPECT_TRUE(first.loaded);
    EXPECT_TRUE(first.hostCheck.Hosts().empty());
    EXPECT_EQ(first.packagesDirectory, HV::PackagesDirectoryPath()) << "beside this program";
    HasTwoHosts();
    HV::InstallerModel& second = HV::InstallerModel::Instance();
    EXPECT_EQ(&first, &second);
    EXPECT_TRUE(second.hostCheck.Hosts().empty());
    HV::InstallerModel::Forget();
}

TEST_F(ModelQueriesTest, GoToANewModelWhenTheFirstIsForgotten) {
    const CapturedStreams streams;
    EXPECT_TRUE(HV::InstallerModel::Instance().hostCheck.Hosts().empty());
    HasTwoHosts();
    HV::InstallerModel::Forget();
    EXPECT_EQ(HV::InstallerModel::Instance().hostCheck.Hosts().size(), 2U);
    HV::InstallerModel::Forget();
}

TEST_F(ModelQueriesTest, HostsAreKnownThoughTheFolderIsBad) {
    HasTwoHosts();
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_TRUE(model.hostCheck.HasHost("mediacomposer"));
}

}  // namespace
