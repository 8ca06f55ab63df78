#include "package/HeldFile.h"

#include <cstdint>
#include <vector>

#include "hvframework/Md5.h"
#include "platform/raw_file.h"
#include "platform/sha256.h"

namespace HV {
namespace {

constexpr std::size_t kBlockSize = 65536;

}  // namespace

HeldFile::HeldFile(fs::path path)
    : path_(std::move(path)), file_(platform::OpenRawFile(path_.c_str(), platform::RawFile::Mode::Read)) {}

HeldFile::~HeldFile() = default;
HeldFile::HeldFile(HeldFile&& other) noexcept = default;
HeldFile& HeldFile::operator=(HeldFile&& other) noexcept = default;

FileDigests HeldFile::Digests() const {
    HVL::Md5 md5;
    platform::Sha256 sha256;
    std::vector<unsigned char> block(kBlockSize);
    std::uint64_t place = 0;
    std::int64_t size = 0;
    while (file_ != nullptr && (size = file_->ReadAt(place, block.data(), block.size())) > 0) {
        md5.Update(block.data(), static_cast<std::size_t>(size));
        sha256.Update(block.data(), static_cast<std::size_t>(size));
        place += static_cast<std::uint64_t>(size);
    }
    return {md5.Finish(), sha256.Finish()};
}

bool HeldFile::IsUntouched() const {
    return file_ != nullptr && file_->IsStillAt(path_.c_str());
}

}  // namespace HV
