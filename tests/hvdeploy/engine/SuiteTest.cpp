// The suite's record: the file beside the packages, and the text that is made when there is none.
#include <stdexcept>

#include "tests/hvdeploy/engine/EngineTest.h"

namespace {

constexpr const char* kSuiteFile = R"(C:\Packages\suite.json)";
const std::string kBadType = WarnLine(R"(non-suite product type encountered in json file "C:\Packages\suite.json")");
const std::string kUnreadable = WarnLine(R"(failed to read suite data from file "C:\Packages\suite.json")");

class SuiteTest : public EngineTest {
protected:
    HV::EngineResult RunWith(const std::string& suite) {
        machine.Has(kSuiteFile, suite);
        return InstallFolder();
    }
    static PackageBuilder OfSuite(const std::string& name, const std::string& identifier, const std::string& version,
                                  const std::string& displayName) {
        return Placing(name)
            .Property("suite_identifier", identifier)
            .Property("suite_version", version)
            .Property("suite_display_name", displayName);
    }
    bool Synthesize(const std::vector<PackageBuilder>& packages) {
        std::vector<fs::path> paths;
        for (const PackageBuilder& package : packages) {
            paths.push_back(package.WriteTo(kPackages));
        }
        return engine.SynthesizeSuiteInfoFromProducts(paths, text);
    }
    std::string NameFor(const std::string& identifier, const std::string& displayName) {
        EXPECT_TRUE(Synthesize({OfSuite("glow", identifier, "1.0", displayName)}));
        HVL::ProductData suite;
        EXPECT_TRUE(suite.ReadJSON(text)) << text;
        return suite.GetDisplayName();
    }

    std::string text;
};

}  // namespace

TEST_F(SuiteTest, TakesASuiteFileWithoutAWarning) {
    EXPECT_EQ(RunWith(R"({"identifier": "com.halvorn.tessaly", "product_type": "0"})"), 0);
    EXPECT_TRUE(log.Has(DebugLine("Located suite .json file...")));
    EXPECT_EQ(log.LinesStartingWith("WARN"), std::vector<std::string>{});
    EXPECT_FALSE(log.Has(DebugLine("HV::Deploy::SynthesizeSuiteInfoFromProducts")));
}

TEST_F(SuiteTest, FindsASuiteFileInUpperCase) {
    machine.Has(R"(C:\Packages\SUITE.JSON)", R"({"product_type": "0"})");
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_TRUE(log.Has(DebugLine("Located suite .json file...")));
}

TEST_F(SuiteTest, WarnsTwiceOfAnotherProductType) {
    EXPECT_EQ(RunWith(R"({"identifier": "com.halvorn.glow", "product_type": "1"})"), 0);
    EXPECT_EQ(log.LinesStartingWith("WARN"), (std::vector<std::string>{kBadType, kUnreadable}));
}

TEST_F(SuiteTest, TakesAMissingProductTypeForAnotherOne) {
    EXPECT_EQ(RunWith(R"({"identifier": "com.halvorn.tessaly"})"), 0);
    EXPECT_EQ(log.LinesStartingWith("WARN"), (std::vector<std::string>{kBadType, kUnreadable}));
}

TEST_F(SuiteTest, DoesNotReadAProductTypeThatIsANumber) {
    EXPECT_EQ(RunWith(R"({"product_type": 0})"), 0);
    EXPECT_EQ(log.LinesStartingWith("WARN"), (std::vector<std::string>{kBadType, kUnreadable}));
}

TEST_F(SuiteTest, WarnsOfATextThatDoesNotParseAndOfTheEmptySynthesis) {
    EXPECT_EQ(RunWith("{ no json"), 0);
    EXPECT_EQ(log.LinesStartingWith("WARN"), (std::vector<std::string>{kUnreadable, kUnreadable}));
}

TEST_F(SuiteTest, LeavesATextThatIsNoObjectToTheCaller) {
    EXPECT_THROW((void)RunWith("[1, 2]"), std::runtime_error);
}

TEST_F(SuiteTest, NamesTheFileAndTheReasonWhenItsTextEndsTheRun) {
    EXPECT_THROW((void)RunWith(R"({"product_type": "0", "size": 1e999})"), std::overflow_error);
    EXPECT_TRUE(log.Has(
        ErrorLine(R"(cannot take suite data from file "C:\Packages\suite.json": a number is too large to be read)")))
        << log.Text();
    log.Clear();
    EXPECT_THROW((void)RunWith("[1, 2]"), std::runtime_error);
    EXPECT_EQ(log.LinesStartingWith(ErrorLine(R"(cannot take suite data from file "C:\Packages\suite.json": )")).size(),
              1U)
        << log.Text();
}

TEST_F(SuiteTest, WarnsWithAnEmptyPathWhenThereIsNoSuiteFile) {
    machine.HasFolder(kPackages);
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_EQ(log.LinesStartingWith("WARN"),
              std::vector<std::string>{WarnLine(R"(failed to read suite data from file "")")});
}

TEST_F(SuiteTest, DoesNotBuildASuiteFromTheFoldersPackages) {
    Ships(OfSuite("glow", "com.halvorn.tessaly", "3.1", "Tessaly"));
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::SynthesizeSuiteInfoFromProducts")));
    EXPECT_TRUE(log.Has(WarnLine(R"(failed to read suite data from file "")"))) << log.Text();
}

// Which of the two is the first is the directory's choice.
TEST_F(SuiteTest, WarnsOfASecondSuiteFile) {
    machine.Has(R"(C:\Packages\a.json)", R"({"product_type": "0"})");
    machine.Has(R"(C:\Packages\b.json)", R"({"product_type": "0"})");
    EXPECT_EQ(InstallFolder(), 0);
    const std::string warning = "found additional json file at root level of packages dir: ";
    EXPECT_EQ(log.Count(WarnLine(warning + R"("C:\Packages\a.json")")) +
                  log.Count(WarnLine(warning + R"("C:\Packages\b.json")")),
              1U);
    EXPECT_EQ(log.LinesStartingWith("WARN").size(), 1U) << log.Text();
}

TEST_F(SuiteTest, WritesTheSuitesTextToTheLetter) {
    ASSERT_TRUE(Synthesize({OfSuite("glow", "com.halvorn.tessaly", "3.1", "Tessaly")}));
    EXPECT_EQ(
        text,
        R"({ "identifier": "com.halvorn.tessaly","version": "3.1","product_type": "0","display_name": "Tessaly"})");
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::SynthesizeSuiteInfoFromProducts")));
}

TEST_F(SuiteTest, LetsTheFirstPackageThatNamesASuiteDecide) {
    ASSERT_TRUE(Synthesize({Placing("plain"), OfSuite("a", "", "1.0", "No identifier"),
                            OfSuite("b", "com.halvorn.tessaly", "", "No version"),
                            OfSuite("c", "com.halvorn.tessaly", "3.1", "Tessaly"),
                            OfSuite("d", "com.halvorn.tessaly", "3.2", "Tessaly")}));
    EXPECT_NE(text.find(R"("version": "3.1")"), std::string::npos) << text;
}

TEST_F(SuiteTest, PassesOverAPackageThatCannotBeOpened) {
    const fs::path good = OfSuite("glow", "com.halvorn.tessaly", "3.1", "Tessaly").WriteTo(kPackages);
    EXPECT_TRUE(engine.SynthesizeSuiteInfoFromProducts({fs::path(R"(C:\Packages\missing.hvpkg)"), good}, text));
}

TEST_F(SuiteTest, AsksAPackageForItsMetadataAlone) {
    ASSERT_TRUE(Synthesize({OfSuite("glow", "com.halvorn.tessaly", "3.1", "Tessaly")
                                .Payload("resource")
                                .To("programdata")
                                .Source("missing.dll")}));
    EXPECT_EQ(log.LinesStartingWith("ERROR"), std::vector<std::string>{});
}

TEST_F(SuiteTest, FindsNoSuiteWhereNoPackageNamesOne) {
    EXPECT_FALSE(Synthesize({Placing("glow"), Placing("grain")}));
    EXPECT_EQ(text, "");
}

TEST_F(SuiteTest, CallsASuiteWithoutANameUnknown) {
    EXPECT_EQ(NameFor("com.halvorn.tessaly", ""), "Unknown");
}

TEST_F(SuiteTest, SaysThatASuiteIsABeta) {
    EXPECT_EQ(NameFor("com.halvorn.tessaly-beta", "Tessaly"), "Tessaly Beta");
    EXPECT_EQ(NameFor("com.halvorn.tessaly-beta2", ""), "Unknown Beta");
}

TEST_F(SuiteTest, DoesNotSayBetaTwice) {
    EXPECT_EQ(NameFor("com.halvorn.tessaly-beta", "Tessaly Beta"), "Tessaly Beta");
    EXPECT_EQ(NameFor("com.halvorn.tessaly-beta", "Tessaly BETA 3"), "Tessaly BETA 3");
}

TEST_F(SuiteTest, DoesNotSayBetaOfAnIdentifierWithoutTheHyphen) {
    EXPECT_EQ(NameFor("com.halvorn.tessalybeta", "Tessaly"), "Tessaly");
}

TEST_F(SuiteTest, MakesATextThatDoesNotParseOfANameWithAQuote) {
    ASSERT_TRUE(Synthesize({OfSuite("glow", "com.halvorn.tessaly", "3.1", "Tessaly \"One\"")}));
    HVL::ProductData suite;
    EXPECT_FALSE(suite.ReadJSON(text));
}
