#pragma once

#include <string>
#include <vector>

/// What a terminal of any width shows after these bytes, line by line, without blanks at the ends of lines. A last line
/// that is empty is left out.
inline std::vector<std::string> TerminalPicture(const std::string& bytes) {
    std::vector<std::string> lines{""};
    std::size_t column = 0;
    for (const char c : bytes) {
        if (c == '\r') {
            column = 0;
        } else if (c == '\n') {
            lines.emplace_back();
            column = 0;
        } else {
            std::string& line = lines.back();
            line.resize(line.size() > column ? line.size() : column + 1, ' ');
            line[column++] = c;
        }
    }
    for (std::string& line : lines) {
        line.erase(line.find_last_not_of(' ') + 1);
    }
    if (lines.back().empty()) {
        lines.pop_back();
    }
    return lines;
}
