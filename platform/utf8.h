#pragma once

#include <string>
#include <string_view>

/// UTF-8 and wide text, the same conversion on both targets.
///
/// Wide text is UTF-16 where wchar_t has two bytes and UTF-32 where it has four. Nothing here fails: what is malformed
/// becomes U+FFFD, one for each longest piece that could have begun a character, as Windows does it.
namespace platform {

std::wstring WideFromUtf8(std::string_view text);
std::string Utf8FromWide(std::wstring_view text);

/// Whether the bytes are UTF-8, with nothing malformed in them.
bool IsUtf8(std::string_view text);

}  // namespace platform
