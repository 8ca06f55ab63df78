#include "tests/support/CapturedStreams.h"

#include <unistd.h>

#include <cstdio>
#include <iostream>

#include "tests/support/ScratchFile.h"

namespace {

constexpr int OutputDescriptor = 1;
constexpr int ErrorDescriptor = 2;

void FlushAll() {
    std::cout.flush();
    std::cerr.flush();
    std::fflush(stdout);
    std::fflush(stderr);
}

}  // namespace

CapturedStreams::CapturedStreams() : output_(Redirect(OutputDescriptor)), errors_(Redirect(ErrorDescriptor)) {}

CapturedStreams::~CapturedStreams() {
    FlushAll();
    Restore(output_);
    Restore(errors_);
}

std::string CapturedStreams::Output() {
    FlushAll();
    return ReadScratchFile(output_.file);
}

std::string CapturedStreams::Errors() {
    FlushAll();
    return ReadScratchFile(errors_.file);
}

CapturedStreams::Stream CapturedStreams::Redirect(int descriptor) {
    FlushAll();
    const Stream stream{descriptor, dup(descriptor), OpenScratchFile()};
    dup2(stream.file, descriptor);
    return stream;
}

void CapturedStreams::Restore(const Stream& stream) {
    dup2(stream.original, stream.descriptor);
    close(stream.original);
    close(stream.file);
}
