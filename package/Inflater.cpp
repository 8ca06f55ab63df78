#include "package/Inflater.h"

#include <algorithm>

namespace HV {

Inflater::Inflater(char* room, std::uint64_t size) : room_(room), size_(size) {
    ready_ = inflateInit2(&stream_, -MAX_WBITS) == Z_OK;
}

Inflater::~Inflater() {
    if (ready_) {
        inflateEnd(&stream_);
    }
}

bool Inflater::Take(char* packed, std::size_t count) {
    stream_.next_in = reinterpret_cast<Bytef*>(packed);
    stream_.avail_in = static_cast<uInt>(count);
    int result = ready_ && !ended_ ? Z_OK : Z_STREAM_END;
    // Output can be waiting although all input is taken, so a full room is asked once more.
    while (result == Z_OK && (stream_.avail_in > 0 || stream_.avail_out == 0)) {
        result = Step();
    }
    ended_ = ended_ || result == Z_STREAM_END;
    if (done_ > size_) {
        problem_ = "it unpacks to more than it claims";
    } else if (result == Z_DATA_ERROR || result == Z_NEED_DICT || result == Z_MEM_ERROR || !ready_) {
        problem_ = "its packed bytes are damaged";
    } else if (ended_ && stream_.avail_in > 0) {
        problem_ = "packed bytes follow its end";
    }
    return problem_.empty();
}

/// Unpacks as far as the room at hand goes; Z_BUF_ERROR when there is nothing to do.
int Inflater::Step() {
    MakeRoom();
    const Bytef* from = stream_.next_out;
    const int result = inflate(&stream_, Z_NO_FLUSH);
    const auto produced = static_cast<uInt>(stream_.next_out - from);
    checksum_ = crc32(checksum_, from, produced);
    done_ += produced;
    return done_ > size_ ? Z_BUF_ERROR : result;
}

void Inflater::MakeRoom() {
    if (stream_.avail_out > 0) {
        return;
    }
    const std::uint64_t left = size_ - done_;
    stream_.next_out = left > 0 ? reinterpret_cast<Bytef*>(room_ + done_) : &spare_;
    stream_.avail_out = left > 0 ? static_cast<uInt>(std::min(left, kLargestPiece)) : 1;
}

std::string Inflater::Problem() const {
    if (!problem_.empty()) {
        return problem_;
    }
    return done_ < size_ ? "it unpacks to less than it claims" : "its packed bytes break off";
}

}  // namespace HV
