#include "tests/wizard/Look.h"

#include <sstream>

namespace look {

namespace {

std::string At(const RECT& part) {
    std::ostringstream text;
    text << " at (" << part.left << ", " << part.top << ") to (" << part.right << ", " << part.bottom << ")";
    return text.str();
}

std::string Hex(Color color) {
    std::ostringstream text;
    text << "0x" << std::hex << color;
    return text.str();
}

RECT Inset(const RECT& part, int by) {
    return {part.left + by, part.top + by, part.right - by, part.bottom - by};
}

/// The corners are round by two points; how smoothly is the drawing layer's affair. So the face is looked for from two
/// points inwards, up to the text's own rectangle, and a corner's outermost point must not be of its colour.
bool HasFace(const Picture& picture, const RECT& part, Color face) {
    const RECT inner = Inset(part, 2);
    const RECT words = Inset(part, 3);
    return picture.IsAll({inner.left, inner.top, inner.right - 1, words.top}, face) &&
           picture.IsAll({inner.left, words.bottom, inner.right - 1, inner.bottom - 1}, face) &&
           picture.IsAll({inner.left, inner.top, words.left, inner.bottom - 1}, face) &&
           picture.At(part.left, part.top) != face;
}

}  // namespace

Mark Filled(const RECT& part, Color color) {
    return {Hex(color) + At(part), [=](const Picture& picture) { return picture.IsAll(part, color); }};
}

Mark Words(const std::string& text, const RECT& part, Font font, unsigned format, Color color, Color background) {
    return {
        "\"" + text + "\" in " + Hex(color) + " on " + Hex(background) + At(part), [=](const Picture& picture) {
            Picture expected(part.right - part.left, part.bottom - part.top, background);
            expected.Write(text, {0, 0, expected.Width(), expected.Height()}, font.height, font.weight, format, color);
            return picture.Holds(expected, part);
        }};
}

Mark WordsInOneLine(const std::string& text, const RECT& part, Font font, unsigned format, Color color,
                    Color background) {
    const auto width = static_cast<int>(part.right - part.left);
    return Words(Picture::Shortened(text, width, font.height, font.weight), part, font, format, color, background);
}

Mark Image(const std::string& hostPath, int left, int top) {
    const Picture image = Picture::OfFile(hostPath);
    const RECT part{left, top, left + image.Width(), top + image.Height()};
    return {hostPath + At(part), [=](const Picture& picture) { return picture.Holds(image, part); }};
}

Mark ImageWithin(const std::string& hostPath, const RECT& part) {
    const Picture image = Picture::OfFile(hostPath);
    return {hostPath + At(part), [=](const Picture& picture) { return picture.Holds(image, part); }};
}

Mark Button(const std::string& text, const RECT& part, Color face, Color background) {
    const Color color = face == DisabledFace ? DisabledText : Text;
    const Mark words = Words(text, Inset(part, 3), Body, InTheMiddle, color, face);
    return {"a button with " + words.description + ", corners on " + Hex(background), [=](const Picture& picture) {
                return words.isIn(picture) && HasFace(picture, part, face) &&
                       picture.IsAll({part.right - 1, part.top, part.right, part.bottom}, background) &&
                       picture.IsAll({part.left, part.bottom - 1, part.right, part.bottom}, background);
            }};
}

Mark CheckBox(const std::string& text, const RECT& part, bool checked, bool enabled) {
    const Mark box = Image(std::string(HV_RESOURCES) + (checked ? "/checkbox-on.bmp" : "/checkbox-off.bmp"), part.left,
                           part.top + 4);
    const Mark label = WordsInOneLine(text, {part.left + 24, part.top, part.right, part.bottom}, Body, OneLineCentred,
                                      enabled ? Text : DisabledText, Page);
    return {box.description + " and " + label.description, [=](const Picture& picture) {
                return box.isIn(picture) && label.isIn(picture) &&
                       picture.IsAll({part.left, part.top, part.right, part.top + 4}, Page);
            }};
}

}  // namespace look
