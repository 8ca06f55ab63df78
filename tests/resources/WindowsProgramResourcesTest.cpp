#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "hvframework/FileVersion.h"
#include "platform/program.h"
#include "platform/win32.h"
#include "tests/resources/ResourceFile.h"

namespace {

/// A text of this program's version block, English in UTF-16; empty when it has none such.
std::string VersionText(const std::string& name) {
    DWORD ignored = 0;
    std::vector<char> block(GetFileVersionInfoSizeA(platform::ProgramPath().c_str(), &ignored));
    void* text = nullptr;
    UINT length = 0;
    if (GetFileVersionInfoA(platform::ProgramPath().c_str(), 0, static_cast<DWORD>(block.size()), block.data()) == 0 ||
        VerQueryValueA(block.data(), ("\\StringFileInfo\\040904B0\\" + name).c_str(), &text, &length) == 0) {
        return {};
    }
    return static_cast<const char*>(text);
}

}  // namespace

TEST(ProgramResources, CarryTheBitmapsWithoutTheirFileHeader) {
    const std::vector<std::pair<std::uint16_t, std::string>> bitmaps = {
        {130, "checkbox-off.bmp"}, {131, "checkbox-on.bmp"}, {133, "final.bmp"}, {134, "banner.bmp"}};
    std::size_t compared = 0;
    for (const auto& [number, name] : bitmaps) {
        // A comparison of the texts themselves would print megabytes.
        EXPECT_TRUE(platform::CompiledResource(number, RT_BITMAP) == ResourceFile(name).substr(14)) << name;
        ++compared;
    }
    EXPECT_EQ(compared, 4U);
}

TEST(ProgramResources, CarryEveryImageOfTheIcon) {
    const std::string group = platform::CompiledResource(129, RT_GROUP_ICON);
    const std::string file = ResourceFile("hvinstaller.ico");
    ASSERT_EQ(group.substr(0, 6), file.substr(0, 6));
    const std::uint32_t images = Number16(file, 4);
    ASSERT_EQ(images, 6U);
    for (std::uint32_t i = 0; i < images; ++i) {
        // The resource's entry ends in the image's number where the file's has its place.
        const auto number = static_cast<std::uint16_t>(Number16(group, 6 + i * 14 + 12));
        const std::string image = file.substr(Number32(file, 6 + i * 16 + 12), Number32(file, 6 + i * 16 + 8));
        EXPECT_TRUE(platform::CompiledResource(number, RT_ICON) == image) << "image " << i;
    }
}

TEST(ProgramResources, GiveTheProjectsVersion) {
    HVL::Version version;
    ASSERT_TRUE(HVL::GetFileVersion(platform::ProgramPath(), version));
    EXPECT_EQ(version.text, HV_PROJECT_VERSION);
    EXPECT_EQ(VersionText("FileVersion"), HV_PROJECT_VERSION);
    EXPECT_EQ(VersionText("ProductVersion"), HV_PROJECT_VERSION);
}

TEST(ProgramResources, SayWhatTheProgramIsAndWhoMadeIt) {
    EXPECT_EQ(VersionText("CompanyName"), "Halvorn LLC");
    EXPECT_EQ(VersionText("ProductName"), "Tessaly Suite");
    EXPECT_EQ(VersionText("FileDescription"), "Tessaly Suite Installer");
    EXPECT_EQ(VersionText("OriginalFilename"), "hvinstaller.exe");
}
