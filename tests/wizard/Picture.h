#pragma once

#include <windows.h>

#include <cstdint>
#include <string>
#include <vector>

/// A colour as 0xRRGGBB.
using Color = std::uint32_t;

/// What stood on the screen at one moment, or what should stand there: rows of colours.
class Picture {
public:
    /// All of one colour.
    Picture(int width, int height, Color color = 0);

    /// The screen as a user sees it, this part of it.
    static Picture OfScreen(const RECT& part);
    /// The client area of a window, with whatever lies over it.
    static Picture OfClient(HWND window);
    /// A bitmap file of the host; fails the test, and is empty, when it cannot be read.
    static Picture OfFile(const std::string& hostPath);

    [[nodiscard]] int Width() const { return width_; }
    [[nodiscard]] int Height() const { return height_; }

    /// The colour at a point. A point outside is no colour: 0xFF000000.
    [[nodiscard]] Color At(int x, int y) const;
    [[nodiscard]] bool IsAll(const RECT& part, Color color) const;
    /// Whether `part` of this picture holds exactly this other picture, which starts at its corner.
    [[nodiscard]] bool Holds(const Picture& other, const RECT& part) const;

    /// Writes text, which is UTF-8, as the wizard writes it: in Tahoma (or what stands for it), with this height and
    /// weight, by this format of DrawTextW, every character as it stands, onto what is there.
    void Write(const std::string& text, RECT part, int height, int weight, unsigned format, Color color);

    /// As much of the text as a line of this width has room for, and three dots where that is not all of it.
    static std::string Shortened(const std::string& text, int width, int height, int weight);

    /// Writes a bitmap file.
    void Save(const std::string& path) const;

private:
    int width_;
    int height_;
    std::vector<Color> colors_;
};
