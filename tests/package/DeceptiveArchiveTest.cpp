// Archives that are read differently by different readers, or that hold something else than they say: each of these
// once became files without a word.
#include <gtest/gtest.h>

#include "package/ZipEntries.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

const std::string kPath = R"(C:\packages\a.zip)";
const std::string kOut = R"(C:\deep\out)";

using Names = std::vector<std::string>;
using Entries = std::vector<ArchiveEntry>;

std::string Line(const std::string& text) {
    return "ERROR hvdeploy-detail: " + text;
}
std::string Reason(const std::string& name, const std::string& problem) {
    return Line("zip entry " + name + ": " + problem);
}
std::string OpenError(const std::string& name) {
    return Line("ERROR: failed to open zip file entry " + name);
}
std::string WriteError(const std::string& name) {
    return Line("ERROR: failed to write zip entry file " + name);
}
std::string FolderError(const std::string& name) {
    return Line("ERROR: failed to create directory " + kOut + "\\" + name);
}

ArchiveBuilder ArchiveOf(const Entries& entries) {
    ArchiveBuilder archive;
    for (const ArchiveEntry& entry : entries) {
        archive.Add(entry);
    }
    return archive;
}

class DeceptiveArchiveTest : public testing::Test {
protected:
    int Extract(const std::string& bytes) {
        machine.Has(kPath, bytes);
        log.Clear();
        return HV::ExtractZip(kPath, kOut);
    }

    /// What is checked and unpacked alike, with these lines: the reason, and for unpacking the one that follows.
    void ExpectRefused(const Entries& entries, const std::string& reason, const std::string& error) {
        EXPECT_EQ(Extract(ArchiveOf(entries).Bytes()), -1) << reason;
        EXPECT_EQ(log.LinesStartingWith("ERROR"), (Names{reason, error}));
        log.Clear();
        EXPECT_EQ(HV::CheckZip(kPath), -1) << reason;
        EXPECT_TRUE(log.Has(reason)) << log.Text();
    }

    /// Files below the destination, without it.
    Names Unpacked() {
        Names names;
        for (const auto& [path, content] : machine.FilesWithoutFolders()) {
            if (path.rfind(kOut + "\\", 0) == 0) {
                names.push_back(path.substr(kOut.size() + 1));
            }
        }
        return names;
    }

    Machine machine;
    LogRecorder log;
};

TEST_F(DeceptiveArchiveTest, ACountThatDisagreesWithTheDirectoryMakesItOneThatDoesNotOpen) {
    const Entries entries{{.name = "1", .bytes = "x"}, {.name = "sub/"}, {.name = "3", .bytes = "x"}};
    int tried = 0;
    for (const int count : {0, 1, 2, 4, 0xFFFE, 0xFFFF}) {
        EXPECT_EQ(Extract(ArchiveOf(entries).ClaimCount(static_cast<std::uint16_t>(count)).Bytes()), 0) << count;
        EXPECT_EQ(log.LinesStartingWith("ERROR"),
                  Names{Line("the archive counts " + std::to_string(count) + " entries, and its directory lists " +
                             (count < 3 ? "more" : "3"))});
        Names files{"left over"};
        Names directories{"left over"};
        EXPECT_EQ(HV::ReadZipEntries(kPath, files, directories), -1) << count;
        EXPECT_EQ(HV::CheckZip(kPath), -1) << count;
        EXPECT_TRUE(files.empty() && directories.empty());
        ++tried;
    }
    EXPECT_EQ(tried, 6);
    EXPECT_EQ(Unpacked(), Names());
    EXPECT_EQ(Extract(ArchiveOf(entries).ClaimCount(3).Bytes()), 0);
    EXPECT_EQ(Unpacked(), (Names{"1", "3"}));
}

TEST_F(DeceptiveArchiveTest, AnEntryThatIsNamedOtherwiseInItsOwnHeaderFails) {
    ExpectRefused({{.name = "read.me", .bytes = "x", .localName = "evil.ex"}},
                  Reason("read.me", "its own header names it evil.ex"), OpenError("read.me"));
    ExpectRefused({{.name = "docs/", .localName = "evil/"}}, Reason("docs/", "its own header names it evil/"),
                  FolderError("docs/"));
    EXPECT_FALSE(machine.Exists(kOut + R"(\docs)"));
    ExpectRefused({{.name = "abc", .bytes = "x", .localName = "abcd"}},
                  Reason("abc", "its own header is missing, or says otherwise than the directory"), OpenError("abc"));
    std::vector<char> bytes;
    EXPECT_EQ(HV::ReadZipEntryBytes(kPath, "abc", bytes), -1);
}

TEST_F(DeceptiveArchiveTest, ANameThatIsNotUtf8Fails) {
    int tried = 0;
    for (const std::string name : {"Gl\xFC", "\xFF", "a\x80", "\xC0\xAF", "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xC3"}) {
        ExpectRefused({{.name = name, .bytes = "x"}}, Reason(name, "its name is not UTF-8"), OpenError(name));
        ExpectRefused({{.name = name + "/"}}, Reason(name + "/", "its name is not UTF-8"), FolderError(name + "/"));
        ++tried;
    }
    EXPECT_EQ(tried, 7);
    EXPECT_EQ(Unpacked(), Names());
    EXPECT_EQ(Extract(ArchiveOf({{.name = "Gl\xC3\xBChen \xEF\xBF\xBD \xF0\x9F\x98\x80", .bytes = "x"}}).Bytes()), 0);
}

TEST_F(DeceptiveArchiveTest, ANameThatWindowsCannotGiveAFileFailsToOpen) {
    const Names names{"a?b", "a*", "a<b", "a>b", "a|b", "a\"b", "a\tb", "a\x01", std::string(256, 'n'), "x\ny/a"};
    std::size_t tried = 0;
    for (const std::string& name : names) {
        ExpectRefused({{.name = name, .bytes = "x"}}, Reason(name, "its name cannot be used on Windows"),
                      OpenError(name));
        ++tried;
    }
    EXPECT_EQ(tried, names.size());
    ExpectRefused({{.name = std::string("a\0b", 3), .bytes = "x"}}, Reason("a", "there is a zero byte in its name"),
                  OpenError("a"));
    EXPECT_EQ(Unpacked(), Names());
    EXPECT_EQ(Extract(ArchiveOf({{.name = std::string(255, 'n'), .bytes = "x"}}).Bytes()), 0) << log.Text();
}

TEST_F(DeceptiveArchiveTest, TwoEntriesThatAreOneFileToWindowsFail) {
    const std::vector<std::pair<std::string, std::string>> pairs{{"A.txt", "a.txt"},
                                                                 {"twice", "twice"},
                                                                 {"Gl\xC3\xBC", "GL\xC3\x9C"},
                                                                 {"\xCF\x83", "\xCE\xA3"},
                                                                 {"\xD0\xB9", "\xD0\x99"},
                                                                 {"./a", "a"},
                                                                 {"\xC3\xBF", "\xC5\xB8"},
                                                                 {"\xC7\x85", "\xC7\x86"},
                                                                 {"\xE1\xBA\x81", "\xE1\xBA\x80"},
                                                                 {"\xEF\xBD\x81", "\xEF\xBC\xA1"}};
    std::size_t tried = 0;
    for (const auto& [one, other] : pairs) {
        ExpectRefused({{.name = one, .bytes = "the first"}, {.name = other, .bytes = "the second"}},
                      Reason(one, "to Windows it has the same name as " + other), OpenError(one));
        ExpectRefused({{.name = one + "/"}, {.name = other + "/"}},
                      Reason(one + "/", "to Windows it has the same name as " + other + "/"), FolderError(one + "/"));
        ++tried;
    }
    EXPECT_EQ(tried, 10U);
    ExpectRefused({{.name = "sub/"}, {.name = "sub/a", .bytes = "1"}, {.name = "SUB\\A", .bytes = "2"}},
                  Reason("sub/a", "to Windows it has the same name as SUB\\A"), OpenError("sub/a"));
    ExpectRefused({{.name = "Glow", .bytes = "1"}, {.name = "glow/"}},
                  Reason("glow/", "to Windows it has the same name as Glow"), FolderError("glow/"));
    EXPECT_EQ(Unpacked(), Names());
}

TEST_F(DeceptiveArchiveTest, NamesThatOnlyLookAlikeAreUnpacked) {
    const Names names{"ss", "\xC3\x9F", "a", "\xC3\xA1", "a\xCC\x81", "\xD0\xB0", "1", "\xC2\xB9"};
    Entries entries;
    for (const std::string& name : names) {
        entries.push_back({.name = name, .bytes = name});
    }
    EXPECT_EQ(Extract(ArchiveOf(entries).Bytes()), 0) << log.Text();
    EXPECT_EQ(Unpacked().size(), names.size());
    EXPECT_EQ(machine.Content(kOut + "\\\xC3\x9F"), "\xC3\x9F");
}

TEST_F(DeceptiveArchiveTest, AnEntryInsideAnothersBytesFails) {
    const ArchiveEntry hidden{.name = "hidden", .bytes = "in another"};
    ArchiveEntry found = hidden;
    found.headerAt = 30 + 5;  // where the bytes of the first entry begin
    ExpectRefused({{.name = "outer", .bytes = ArchiveOf({hidden}).Bytes(), .method = 0}, found},
                  Reason("hidden", "it overlaps another entry"), OpenError("hidden"));
}

TEST_F(DeceptiveArchiveTest, AnEntryThatIsPartOfTheBytesBeforeItFails) {
    const ArchiveEntry next{.name = "next", .bytes = "x", .method = 0};
    const std::string bytes = "abc" + ArchiveOf({next}).Bytes().substr(0, 30 + 4 + 1);
    const ArchiveEntry reaching{
        .name = "reaching", .bytes = bytes, .method = 0, .claimedCompressedSize = bytes.size(), .packed = "abc"};
    ExpectRefused({reaching, next}, Reason("next", "it overlaps another entry"), OpenError("next"));
    ArchiveEntry behindMore = next;
    behindMore.localExtra = "\xFE\xCA\x02\x00zz";
    EXPECT_EQ(Extract(ArchiveOf({behindMore, {.name = "last", .bytes = "y"}}).Bytes()), 0) << log.Text();
}

TEST_F(DeceptiveArchiveTest, AHundredRecordsOverOneBodyUnpackItNotOnce) {
    Entries entries{{.name = "bomb", .bytes = std::string(1 << 20, 'b')}};
    for (int copy = 1; copy < 100; ++copy) {
        ArchiveEntry again = entries.front();
        again.headerAt = 0;
        entries.push_back(again);
    }
    EXPECT_EQ(Extract(ArchiveOf(entries).Bytes()), -1);
    EXPECT_EQ(Unpacked(), Names());
    EXPECT_EQ(HV::CheckZip(kPath), -1);
}

TEST_F(DeceptiveArchiveTest, AStreamThatGoesOnAfterItsDeclaredSizeFails) {
    // Size and checksum are those of the first three bytes.
    ExpectRefused({{.name = "cut", .bytes = "abc", .packed = PackedBytes("abcdef")}},
                  Reason("cut", "it unpacks to more than it claims"), WriteError("cut"));
    EXPECT_EQ(machine.Content(kOut + R"(\cut)"), "") << "no part of it is written";
    ExpectRefused({{.name = "none", .bytes = "", .packed = PackedBytes("abcdef")}},
                  Reason("none", "it unpacks to more than it claims"), WriteError("none"));
}

TEST_F(DeceptiveArchiveTest, AStreamThatDoesNotEndFails) {
    const std::string unfinished("\x00\x03\x00\xFC\xFF\x61\x62\x63", 8);  // a stored block that is not the last
    ExpectRefused({{.name = "open", .bytes = "abc", .packed = unfinished}},
                  Reason("open", "its packed bytes break off"), WriteError("open"));
}

TEST_F(DeceptiveArchiveTest, PackedBytesAfterTheEndOfTheStreamFail) {
    ExpectRefused({{.name = "more", .bytes = "abc", .packed = PackedBytes("abc") + "hidden"}},
                  Reason("more", "packed bytes follow its end"), WriteError("more"));
    ExpectRefused({{.name = "none", .bytes = "", .packed = PackedBytes("") + "hidden"}},
                  Reason("none", "packed bytes follow its end"), WriteError("none"));
}

TEST_F(DeceptiveArchiveTest, LargeStreamsEndWhereTheySayInEveryPieceOfThem) {
    // Longer than what is taken at once, packed and unpacked, and of bytes that do not pack.
    std::string noise;
    for (std::uint32_t state = 1; noise.size() < 700000; state = state * 1664525 + 1013904223) {
        noise += static_cast<char>(state >> 24);
    }
    const Entries entries{{.name = "noise", .bytes = noise}, {.name = "calm", .bytes = std::string(3000000, 'c')}};
    EXPECT_EQ(Extract(ArchiveOf(entries).Bytes()), 0) << log.Text();
    EXPECT_EQ(machine.Content(kOut + R"(\noise)"), noise);
    EXPECT_EQ(machine.Content(kOut + R"(\calm)"), entries[1].bytes);
    EXPECT_EQ(HV::CheckZip(kPath), 0);
    ExpectRefused({{.name = "noise", .bytes = noise, .packed = PackedBytes(noise) + "x"}},
                  Reason("noise", "packed bytes follow its end"), WriteError("noise"));
}

TEST_F(DeceptiveArchiveTest, AnEmptyEntryMayHaveNoStream) {
    EXPECT_EQ(Extract(ArchiveOf({{.name = "none", .bytes = "", .packed = ""}}).Bytes()), 0) << log.Text();
    EXPECT_EQ(machine.Content(kOut + R"(\none)"), "");
}

TEST_F(DeceptiveArchiveTest, SizesAndPlacesInTheFieldsForLargeArchivesAreRead) {
    EXPECT_EQ(Extract(ArchiveOf({{.name = "first", .bytes = "1"},
                                 {.name = "sub/", .wide = true},
                                 {.name = "sub/packed", .bytes = std::string(5000, 'p'), .wide = true},
                                 {.name = "stored", .bytes = "as it is", .method = 0, .wide = true}})
                          .Bytes()),
              0)
        << log.Text();
    EXPECT_EQ(machine.Content(kOut + R"(\sub\packed)"), std::string(5000, 'p'));
    EXPECT_EQ(machine.Content(kOut + R"(\stored)"), "as it is");
    EXPECT_EQ(HV::CheckZip(kPath), 0);
}

TEST_F(DeceptiveArchiveTest, AnEntryOfFourGigabytesFailsToOpen) {
    ExpectRefused({{.name = "vast", .bytes = "x", .claimedSize = std::uint64_t{1} << 32, .packed = "x", .wide = true}},
                  Reason("vast", "it is larger than 4294967295 bytes"), OpenError("vast"));
}

TEST_F(DeceptiveArchiveTest, NothingIsWrittenWhereTheTotalDoesNotFitOnTheDisk) {
    const Entries entries{{.name = "sub/"},
                          {.name = "small", .bytes = "x"},
                          {.name = "vast", .bytes = "x", .claimedSize = std::uint64_t{1} << 62, .wide = true}};
    EXPECT_EQ(Extract(ArchiveOf(entries).Bytes()), -1);
    const Names errors = log.LinesStartingWith("ERROR");
    ASSERT_EQ(errors.size(), 1U) << log.Text();
    const std::string start = Line("unpacking takes 4611686018427387905 bytes, and at C:\\deep\\out there are ");
    EXPECT_EQ(errors[0].substr(0, start.size()), start);
    EXPECT_FALSE(machine.Exists(kOut + R"(\sub)"));
    EXPECT_FALSE(machine.Exists(kOut + R"(\small)"));
}

TEST_F(DeceptiveArchiveTest, TheTotalOfLyingSizesDoesNotWrapAround) {
    const ArchiveEntry vast{.name = "a", .bytes = "x", .claimedSize = ~std::uint64_t{0}, .wide = true};
    ArchiveEntry other = vast;
    other.name = "b";
    other.claimedSize = 2;
    EXPECT_EQ(Extract(ArchiveOf({vast, other}).Bytes()), -1);
    EXPECT_EQ(Unpacked(), Names());
}

TEST_F(DeceptiveArchiveTest, AFileWhoseFolderHasNoEntryIsNamed) {
    ExpectRefused({{.name = "sub/deep/"}, {.name = "sub/a", .bytes = "x"}, {.name = "other/b", .bytes = "x"}},
                  Reason("other/b", "its folder other/ has no entry of its own"), WriteError("other/b"));
    EXPECT_FALSE(log.Has(Reason("sub/a", "its folder sub/ has no entry of its own")));
}

TEST_F(DeceptiveArchiveTest, CheckingNamesEveryEntryThatFailsAndWritesNothing) {
    machine.Has(kPath, ArchiveOf({{.name = "good", .bytes = "x"},
                                  {.name = "bad", .bytes = "x", .claimedChecksum = 1},
                                  {.name = "secret", .bytes = "x", .method = 0, .flags = 1},
                                  {.name = "no/where", .bytes = "x"},
                                  {.name = "odd", .bytes = "x", .method = 12}})
                           .Bytes());
    const auto before = machine.Files();
    EXPECT_EQ(HV::CheckZip(kPath), -1);
    EXPECT_EQ(log.Lines(),
              (Names{Reason("bad", "its bytes do not match their checksum"), Reason("secret", "it is encrypted"),
                     Reason("no/where", "its folder no/ has no entry of its own"),
                     Reason("odd", "it is compressed by the unknown method 12")}));
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(DeceptiveArchiveTest, AManifestIsNotUnpackedBeyondItsLimit) {
    std::vector<char> bytes;
    machine.Has(kPath, ArchiveOf({{.name = "a", .bytes = std::string(1001, 'a')}}).Bytes());
    EXPECT_EQ(HV::ReadZipEntryBytes(kPath, "a", bytes, 1000), -1);
    EXPECT_TRUE(log.Has(Reason("a", "it is longer than 1000 bytes")));
    EXPECT_TRUE(bytes.empty());
    EXPECT_EQ(HV::ReadZipEntryBytes(kPath, "a", bytes, 1001), 0);
}

}  // namespace
