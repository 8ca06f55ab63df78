// A package whose archive is sound but for what its entries are called and hold: checksums keep a fuzzer that turns
// single bytes from ever getting that far. Names and contents take turns, each ended by a zero byte.
#include "fuzz/Fuzzing.h"
#include "fuzz/PackageRun.h"
#include "hvframework/StringUtils.h"
#include "tests/support/ArchiveBuilder.h"

namespace {

/// A file with hundreds of entries says no more than one with some, and takes longer.
constexpr std::size_t kMostPieces = 32;

std::string Archive(const std::vector<std::string>& pieces) {
    ArchiveBuilder archive;
    for (std::size_t i = 0; i + 1 < pieces.size() && i < kMostPieces; i += 2) {
        ArchiveEntry entry{.name = pieces[i], .bytes = pieces[i + 1]};
        entry.method = entry.bytes.size() % 2 == 0 ? 0 : 8;
        archive.Add(entry);
    }
    return archive.Bytes();
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UsePackage(Archive(HVL::StringUtils::Split(fuzzing::Text(data, size), '\0')));
    return 0;
}
