// The link as the shell itself reads it back, which only Windows can tell.
#include <gtest/gtest.h>

#include <array>

#include "hvframework/Shortcut.h"
#include "platform/shell_link.h"
#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kProgram = "C:\\Program Files\\Halvorn\\Glow\\Gl\xC3\xBChen.exe";
constexpr const char* kLink = R"(C:\Users\Public\Glow.lnk)";

struct ShellReading {
    std::string target;
    std::string description;
    std::string icon;
    int iconIndex = -1;
};

ShellReading ReadThroughShell(const std::string& path) {
    ShellReading reading;
    IShellLinkW* link = nullptr;
    IPersistFile* file = nullptr;
    std::array<wchar_t, 1024> text{};
    const auto size = static_cast<int>(text.size());
    EXPECT_EQ(CoCreateInstance(CLSID_ShellLink, nullptr, CLSCTX_INPROC_SERVER, IID_IShellLinkW,
                               reinterpret_cast<void**>(&link)),
              S_OK);
    EXPECT_EQ(link->QueryInterface(IID_IPersistFile, reinterpret_cast<void**>(&file)), S_OK);
    EXPECT_EQ(file->Load(platform::WideFromUtf8(path).c_str(), STGM_READ), S_OK);
    EXPECT_EQ(link->GetPath(text.data(), size, nullptr, 0), S_OK);
    reading.target = platform::Utf8FromWide(text.data());
    EXPECT_EQ(link->GetDescription(text.data(), size), S_OK);
    reading.description = platform::Utf8FromWide(text.data());
    text[0] = 0;
    EXPECT_EQ(link->GetIconLocation(text.data(), size, &reading.iconIndex), S_OK);
    reading.icon = platform::Utf8FromWide(text.data());
    file->Release();
    link->Release();
    return reading;
}

}  // namespace

TEST(ShortcutThroughShell, IsReadBackAsItWasMade) {
    Machine machine;
    machine.Has(kProgram, "program");
    ASSERT_EQ(HVL::FileUtils::MakeShortcut(kProgram, kLink), 0);
    const ShellReading reading = ReadThroughShell(kLink);
    EXPECT_EQ(reading.target, kProgram);
    EXPECT_EQ(reading.description, "Halvorn shortcut");
    EXPECT_EQ(reading.icon, kProgram);
    EXPECT_EQ(reading.iconIndex, 0);
}

TEST(ShortcutThroughShell, HasNoIconOfItsOwnUnlessItOpensAProgram) {
    Machine machine;
    machine.Has(R"(C:\Users\Public\Manual.pdf)", "content");
    ASSERT_EQ(HVL::FileUtils::MakeShortcut(R"(C:\Users\Public\Manual.pdf)", kLink), 0);
    EXPECT_EQ(ReadThroughShell(kLink).target, R"(C:\Users\Public\Manual.pdf)");
    EXPECT_EQ(ReadThroughShell(kLink).icon, "");
}
