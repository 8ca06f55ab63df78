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
    /// One standard stream: where its descriptor went, and the file that takes its place.
    struct Stream {
        int descriptor = -1;
        int original = -1;
        int file = -1;
        std::string name;
    };
    static Stream Redirect(int descriptor);
    static void Restore(Stream& stream);
    static std::string ReadAll(const Stream& stream);

    Stream output_;
    Stream errors_;
};
