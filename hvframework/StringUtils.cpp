#include "hvframework/StringUtils.h"

#include <algorithm>
#include <array>

#include "platform/win32.h"

namespace HVL::StringUtils {
namespace {

constexpr std::size_t kEnvironmentBufferSize = 8192;

bool IsQuote(char character) {
    return character == '"' || character == '\'';
}

}  // namespace

bool StartsWith(std::string_view text, std::string_view prefix) {
    return text.starts_with(prefix);
}

bool EndsWith(std::string_view text, std::string_view suffix) {
    return text.ends_with(suffix);
}

std::vector<std::string> Split(std::string_view text, char separator) {
    std::vector<std::string> pieces;
    pieces.reserve(static_cast<std::size_t>(std::count(text.begin(), text.end(), separator)) + 1);
    std::size_t begin = 0;
    for (std::size_t end = text.find(separator); end != std::string_view::npos; end = text.find(separator, begin)) {
        pieces.emplace_back(text.substr(begin, end - begin));
        begin = end + 1;
    }
    pieces.emplace_back(text.substr(begin));
    return pieces;
}

std::string ToString(std::int64_t number) {
    return std::to_string(number);
}

std::string ReplaceAll(std::string_view text, std::string_view token, std::string_view replacement) {
    if (token.empty()) {
        return std::string(text);
    }
    std::string result;
    std::size_t begin = 0;
    for (std::size_t found = text.find(token); found != std::string_view::npos; found = text.find(token, begin)) {
        result += text.substr(begin, found - begin);
        result += replacement;
        begin = found + token.size();
    }
    result += text.substr(begin);
    return result;
}

std::string RemoveChar(std::string_view text, char unwanted) {
    std::string result(text);
    std::erase(result, unwanted);
    return result;
}

std::string StripQuotes(std::string_view text) {
    if (!text.empty() && IsQuote(text.front())) {
        text.remove_prefix(1);
    }
    if (!text.empty() && IsQuote(text.back())) {
        text.remove_suffix(1);
    }
    return std::string(text);
}

std::string Trim(std::string_view text) {
    const std::size_t first = text.find_first_not_of(kWhiteSpace);
    if (first == std::string_view::npos) {
        return {};
    }
    return std::string(text.substr(first, text.find_last_not_of(kWhiteSpace) - first + 1));
}

std::string ToLower(std::string text) {
    std::ranges::transform(text, text.begin(), [](char c) { return ToLower(c); });
    return text;
}

std::string ToUpper(std::string text) {
    std::ranges::transform(text, text.begin(),
                           [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; });
    return text;
}

std::string GetEnvironmentValue(const std::string& name) {
    std::array<char, kEnvironmentBufferSize> buffer;
    const auto length = GetEnvironmentVariableA(name.c_str(), buffer.data(), static_cast<DWORD>(buffer.size()));
    // A value that does not fit is answered with the size it needs, and leaves the buffer undefined.
    return length < buffer.size() ? std::string(buffer.data(), length) : std::string();
}

}  // namespace HVL::StringUtils
