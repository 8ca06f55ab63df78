#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

/// Plain functions on narrow strings, for every room.
///
/// All of them work byte by byte: upper and lower case differ, and no locale takes part. None of them keeps state or
/// fails; all may be called from any thread.
namespace HVL::StringUtils {

/// Whether `text` begins with `prefix`. A prefix longer than the text gives false, an empty one true.
[[nodiscard]] bool StartsWith(std::string_view text, std::string_view prefix);

/// Whether `text` ends with `suffix`. A suffix longer than the text gives false, an empty one true.
[[nodiscard]] bool EndsWith(std::string_view text, std::string_view suffix);

/// Every piece of `text` between separators, empty ones included: always one piece more than there are separators.
/// So a trailing separator yields a last empty piece, and an empty text yields one empty piece.
[[nodiscard]] std::vector<std::string> Split(std::string_view text, char separator);

/// `number` in decimal, with a "-" before a negative one.
[[nodiscard]] std::string ToString(std::int64_t number);

/// A copy of `text` with every occurrence of `token` replaced. What is inserted is not searched again. An empty token
/// occurs nowhere.
[[nodiscard]] std::string ReplaceAll(std::string_view text, std::string_view token, std::string_view replacement);

/// A copy of `text` without any `unwanted`.
[[nodiscard]] std::string RemoveChar(std::string_view text, char unwanted);

/// A copy of `text` without one leading and one trailing double or single quote. The two ends are looked at each by
/// itself: they need not match, and one alone is removed too.
[[nodiscard]] std::string StripQuotes(std::string_view text);

/// Blanks, tabs and all characters that end a line.
inline constexpr std::string_view kWhiteSpace = " \t\n\v\f\r";

/// A copy of `text` without the white space at both ends.
[[nodiscard]] std::string Trim(std::string_view text);

/// The letter in lower case, for the 26 letters of ASCII; any other character as it is.
[[nodiscard]] constexpr char ToLower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

/// Copies of `text` in which the letters of ASCII are in lower, or in upper case.
[[nodiscard]] std::string ToLower(std::string text);
[[nodiscard]] std::string ToUpper(std::string text);

/// The value of the environment variable `name`; empty when it is not set, is set to nothing, or does not fit into
/// 8191 bytes.
[[nodiscard]] std::string GetEnvironmentValue(const std::string& name);

}  // namespace HVL::StringUtils
