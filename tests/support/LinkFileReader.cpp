#include "tests/support/LinkFileReader.h"

#include <stdexcept>

#include "platform/utf8.h"

namespace {

[[noreturn]] void Refuse(const std::string& what) {
    throw std::runtime_error("no link file: " + what);
}

/// A piece of the file. Whatever is asked of it has to lie within it.
class Piece {
public:
    explicit Piece(std::string bytes) : bytes_(std::move(bytes)) {}

    [[nodiscard]] std::size_t Size() const { return bytes_.size(); }

    [[nodiscard]] std::uint32_t Number(std::size_t at, std::size_t bytes) const {
        const std::string text = Bytes(at, bytes);
        std::uint32_t number = 0;
        for (std::size_t i = bytes; i > 0; --i) {
            number = number << 8 | static_cast<unsigned char>(text[i - 1]);
        }
        return number;
    }
    [[nodiscard]] std::uint32_t U16(std::size_t at) const { return Number(at, 2); }
    [[nodiscard]] std::uint32_t U32(std::size_t at) const { return Number(at, 4); }

    [[nodiscard]] std::string Bytes(std::size_t at, std::size_t count) const {
        if (at > bytes_.size() || count > bytes_.size() - at) {
            Refuse("it ends at " + std::to_string(bytes_.size()) + ", before " + std::to_string(at + count));
        }
        return bytes_.substr(at, count);
    }

    [[nodiscard]] Piece Part(std::size_t at, std::size_t count) const { return Piece(Bytes(at, count)); }

    /// The text up to its terminator.
    [[nodiscard]] std::string Text(std::size_t at) const {
        std::string text;
        for (; Number(at, 1) != 0; ++at) {
            text += static_cast<char>(Number(at, 1));
        }
        return text;
    }

    [[nodiscard]] std::string Wide(std::size_t at, std::size_t characters) const {
        std::wstring text;
        for (std::size_t i = 0; i < characters; ++i) {
            AddUnit(text, U16(at + 2 * i));
        }
        return platform::Utf8FromWide(text);
    }

    [[nodiscard]] std::string WideText(std::size_t at) const {
        std::size_t length = 0;
        while (U16(at + 2 * length) != 0) {
            ++length;
        }
        return Wide(at, length);
    }

private:
    // Joins the halves of a surrogate pair where a wide character holds more than one half.
    static void AddUnit(std::wstring& text, std::uint32_t unit) {
        const bool isSecondHalf = unit >= 0xDC00 && unit < 0xE000;
        if (sizeof(wchar_t) > 2 && isSecondHalf && !text.empty()) {
            const auto first = static_cast<std::uint32_t>(text.back());
            text.back() = static_cast<wchar_t>(0x10000 + ((first - 0xD800) << 10) + (unit - 0xDC00));
        } else {
            text += static_cast<wchar_t>(unit);
        }
    }

    std::string bytes_;
};

/// Walks over the file from its header on.
class Reader {
public:
    explicit Reader(const std::string& bytes) : file_(bytes) {}

    LinkFileContent Read() {
        ReadHeader();
        if (Has(0x01)) {
            ReadItems();
        }
        if (Has(0x02)) {
            ReadInformation();
        }
        content_.description = Has(0x04) ? CountedText() : "";
        for (const std::uint32_t passedOver : {0x08U, 0x10U, 0x20U}) {
            if (Has(passedOver)) {
                (void)CountedText();
            }
        }
        content_.icon = Has(0x40) ? CountedText() : "";
        PassOverExtraData();
        return content_;
    }

private:
    [[nodiscard]] bool Has(std::uint32_t flag) const { return (flags_ & flag) != 0; }

    Piece Take(std::size_t count) {
        at_ += count;
        return file_.Part(at_ - count, count);
    }

    void ReadHeader() {
        const Piece header = Take(0x4C);
        const std::string linkClass("\x01\x14\x02\0\0\0\0\0\xC0\0\0\0\0\0\0\x46", 16);
        if (header.U32(0) != 0x4C || header.Bytes(4, 16) != linkClass) {
            Refuse("the header is another");
        }
        flags_ = header.U32(0x14);
        content_.attributes = header.U32(0x18);
        content_.size = header.U32(0x34);
        content_.iconIndex = static_cast<std::int32_t>(header.U32(0x38));
        if (!Has(0x80)) {
            Refuse("its texts are narrow");
        }
    }

    void ReadItems() {
        const Piece items = Take(file_.U16(at_) + 2);
        std::size_t at = 2;
        for (std::size_t size = items.U16(at); size != 0; size = items.U16(at)) {
            AddItem(items.Part(at, size));
            at += size;
        }
        if (at + 2 != items.Size()) {
            Refuse("the list of items does not end where it says");
        }
    }

    void AddItem(const Piece& item) {
        const std::uint32_t type = item.Number(2, 1);
        if ((type & 0x70) == 0x20) {
            content_.itemsTarget = item.Text(3);
        } else if ((type & 0x70) == 0x30) {
            const std::string separator = content_.itemsTarget.ends_with('\\') ? "" : "\\";
            content_.itemsTarget += separator + LongName(item);
        }
    }

    // A file's item ends in the offset of the block with its full name.
    static std::string LongName(const Piece& item) {
        const std::size_t blockAt = item.U16(item.Size() - 2);
        const Piece block = item.Part(blockAt, item.U16(blockAt));
        if (block.U16(2) != 3 || block.U32(4) != 0xBEEF0004) {
            Refuse("an item's name is of another version");
        }
        return block.WideText(20);
    }

    void ReadInformation() {
        const Piece information = Take(file_.U32(at_));
        if ((information.U32(8) & 1) == 0) {
            return;
        }
        const Piece volume = information.Part(information.U32(12), information.U32(information.U32(12)));
        if (volume.Size() <= 0x10) {
            Refuse("the volume has no label, not even an empty one");
        }
        const bool isWide = information.U32(4) >= 0x24;
        content_.target = isWide ? information.WideText(information.U32(28)) + information.WideText(information.U32(32))
                                 : information.Text(information.U32(16)) + information.Text(information.U32(24));
    }

    std::string CountedText() {
        const std::size_t characters = Take(2).U16(0);
        return Take(2 * characters).Wide(0, characters);
    }

    // Blocks with their sizes, the last of which is less than 4.
    void PassOverExtraData() {
        while (file_.U32(at_) >= 4) {
            (void)Take(file_.U32(at_));
        }
        (void)Take(4);
        if (at_ != file_.Size()) {
            Refuse("there are bytes after its end");
        }
    }

    Piece file_;
    std::size_t at_ = 0;
    std::uint32_t flags_ = 0;
    LinkFileContent content_;
};

}  // namespace

LinkFileContent ReadLinkFile(const std::string& bytes) {
    return Reader(bytes).Read();
}
