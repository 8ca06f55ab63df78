#include "platform/hosted/registry_text.h"

#include <array>
#include <charconv>
#include <cstdio>
#include <optional>

namespace hosted {
namespace {

constexpr std::string_view Header = "REGEDIT4";
constexpr std::string_view ByteOrderMark = "\xEF\xBB\xBF";
constexpr std::uint32_t StringType = 1;
constexpr std::uint32_t BinaryType = 3;
constexpr std::uint32_t NumberType = 4;
constexpr std::size_t HexLineLength = 72;

constexpr std::array<std::string_view, 5> HiveNames = {"HKEY_CLASSES_ROOT", "HKEY_CURRENT_USER", "HKEY_LOCAL_MACHINE",
                                                       "HKEY_USERS", "HKEY_CURRENT_CONFIG"};

/// Two hives are views of keys elsewhere, which lie up to so much deeper.
constexpr std::size_t LevelsBehindView = 4;

bool IsView(std::string_view hive) {
    return hive == "HKEY_CLASSES_ROOT" || hive == "HKEY_CURRENT_CONFIG";
}

std::string_view TrimBlanks(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

/// Reads a text line by line and turns each into a change.
class Parser {
public:
    explicit Parser(std::string_view text) : rest_(text) {}

    std::vector<RegistryChange> Parse() {
        ReadHeader();
        while (NextLine()) {
            ReadLine();
        }
        return std::move(changes_);
    }

private:
    [[noreturn]] void Fail(const std::string& what) const { throw RegistryTextError(number_, what); }

    bool NextLine() {
        if (rest_.empty()) {
            return false;
        }
        const std::size_t end = rest_.find('\n');
        line_ = rest_.substr(0, end);
        rest_.remove_prefix(end == std::string_view::npos ? rest_.size() : end + 1);
        if (!line_.empty() && line_.back() == '\r') {
            line_.remove_suffix(1);
        }
        line_ = TrimBlanks(line_);
        ++number_;
        return true;
    }

    void ReadHeader() {
        if (rest_.substr(0, ByteOrderMark.size()) == ByteOrderMark) {
            rest_.remove_prefix(ByteOrderMark.size());
        }
        NextLine();
        if (line_ != Header) {
            number_ = 1;
            Fail("the first line must be REGEDIT4");
        }
    }

    void ReadLine() {
        if (line_.empty() || line_[0] == ';') {
            return;
        }
        if (line_[0] == '[') {
            ReadKey();
        } else if (line_[0] == '"' || line_[0] == '@') {
            ReadValue();
        } else {
            Fail("neither a key in brackets nor a value");
        }
    }

    // A key's name may hold a bracket itself, so the last one of the line ends it.
    void ReadKey() {
        const std::size_t end = line_.rfind(']');
        if (end != line_.size() - 1) {
            Fail("a key without its closing bracket");
        }
        const bool deletes = line_.substr(1, 1) == "-";
        key_ = line_.substr(deletes ? 2 : 1, end - (deletes ? 2 : 1));
        CheckKey(deletes);
        keyIsDeleted_ = deletes;
        const auto kind = deletes ? RegistryChange::Kind::DeleteKey : RegistryChange::Kind::MakeKey;
        changes_.push_back({kind, key_, {}, 0, {}});
    }

    void CheckKey(bool deletes) const {
        const std::string_view hive = std::string_view(key_).substr(0, key_.find('\\'));
        for (const std::string_view name : HiveNames) {
            if (hive == name) {
                if (deletes && hive.size() == key_.size()) {
                    Fail("a hive cannot be deleted");
                }
                if (CountNames(key_) + (IsView(hive) ? LevelsBehindView : 0) > DeepestKey) {
                    Fail("a key that lies too deep");
                }
                return;
            }
        }
        Fail("\"" + std::string(hive) + "\" is no hive");
    }

    void ReadValue() {
        if (key_.empty() || keyIsDeleted_) {
            Fail("a value without a key");
        }
        RegistryChange change{RegistryChange::Kind::SetValue, key_, ReadName(), 0, {}};
        if (line_ == "-") {
            change.kind = RegistryChange::Kind::DeleteValue;
        } else {
            ReadData(change);
        }
        changes_.push_back(std::move(change));
    }

    /// Takes the name and the equals sign from the line.
    std::string ReadName() {
        std::string name;
        if (line_[0] == '@') {
            line_.remove_prefix(1);
        } else {
            name = ReadQuoted();
        }
        line_ = TrimBlanks(line_);
        if (line_.empty() || line_[0] != '=') {
            Fail("a value name without an equals sign");
        }
        line_ = TrimBlanks(line_.substr(1));
        return name;
    }

    /// Takes a text in quotes from the line.
    std::string ReadQuoted() {
        std::string text;
        std::size_t at = 1;
        for (; at < line_.size() && line_[at] != '"'; ++at) {
            if (line_[at] == '\\' && at + 1 < line_.size()) {
                ++at;
                text += Unescaped(line_[at]);
            } else {
                text += line_[at];
            }
        }
        if (at >= line_.size()) {
            Fail("a text without its closing quote");
        }
        line_.remove_prefix(at + 1);
        return text;
    }

    static char Unescaped(char c) {
        switch (c) {
            case 'n':
                return '\n';
            case 'r':
                return '\r';
            default:
                return c;
        }
    }

    void ReadData(RegistryChange& change) {
        if (!line_.empty() && line_[0] == '"') {
            change.type = StringType;
            change.data = ReadQuoted() + '\0';
            CheckNothingBehind();
        } else if (Takes("dword:")) {
            change.type = NumberType;
            change.data = ReadNumber();
        } else if (Takes("hex:")) {
            change.type = BinaryType;
            change.data = ReadBytes();
        } else if (Takes("hex(")) {
            change.type = ReadType();
            change.data = ReadBytes();
        } else {
            Fail("a value that is neither text, dword nor hex");
        }
    }

    bool Takes(std::string_view start) {
        if (line_.substr(0, start.size()) != start) {
            return false;
        }
        line_.remove_prefix(start.size());
        return true;
    }

    void CheckNothingBehind() const {
        const std::string_view behind = TrimBlanks(line_);
        if (!behind.empty() && behind[0] != ';') {
            Fail("characters behind the end of the text");
        }
    }

    static std::optional<std::uint32_t> ReadHex(std::string_view text) {
        std::uint32_t number = 0;
        const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, 16);
        const bool whole = error == std::errc() && end == text.data() + text.size();
        return whole ? std::optional(number) : std::nullopt;
    }

    std::string ReadNumber() {
        const auto number = ReadHex(TrimBlanks(line_.substr(0, line_.find(';'))));
        if (!number) {
            Fail("a dword that is no hexadecimal number");
        }
        std::string data;
        for (unsigned shift = 0; shift < 32; shift += 8) {
            data += static_cast<char>(*number >> shift & 0xFF);
        }
        return data;
    }

    std::uint32_t ReadType() {
        const std::size_t end = line_.find("):");
        const auto type = ReadHex(line_.substr(0, end));
        if (end == std::string_view::npos || !type) {
            Fail("a hex type that is no number");
        }
        line_.remove_prefix(end + 2);
        return *type;
    }

    std::string ReadBytes() {
        std::string data;
        while (!line_.empty()) {
            const std::string_view part = TrimBlanks(line_.substr(0, line_.find(',')));
            if (part == "\\") {
                if (!NextLine()) {
                    Fail("a line that goes on behind the end of the text");
                }
                continue;
            }
            data += ReadByte(part);
            const std::size_t comma = line_.find(',');
            line_ = comma == std::string_view::npos ? std::string_view() : TrimBlanks(line_.substr(comma + 1));
        }
        return data;
    }

    char ReadByte(std::string_view part) const {
        const auto number = part.size() <= 2 ? ReadHex(part) : std::nullopt;
        if (!number) {
            Fail("\"" + std::string(part) + "\" is no byte");
        }
        return static_cast<char>(*number);
    }

    std::string_view rest_;
    std::string_view line_;
    std::size_t number_ = 0;
    std::string key_;
    bool keyIsDeleted_ = false;
    std::vector<RegistryChange> changes_;
};

std::string Quoted(std::string_view text) {
    std::string quoted = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') {
            quoted += '\\';
        }
        // A line end inside the quotes would end the entry; these two are the escapes that Wine's reader knows.
        if (c == '\n' || c == '\r') {
            quoted += c == '\n' ? "\\n" : "\\r";
        } else {
            quoted += c;
        }
    }
    return quoted + '"';
}

/// Text between quotes holds printable characters and one terminator, at its end; anything else needs bytes.
bool IsPlainText(std::string_view data) {
    if (data.empty() || data.back() != '\0') {
        return false;
    }
    for (const char c : data.substr(0, data.size() - 1)) {
        if (static_cast<unsigned char>(c) < ' ') {
            return false;
        }
    }
    return true;
}

std::string HexData(std::string_view start, std::string_view data) {
    std::string text(start);
    std::size_t lineLength = text.size();
    for (std::size_t at = 0; at < data.size(); ++at) {
        char byte[4];
        std::snprintf(byte, sizeof byte, "%02x", static_cast<unsigned>(static_cast<unsigned char>(data[at])));
        text += byte;
        lineLength += 3;
        if (at + 1 < data.size()) {
            text += ',';
            if (lineLength > HexLineLength) {
                text += "\\\n  ";
                lineLength = 2;
            }
        }
    }
    return text;
}

std::string DataText(std::uint32_t type, std::string_view data) {
    if (type == StringType && IsPlainText(data)) {
        return Quoted(data.substr(0, data.size() - 1));
    }
    char start[24];
    if (type == NumberType && data.size() == 4) {
        const auto byte = [&](std::size_t at) { return static_cast<unsigned>(static_cast<unsigned char>(data[at])); };
        std::snprintf(start, sizeof start, "dword:%02x%02x%02x%02x", byte(3), byte(2), byte(1), byte(0));
        return start;
    }
    if (type == BinaryType) {
        return HexData("hex:", data);
    }
    std::snprintf(start, sizeof start, "hex(%x):", static_cast<unsigned>(type));
    return HexData(start, data);
}

}  // namespace

std::size_t CountNames(std::string_view path) {
    std::size_t names = 0;
    bool inName = false;
    for (const char c : path) {
        names += !inName && c != '\\' ? 1 : 0;
        inName = c != '\\';
    }
    return names;
}

std::vector<RegistryChange> ParseRegistryText(std::string_view text) {
    return Parser(text).Parse();
}

std::string RegistryTextHeader() {
    return std::string(Header) + "\n";
}

std::string KeyLine(std::string_view key) {
    return "[" + std::string(key) + "]\n";
}

std::string DeletedKeyLine(std::string_view key) {
    return "[-" + std::string(key) + "]\n";
}

std::string DeletedValueLine(std::string_view name) {
    return (name.empty() ? "@" : Quoted(name)) + "=-\n";
}

std::string ValueLine(std::string_view name, std::uint32_t type, std::string_view data) {
    return (name.empty() ? "@" : Quoted(name)) + "=" + DataText(type, data) + "\n";
}

}  // namespace hosted
