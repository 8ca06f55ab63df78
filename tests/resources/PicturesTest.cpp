#include <gtest/gtest.h>

#include <string>

#include "tests/resources/ResourceFile.h"

namespace {

constexpr std::size_t kHeaders = 54;
constexpr std::uint32_t kPageColor = 0x1A1A1A;

/// A bitmap whose rows run from the bottom up, three bytes a pixel, each row filled up to a multiple of four bytes.
struct Bitmap {
    explicit Bitmap(const std::string& name) : bytes(ResourceFile(name)) {}

    [[nodiscard]] std::uint32_t Width() const { return Number32(bytes, 18); }
    [[nodiscard]] std::uint32_t Height() const { return Number32(bytes, 22); }
    [[nodiscard]] std::size_t RowSize() const { return (std::size_t{Width()} * 3 + 3) / 4 * 4; }
    /// Red, green and blue, counted from the upper left corner.
    [[nodiscard]] std::uint32_t Pixel(std::size_t x, std::size_t y) const {
        return Number32(bytes, kHeaders + (Height() - 1 - y) * RowSize() + x * 3 - 1) >> 8;
    }

    std::string bytes;
};

/// The form that LoadBitmapW takes without further ado: 24 bits, uncompressed, no colour table.
void ExpectPlainBitmap(const std::string& name, std::uint32_t width, std::uint32_t height) {
    SCOPED_TRACE(name);
    const Bitmap bitmap(name);
    EXPECT_EQ(bitmap.bytes.substr(0, 2), "BM");
    EXPECT_EQ(bitmap.Width(), width);
    EXPECT_EQ(bitmap.Height(), height);
    EXPECT_EQ(Number32(bitmap.bytes, 2), bitmap.bytes.size());
    EXPECT_EQ(Number32(bitmap.bytes, 10), kHeaders) << "where the pixels begin";
    EXPECT_EQ(Number32(bitmap.bytes, 14), 40U) << "the information header's size";
    EXPECT_EQ(Number16(bitmap.bytes, 26), 1U) << "planes";
    EXPECT_EQ(Number16(bitmap.bytes, 28), 24U) << "bits a pixel";
    EXPECT_EQ(Number32(bitmap.bytes, 30), 0U) << "compression";
    EXPECT_EQ(bitmap.bytes.size(), kHeaders + bitmap.RowSize() * height);
}

/// How bright the eye takes a colour to be, from 0 to 255: green counts most.
constexpr double Brightness(std::uint32_t color) {
    return 0.2126 * (color >> 16 & 0xFF) + 0.7152 * (color >> 8 & 0xFF) + 0.0722 * (color & 0xFF);
}

void ExpectCornersInPageColor(const std::string& name) {
    SCOPED_TRACE(name);
    const Bitmap box(name);
    for (const std::size_t x : {std::size_t{0}, std::size_t{16}}) {
        EXPECT_EQ(box.Pixel(x, 0), kPageColor);
        EXPECT_EQ(box.Pixel(x, 15), kPageColor);
    }
}

}  // namespace

TEST(Pictures, CheckBoxesArePlainBitmapsOf17By16) {
    ExpectPlainBitmap("checkbox-off.bmp", 17, 16);
    ExpectPlainBitmap("checkbox-on.bmp", 17, 16);
}

TEST(Pictures, TheFinalPictureIsAPlainBitmapOf800By350) {
    ExpectPlainBitmap("final.bmp", 800, 350);
}

TEST(Pictures, TheBannerIsAPlainBitmapOf160By350) {
    ExpectPlainBitmap("banner.bmp", 160, 350);
}

TEST(Pictures, CheckBoxesStandOnThePagesColor) {
    ExpectCornersInPageColor("checkbox-off.bmp");
    ExpectCornersInPageColor("checkbox-on.bmp");
}

TEST(Pictures, CheckBoxesDifferInTheMiddle) {
    EXPECT_NE(Bitmap("checkbox-off.bmp").Pixel(8, 8), Bitmap("checkbox-on.bmp").Pixel(8, 8));
}

TEST(Pictures, TheMarkStandsStillWhenTheFinalPictureCoversTheBanner) {
    const Bitmap banner("banner.bmp");
    const Bitmap final("final.bmp");
    std::size_t compared = 0;
    std::size_t different = 0;
    // The mark's bar, which has no tile on the way.
    for (std::size_t y = 70; y < 110; ++y) {
        for (std::size_t x = 20; x < 140; ++x) {
            ++compared;
            different += banner.Pixel(x, y) != final.Pixel(x, y) ? 1U : 0U;
        }
    }
    EXPECT_EQ(compared, 4800U);
    EXPECT_EQ(different, 0U);
}

// A release of any suite shows this picture, also after a run that could not replace a file.
TEST(Pictures, TheFinalPictureNamesNoSuiteAndPromisesNothing) {
    const std::string source = ResourceFile("art/final.svg");
    EXPECT_NE(source.find("<text "), std::string::npos);
    EXPECT_EQ(source.find("Tessaly"), std::string::npos);
    EXPECT_EQ(source.find("in place"), std::string::npos);
    EXPECT_EQ(source.find("complete"), std::string::npos);
}

// The one button that is lit says where to go on; the warm colours of the banner are weaker.
TEST(Pictures, TheBannersAmberIsQuieterThanTheLitButton) {
    constexpr double kLitButton = Brightness(0x009FE1);
    const Bitmap banner("banner.bmp");
    std::size_t amber = 0;
    for (std::size_t y = 0; y < banner.Height(); ++y) {
        for (std::size_t x = 0; x < banner.Width(); ++x) {
            const std::uint32_t color = banner.Pixel(x, y);
            const bool isWarm = (color >> 16) > (color & 0xFF) + 16;
            amber += isWarm ? 1U : 0U;
            ASSERT_FALSE(isWarm && Brightness(color) > kLitButton * 3 / 4) << x << ", " << y;
        }
    }
    EXPECT_GT(amber, 500U) << "the last tile is to be seen";
}

TEST(Pictures, TheIconHasSixSizesOfFullColor) {
    const std::string icon = ResourceFile("hvinstaller.ico");
    ASSERT_EQ(Number32(icon, 0), 0x10000U) << "an icon";
    ASSERT_EQ(Number16(icon, 4), 6U);
    std::size_t next = 6 + 6 * 16;
    std::size_t entry = 6;
    for (const std::uint32_t size : {16U, 24U, 32U, 48U, 64U, 256U}) {
        SCOPED_TRACE(size);
        EXPECT_EQ(Number16(icon, entry), (size & 0xFF) * 0x101) << "width and height; a byte 0 means 256";
        EXPECT_EQ(Number16(icon, entry + 6), 32U) << "bits a pixel";
        EXPECT_EQ(Number32(icon, entry + 12), next) << "each image follows the one before it";
        next += Number32(icon, entry + 8);
        entry += 16;
    }
    EXPECT_EQ(next, icon.size());
}
