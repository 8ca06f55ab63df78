#include "tests/wizard/Picture.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstring>

namespace {

constexpr Color kNoColor = 0xFF000000;

std::wstring Wide(const std::string& text) {
    std::wstring wide(text.size(), L'\0');
    wide.resize(static_cast<std::size_t>(MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, text.data(),
                                                             static_cast<int>(text.size()), wide.data(),
                                                             static_cast<int>(wide.size()))));
    return wide;
}

std::string Narrow(const std::wstring& wide) {
    std::string text(wide.size() * 3, '\0');
    text.resize(
        static_cast<std::size_t>(WideCharToMultiByte(CP_UTF8, 0, wide.data(), static_cast<int>(wide.size()),
                                                     text.data(), static_cast<int>(text.size()), nullptr, nullptr)));
    return text;
}

/// The font of the wizard, chosen into a device context for as long as this lives.
class ChosenFont {
public:
    ChosenFont(HDC context, int height, int weight) : context_(context) {
        LOGFONTA description{};
        description.lfHeight = height;
        description.lfWeight = weight;
        std::strcpy(description.lfFaceName, "Tahoma");
        font_ = CreateFontIndirectA(&description);
        before_ = SelectObject(context_, font_);
    }
    ~ChosenFont() {
        SelectObject(context_, before_);
        DeleteObject(font_);
    }
    ChosenFont(const ChosenFont&) = delete;
    ChosenFont& operator=(const ChosenFont&) = delete;

private:
    HDC context_;
    HFONT font_;
    HGDIOBJ before_;
};

COLORREF Ref(Color color) {
    return RGB(color >> 16 & 0xFF, color >> 8 & 0xFF, color & 0xFF);
}

BITMAPINFO TopDown(int width, int height) {
    BITMAPINFO info{};
    info.bmiHeader.biSize = sizeof info.bmiHeader;
    info.bmiHeader.biWidth = width;
    info.bmiHeader.biHeight = -height;
    info.bmiHeader.biPlanes = 1;
    info.bmiHeader.biBitCount = 32;
    return info;
}

/// A device context on a bitmap of its own, whose points can be read and written.
class Canvas {
public:
    Canvas(int width, int height) : size_(static_cast<std::size_t>(width) * static_cast<std::size_t>(height)) {
        const BITMAPINFO info = TopDown(width, height);
        void* points = nullptr;
        bitmap_ = CreateDIBSection(context_, &info, DIB_RGB_COLORS, &points, nullptr, 0);
        points_ = static_cast<Color*>(points);
        before_ = SelectObject(context_, bitmap_);
    }
    ~Canvas() {
        SelectObject(context_, before_);
        DeleteObject(bitmap_);
        DeleteDC(context_);
    }
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    [[nodiscard]] HDC Context() const { return context_; }

    void Take(const std::vector<Color>& colors) const { std::memcpy(points_, colors.data(), size_ * sizeof(Color)); }

    void Give(std::vector<Color>& colors) const {
        GdiFlush();
        for (std::size_t i = 0; i < size_; ++i) {
            colors[i] = points_[i] & 0xFFFFFF;
        }
    }

private:
    std::size_t size_;
    HDC context_ = CreateCompatibleDC(nullptr);
    HBITMAP bitmap_ = nullptr;
    HGDIOBJ before_ = nullptr;
    Color* points_ = nullptr;
};

}  // namespace

Picture::Picture(int width, int height, Color color)
    : width_(width),
      height_(height),
      colors_(static_cast<std::size_t>(width) * static_cast<std::size_t>(height), color) {}

Picture Picture::OfScreen(const RECT& part) {
    Picture picture(part.right - part.left, part.bottom - part.top);
    const Canvas canvas(picture.width_, picture.height_);
    const HDC screen = GetDC(nullptr);
    BitBlt(canvas.Context(), 0, 0, picture.width_, picture.height_, screen, part.left, part.top, SRCCOPY);
    ReleaseDC(nullptr, screen);
    canvas.Give(picture.colors_);
    return picture;
}

Picture Picture::OfClient(HWND window) {
    RECT client{};
    GetClientRect(window, &client);
    MapWindowPoints(window, nullptr, reinterpret_cast<POINT*>(&client), 2);
    return OfScreen(client);
}

Picture Picture::OfFile(const std::string& hostPath) {
    const auto bitmap = static_cast<HBITMAP>(
        LoadImageA(nullptr, ("Z:" + hostPath).c_str(), IMAGE_BITMAP, 0, 0, LR_LOADFROMFILE | LR_CREATEDIBSECTION));
    BITMAP size{};
    if (bitmap == nullptr || GetObjectA(bitmap, sizeof size, &size) == 0) {
        ADD_FAILURE() << "no bitmap in " << hostPath;
        return {0, 0};
    }
    Picture picture(size.bmWidth, size.bmHeight);
    const HDC screen = GetDC(nullptr);
    BITMAPINFO info = TopDown(picture.width_, picture.height_);
    GetDIBits(screen, bitmap, 0, static_cast<UINT>(picture.height_), picture.colors_.data(), &info, DIB_RGB_COLORS);
    ReleaseDC(nullptr, screen);
    DeleteObject(bitmap);
    for (Color& color : picture.colors_) {
        color &= 0xFFFFFF;
    }
    return picture;
}

Color Picture::At(int x, int y) const {
    if (x < 0 || y < 0 || x >= width_ || y >= height_) {
        return kNoColor;
    }
    return colors_[static_cast<std::size_t>(y) * static_cast<std::size_t>(width_) + static_cast<std::size_t>(x)];
}

bool Picture::IsAll(const RECT& part, Color color) const {
    for (int y = part.top; y < part.bottom; ++y) {
        for (int x = part.left; x < part.right; ++x) {
            if (At(x, y) != color) {
                return false;
            }
        }
    }
    return true;
}

bool Picture::Holds(const Picture& other, const RECT& part) const {
    for (int y = part.top; y < part.bottom; ++y) {
        for (int x = part.left; x < part.right; ++x) {
            if (At(x, y) != other.At(x - part.left, y - part.top)) {
                return false;
            }
        }
    }
    return true;
}

void Picture::Write(const std::string& text, RECT part, int height, int weight, unsigned format, Color color) {
    const Canvas canvas(width_, height_);
    canvas.Take(colors_);
    {
        const ChosenFont font(canvas.Context(), height, weight);
        const std::wstring wide = Wide(text);
        SetTextColor(canvas.Context(), Ref(color));
        SetBkMode(canvas.Context(), TRANSPARENT);
        DrawTextW(canvas.Context(), wide.c_str(), static_cast<int>(wide.size()), &part, format | DT_NOPREFIX);
    }
    canvas.Give(colors_);
}

std::string Picture::Shortened(const std::string& text, int width, int height, int weight) {
    const Canvas canvas(1, 1);
    const ChosenFont font(canvas.Context(), height, weight);
    const auto fits = [&](const std::wstring& line) {
        SIZE size{};
        GetTextExtentPoint32W(canvas.Context(), line.c_str(), static_cast<int>(line.size()), &size);
        return size.cx <= width;
    };
    std::wstring kept = Wide(text);
    if (fits(kept)) {
        return text;
    }
    while (!kept.empty() && !fits(kept + L"...")) {
        kept.pop_back();
    }
    return Narrow(kept + L"...");
}

void Picture::Save(const std::string& path) const {
    const BITMAPINFO info = TopDown(width_, height_);
    BITMAPFILEHEADER header{};
    header.bfType = 0x4D42;
    header.bfOffBits = sizeof header + sizeof info.bmiHeader;
    header.bfSize = header.bfOffBits + static_cast<DWORD>(colors_.size() * sizeof(Color));
    FILE* const file = std::fopen(path.c_str(), "wb");
    if (file == nullptr) {
        ADD_FAILURE() << "no picture can be written to " << path;
        return;
    }
    std::fwrite(&header, sizeof header, 1, file);
    std::fwrite(&info.bmiHeader, sizeof info.bmiHeader, 1, file);
    std::fwrite(colors_.data(), sizeof(Color), colors_.size(), file);
    std::fclose(file);
}
