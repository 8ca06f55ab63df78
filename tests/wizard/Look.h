#pragma once

#include <functional>
#include <string>
#include <vector>

#include "tests/wizard/Picture.h"

/// The wizard's look as its design gives it, in numbers: what a picture of it must show. The numbers stand here a
/// second time on purpose; taken from the program they would prove nothing.
namespace look {

constexpr Color Page = 0x1A1A1A;
constexpr Color Strip = 0x222222;
constexpr Color Light = 0xDEDEDE;
constexpr Color Text = 0xF0F0F0;
constexpr Color DisabledText = 0x646464;
constexpr Color Face = 0x434343;
constexpr Color DisabledFace = 0x303030;
constexpr Color Highlight = 0x009FE1;
constexpr Color Track = 0x1E1E1E;
constexpr Color Fill = 0x429EDB;
constexpr Color Black = 0x000000;

struct Font {
    int height;
    int weight;
};
constexpr Font Title{20, 300};
constexpr Font Body{13, 300};
constexpr Font Strong{13, 600};
constexpr Font Wait{16, 300};

/// Formats of DrawTextW.
constexpr unsigned Wrapped = 16;
constexpr unsigned OneLine = 32;
constexpr unsigned OneLineCentred = 36;
constexpr unsigned InTheMiddle = 37;
constexpr unsigned AtTheBottom = 40;

/// One thing that a picture shows, as a sentence and as a question to the picture.
struct Mark {
    std::string description;
    std::function<bool(const Picture&)> isIn;
};

/// Every point of the rectangle has this colour.
Mark Filled(const RECT& part, Color color);

/// The rectangle holds this text and nothing else, letter for letter.
Mark Words(const std::string& text, const RECT& part, Font font, unsigned format, Color color, Color background);

/// The rectangle holds as much of this text as one line has room for, and three dots after it.
Mark WordsInOneLine(const std::string& text, const RECT& part, Font font, unsigned format, Color color,
                    Color background);

/// The bitmap stands at this point, at its own size.
Mark Image(const std::string& hostPath, int left, int top);
/// As much of the bitmap as the rectangle has room for.
Mark ImageWithin(const std::string& hostPath, const RECT& part);

/// A rounded button with this text: its face, its rounded corners and the strip at its right and bottom edges, where
/// `background` shows.
Mark Button(const std::string& text, const RECT& part, Color face, Color background);

/// A check box of the selection page: its bitmap and its label.
Mark CheckBox(const std::string& text, const RECT& part, bool checked, bool enabled);

}  // namespace look
