#include <gtest/gtest.h>

#include "platform/win32.h"

#include <array>

#include <objbase.h>
#include <shobjidl.h>

#include "platform/utf8.h"
#include "tests/support/Link.h"

namespace {

using Text = std::array<wchar_t, 1024>;
constexpr int kLength = static_cast<int>(Text().size());

LinkContent ContentOf(IShellLinkW& link) {
    LinkContent content;
    Text text{};
    EXPECT_EQ(link.GetPath(text.data(), kLength, nullptr, 0), S_OK);
    content.target = platform::Utf8FromWide(text.data());
    EXPECT_EQ(link.GetDescription(text.data(), kLength), S_OK);
    content.description = platform::Utf8FromWide(text.data());
    // A link without an icon of its own leaves the buffer alone.
    text = {};
    EXPECT_EQ(link.GetIconLocation(text.data(), kLength, &content.iconIndex), S_OK);
    content.icon = platform::Utf8FromWide(text.data());
    return content;
}

}  // namespace

LinkContent LinkOf(const Machine&, const std::string& path) {
    LinkContent content;
    IShellLinkW* link = nullptr;
    IPersistFile* file = nullptr;
    // Each initialisation counts; this one lasts as long as the test program.
    (void)CoInitialize(nullptr);
    if (FAILED(CoCreateInstance(CLSID_ShellLink, nullptr, CLSCTX_INPROC_SERVER, IID_IShellLinkW,
                                reinterpret_cast<void**>(&link))) ||
        FAILED(link->QueryInterface(IID_IPersistFile, reinterpret_cast<void**>(&file)))) {
        ADD_FAILURE() << "the shell makes no links";
        return content;
    }
    if (FAILED(file->Load(platform::WideFromUtf8(path).c_str(), STGM_READ))) {
        ADD_FAILURE() << "the shell cannot read " << path;
    } else {
        content = ContentOf(*link);
    }
    file->Release();
    link->Release();
    return content;
}
