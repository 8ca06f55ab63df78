// The hosted target's path class against the library's own on Windows, on thousands of paths.
//
// This exists for the windows target alone: only there the library follows Windows path rules. The hosted class is
// nothing but text, so its very source is compiled into this program and both answer the same questions side by side.

#include <gtest/gtest.h>

#include <boost/functional/hash.hpp>
#include <functional>
#include <iomanip>
#include <random>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "platform/filesystem.h"
#include "platform/hosted/path.h"

namespace {

using LibraryPath = fs::path;
using OwnPath = hosted::filesystem::path;
using Answers = std::vector<std::pair<std::string, std::wstring>>;

constexpr int ReportedDifferences = 20;
/// No path here has as many elements: a walk that does not end is cut off, and differs.
constexpr int LongestWalk = 200;

/// What paths are made of: roots, separators, dots, names and what looks like any of these.
const std::vector<std::wstring> Pieces = {
    L"C:", L"c:x",   L"\\",  L"/",  L"\\\\",  L"//",     L"///",        L".",      L"..",         L"...",
    L"a",  L"B.txt", L".rc", L"x.", L"a.b.c", L"server", L"?",          L"??",     L"NUL",        L"COM1:",
    L":",  L"$1",    L" ",   L"&",  L"\"",    L"*",      L"\u00E9.txt", L"\u65E5", L"\U0001D11E", L"\xD800",
};

const std::vector<std::wstring> HandPicked = {
    L"",
    L"C:",
    L"C:\\",
    L"C:/",
    L"C:\\\\",
    L"C:x",
    L"C:..",
    L"C:\\..",
    L"C:\\a\\..\\..",
    L"C:\\Program Files\\Halvorn\\Glow\\Glow.aex",
    L"C:/Program Files/Halvorn\\Glow/",
    L"C:\\ProgramData\\Halvorn\\.hvdeploy\\history",
    L"\\\\server\\share",
    L"\\\\server\\share\\a\\b.txt",
    L"//server/share/",
    L"\\\\server",
    L"\\\\server\\",
    L"\\\\server.local",
    L"\\\\",
    L"//",
    L"\\/",
    L"\\\\\\",
    L"\\\\\\server\\share",
    L"\\\\?\\C:\\a",
    L"\\\\?\\C:a",
    L"\\\\?\\C:",
    L"\\\\?\\",
    L"\\\\?\\\\a",
    L"\\\\?",
    L"\\\\?\\UNC\\server\\share\\a",
    L"//?/C:/a",
    L"\\\\.\\COM56",
    L"\\\\.\\PhysicalDrive0\\a",
    L"\\\\.",
    L"\\\\..\\a",
    L"\\??\\C:\\a",
    L"/\?\?/a",
    L"\\??",
    L"NUL",
    L"NUL:",
    L"COM1:\\a",
    L"CONIN$:",
    L"a",
    L"a\\",
    L"a\\\\",
    L"a/b",
    L"a\\/b",
    L"a\\b\\",
    L"a//b///c",
    L"\\a",
    L"/a/b",
    L"/",
    L"\\",
    L".",
    L"..",
    L".\\",
    L"..\\",
    L"...",
    L"./a/./b/.",
    L"a/../b",
    L"a/..",
    L"a\\..\\",
    L"../../a",
    L"..\\..",
    L".profile",
    L"a.",
    L"a..b",
    L"a.b.c",
    L"a\\.b",
    L"a\\b.",
    L"a:b",
    L"a:b:c\\d",
    L"a/b:/c/..",
    L"1:\\a",
    L"file name with blanks .txt",
    L"quote\"and&and\\x",
    L"\u00DCberschrift\\\u65E5\u672C.txt",
    L"\U0001D11E\\\U0001F600.x",
    L"\xDC00\xD800",
};

std::wstring Widen(bool value) {
    return value ? L"true" : L"false";
}
std::wstring Widen(const std::string& narrow) {
    return {narrow.begin(), narrow.end()};
}

template <class Path>
std::wstring Forwards(const Path& path) {
    std::wstring walked;
    int steps = 0;
    for (auto i = path.begin(); i != path.end() && steps < LongestWalk; ++i, ++steps) {
        walked += L"<" + i->native() + L">";
    }
    return walked;
}

template <class Path>
std::wstring Backwards(const Path& path) {
    std::wstring walked;
    int steps = 0;
    for (auto i = path.end(); i != path.begin() && steps < LongestWalk; ++steps) {
        --i;
        walked += L"<" + i->native() + L">";
    }
    return walked;
}

template <class Path>
std::string Streamed(const Path& path) {
    std::ostringstream stream;
    stream << path << '|' << std::setw(30) << std::setfill('.') << std::left << path << '|' << std::setw(30)
           << std::right << path;
    return stream.str();
}

template <class Path>
std::wstring WidelyStreamed(const Path& path) {
    std::wostringstream stream;
    stream << path;
    return stream.str();
}

template <class Path>
Path Changed(Path path, const std::function<void(Path&)>& change) {
    change(path);
    return path;
}

template <class Path>
Answers Observe(const std::wstring& text) {
    const Path p(text);
    return {
        {"native", p.native()},
        {"c_str", p.c_str()},
        {"size", std::to_wstring(p.size())},
        {"empty", Widen(p.empty())},
        {"string", Widen(p.string())},
        {"string<string>", Widen(p.template string<std::string>())},
        {"string<wstring>", p.template string<std::wstring>()},
        {"wstring", p.wstring()},
        {"generic_path", p.generic_path().native()},
        {"generic_string", Widen(p.generic_string())},
        {"generic_wstring", p.generic_wstring()},
        {"root_name", p.root_name().native()},
        {"root_directory", p.root_directory().native()},
        {"root_path", p.root_path().native()},
        {"relative_path", p.relative_path().native()},
        {"parent_path", p.parent_path().native()},
        {"filename", p.filename().native()},
        {"stem", p.stem().native()},
        {"extension", p.extension().native()},
        {"has_root_name", Widen(p.has_root_name())},
        {"has_root_directory", Widen(p.has_root_directory())},
        {"has_root_path", Widen(p.has_root_path())},
        {"has_relative_path", Widen(p.has_relative_path())},
        {"has_parent_path", Widen(p.has_parent_path())},
        {"has_filename", Widen(p.has_filename())},
        {"has_stem", Widen(p.has_stem())},
        {"has_extension", Widen(p.has_extension())},
        {"is_absolute", Widen(p.is_absolute())},
        {"is_relative", Widen(p.is_relative())},
        {"lexically_normal", p.lexically_normal().native()},
        {"forwards", Forwards(p)},
        {"backwards", Backwards(p)},
        {"hash_value", std::to_wstring(hash_value(p))},
        {"streamed", Widen(Streamed(p))},
        {"widely streamed", WidelyStreamed(p)},
        {"make_preferred", Changed<Path>(p, [](Path& x) { x.make_preferred(); }).native()},
        {"remove_filename", Changed<Path>(p, [](Path& x) { x.remove_filename(); }).native()},
        {"remove_trailing_separator", Changed<Path>(p, [](Path& x) { x.remove_trailing_separator(); }).native()},
        {"replace_extension", Changed<Path>(p, [](Path& x) { x.replace_extension(); }).native()},
        {"replace_extension(txt)", Changed<Path>(p, [](Path& x) { x.replace_extension("txt"); }).native()},
        {"replace_extension(itself)", Changed<Path>(p, [](Path& x) { x.replace_extension(x); }).native()},
        {"append itself", Changed<Path>(p, [](Path& x) { x /= x; }).native()},
        {"append narrow", (p / "x\xC3\xA9").native()},
        {"append text", (p / std::wstring(L"/x") / std::string("y") / L"z").native()},
        {"concat itself", Changed<Path>(p, [](Path& x) { x += x; }).native()},
        {"concat", Changed<Path>(p, [](Path& x) { ((x += 'c') += L'\\') += ".x"; }).native()},
        {"from narrow", Path(p.string()).native()},
        {"from range", Path(text.begin(), text.end()).native()},
    };
}

template <class Path>
Answers ObservePair(const std::wstring& leftText, const std::wstring& rightText) {
    const Path left(leftText);
    const Path right(rightText);
    return {
        {"append", (left / right).native()},
        {"concat", Changed<Path>(left, [&](Path& x) { x += right; }).native()},
        {"compare", std::to_wstring(left.compare(right))},
        {"==", Widen(left == right)},
        {"!=", Widen(left != right)},
        {"<", Widen(left < right)},
        {"<=", Widen(left <= right)},
        {">", Widen(left > right)},
        {">=", Widen(left >= right)},
        {"replace_extension", Changed<Path>(left, [&](Path& x) { x.replace_extension(right); }).native()},
    };
}

/// Compares answers, and reports only so many differences that they can still be read.
class Comparison {
public:
    void Check(const std::string& asked, const Answers& library, const Answers& own) {
        ++cases_;
        ASSERT_EQ(library.size(), own.size());
        for (std::size_t i = 0; i < library.size(); ++i) {
            ++answers_;
            if (library[i] != own[i] && ++differences_ <= ReportedDifferences) {
                ADD_FAILURE() << asked << ": " << library[i].first << " is " << fs::path(library[i].second)
                              << " with the library, but " << fs::path(own[i].second);
            }
        }
    }
    [[nodiscard]] int Cases() const { return cases_; }
    [[nodiscard]] int Answered() const { return answers_; }
    [[nodiscard]] int Differences() const { return differences_; }

private:
    int cases_ = 0;
    int answers_ = 0;
    int differences_ = 0;
};

std::string Quoted(const std::wstring& text) {
    return "\"" + fs::path(text).string() + "\"";
}

void CheckPath(Comparison& comparison, const std::wstring& text) {
    comparison.Check(Quoted(text), Observe<LibraryPath>(text), Observe<OwnPath>(text));
}

void CheckPair(Comparison& comparison, const std::wstring& left, const std::wstring& right) {
    comparison.Check(Quoted(left) + " and " + Quoted(right), ObservePair<LibraryPath>(left, right),
                     ObservePair<OwnPath>(left, right));
}

/// Everything that up to `length` pieces in a row can make.
std::vector<std::wstring> AllSequences(int length) {
    std::vector<std::wstring> all = {L""};
    std::size_t begin = 0;
    for (int i = 0; i < length; ++i) {
        const std::size_t end = all.size();
        for (; begin < end; ++begin) {
            for (const std::wstring& piece : Pieces) {
                all.push_back(all[begin] + piece);
            }
        }
    }
    return all;
}

class RandomPaths {
public:
    std::wstring Next() {
        std::wstring text;
        const std::size_t pieces = 1 + Below(9);
        for (std::size_t i = 0; i < pieces; ++i) {
            text += Pieces[Below(Pieces.size())];
            text += Below(2) == 0 ? L"\\" : L"";
        }
        return text;
    }

private:
    // The generator alone is the same everywhere; the library's distributions need not be.
    std::size_t Below(std::size_t bound) { return generator_() % bound; }

    std::mt19937 generator_{20240117};
};

TEST(PathDifferential, EveryAnswerAboutOnePathIsTheLibrarys) {
    Comparison comparison;
    for (const std::wstring& text : HandPicked) {
        CheckPath(comparison, text);
    }
    for (const std::wstring& text : AllSequences(3)) {
        CheckPath(comparison, text);
    }
    RandomPaths random;
    for (int i = 0; i < 10000; ++i) {
        CheckPath(comparison, random.Next());
    }
    EXPECT_EQ(comparison.Differences(), 0);
    EXPECT_EQ(comparison.Cases(), 79 + 27931 + 10000);
    EXPECT_EQ(comparison.Answered(), comparison.Cases() * 48);
}

TEST(PathDifferential, EveryAnswerAboutTwoPathsIsTheLibrarys) {
    Comparison comparison;
    for (const std::wstring& left : HandPicked) {
        for (const std::wstring& right : HandPicked) {
            CheckPair(comparison, left, right);
        }
    }
    const std::vector<std::wstring> paths = AllSequences(2);
    for (std::size_t i = 0; i < paths.size(); ++i) {
        for (std::size_t j = i % 23; j < paths.size(); j += 23) {
            CheckPair(comparison, paths[i], paths[j]);
        }
    }
    RandomPaths random;
    for (int i = 0; i < 10000; ++i) {
        const std::wstring left = random.Next();
        CheckPair(comparison, left, random.Next());
    }
    EXPECT_EQ(comparison.Differences(), 0);
    EXPECT_EQ(comparison.Cases(), 79 * 79 + 37691 + 10000);
    EXPECT_EQ(comparison.Answered(), comparison.Cases() * 10);
}

}  // namespace
