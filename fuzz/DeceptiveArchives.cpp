// Archives of which it is known whether they deceive. Each is made honestly, and then one thing about it may be made a
// lie: what is honest has to be unpacked to exactly its files, and every lie has to be noticed, by checking and by
// unpacking alike. The input chooses contents and lie.
#include <array>
#include <map>
#include <string_view>

#include "fuzz/Choices.h"
#include "fuzz/Fuzzing.h"
#include "hvframework/FileUtils.h"
#include "package/ZipEntries.h"
#include "tests/support/ArchiveBuilder.h"

namespace {

using fuzzing::Choices;
using Entries = std::vector<ArchiveEntry>;

constexpr const char* kArchive = R"(C:\archive.zip)";
constexpr const char* kOut = R"(C:\out)";

/// The first entry is the folder of all others.
Entries HonestEntries(Choices& choices) {
    Entries entries{{.name = "f/"}};
    const std::size_t count = 1 + choices.Next(5);
    for (std::size_t number = 0; number < count; ++number) {
        ArchiveEntry entry{.name = "f/entry" + std::to_string(number)};
        entry.bytes = std::string(choices.Next(256), static_cast<char>('a' + choices.Next(26)));
        entry.method = choices.Next(2) == 0 ? 8 : 0;
        entry.wide = choices.Next(4) == 1;
        entry.localExtra = std::string(choices.Next(2) * 4, '\0');
        entries.push_back(entry);
    }
    return entries;
}

// The lies. Each takes the entries and one that it is about, and leaves something that nobody may unpack.

void NameItOtherwiseInItsHeader(Entries&, ArchiveEntry& entry, Choices&) {
    entry.localName = entry.name;
    entry.localName->back() = 'X';
}

void SpoilItsName(Entries&, ArchiveEntry& entry, Choices& choices) {
    constexpr std::array<std::string_view, 12> kNames{
        "f/\xFF", "f/a\xED\xA0\x80", "../a",   "f/../../a", "C:/a", "f/nul", "f/a.", "f/a ", "/a",
        "f/a?",   "f/a:b",           "f/a\x02"};
    entry.name = kNames[choices.Next(kNames.size())];
}

void LeaveOutItsFolder(Entries&, ArchiveEntry& entry, Choices&) {
    entry.name = "g/entry";
}

void AddItsNamesake(Entries& entries, ArchiveEntry& entry, Choices& choices) {
    constexpr std::array<std::string_view, 4> kStarts{"f/entry", "F/entry", "f\\ENTRY", "./f//entry"};
    ArchiveEntry other = entry;
    other.name = std::string(kStarts[choices.Next(kStarts.size())]) + entry.name.substr(7);
    entries.push_back(other);
}

void ClaimLess(Entries&, ArchiveEntry& entry, Choices&) {
    entry.method = 8;
    entry.packed = PackedBytes(entry.bytes + "more");
}

void ClaimMore(Entries&, ArchiveEntry& entry, Choices&) {
    entry.method = 8;
    entry.packed = PackedBytes(entry.bytes);
    entry.bytes += "more";
}

void AddPackedBytes(Entries&, ArchiveEntry& entry, Choices&) {
    entry.method = 8;
    entry.packed = PackedBytes(entry.bytes) + "more";
}

void ChangeItsChecksum(Entries&, ArchiveEntry& entry, Choices&) {
    entry.claimedChecksum = 0x12345678;
}

void Encrypt(Entries&, ArchiveEntry& entry, Choices&) {
    entry.flags = 1;
}

void PackInAnotherWay(Entries&, ArchiveEntry& entry, Choices& choices) {
    constexpr std::array<std::uint16_t, 5> kMethods{1, 9, 12, 14, 0xFFFF};
    entry.method = kMethods[choices.Next(kMethods.size())];
}

/// An archive as the first file, stored, with a record for what is in it.
void HideOneInside(Entries& entries, ArchiveEntry&, Choices&) {
    ArchiveEntry hidden{.name = "f/hidden", .bytes = "hidden"};
    ArchiveEntry outer{.name = "o", .bytes = ArchiveBuilder().Add(hidden).Bytes(), .method = 0};
    hidden.headerAt = 30 + outer.name.size();
    entries.insert(entries.begin(), outer);
    entries.push_back(hidden);
}

using Lie = void (*)(Entries&, ArchiveEntry&, Choices&);
constexpr std::array<Lie, 11> kLies{
    NameItOtherwiseInItsHeader, SpoilItsName, LeaveOutItsFolder, AddItsNamesake, ClaimLess, ClaimMore, AddPackedBytes,
    ChangeItsChecksum,          Encrypt,      PackInAnotherWay,  HideOneInside};

std::string BytesOf(const Entries& entries) {
    ArchiveBuilder archive;
    for (const ArchiveEntry& entry : entries) {
        archive.Add(entry);
    }
    return archive.Bytes();
}

void ExpectUnpacked(const Entries& entries) {
    fuzzing::Demand(HV::CheckZip(kArchive) == 0, "an honest archive is found sound");
    fuzzing::Demand(HV::ExtractZip(kArchive, kOut) == 0, "an honest archive is unpacked");
    for (std::size_t place = 1; place < entries.size(); ++place) {
        std::string bytes;
        const std::string path = std::string(kOut) + "\\" + entries[place].name;
        fuzzing::Demand(HVL::FileUtils::ReadFileToString(path, bytes) == 0 && bytes == entries[place].bytes,
                        "each file is unpacked to its bytes");
    }
    fuzzing::Demand(fuzzing::CountItems(R"(C:\out\f)") == entries.size() - 1, "and there is no other");
}

void ExpectRefused() {
    fuzzing::Demand(HV::CheckZip(kArchive) != 0, "a lie is noticed by checking");
    fuzzing::Demand(HV::ExtractZip(kArchive, kOut) != 0, "a lie is noticed by unpacking");
}

void ExpectUnopened() {
    std::vector<std::string> files;
    std::vector<std::string> folders;
    fuzzing::Demand(HV::ReadZipEntries(kArchive, files, folders) != 0, "an archive that miscounts does not open");
    fuzzing::Demand(HV::CheckZip(kArchive) != 0, "an archive that miscounts is not sound");
    fuzzing::Demand(HV::ExtractZip(kArchive, kOut) == 0 && fuzzing::CountItems(kOut) == 0, "and holds nothing");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UseThrowAwayMachine();
    fuzzing::RemoveFolder(kOut);
    Choices choices(data, size);
    Entries entries = HonestEntries(choices);
    const std::size_t chosen = choices.Next(kLies.size() + 2);
    if (chosen == 0) {
        fuzzing::WriteFile(kArchive, BytesOf(entries));
        ExpectUnpacked(entries);
    } else if (chosen <= kLies.size()) {
        kLies[chosen - 1](entries, entries[1 + choices.Next(entries.size() - 1)], choices);
        fuzzing::WriteFile(kArchive, BytesOf(entries));
        ExpectRefused();
    } else {
        ArchiveBuilder archive;
        for (const ArchiveEntry& entry : entries) {
            archive.Add(entry);
        }
        const std::size_t off = 1 + choices.Next(255);
        const std::size_t count =
            choices.Next(2) == 0 ? entries.size() + off : entries.size() - 1 - (off % entries.size());
        archive.ClaimCount(static_cast<std::uint16_t>(count));
        fuzzing::WriteFile(kArchive, archive.Bytes());
        ExpectUnopened();
    }
    return 0;
}
