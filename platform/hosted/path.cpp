#include "platform/hosted/path.h"

#include <algorithm>
#include <boost/functional/hash.hpp>

#include "platform/utf8.h"

namespace hosted::filesystem {
namespace {

using Text = std::wstring_view;

constexpr Text Dot = L".";
constexpr Text DotDot = L"..";
/// How the root directory shows among the elements, whichever separator the text has.
constexpr Text RootDirectoryElement = L"/";

bool IsSeparator(wchar_t c) {
    return c == path::separator || c == path::preferred_separator;
}
bool IsLetter(wchar_t c) {
    return (c >= L'a' && c <= L'z') || (c >= L'A' && c <= L'Z');
}
bool IsDeviceNameCharacter(wchar_t c) {
    return IsLetter(c) || (c >= L'0' && c <= L'9') || c == L'$';
}

/// The root of a path: the root name is the first `nameSize` characters, and `directory` is where the separator stands
/// that is the root directory, the text's size if there is none.
struct Root {
    std::size_t nameSize = 0;
    std::size_t directory = 0;
};

bool HasDirectory(const Root& root, Text text) {
    return root.directory < text.size();
}

/// Where the relative part may begin; separators repeated after the root directory still stand there.
std::size_t RootPathSize(const Root& root, Text text) {
    return HasDirectory(root, text) ? root.directory + 1 : root.nameSize;
}

std::size_t SkipSeparators(Text text, std::size_t position) {
    while (position < text.size() && IsSeparator(text[position])) {
        ++position;
    }
    return position;
}

std::size_t FindSeparator(Text text, std::size_t position) {
    return std::min(text.find_first_of(L"/\\", position), text.size());
}

/// Size of `\\?\`, `\\.\` or `\??\` at the start, 0 if none is there.
std::size_t NtPrefixSize(Text text) {
    if (text.size() < 4 || !IsSeparator(text[0]) || !IsSeparator(text[3])) {
        return 0;
    }
    const bool win32Form = IsSeparator(text[1]) && (text[2] == L'?' || text[2] == path::dot);
    const bool ntForm = text[1] == L'?' && text[2] == L'?';
    return win32Form || ntForm ? 4 : 0;
}

/// Size of a drive or device name with its colon at the start, 0 if none is there.
std::size_t DeviceNameSize(Text text) {
    if (text.empty() || !IsLetter(text[0])) {
        return 0;
    }
    std::size_t size = 1;
    while (size < text.size() && IsDeviceNameCharacter(text[size])) {
        ++size;
    }
    return size < text.size() && text[size] == L':' ? size + 1 : 0;
}

Root RootNamedUpToSeparator(Text text, std::size_t from) {
    const std::size_t size = FindSeparator(text, from);
    return {size, size};
}

Root FindRoot(Text text) {
    const std::size_t prefix = NtPrefixSize(text);
    if (prefix == 0 && !text.empty() && IsSeparator(text[0])) {
        // Exactly two separators open a network name; three and more are one root directory, written lavishly.
        const bool network = SkipSeparators(text.substr(0, 3), 0) == 2;
        return network ? RootNamedUpToSeparator(text, 2) : Root{0, 0};
    }
    if (const std::size_t device = DeviceNameSize(text.substr(prefix)); device > 0) {
        const std::size_t size = prefix + device;
        return {size, size < text.size() && IsSeparator(text[size]) ? size : text.size()};
    }
    return prefix > 0 ? RootNamedUpToSeparator(text, prefix) : Root{0, text.size()};
}

/// Where the filename that ends at the text's end starts; the text's size if there is none after `floor`.
std::size_t FilenameStart(Text text, std::size_t floor) {
    std::size_t start = text.size();
    while (start > floor && !IsSeparator(text[start - 1])) {
        --start;
    }
    return start;
}

/// True when the separators at the text's end, which must be there, are the root directory.
bool EndsInRootDirectory(Text text, const Root& root) {
    std::size_t run = text.size() - 1;
    while (run > root.directory && IsSeparator(text[run - 1])) {
        --run;
    }
    return run == root.directory;
}

bool EndsInSeparator(Text text) {
    return !text.empty() && IsSeparator(text.back());
}

std::size_t ParentSize(Text text) {
    const Root root = FindRoot(text);
    std::size_t end = FilenameStart(text, root.nameSize);
    const bool hasFilename = end < text.size();
    while (end > root.nameSize && IsSeparator(text[end - 1])) {
        --end;
        if (end == root.directory) {
            return hasFilename ? end + 1 : end;
        }
    }
    return end <= root.nameSize && !hasFilename ? 0 : end;
}

Text Filename(Text text) {
    const Root root = FindRoot(text);
    if (HasDirectory(root, text) && EndsInSeparator(text) && EndsInRootDirectory(text, root)) {
        return text.substr(root.directory, 1);
    }
    if (root.nameSize == text.size()) {
        return text;
    }
    const std::size_t start = FilenameStart(text, root.nameSize);
    // Only a separator that is not the root's can stand at the end here.
    return start == text.size() && EndsInSeparator(text) ? Dot : text.substr(start);
}

/// The extension's size within `filename`, its dot included.
std::size_t ExtensionSize(Text filename) {
    if (filename == Dot || filename == DotDot) {
        return 0;
    }
    const std::size_t position = filename.rfind(path::dot);
    return position == Text::npos ? 0 : filename.size() - position;
}

/// One element of a path: where it stands, and how it shows. The end is at the text's size and shows nothing.
struct Element {
    std::size_t position = 0;
    Text shown;
};

Element FirstElement(Text text, const Root& root) {
    if (root.nameSize > 0) {
        return {0, text.substr(0, root.nameSize)};
    }
    if (HasDirectory(root, text)) {
        return {root.directory, RootDirectoryElement};
    }
    return {0, text.substr(0, FindSeparator(text, 0))};
}

Element NextElement(Text text, const Root& root, const Element& element) {
    const std::size_t after = element.position + element.shown.size();
    if (after >= text.size()) {
        return {text.size(), {}};
    }
    if (after == root.directory && element.shown.size() == root.nameSize) {
        return {after, RootDirectoryElement};
    }
    const std::size_t start = SkipSeparators(text, after);
    if (start == text.size() && !EndsInRootDirectory(text, root)) {
        return {text.size() - 1, Dot};
    }
    return {start, text.substr(start, FindSeparator(text, start) - start)};
}

Element PreviousElement(Text text, const Root& root, std::size_t position) {
    const Element rootName{0, text.substr(0, root.nameSize)};
    if (HasDirectory(root, text) && position == root.directory) {
        return rootName;
    }
    if (position == text.size() && text.size() > 1 && EndsInSeparator(text) && !EndsInRootDirectory(text, root)) {
        return {position - 1, Dot};
    }
    std::size_t end = position;
    while (end > root.nameSize && IsSeparator(text[end - 1])) {
        --end;
        if (end == root.directory) {
            return {end, RootDirectoryElement};
        }
    }
    if (end <= root.nameSize) {
        return rootName;
    }
    const std::size_t start = FilenameStart(text.substr(0, end), root.nameSize);
    return {start, text.substr(start, end - start)};
}

/// The elements of a text one after the other, without copying any.
class Elements {
public:
    explicit Elements(Text text) : text_(text), root_(FindRoot(text)), element_(FirstElement(text, root_)) {}
    [[nodiscard]] bool AtEnd() const { return element_.position == text_.size(); }
    [[nodiscard]] Text Shown() const { return element_.shown; }
    void Advance() { element_ = NextElement(text_, root_, element_); }

private:
    Text text_;
    Root root_;
    Element element_;
};

}  // namespace

path::path(const char* text) : text_(platform::WideFromUtf8(text)) {}
path::path(const std::string& text) : text_(platform::WideFromUtf8(text)) {}
path::path(std::string_view text) : text_(platform::WideFromUtf8(text)) {}

path& path::assign(const path& source) {
    text_ = source.text_;
    return *this;
}

path& path::append(const path& source) {
    if (&source == this) {
        return append(path(source));
    }
    if (!source.empty()) {
        if (!IsSeparator(source.text_[0])) {
            AppendSeparatorIfNeeded();
        }
        text_ += source.text_;
    }
    return *this;
}

path& path::concat(const path& source) {
    text_ += source.text_;
    return *this;
}

path& path::operator+=(value_type character) {
    text_ += character;
    return *this;
}

path& path::operator+=(char character) {
    text_ += platform::WideFromUtf8({&character, 1});
    return *this;
}

void path::AppendSeparatorIfNeeded() {
    // Any colon counts, not only a drive's: so it is with the library, and joined texts must come out alike.
    if (!text_.empty() && text_.back() != L':' && !IsSeparator(text_.back())) {
        text_ += preferred_separator;
    }
}

path& path::make_preferred() {
    std::replace(text_.begin(), text_.end(), separator, preferred_separator);
    return *this;
}

path& path::remove_filename() {
    text_.resize(ParentSize(text_));
    return *this;
}

path& path::remove_trailing_separator() {
    if (EndsInSeparator(text_)) {
        text_.pop_back();
    }
    return *this;
}

path& path::replace_extension(const path& extension) {
    text_.resize(text_.size() - ExtensionSize(Filename(text_)));
    if (!extension.empty()) {
        if (extension.text_[0] != dot) {
            text_ += dot;
        }
        text_ += extension.text_;
    }
    return *this;
}

std::string path::string() const {
    return platform::Utf8FromWide(text_);
}

path path::generic_path() const {
    path generic(*this);
    std::replace(generic.text_.begin(), generic.text_.end(), preferred_separator, separator);
    return generic;
}

std::string path::generic_string() const {
    return generic_path().string();
}
std::wstring path::generic_wstring() const {
    return generic_path().native();
}

int path::compare(const path& other) const {
    if (text_ == other.text_) {
        return 0;
    }
    Elements left(text_);
    Elements right(other.text_);
    for (; !left.AtEnd() && !right.AtEnd(); left.Advance(), right.Advance()) {
        if (const int order = left.Shown().compare(right.Shown()); order != 0) {
            return order < 0 ? -1 : 1;
        }
    }
    if (left.AtEnd() && right.AtEnd()) {
        return 0;
    }
    return left.AtEnd() ? -1 : 1;
}

path path::root_name() const {
    return Text(text_).substr(0, FindRoot(text_).nameSize);
}

path path::root_directory() const {
    const Root root = FindRoot(text_);
    return Text(text_).substr(root.directory, HasDirectory(root, text_) ? 1 : 0);
}

path path::root_path() const {
    return Text(text_).substr(0, RootPathSize(FindRoot(text_), text_));
}

path path::relative_path() const {
    const Root root = FindRoot(text_);
    const std::size_t size = RootPathSize(root, text_);
    return Text(text_).substr(HasDirectory(root, text_) ? SkipSeparators(text_, size) : size);
}

path path::parent_path() const {
    return Text(text_).substr(0, ParentSize(text_));
}
path path::filename() const {
    return Filename(text_);
}

path path::stem() const {
    const Text name = Filename(text_);
    return name.substr(0, name.size() - ExtensionSize(name));
}

path path::extension() const {
    const Text name = Filename(text_);
    return name.substr(name.size() - ExtensionSize(name));
}

bool path::is_absolute() const {
    const Root root = FindRoot(text_);
    return root.nameSize > 0 && HasDirectory(root, text_);
}

path path::lexically_normal() const {
    const Text text = text_;
    const Root root = FindRoot(text);
    path normal(text.substr(0, root.nameSize));
    normal.make_preferred();
    if (HasDirectory(root, text)) {
        normal.text_ += preferred_separator;
    }
    const std::size_t rootSize = normal.size();
    std::size_t position = SkipSeparators(text, rootSize);
    if (position == text.size()) {
        return normal;
    }
    Text last;
    while (position < text.size()) {
        const std::size_t end = FindSeparator(text, position);
        last = text.substr(position, end - position);
        position = SkipSeparators(text, end);
        const std::size_t previous = FilenameStart(normal.text_, rootSize);
        if (last == DotDot && normal.size() > rootSize && Text(normal.text_).substr(previous) != DotDot) {
            normal.text_.resize(previous > rootSize ? previous - 1 : previous);
        } else if (last != Dot) {
            normal.AppendSeparatorIfNeeded();
            normal.text_ += last;
        }
    }
    if (normal.empty() || last == Dot || EndsInSeparator(text)) {
        normal.AppendSeparatorIfNeeded();
        normal.text_ += dot;
    }
    return normal;
}

path::iterator path::begin() const {
    const Element first = FirstElement(text_, FindRoot(text_));
    return {this, first.position, first.shown};
}

path::iterator path::end() const {
    return {this, text_.size(), {}};
}

path::iterator::iterator(const path* whole, std::size_t position, std::wstring_view element)
    : path_(whole), position_(position), element_(element) {}

path::iterator& path::iterator::operator++() {
    const Text text = path_->text_;
    const Element next = NextElement(text, FindRoot(text), {position_, element_.text_});
    position_ = next.position;
    element_.text_.assign(next.shown);
    return *this;
}

path::iterator path::iterator::operator++(int) {
    iterator before = *this;
    ++*this;
    return before;
}

path::iterator& path::iterator::operator--() {
    const Text text = path_->text_;
    const Element previous = PreviousElement(text, FindRoot(text), position_);
    position_ = previous.position;
    element_.text_.assign(previous.shown);
    return *this;
}

path::iterator path::iterator::operator--(int) {
    iterator before = *this;
    --*this;
    return before;
}

std::size_t hash_value(const path& source) noexcept {
    std::size_t seed = 0;
    for (const wchar_t* c = source.c_str(); *c != L'\0'; ++c) {
        boost::hash_combine(seed, *c == L'/' ? L'\\' : *c);
    }
    return seed;
}

}  // namespace hosted::filesystem
