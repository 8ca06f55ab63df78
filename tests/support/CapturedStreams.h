#pragma once

#include <string>

/// Holds back what the process writes to standard output and standard error while it lives, at the level of
/// descriptors, so that the C and C++ streams, libraries and child processes are all seen.
///
/// Texts come with CR LF read as LF. The streams are as before afterwards. One at a time.
class CapturedStreams {
public:
    CapturedStreams();
    ~CapturedStreams();
    CapturedStreams(const CapturedStreams&) = delete;
    CapturedStreams& operator=(const CapturedStreams&) = delete;

    /// Everything written so far.
    [[nodiscard]] std::string Output();
    [[nodiscard]] std::string Errors();

private:
    /// One standard stream: its descriptor, where that went before, and the file that takes its place.
    struct Stream {
        int descriptor;
        int original;
        int file;
    };
    static Stream Redirect(int descriptor);
    static void Restore(const Stream& stream);

    Stream output_;
    Stream errors_;
};
