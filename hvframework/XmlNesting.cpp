#include "hvframework/XmlNesting.h"

#include <algorithm>
#include <cstring>

#include "hvframework/StringUtils.h"

namespace HVL {
namespace {

/// How the library tells characters apart. Before a declaration it takes bytes, but does not know yet what follows.
enum class Reading { Undecided, Bytes, Utf8 };

bool IsBlank(char c) {
    return c == ' ' || (c >= '\t' && c <= '\r');
}

bool StartsName(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_' || static_cast<unsigned char>(c) >= 127;
}

bool ContinuesName(char c) {
    return StartsName(c) || (c >= '0' && c <= '9') || c == '-' || c == '.' || c == ':';
}

/// Steps over the text as the library does, without building anything and without recursion.
///
/// Each step returns false where the library gives up; what it has taken by then has been counted. The steps follow
/// the library's, oddities included, because a difference would let a text hide its depth: a character that swallows
/// the `<` that follows, a quote after a byte order mark, a `>` inside a value.
class NestingScan {
public:
    NestingScan(const char* text, Reading reading) : p_(text), reading_(reading) {}

    XmlShape Measure() {
        while (SkipBlanks(), *p_ == '<') {
            const bool declaration = AtDeclaration();
            if (!(declaration ? SkipDeclaration() : SkipTopNode())) {
                break;
            }
            if (declaration && reading_ == Reading::Undecided) {
                return ShapeInEitherReading();
            }
        }
        return shape_;
    }

private:
    /// The declaration's word for the encoding need not be understood when both readings are tried.
    [[nodiscard]] XmlShape ShapeInEitherReading() const {
        const XmlShape bytes = NestingScan(p_, Reading::Bytes).Measure();
        const XmlShape utf8 = NestingScan(p_, Reading::Utf8).Measure();
        return {std::max({shape_.deepest, bytes.deepest, utf8.deepest}),
                std::max({shape_.mostAttributes, bytes.mostAttributes, utf8.mostAttributes})};
    }

    /// An element with all that is in it, or any other node.
    bool SkipTopNode() {
        if (!SkipNode()) {
            return false;
        }
        while (depth_ > 0) {
            if (!SkipContent()) {
                return false;
            }
        }
        return true;
    }

    /// One piece of an element's content: text, a node, or the end tag.
    bool SkipContent() {
        SkipBlanks();
        if (*p_ == '\0') {
            return false;
        }
        if (*p_ != '<') {
            return SkipTextTo('<');
        }
        return p_[1] == '/' ? SkipEndTag() : SkipNode();
    }

    bool SkipNode() {
        if (AtDeclaration()) {
            return SkipDeclaration();
        }
        if (At("<!--")) {
            return SkipPast("-->", 4);
        }
        if (At("<![CDATA[")) {
            return SkipPast("]]>", 9);
        }
        if (p_[1] == '!' || !StartsName(p_[1])) {
            return SkipPast(">", 1);
        }
        return SkipStartTag();
    }

    bool SkipStartTag() {
        shape_.deepest = std::max(shape_.deepest, ++depth_);
        ++p_;
        SkipBlanks();
        if (!SkipName()) {
            return false;
        }
        std::size_t attributes = 0;
        while (SkipBlanks(), *p_ != '>' && *p_ != '/') {
            if (!SkipAttribute()) {
                return false;
            }
            shape_.mostAttributes = std::max(shape_.mostAttributes, ++attributes);
        }
        if (*p_++ == '>') {
            return true;
        }
        --depth_;
        return *p_++ == '>';
    }

    /// The name is not compared: where it is another, the library gives up.
    bool SkipEndTag() {
        --depth_;
        p_ += 2;
        while (ContinuesName(*p_)) {
            ++p_;
        }
        SkipBlanks();
        return *p_++ == '>';
    }

    bool SkipAttribute() {
        if (!SkipName()) {
            return false;
        }
        SkipBlanks();
        if (*p_ != '=') {
            return false;
        }
        ++p_;
        SkipBlanks();
        if (*p_ == '"' || *p_ == '\'') {
            const char quote = *p_++;
            return SkipTextTo(quote) && (++p_, true);
        }
        return SkipBareValue();
    }

    bool SkipBareValue() {
        while (*p_ != '\0' && !IsBlank(*p_) && *p_ != '/' && *p_ != '>') {
            if (*p_ == '"' || *p_ == '\'') {
                return false;
            }
            ++p_;
        }
        return *p_ != '\0';
    }

    /// `<?xml` ends at the first `>` that is not inside the value of one of the three words that are read.
    bool SkipDeclaration() {
        p_ += 5;
        while (*p_ != '\0') {
            if (*p_ == '>') {
                ++p_;
                return true;
            }
            SkipBlanks();
            if (AtWord("version") || AtWord("encoding") || AtWord("standalone")) {
                if (!SkipAttribute()) {
                    return false;
                }
            } else {
                while (*p_ != '\0' && *p_ != '>' && !IsBlank(*p_)) {
                    ++p_;
                }
            }
        }
        return false;
    }

    bool SkipName() {
        if (!StartsName(*p_)) {
            return false;
        }
        while (ContinuesName(*p_)) {
            ++p_;
        }
        return *p_ != '\0';
    }

    /// To the next `end`, which a cut character can swallow.
    bool SkipTextTo(char end) {
        while (*p_ != '\0' && *p_ != end) {
            p_ += CharacterLength();
        }
        return *p_ != '\0';
    }

    [[nodiscard]] std::size_t CharacterLength() const {
        const auto lead = static_cast<unsigned char>(*p_);
        if (reading_ != Reading::Utf8 || lead < 0xC2 || lead > 0xF4) {
            return 1;
        }
        return lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
    }

    bool SkipPast(const char* end, std::size_t from) {
        const char* found = std::strstr(p_ + from, end);
        p_ = found != nullptr ? found + std::strlen(end) : p_ + std::strlen(p_);
        return found != nullptr;
    }

    /// In UTF-8 the library takes a byte order mark, and two characters like it, for white space anywhere.
    void SkipBlanks() {
        while (IsBlank(*p_) || (reading_ == Reading::Utf8 && AtMark())) {
            p_ += IsBlank(*p_) ? 1 : 3;
        }
    }

    [[nodiscard]] bool AtMark() const { return At("\xEF\xBB\xBF") || At("\xEF\xBF\xBE") || At("\xEF\xBF\xBF"); }
    [[nodiscard]] bool AtDeclaration() const { return AtWord("<?xml"); }
    [[nodiscard]] bool At(const char* text) const { return std::strncmp(p_, text, std::strlen(text)) == 0; }
    [[nodiscard]] bool AtWord(const char* word) const {
        return std::equal(word, word + std::strlen(word), p_,
                          [](char a, char b) { return a == StringUtils::ToLower(b); });
    }

    const char* p_;
    Reading reading_;
    std::size_t depth_ = 0;
    XmlShape shape_;
};

}  // namespace

XmlShape MeasureXml(const std::string& text) {
    const bool marked = text.compare(0, 3, "\xEF\xBB\xBF") == 0;
    return NestingScan(text.c_str(), marked ? Reading::Utf8 : Reading::Undecided).Measure();
}

std::string ExcessOfXml(const std::string& text) {
    if (text.size() > kLongestXml + kXmlPadding) {
        return "the text is longer than " + std::to_string(kLongestXml) + " bytes";
    }
    const XmlShape shape = MeasureXml(text);
    if (shape.deepest > kDeepestElement) {
        return "elements are nested more than " + std::to_string(kDeepestElement) + " deep";
    }
    if (shape.mostAttributes > kMostAttributes) {
        return "an element has more than " + std::to_string(kMostAttributes) + " attributes";
    }
    return "";
}

}  // namespace HVL
