#include <gtest/gtest.h>

#include <map>

#include "package/Package.h"
#include "package/ZipEntries.h"
#include "platform/filesystem.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

const std::string kPath = R"(C:\packages\a.zip)";
const std::string kOut = R"(C:\deep\out)";

std::string OpenError(const std::string& name) {
    return "ERROR hvdeploy-detail: ERROR: failed to open zip file entry " + name;
}
std::string WriteError(const std::string& name) {
    return "ERROR hvdeploy-detail: ERROR: failed to write zip entry file " + name;
}

class HostileArchiveTest : public testing::Test {
protected:
    int Extract(const ArchiveEntry& entry) {
        machine.Has(kPath, ArchiveBuilder().Add(entry).Bytes());
        return HV::ExtractZip(kPath, kOut);
    }

    /// Files below the destination, with what is in them.
    std::map<std::string, std::string> Unpacked() {
        std::map<std::string, std::string> files;
        for (const auto& [path, content] : machine.FilesWithoutFolders()) {
            if (path.rfind(kOut + "\\", 0) == 0) {
                files.emplace(path, content);
            }
        }
        return files;
    }

    /// Files that are neither the archive nor below the destination.
    std::vector<std::string> Strays() {
        std::vector<std::string> strays;
        for (const auto& [path, content] : machine.FilesWithoutFolders()) {
            if (path != kPath && path.rfind(kOut + "\\", 0) != 0) {
                strays.push_back(path);
            }
        }
        return strays;
    }

    Machine machine;
    LogRecorder log;
};

TEST_F(HostileArchiveTest, FilesThatWouldLeaveTheDestinationFailToOpen) {
    const std::vector<std::string> names{
        "../a",         "..\\a",   "x/../../a", "x\\..\\..\\a", "/a",     "\\a",         "//server/share/a",
        "C:/a",         "C:a",     "c:\\a",     "a:stream",     ".. /a",  "../../..",    "x/.. ./a",
        "\\\\?\\C:\\a", "..",      "a.",        "a ",           "x./a",   "nul",         "COM1",
        "x/con.txt",    "aux.h/a", "LPT9.",     "Prn .txt",     "conin$", "COM\xC2\xB9", ""};
    std::size_t tried = 0;
    for (const std::string& name : names) {
        log.Clear();
        EXPECT_EQ(Extract({.name = name, .bytes = "escaped"}), -1) << name;
        EXPECT_TRUE(log.Has(OpenError(name))) << name << '\n' << log.Text();
        ++tried;
    }
    EXPECT_EQ(tried, 28U);
    EXPECT_EQ(Strays(), std::vector<std::string>());
}

TEST_F(HostileArchiveTest, FoldersThatWouldLeaveTheDestinationAreNotMade) {
    const std::vector<std::string> names{"../a/", "..\\a\\", "x/../../a/", "/a/", "C:/a/", "../", "/", "a./", "nul/"};
    std::size_t tried = 0;
    for (const std::string& name : names) {
        log.Clear();
        EXPECT_EQ(Extract({.name = name}), -1) << name;
        EXPECT_TRUE(log.Has("ERROR hvdeploy-detail: ERROR: failed to create directory C:\\deep\\out\\" + name)) << name;
        ++tried;
    }
    EXPECT_EQ(tried, 9U);
    EXPECT_FALSE(machine.Exists(R"(C:\deep\a)"));
    EXPECT_FALSE(machine.Exists(R"(C:\a)"));
}

TEST_F(HostileArchiveTest, NamesThatOnlyLookBadAreUnpacked) {
    const std::vector<std::string> names{"...a", "..a",   "a..b",      ".hidden", "console",
                                         "COM",  "COM10", "nulls.txt", "a b",     "lpt\xC2\xB4"};
    std::size_t tried = 0;
    for (const std::string& name : names) {
        EXPECT_EQ(Extract({.name = name, .bytes = name}), 0) << name << '\n' << log.Text();
        EXPECT_EQ(machine.Content(kOut + "\\" + name), name);
        ++tried;
    }
    EXPECT_EQ(tried, 10U);
}

TEST_F(HostileArchiveTest, ADotStandsForItsFolder) {
    EXPECT_EQ(Extract({.name = "./a", .bytes = "x"}), 0);
    EXPECT_EQ(machine.Content(kOut + "\\a"), "x");
}

TEST_F(HostileArchiveTest, ANameLongerThanTheBufferFailsToOpen) {
    EXPECT_EQ(Extract({.name = std::string(300, 'n'), .bytes = "x"}), -1);
    EXPECT_TRUE(log.Has(OpenError(std::string(259, 'n'))));
}

TEST_F(HostileArchiveTest, AFolderWhoseNameIsLongerThanTheBufferFailsToOpen) {
    EXPECT_EQ(Extract({.name = std::string(300, 'n') + "/"}), -1);
    EXPECT_TRUE(log.Has(OpenError(std::string(259, 'n'))));
}

TEST_F(HostileArchiveTest, AnEncryptedEntryFailsToOpen) {
    EXPECT_EQ(Extract({.name = "secret", .bytes = "0123456789abcdef", .method = 0, .flags = 1}), -1);
    EXPECT_TRUE(log.Has(OpenError("secret")));
}

TEST_F(HostileArchiveTest, EntriesOfUnknownMethodsFailToOpen) {
    int tried = 0;
    for (const int method : {1, 6, 9, 12, 14, 93, 99, 0xFFFF}) {
        log.Clear();
        EXPECT_EQ(Extract({.name = "odd", .bytes = "packed bytes", .method = static_cast<std::uint16_t>(method)}), -1)
            << method;
        EXPECT_TRUE(log.Has(OpenError("odd"))) << method;
        ++tried;
    }
    EXPECT_EQ(tried, 8);
    EXPECT_FALSE(machine.Exists(kOut + "\\odd"));
}

TEST_F(HostileArchiveTest, AnEntryThatClaimsMoreThanItCanHoldFailsToOpen) {
    EXPECT_EQ(Extract({.name = "huge", .bytes = "small", .claimedSize = 0xFFFFFFF0U}), -1);
    EXPECT_TRUE(log.Has(OpenError("huge")));
}

TEST_F(HostileArchiveTest, AnEntryThatClaimsMoreThanTheArchiveHoldsFailsToOpen) {
    EXPECT_EQ(Extract({.name = "huge", .bytes = "x", .claimedSize = 0xFFFFFFF0U, .claimedCompressedSize = 0xFFFFFFF0U}),
              -1);
    EXPECT_TRUE(log.Has(OpenError("huge")));
}

TEST_F(HostileArchiveTest, AStoredEntryOfTwoSizesFailsToOpen) {
    EXPECT_EQ(Extract({.name = "odd", .bytes = "abc", .method = 0, .claimedSize = 2}), -1);
    EXPECT_TRUE(log.Has(OpenError("odd")));
}

TEST_F(HostileArchiveTest, AnEntryAtOddsWithItsOwnHeaderFailsToOpen) {
    EXPECT_EQ(Extract({.name = "odd", .bytes = "abc", .localSize = 2}), -1);
    EXPECT_TRUE(log.Has(OpenError("odd")));
}

TEST_F(HostileArchiveTest, AnEntryThatClaimsALittleMoreThanItHasFailsToBeWritten) {
    EXPECT_EQ(Extract({.name = "short", .bytes = "abc", .claimedSize = 4}), -1);
    EXPECT_TRUE(log.Has(WriteError("short")));
}

TEST_F(HostileArchiveTest, AnEntryThatHidesASurplusFailsToBeWritten) {
    EXPECT_EQ(Extract({.name = "long", .bytes = "abc", .claimedSize = 2}), -1);
    EXPECT_TRUE(log.Has(WriteError("long")));
}

TEST_F(HostileArchiveTest, AnEntryThatClaimsToBeEmptyFailsToBeWritten) {
    EXPECT_EQ(Extract({.name = "full", .bytes = "abc", .claimedSize = 0}), -1);
    EXPECT_TRUE(log.Has(WriteError("full")));
}

TEST_F(HostileArchiveTest, AnEntryWithAWrongChecksumFailsToBeWritten) {
    EXPECT_EQ(Extract({.name = "bad", .bytes = "abc", .claimedChecksum = 7}), -1);
    EXPECT_TRUE(log.Has(WriteError("bad")));
}

TEST_F(HostileArchiveTest, AnEntryWhosePackedBytesAreGarbageFailsToBeWritten) {
    machine.Has(kPath, ArchiveBuilder().Add({.name = "bad", .bytes = std::string(2000, 'a')}).Bytes());
    std::string bytes = machine.Content(kPath);
    bytes[30 + 3] = '\xFF';  // the first byte after the entry's header and name
    machine.Has(kPath, bytes);
    EXPECT_EQ(HV::ExtractZip(kPath, kOut), -1);
    EXPECT_TRUE(log.Has(WriteError("bad")));
}

const std::string kPlugin = "the plug-in, the plug-in, the plug-in";

/// A small package with everything in it that an archive can have.
PackageBuilder SmallPackage() {
    PackageBuilder package("com.halvorn.glow");
    package.Payload("plugin").File("plugins/Glow.aex", kPlugin).File("empty.txt", "");
    package.RawEntry({.name = "stored.bin", .bytes = "stored", .method = 0}).Named("a.zip");
    return package;
}

/// What comes of a package when the engine meets it: checked, and unpacked all the same.
struct Met {
    bool sound = false;
    bool unpacked = false;
};

Met Meet() {
    fs::remove_all(fs::path(kOut));
    HV::Package package{fs::path(kPath)};
    Met met;
    met.sound = package.Validate(false);
    met.unpacked = package.ExtractTo(fs::path(kOut));
    return met;
}

TEST_F(HostileArchiveTest, ACutPackageIsRefusedUnlessItLostNothingButZerosAtItsEnd) {
    const std::string whole = SmallPackage().Bytes();
    std::size_t tried = 0;
    for (std::size_t length = 0; length < whole.size(); ++length, ++tried) {
        machine.Has(kPath, whole.substr(0, length));
        const Met met = Meet();
        const bool onlyZerosLost = whole.find_first_not_of('\0', length) == std::string::npos;
        EXPECT_TRUE(!met.sound || (onlyZerosLost && met.unpacked)) << length;
        if (met.sound) {
            EXPECT_EQ(machine.Content(kOut + R"(\plugins\Glow.aex)"), kPlugin);
            EXPECT_EQ(machine.Content(kOut + R"(\stored.bin)"), "stored");
        }
        log.Clear();
    }
    EXPECT_EQ(tried, whole.size());
    EXPECT_EQ(Strays(), std::vector<std::string>());
    machine.Has(kPath, whole);
    EXPECT_TRUE(Meet().sound);
}

TEST_F(HostileArchiveTest, AFlippedByteNeverUnpacksToOtherFiles) {
    const std::string whole = SmallPackage().Bytes();
    machine.Has(kPath, whole);
    ASSERT_TRUE(Meet().unpacked);
    const auto honest = Unpacked();
    std::size_t tried = 0;
    std::size_t failed = 0;
    for (std::size_t at = 0; at < whole.size(); ++at) {
        for (const char mask : {'\x01', '\x80', '\xFF'}) {
            std::string flipped = whole;
            flipped[at] = static_cast<char>(flipped[at] ^ mask);
            machine.Has(kPath, flipped);
            const Met met = Meet();
            if (met.sound && met.unpacked) {
                EXPECT_EQ(Unpacked(), honest) << at;
            }
            failed += met.sound && met.unpacked ? 0 : 1;
            log.Clear();
            ++tried;
        }
    }
    EXPECT_EQ(tried, whole.size() * 3);
    EXPECT_GT(failed, tried / 3);
    EXPECT_EQ(Strays(), std::vector<std::string>());
}

}  // namespace
