// The history folder is anybody's to write to. What lies in it under odd names is listed as it is named, decides about
// the product of exactly that name, and harms nothing else.
#include "hvdeploy/src/InstalledHistory.h"
#include "tests/hvdeploy/CommandLineTest.h"
#include "tests/support/RunProgram.h"

namespace {

const std::string kFolder = R"(C:\ProgramData\Halvorn\.hvdeploy\history)";
constexpr const char* kEnding = "_hvmanifest.xml";
/// What Windows allows as the length of a name.
constexpr std::size_t kLongestName = 255;

class OddHistoryTest : public CommandLineTest {
protected:
    void HasRecord(const std::string& stem, const std::string& content = "<hvmanifest/>") {
        machine.Has(kFolder + '\\' + stem + kEnding, content);
    }

    /// What `list=installed` prints; the shipped program says the same.
    std::string Listed() {
        std::string text;
        {
            CapturedStreams streams;
            EXPECT_EQ(Run("list=installed"), 0);
            text = streams.Output();
        }
        const ProgramResult result = RunProgram("hvdeploy", {"list=installed", "loglevel=emerg"});
        EXPECT_EQ(result.exitStatus, 0);
        EXPECT_EQ(result.output, text);
        return text;
    }

    /// Whether a run installs version 2.0 of the product. A product that is left out is no failure.
    bool Installs(const std::string& product = "com.halvorn.glow") {
        (void)PackageBuilder(product)
            .Version("2.0")
            .Named("product.hvpkg")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("placed.txt", "text")
            .WriteTo(R"(C:\Packages)");
        HV::DeployCLI other(nullptr);
        EXPECT_EQ(other.ParseLine(R"(dir=C:\Packages)"), 0);
        EXPECT_EQ(other.Run(), 0) << log.Text();
        const bool installed = machine.HasFile(R"(C:\ProgramData\Halvorn\placed.txt)");
        EXPECT_EQ(installed, !log.Has(DebugLine("Skipping package " + product + " (v. 2.0)"))) << log.Text();
        return installed;
    }
};

TEST_F(OddHistoryTest, AFolderWithTheNameOfARecordIsNone) {
    machine.Has(kFolder + R"(\com.halvorn.glow_v9.0_hvmanifest.xml\com.halvorn.glow_v8.0_hvmanifest.xml)", "<x/>");
    EXPECT_EQ(Listed(), "");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, AFileInTheFoldersPlaceHoldsNoRecords) {
    machine.Has(kFolder, "a file");
    EXPECT_EQ(Listed(), "");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, NamesThatAreNoIdentifiersAreListedAndMeanNoProduct) {
    for (const char* stem : {"", "_v", "_v9.0", "v9.0", "-", "..com_v9.0", "a,b;c_v9.0", "100%_v9.0"}) {
        HasRecord(stem);
    }
    EXPECT_EQ(Listed(), "\n-\n..com_v9.0\n100%_v9.0\n_v\n_v9.0\na,b;c_v9.0\nv9.0\n");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, AProductWithoutANameIsTheOneAfterAnEmptyIdentifier) {
    HasRecord("_v9.0");
    HV::InstalledHistory history{kFolder};
    EXPECT_FALSE(history.Versions("").empty());
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, BlanksAreLettersLikeAnyOther) {
    HasRecord(" com.halvorn.glow_v9.0");
    HasRecord("com.halvorn.glow _v9.0");
    HasRecord("com.halvorn. glow_v9.0");
    HasRecord("com.halvorn.keyer_v1.0 (copy 2)");
    EXPECT_EQ(Listed(),
              " com.halvorn.glow_v9.0\ncom.halvorn. glow_v9.0\ncom.halvorn.glow _v9.0\ncom.halvorn.keyer_v1.0 (copy "
              "2)\n");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, ABlankAfterTheVersionDoesNotChangeItsNumbers) {
    HasRecord("com.halvorn.glow_v9.0 (copy 2)");
    EXPECT_FALSE(Installs());
}

TEST_F(OddHistoryTest, ANameAsLongAsNamesMayBeCounts) {
    const std::string rest = std::string("_v9.0") + kEnding;
    const std::string product = "com.halvorn." + std::string(kLongestName - rest.size() - 12, 'g');
    HasRecord(product + "_v9.0");
    EXPECT_EQ(Listed(), product + "_v9.0\n");
    EXPECT_FALSE(Installs(product));
}

TEST_F(OddHistoryTest, ALongNameDoesNotStandForTheShorterOneThatItBeginsWith) {
    HasRecord("com.halvorn.glow" + std::string(200, 'w') + "_v9.0");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, WhatARecordHoldsIsNeverRead) {
    HasRecord("com.halvorn.empty_v9.0", "");
    HasRecord("com.halvorn.glow_v9.0", std::string("\0\xFF\xFE<not><xml", 12));
    HasRecord("com.halvorn.large_v9.0", std::string(1 << 20, '<'));
    EXPECT_EQ(Listed(), "com.halvorn.empty_v9.0\ncom.halvorn.glow_v9.0\ncom.halvorn.large_v9.0\n");
    EXPECT_FALSE(Installs());
}

// On a disk that tells names apart by case both could lie there; the engine tells them apart everywhere.
TEST_F(OddHistoryTest, ARecordInAnotherCaseIsAnotherProducts) {
    HasRecord("com.Halvorn.Glow_v9.0");
    EXPECT_EQ(Listed(), "com.Halvorn.Glow_v9.0\n");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, TheMarkOfTheVersionIsOfLowerCase) {
    HasRecord("com.halvorn.glow_V9.0");
    EXPECT_EQ(Listed(), "com.halvorn.glow_V9.0\n");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, TheEndingIsOfLowerCase) {
    machine.Has(kFolder + R"(\com.halvorn.glow_v9.0_HvManifest.xml)", "<x/>");
    EXPECT_EQ(Listed(), "");
    EXPECT_TRUE(Installs());
}

TEST_F(OddHistoryTest, NamesOfAllScriptsAreListedAndMeant) {
    const std::string product = "com.halvorn.gl\xC3\xBChen.\xE5\x85\x89";
    HasRecord(product + "_v9.0");
    EXPECT_EQ(Listed(), product + "_v9.0\n");
    EXPECT_FALSE(Installs(product));
}

TEST_F(OddHistoryTest, AReadOnlyRecordCountsLikeAnyOther) {
    machine.HasReadOnly(kFolder + R"(\com.halvorn.glow_v9.0_hvmanifest.xml)", "<x/>");
    EXPECT_EQ(Listed(), "com.halvorn.glow_v9.0\n");
    EXPECT_FALSE(Installs());
}

}  // namespace
