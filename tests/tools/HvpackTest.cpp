#include <gtest/gtest.h>

#include <sstream>

#include "package/Package.h"
#include "platform/filesystem.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/tools/HvpackRun.h"

namespace {

/// A machine with the folder of a package on it.
class HvpackTest : public HvpackRun {
protected:
    void SetUp() override {
        PackageBuilder description("com.halvorn.glow");
        description.Payload("plugin").Source("plugins/*");
        machine.Has(R"(C:\glow\_hvmanifest.xml)", description.Manifest());
        machine.Has(R"(C:\glow\plugins\Glow.aex)", std::string(5000, 'g'));
        machine.Has(R"(C:\glow\plugins\deep\er\note.txt)", "note");
        machine.Has(R"(C:\glow\empty.txt)", "");
        machine.HasFolder(R"(C:\glow\an empty folder)");
    }

    int Make(const std::string& output = R"(C:\out\glow.hvpkg)") {
        machine.HasFolder(R"(C:\out)");
        return Run({"make", R"(C:\glow)", output});
    }

    bool ErrorHas(const std::string& text) const { return err.find(text) != std::string::npos; }

    Machine machine;
};

const char* const kUsageStart = "usage: hvpack make FOLDER OUT.hvpkg";

TEST_F(HvpackTest, MakesAPackageThatTheEngineUnpacksToTheFolder) {
    ASSERT_EQ(Make(), 0) << err;
    EXPECT_EQ(out, "OK C:\\out\\glow.hvpkg\n");
    EXPECT_EQ(err, "");
    HV::Package package{fs::path(R"(C:\out\glow.hvpkg)")};
    ASSERT_TRUE(package.ExtractTo(fs::path(R"(C:\again)")));
    for (const char* path : {"_hvmanifest.xml", "plugins\\Glow.aex", "plugins\\deep\\er\\note.txt", "empty.txt"}) {
        EXPECT_EQ(machine.Content(R"(C:\again\)" + std::string(path)),
                  machine.Content(R"(C:\glow\)" + std::string(path)));
    }
    EXPECT_TRUE(machine.Exists(R"(C:\again\an empty folder)"));
}

TEST_F(HvpackTest, ListsEntriesSortedWithAnEntryForEveryFolder) {
    ASSERT_EQ(Make(), 0) << err;
    EXPECT_EQ(Run({"list", R"(C:\out\glow.hvpkg)"}), 0);
    EXPECT_EQ(out,
              "an empty folder/\nplugins/\nplugins/deep/\nplugins/deep/er/\n"
              "_hvmanifest.xml\nempty.txt\nplugins/Glow.aex\nplugins/deep/er/note.txt\n");
}

TEST_F(HvpackTest, MakesTheSameBytesFromTheSameContents) {
    ASSERT_EQ(Make(), 0) << err;
    const std::string first = machine.Content(R"(C:\out\glow.hvpkg)");
    const std::string content = machine.Content(R"(C:\glow\plugins\Glow.aex)");
    fs::remove(fs::path(R"(C:\glow\plugins\Glow.aex)"));
    machine.Has(R"(C:\glow\plugins\Glow.aex)", content);
    ASSERT_EQ(Make(R"(C:\out\other.zip)"), 0) << err;
    EXPECT_EQ(machine.Content(R"(C:\out\other.zip)"), first);
    EXPECT_LT(first.size(), 3000U) << "nothing was compressed";
}

TEST_F(HvpackTest, ReplacesAnOlderPackageAndLeavesNothingBeside) {
    ASSERT_EQ(Make(), 0) << err;
    machine.Has(R"(C:\glow\more.txt)", "more");
    ASSERT_EQ(Make(), 0) << err;
    EXPECT_EQ(Run({"list", R"(C:\out\glow.hvpkg)"}), 0);
    EXPECT_NE(out.find("more.txt"), std::string::npos);
    EXPECT_FALSE(machine.Exists(R"(C:\out\glow.hvpkg.part)"));
}

TEST_F(HvpackTest, RefusesAFolderWithoutARootManifest) {
    fs::rename(fs::path(R"(C:\glow\_hvmanifest.xml)"), fs::path(R"(C:\glow\plugins\_hvmanifest.xml)"));
    EXPECT_EQ(Make(), 1);
    EXPECT_EQ(err, "hvpack: no _hvmanifest.xml in C:\\glow\n");
    EXPECT_FALSE(machine.Exists(R"(C:\out\glow.hvpkg)"));
}

TEST_F(HvpackTest, RefusesWhatTheEngineWouldAndKeepsTheOlderPackage) {
    machine.Has(R"(C:\out\glow.hvpkg)", "the older one");
    fs::remove_all(fs::path(R"(C:\glow\plugins)"));
    EXPECT_EQ(Make(), 1);
    EXPECT_EQ(err,
              "ERROR: Error in package glow.hvpkg- cannot find source for payload payload-1, source plugins\\*\n"
              "hvpack: glow.hvpkg would not be a sound package\n");
    EXPECT_EQ(machine.Content(R"(C:\out\glow.hvpkg)"), "the older one");
    EXPECT_FALSE(machine.Exists(R"(C:\out\glow.hvpkg.part)"));
}

TEST_F(HvpackTest, RefusesTwoRootManifests) {
    machine.Has(R"(C:\glow\other_hvmanifest.xml)", "x");
    EXPECT_EQ(Make(), 1);
    EXPECT_TRUE(ErrorHas("WARN: In HV::Package::Validate - multiple root manifests found in glow.hvpkg\n")) << err;
}

TEST_F(HvpackTest, RefusesAnotherExtension) {
    EXPECT_EQ(Make(R"(C:\out\glow.rar)"), 1);
    EXPECT_EQ(err, "hvpack: a package is named .hvpkg or .zip, not glow.rar\n");
}

TEST_F(HvpackTest, RefusesAMissingFolder) {
    EXPECT_EQ(Run({"make", R"(C:\nowhere)", R"(C:\x.zip)"}), 1);
    EXPECT_EQ(err, "hvpack: C:\\nowhere is not a folder\n");
}

TEST_F(HvpackTest, RefusesToWriteIntoTheFolderItself) {
    EXPECT_EQ(Make(R"(C:\glow\plugins\glow.hvpkg)"), 1);
    EXPECT_EQ(err, "hvpack: the package cannot be written into the folder that it is made of\n");
}

TEST_F(HvpackTest, RefusesNamesThatCannotBeUnpacked) {
    const std::string part(120, 'n');
    machine.Has(R"(C:\glow\plugins\)" + part + "\\" + part + R"(\a-name-of-some-length.txt)", "x");
    EXPECT_EQ(Make(), 1);
    EXPECT_TRUE(ErrorHas("is longer than 259 bytes")) << err;
}

TEST_F(HvpackTest, SaysSoWhenItCannotWrite) {
    machine.Has(R"(C:\file)", "not a folder");
    EXPECT_EQ(Run({"make", R"(C:\glow)", R"(C:\file\x.zip)"}), 1);
    EXPECT_EQ(err.rfind("hvpack: ", 0), 0U) << err;
    EXPECT_EQ(out, "");
}

TEST_F(HvpackTest, ChecksEveryFileAndFailsForOne) {
    ASSERT_EQ(Make(), 0) << err;
    machine.Has(R"(C:\out\bad.zip)", "garbage");
    EXPECT_EQ(Run({"check", R"(C:\out\bad.zip)", R"(C:\out\glow.hvpkg)", R"(C:\out\none.zip)", R"(C:\out\a.txt)"}), 1);
    EXPECT_EQ(out, "OK C:\\out\\glow.hvpkg\n");
    EXPECT_EQ(err,
              "ERROR: ReadZipEntries failed for bad.zip\n"
              "hvpack: C:\\out\\bad.zip is not a sound package\n"
              "hvpack: File not found at path C:\\out\\none.zip\n"
              "hvpack: C:\\out\\a.txt is not named .hvpkg or .zip\n");
}

TEST_F(HvpackTest, ChecksSoundPackagesWithStatusZero) {
    ASSERT_EQ(Make(), 0) << err;
    ASSERT_EQ(Make(R"(C:\out\two.zip)"), 0) << err;
    EXPECT_EQ(Run({"check", R"(C:\out\glow.hvpkg)", R"(C:\out\two.zip)"}), 0);
    EXPECT_EQ(out, "OK C:\\out\\glow.hvpkg\nOK C:\\out\\two.zip\n");
    EXPECT_EQ(err, "");
}

/// Packages that pass for sound until their entries are unpacked.
class UnpackablePackageTest : public HvpackTest {
protected:
    UnpackablePackageTest() { description.Payload("plugin").File("Glow.aex", "bytes"); }

    void ExpectRefusedFor(const ArchiveEntry& entry, const std::string& reason) {
        PackageBuilder spoilt = description;
        (void)spoilt.RawEntry(entry).Named("glow.hvpkg").WriteTo(R"(C:\out)");
        const auto before = machine.Files();
        EXPECT_EQ(Run({"check", R"(C:\out\glow.hvpkg)"}), 1);
        EXPECT_EQ(out, "");
        EXPECT_EQ(err, "ERROR: zip entry " + entry.name + ": " + reason +
                           "\nhvpack: C:\\out\\glow.hvpkg is not a sound package\n");
        EXPECT_EQ(Run({"table", R"(C:\out)"}), 1) << "what is not sound has no row";
        EXPECT_EQ(machine.Files(), before);
    }

    PackageBuilder description{"com.halvorn.glow"};
};

TEST_F(UnpackablePackageTest, AreRefusedForEveryKindOfEntryThatExtractionRefuses) {
    ExpectRefusedFor({.name = "damaged", .bytes = "x", .claimedChecksum = 7}, "its bytes do not match their checksum");
    ExpectRefusedFor({.name = "secret", .bytes = "x", .method = 0, .flags = 1}, "it is encrypted");
    ExpectRefusedFor({.name = "odd", .bytes = "x", .method = 14}, "it is compressed by the unknown method 14");
    ExpectRefusedFor({.name = "con.txt", .bytes = "x"}, "its name cannot be used on Windows");
    ExpectRefusedFor({.name = "../up", .bytes = "x"}, "its name cannot be used on Windows");
    ExpectRefusedFor({.name = "Gl\xFC", .bytes = "x"}, "its name is not UTF-8");
    ExpectRefusedFor({.name = "one", .bytes = "x", .localName = "two"}, "its own header names it two");
    ExpectRefusedFor({.name = "short", .bytes = "abc", .packed = PackedBytes("abcdef")},
                     "it unpacks to more than it claims");
}

TEST_F(UnpackablePackageTest, HaveTheirMissingFoldersNamed) {
    ExpectRefusedFor({.name = "docs/deep/note.txt", .bytes = "x"}, "its folder docs/deep/ has no entry of its own");
    description.Folder("docs/deep");
    description.RawEntry({.name = "docs/deep/note.txt", .bytes = "x"});
    (void)description.Named("glow.hvpkg").WriteTo(R"(C:\out)");
    EXPECT_EQ(Run({"check", R"(C:\out\glow.hvpkg)"}), 0) << err;
}

TEST_F(UnpackablePackageTest, AreRefusedForTwoNamesThatAreOneOnWindows) {
    description.File("read.me", "1").File("READ.ME", "2");
    (void)description.Named("glow.hvpkg").WriteTo(R"(C:\out)");
    EXPECT_EQ(Run({"check", R"(C:\out\glow.hvpkg)"}), 1);
    EXPECT_EQ(err,
              "ERROR: zip entry read.me: to Windows it has the same name as READ.ME\n"
              "ERROR: zip entry READ.ME: to Windows it has the same name as read.me\n"
              "hvpack: C:\\out\\glow.hvpkg is not a sound package\n");
}

/// A package with one payload for hosts and one for a system directory, which a test spoils.
class PackageWarningsTest : public HvpackTest {
protected:
    PackageWarningsTest() {
        description.Payload("plugin").Id("effect").File("Glow.aex", "bytes").Subpath("Halvorn/Glow");
    }
    /// What `check` says, after the words that each warning begins with.
    std::string Warning() {
        (void)description.Named("glow.hvpkg").WriteTo(R"(C:\out)");
        EXPECT_EQ(Run({"check", R"(C:\out\glow.hvpkg)"}), 0) << err;
        EXPECT_EQ(out, "OK C:\\out\\glow.hvpkg\n");
        const std::string start = R"(hvpack: WARNING: C:\out\glow.hvpkg: )";
        return err.rfind(start, 0) == 0 ? err.substr(start.size()) : err;
    }

    PackageBuilder description{"com.halvorn.glow"};
};

TEST_F(PackageWarningsTest, AreNoneWhenEveryWordIsKnown) {
    int known = 0;
    for (const char* host : {"aftereffects", "aftereffectsMC", "aftereffects+premiere", "premiere", "edius", "hitfilm",
                             "mediacomposer", "resolve", "vegas", "ofx", "finalcutprox", "motion"}) {
        description.ForHost(host);
        ++known;
    }
    description.Payload("help").To("commondocs", "Halvorn...").File("Read me.txt", "text");
    EXPECT_EQ(Warning(), "");
    EXPECT_EQ(known, 12);
}

TEST_F(PackageWarningsTest, TellOfAnUnknownType) {
    description.Payload("Library").Id("core").To("programdata").File("Core.dll", "bytes");
    EXPECT_EQ(Warning(), "payload core has an unknown type\n");
}

TEST_F(PackageWarningsTest, TellOfAnUnknownHost) {
    description.ForHost("resolve").ForHost("After Effects");
    EXPECT_EQ(Warning(), "payload effect has the unknown host-ref \"After Effects\"\n");
}

TEST_F(PackageWarningsTest, TellOfAnUnknownSystemDirectory) {
    description.Payload("help").Id("manual").To("CommonDocs").File("Read me.txt", "text");
    EXPECT_EQ(Warning(), "payload manual has the unknown sysdir \"CommonDocs\"\n");
}

TEST_F(PackageWarningsTest, TellOfASubpathThatLeavesItsFolder) {
    description.Subpath("Halvorn/../../Other");
    EXPECT_EQ(Warning(), "payload effect leaves its folder: \"..\" stands in its subpath\n");
}

TEST_F(PackageWarningsTest, PassOverPayloadsForOtherSystems) {
    description.Payload("Bundle").Os("mac").To("nowhere", "../..").ForHost("nobody").File("Glow.plugin", "bytes");
    EXPECT_EQ(Warning(), "");
}

TEST_F(PackageWarningsTest, DoNotKeepAPackageFromBeingMade) {
    description.ForHost("premier");
    machine.Has(R"(C:\odd\_hvmanifest.xml)", description.Manifest());
    machine.Has(R"(C:\odd\Glow.aex)", "bytes");
    EXPECT_EQ(Run({"make", R"(C:\odd)", R"(C:\glow.hvpkg)"}), 0);
    EXPECT_EQ(out, "OK C:\\glow.hvpkg\n");
    EXPECT_EQ(err, "hvpack: WARNING: C:\\glow.hvpkg: payload effect has the unknown host-ref \"premier\"\n");
}

TEST_F(HvpackTest, DoesNotListWhatIsNoPackage) {
    machine.Has(R"(C:\out\bad.zip)", "garbage");
    EXPECT_EQ(Run({"list", R"(C:\out\bad.zip)"}), 1);
    EXPECT_EQ(err, "hvpack: C:\\out\\bad.zip cannot be opened as a package\n");
}

TEST_F(HvpackTest, TellsHowItIsUsedWhenItDoesNotUnderstand) {
    const std::vector<std::vector<std::string>> lines{
        {},       {"help"},           {"make"},  {"make", "a"},           {"check"}, {"make", "a", "b", "c"},
        {"list"}, {"list", "a", "b"}, {"table"}, {"table", "a", "b", "c"}};
    std::size_t tried = 0;
    for (const auto& line : lines) {
        EXPECT_EQ(Run(line), 1);
        EXPECT_EQ(err.rfind(kUsageStart, 0), 0U) << err;
        EXPECT_EQ(out, "");
        ++tried;
    }
    EXPECT_EQ(tried, 10U);
}

TEST_F(HvpackTest, LeavesLoggingAsItFoundIt) {
    const LogRecorder log;
    EXPECT_EQ(Run({"check", R"(C:\out\none.zip)"}), 1);
    HV::Package unpacked{fs::path(R"(C:\glow)")};
    EXPECT_FALSE(unpacked.Validate(false));
    EXPECT_TRUE(log.Has("WARN hvdeploy-detail: In HV::Package::Validate - zip does not exist at "));
}

}  // namespace
