// What the wizard finds in its packages folder.
#include <array>

#include "platform/filesystem.h"
#include "tests/installer/ModelTest.h"

namespace {

const std::string kUnreadableSuite = R"(ERROR: failed to read suite data from file C:\Setup\packages\suite.json)"
                                     "\n";

class ScanTest : public ModelTest {
protected:
    /// The names of the folder's entries in the system's order.
    static Texts NamesInOrder() {
        Texts names;
        for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(kPackages))) {
            names.push_back(entry.path().filename().string());
        }
        return names;
    }
};

TEST_F(ScanTest, AGoodFolderIsValid) {
    setup.HasSuite();
    const std::string name = setup.Ships(Product("glow"));
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_TRUE(model.loaded);
    EXPECT_EQ(model.packagesDirectory, kPackages);
    EXPECT_EQ(model.packageFiles, Texts{InPackages(name)});
    EXPECT_EQ(model.suiteJsonPath, InPackages("suite.json"));
    EXPECT_EQ(model.suite.GetDisplayName(), "Tessaly Suite");
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, NoFolderIsNotValid) {
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.packagesDirectory, kPackages);
    EXPECT_EQ(model.suiteJsonPath, "");
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, AFileInPlaceOfTheFolderIsNotValid) {
    machine.Has(kPackages, "no folder");
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, AnEmptyFolderIsNotValid) {
    machine.HasFolder(kPackages);
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, AFolderWithoutASuiteFileIsNotValid) {
    setup.Ships(Product("glow"));
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.packageFiles.size(), 1U);
    EXPECT_EQ(model.suiteJsonPath, "");
    EXPECT_TRUE(model.packages.empty());
    EXPECT_EQ(errors, "");
    EXPECT_EQ(log.LinesStartingWith("ERROR"), Texts{});
}

TEST_F(ScanTest, ADirectoryWithTheNameOfASuiteFileIsNone) {
    setup.Ships(Product("glow"));
    machine.HasFolder(InPackages("suite.json"));
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.suiteJsonPath, "");
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, AFolderWithoutPackagesIsNotValidAndItsSuiteIsReadAllTheSame) {
    setup.HasSuite();
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.suite.GetDisplayName(), "Tessaly Suite");
    // The table of this build is empty, which is nobody's business before there are packages.
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, TheFirstOfTwoSuiteFilesWinsAndTheRunGoesOn) {
    setup.Ships(Product("glow"));
    setup.HasSuite(R"({"display_name": "suite.json"})", "suite.json");
    setup.HasSuite(R"({"display_name": "another.json"})", "another.json");
    const Texts names = NamesInOrder();
    const bool suiteComesFirst = std::ranges::find(names, "suite.json") < std::ranges::find(names, "another.json");
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid);
    EXPECT_EQ(model.suite.GetDisplayName(), suiteComesFirst ? "suite.json" : "another.json");
    EXPECT_EQ(errors, "WARNING: found additional json file at root level of packages dir: \"" +
                          InPackages(suiteComesFirst ? "another.json" : "suite.json") + "\"\n");
}

TEST_F(ScanTest, EveryFurtherSuiteFileHasAWarning) {
    setup.Ships(Product("glow"));
    for (const char* name : {"a.json", "b.json", "c.json", "d.json"}) {
        setup.HasSuite("{}", name);
    }
    EXPECT_TRUE(Load().valid);
    const std::string warning = "WARNING: found additional json file at root level of packages dir: ";
    std::size_t warnings = 0;
    for (auto at = errors.find(warning); at != std::string::npos; at = errors.find(warning, at + 1)) {
        ++warnings;
    }
    EXPECT_EQ(warnings, 3U) << errors;
}

TEST_F(ScanTest, ATextThatIsNoJsonObjectIsRefused) {
    setup.Ships(Product("glow"));
    const std::array<std::string, 9> bad{
        "",
        "[1, 2]",
        "\"text\"",
        "{\"identifier\": \"com.halvorn.suite\"",
        "nonsense",
        "\xEF\xBB\xBF{\"display_name\": \"after a byte-order mark\"}",
        "{\"number\": 1e999}",
        "{\"installed_file_paths\": [1]}",
        std::string(10'000'000, '['),  // NOLINT(bugprone-string-constructor): ten megabytes are meant.
    };
    std::size_t refused = 0;
    for (const std::string& json : bad) {
        // The model before this one holds the file.
        LetGo();
        setup.HasSuite(json);
        const HV::InstallerModel& model = Load();
        EXPECT_FALSE(model.valid) << json.substr(0, 60);
        EXPECT_TRUE(model.packages.empty());
        refused += errors == kUnreadableSuite ? 1 : 0;
    }
    EXPECT_EQ(refused, 9U) << errors;
}

TEST_F(ScanTest, ASuiteFileOfTenMegabytesIsRead) {
    setup.Ships(Product("glow"));
    // NOLINTNEXTLINE(bugprone-string-constructor): ten megabytes are meant.
    setup.HasSuite("{\"filler\": \"" + std::string(10'000'000, 'x') + "\", \"display_name\": \"Large Suite\"}");
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid);
    EXPECT_EQ(model.suite.GetDisplayName(), "Large Suite");
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, AnySuiteObjectWillDo) {
    setup.Ships(Product("glow"));
    setup.HasSuite(R"({"product_type": "7", "version": 4, "nested": {"display_name": "x"}})");
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << "the engine asks for a suite's type, the wizard does not";
    EXPECT_EQ(model.suite.GetVersion(), "");
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, ExtensionsAreComparedInTheirCase) {
    setup.HasSuite();
    setup.Has(Product("glow").Named("glow.HVPKG"));
    setup.Has(Product("grain").Named("grain.Zip"));
    setup.HasSuite("nonsense", "other.JSON");
    const HV::InstallerModel& model = Load();
    EXPECT_EQ(model.packageFiles, Texts{});
    EXPECT_EQ(model.suiteJsonPath, InPackages("suite.json"));
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, OtherFilesAndFoldersArePassedOver) {
    setup.HasSuite();
    const std::string name = setup.Ships(Product("glow"));
    machine.Has(InPackages("read me.txt"), "text");
    machine.Has(InPackages("glow.hvpkg.bak"), "copy");
    machine.Has(InPackages("hvpkg"), "no extension");
    machine.HasFolder(InPackages("folder.hvpkg"));
    machine.Has(InPackages(R"(folder.hvpkg\deep.hvpkg)"), "deep");
    machine.Has(InPackages(R"(more\deep.zip)"), "deep");
    machine.Has(InPackages(R"(more\deep.json)"), "deep");
    const HV::InstallerModel& model = Load();
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(model.packageFiles, Texts{InPackages(name)});
    EXPECT_EQ(errors, "");
}

TEST_F(ScanTest, BothExtensionsAreListedInTheOrderOfTheFolder) {
    for (const char* name : {"d.zip", "a.hvpkg", "c.zip", "b.hvpkg"}) {
        machine.Has(InPackages(name), "package");
    }
    Texts expected;
    for (const std::string& name : NamesInOrder()) {
        expected.push_back(InPackages(name));
    }
    const HV::InstallerModel& model = Load();
    EXPECT_EQ(model.packageFiles, expected);
    EXPECT_EQ(expected.size(), 4U);
}

}  // namespace
