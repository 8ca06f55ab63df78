#include "hvdeploy/src/ProgressBar.h"

#include <algorithm>
#include <mutex>
#include <ostream>
#include <streambuf>
#include <string>

namespace HV {
namespace {

constexpr std::size_t kCells = 24;
constexpr std::size_t kLineWidth = 79;  // one less than the narrowest terminal in use, so that nothing wraps

// Cuts at the start of a character, never inside it.
std::string CutToWidth(std::string line) {
    if (line.size() > kLineWidth) {
        std::size_t end = kLineWidth;
        while (end > 0 && (static_cast<unsigned char>(line[end]) & 0xC0U) == 0x80U) {
            --end;
        }
        line.resize(end);
    }
    return line;
}

std::string BarLine(std::uint32_t percent, const std::string& message) {
    const std::size_t filled = kCells * percent / 100;
    std::string number = std::to_string(percent);
    number.insert(0, 3 - number.size(), ' ');
    return CutToWidth("[" + std::string(filled, '#') + std::string(kCells - filled, '.') + "] " + number + "% " +
                      message);
}

}  // namespace

/// Stands between the stream and the terminal, and knows whether the bar is on the last line.
///
/// Reports and texts come from the thread of the run; the line that says "cancelled" comes from the thread on which the
/// platform tells of an interrupt. So every way in takes the mutex.
class ProgressBar::Screen : public std::streambuf {
public:
    explicit Screen(std::streambuf* below) : terminal(below) {}

    std::streambuf* Below() const { return terminal; }

    void Show(std::uint32_t newPercent, const std::string& newMessage) {
        const std::lock_guard<std::mutex> guard(mutex);
        // A failed run leaves the bar where it came to a halt.
        percent = newPercent == kFailedPercent ? percent : std::min<std::uint32_t>(newPercent, 100);
        if (!newMessage.empty()) {
            message = newMessage;
        }
        Erase();
        drawn = BarLine(percent, message);
        started = true;
        Draw();
        terminal->pubsync();
    }

    void Finish() {
        const std::lock_guard<std::mutex> guard(mutex);
        Draw();
        if (shown) {
            terminal->sputc('\n');
            shown = false;
        }
        started = false;
        terminal->pubsync();
    }

protected:
    int_type overflow(int_type c) override {
        if (traits_type::eq_int_type(c, traits_type::eof())) {
            return traits_type::not_eof(c);
        }
        const char text = traits_type::to_char_type(c);
        return xsputn(&text, 1) == 1 ? c : traits_type::eof();
    }

    std::streamsize xsputn(const char* text, std::streamsize count) override {
        if (count <= 0) {
            return 0;
        }
        const std::lock_guard<std::mutex> guard(mutex);
        Erase();
        const std::streamsize written = terminal->sputn(text, count);
        atLineStart = text[count - 1] == '\n';
        // Not every writer flushes its lines, the log does not: the end of a line is what brings the bar back.
        Draw();
        return written;
    }

    int sync() override {
        const std::lock_guard<std::mutex> guard(mutex);
        return terminal->pubsync();
    }

private:
    void Erase() {
        if (shown) {
            const std::string blanks(drawn.size(), ' ');
            Put("\r" + blanks + "\r");
            shown = false;
        }
    }

    void Draw() {
        if (started && !shown && atLineStart) {
            Put(drawn);
            shown = true;
        }
    }

    void Put(const std::string& text) { terminal->sputn(text.data(), static_cast<std::streamsize>(text.size())); }

    std::mutex mutex;
    std::streambuf* terminal;
    std::uint32_t percent = 0;
    std::string message;
    std::string drawn;
    bool started = false;
    bool shown = false;
    bool atLineStart = true;
};

ProgressBar::ProgressBar(std::ostream& stream) : terminal(stream), screen(std::make_unique<Screen>(stream.rdbuf())) {
    terminal.rdbuf(screen.get());
}

ProgressBar::~ProgressBar() {
    screen->Finish();
    terminal.rdbuf(screen->Below());
}

void ProgressBar::update(std::uint32_t percent, const char* message, std::int32_t /*error*/) {
    screen->Show(percent, message != nullptr ? message : "");
}

}  // namespace HV
