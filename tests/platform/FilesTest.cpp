#include <gtest/gtest.h>

#include <functional>
#include <set>
#include <string>
#include <vector>

#include "platform/filesystem.h"
#include "platform/raw_file.h"
#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

namespace errc = boost::system::errc;
using boost::system::error_code;

constexpr const char* Folder = "C:\\ProgramData\\Test";

/// The error that the operation reports; it must say the same whether it is asked for a code or throws.
error_code ErrorOf(const std::function<void(error_code&)>& withCode, const std::function<void()>& throwing) {
    error_code code;
    withCode(code);
    try {
        throwing();
        EXPECT_FALSE(code) << "only the form with a code fails: " << code.message();
    } catch (const fs::filesystem_error& error) {
        EXPECT_EQ(error.code(), code);
    }
    return code;
}

class FilesTest : public testing::Test {
protected:
    FilesTest() { machine.HasFolder(Folder); }

    static std::string In(const std::string& name) { return std::string(Folder) + "\\" + name; }
    static error_code RenameError(const std::string& from, const std::string& to) {
        error_code code;
        fs::rename(In(from), In(to), code);
        return code;
    }
    static error_code CopyError(const std::string& from, const std::string& to) {
        return ErrorOf([&](error_code& code) { EXPECT_FALSE(fs::copy_file(In(from), In(to), code)); },
                       [&] { fs::copy_file(In(from), In(to)); });
    }
    static std::set<std::string> NamesIn(const std::string& folder) {
        std::set<std::string> names;
        for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
            EXPECT_TRUE(names.insert(entry.path().filename().string()).second);
        }
        return names;
    }

    Machine machine;
};

TEST_F(FilesTest, TellsFilesFoldersAndNothingApart) {
    machine.Has(In("file"), "x");
    EXPECT_EQ(fs::status(In("file")).type(), fs::regular_file);
    EXPECT_EQ(fs::status(Folder).type(), fs::directory_file);
    EXPECT_EQ(fs::status(In("none")).type(), fs::file_not_found);
    EXPECT_EQ(fs::symlink_status(In("file")).type(), fs::regular_file);
    EXPECT_TRUE(fs::is_regular_file(In("file")));
    EXPECT_FALSE(fs::is_directory(In("file")));
    EXPECT_FALSE(fs::is_symlink(In("file")));
    EXPECT_TRUE(fs::is_directory(Folder));
    EXPECT_FALSE(fs::exists(In("none")));
}

TEST_F(FilesTest, SaysWhyAnItemIsMissingWhereACodeIsGiven) {
    error_code code;
    EXPECT_FALSE(fs::exists(In("none"), code));
    EXPECT_EQ(code, errc::no_such_file_or_directory);
    EXPECT_TRUE(fs::exists(Folder, code));
    EXPECT_FALSE(code);
}

TEST_F(FilesTest, FindsNothingUnderAnEmptyPathOrBelowAFile) {
    machine.Has(In("file"), "x");
    EXPECT_FALSE(fs::exists(fs::path()));
    EXPECT_FALSE(fs::exists(In("file\\below")));
    EXPECT_FALSE(fs::exists("Q:\\no such drive"));
    EXPECT_FALSE(fs::exists(In("what?")));
}

TEST_F(FilesTest, FindsAPathInEitherKindOfSeparator) {
    machine.Has(In("file"), "x");
    EXPECT_TRUE(fs::exists("C:/ProgramData/Test/file"));
    EXPECT_TRUE(fs::exists("C:\\ProgramData/Test//file"));
    EXPECT_TRUE(fs::exists("C:\\ProgramData\\Test\\..\\Test\\.\\file"));
}

TEST_F(FilesTest, CountsBytesOfFilesOnly) {
    machine.Has(In("file"), "12345");
    EXPECT_EQ(fs::file_size(In("file")), 5u);
    EXPECT_TRUE(ErrorOf([](error_code& code) { EXPECT_EQ(fs::file_size(Folder, code), std::uintmax_t(-1)); },
                        [] { static_cast<void>(fs::file_size(Folder)); }));
    EXPECT_EQ(ErrorOf([](error_code& code) { static_cast<void>(fs::file_size(In("none"), code)); },
                      [] { static_cast<void>(fs::file_size(In("none"))); }),
              errc::no_such_file_or_directory);
}

TEST_F(FilesTest, AnErrorNamesItsPaths) {
    try {
        fs::rename(In("none"), In("there"));
        FAIL() << "renamed what is not there";
    } catch (const fs::filesystem_error& error) {
        const std::string text = error.what();
        EXPECT_EQ(text.rfind("boost::filesystem::rename: ", 0), 0u) << text;
        EXPECT_NE(text.find(": \"C:\\ProgramData\\Test\\none\", \"C:\\ProgramData\\Test\\there\""), std::string::npos)
            << text;
        EXPECT_EQ(error.path1(), fs::path(In("none")));
        EXPECT_EQ(error.path2(), fs::path(In("there")));
    }
}

TEST_F(FilesTest, RenamesAFile) {
    machine.Has(In("old"), "content");
    EXPECT_FALSE(RenameError("old", "new"));
    EXPECT_FALSE(machine.Exists(In("old")));
    EXPECT_EQ(machine.Content(In("new")), "content");
}

TEST_F(FilesTest, RenamesAFolderWithWhatItHolds) {
    machine.Has(In("old\\below\\file"), "content");
    EXPECT_FALSE(RenameError("old", "new"));
    EXPECT_FALSE(machine.Exists(In("old")));
    EXPECT_EQ(machine.Content(In("new\\below\\file")), "content");
}

TEST_F(FilesTest, ARenameReplacesAFile) {
    machine.Has(In("old"), "content");
    machine.Has(In("new"), "replaced");
    EXPECT_FALSE(RenameError("old", "new"));
    EXPECT_EQ(machine.Content(In("new")), "content");
}

TEST_F(FilesTest, ARenameNeverReplacesAFolder) {
    machine.Has(In("file"), "content");
    machine.HasFolder(In("folder"));
    machine.HasFolder(In("taken"));
    EXPECT_EQ(RenameError("file", "taken"), errc::permission_denied);
    EXPECT_EQ(RenameError("folder", "taken"), errc::permission_denied);
    EXPECT_TRUE(machine.Exists(In("folder")));
    EXPECT_EQ(machine.Content(In("file")), "content");
}

TEST_F(FilesTest, ARenameOfAFolderReplacesAFile) {
    machine.Has(In("folder\\below"), "content");
    machine.Has(In("file"), "replaced");
    EXPECT_FALSE(RenameError("folder", "file"));
    EXPECT_EQ(machine.Content(In("file\\below")), "content");
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{"file"}));
}

TEST_F(FilesTest, ARenameToItselfChangesNothing) {
    machine.Has(In("file"), "content");
    EXPECT_FALSE(RenameError("file", "file"));
    EXPECT_EQ(machine.Content(In("file")), "content");
}

TEST_F(FilesTest, ARenameNeedsItsSourceAndItsFolder) {
    machine.Has(In("file"), "content");
    EXPECT_EQ(RenameError("none", "new"), errc::no_such_file_or_directory);
    EXPECT_EQ(RenameError("file", "none\\new"), errc::no_such_file_or_directory);
    EXPECT_EQ(machine.Content(In("file")), "content");
}

TEST_F(FilesTest, CopiesContentsOfAnySize) {
    const std::size_t sizes[] = {0, 1, 65535, 65536, 65537, 1000003};
    int ran = 0;
    for (const std::size_t size : sizes) {
        std::string content(size, '\0');
        for (std::size_t i = 0; i < size; ++i) {
            content[i] = static_cast<char>(i * 31 + i / 256);
        }
        const std::string name = std::to_string(size);
        machine.Has(In(name), content);
        EXPECT_TRUE(fs::copy_file(In(name), In(name + ".copy")));
        EXPECT_TRUE(machine.Content(In(name + ".copy")) == content) << size;
        ++ran;
    }
    EXPECT_EQ(ran, 6);
}

TEST_F(FilesTest, ACopyNeverReplaces) {
    machine.Has(In("old"), "content");
    machine.Has(In("new"), "kept");
    machine.HasFolder(In("folder"));
    EXPECT_EQ(CopyError("old", "new"), errc::file_exists);
    EXPECT_EQ(machine.Content(In("new")), "kept");
    EXPECT_TRUE(CopyError("old", "folder"));
}

TEST_F(FilesTest, ACopyNeedsAFileAndAFolderToPutItIn) {
    machine.Has(In("file"), "content");
    machine.HasFolder(In("folder"));
    EXPECT_EQ(CopyError("none", "new"), errc::no_such_file_or_directory);
    EXPECT_EQ(CopyError("file", "none\\new"), errc::no_such_file_or_directory);
    EXPECT_EQ(CopyError("folder", "new"), errc::permission_denied);
    EXPECT_FALSE(machine.Exists(In("new")));
}

TEST_F(FilesTest, RefusesNamesThatWindowsRefuses) {
    machine.Has(In("file"), "content");
    int ran = 0;
    for (const char* name : {"a?b", "a*b", "a<b", "a>b", "a|b", "a\"b"}) {
        error_code code;
        EXPECT_FALSE(fs::create_directory(In(name), code)) << name;
        EXPECT_TRUE(code) << name;
        EXPECT_TRUE(CopyError("file", name)) << name;
        EXPECT_TRUE(RenameError("file", name)) << name;
        ++ran;
    }
    EXPECT_EQ(ran, 6);
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{"file"}));
}

TEST_F(FilesTest, MakesAFolderOnce) {
    EXPECT_TRUE(fs::create_directory(In("folder")));
    EXPECT_FALSE(fs::create_directory(In("folder")));
    EXPECT_TRUE(fs::is_directory(In("folder")));
}

TEST_F(FilesTest, MakesNoFolderWhereAFileIsOrAParentIsMissing) {
    machine.Has(In("file"), "content");
    EXPECT_EQ(ErrorOf([](error_code& code) { EXPECT_FALSE(fs::create_directory(In("file"), code)); },
                      [] { fs::create_directory(In("file")); }),
              errc::file_exists);
    EXPECT_EQ(ErrorOf([](error_code& code) { EXPECT_FALSE(fs::create_directory(In("none\\new"), code)); },
                      [] { fs::create_directory(In("none\\new")); }),
              errc::no_such_file_or_directory);
}

TEST_F(FilesTest, MakesFoldersWithTheirParents) {
    EXPECT_TRUE(fs::create_directories(In("a\\b\\c")));
    EXPECT_TRUE(fs::is_directory(In("a\\b\\c")));
    EXPECT_FALSE(fs::create_directories(In("a\\b\\c")));
    EXPECT_FALSE(fs::create_directories("C:\\"));
}

TEST_F(FilesTest, MakesNoFoldersBelowAFileOrFromNothing) {
    machine.Has(In("file"), "content");
    EXPECT_TRUE(ErrorOf([](error_code& code) { EXPECT_FALSE(fs::create_directories(In("file\\a\\b"), code)); },
                        [] { fs::create_directories(In("file\\a\\b")); }));
    EXPECT_EQ(ErrorOf([](error_code& code) { EXPECT_FALSE(fs::create_directories(fs::path(), code)); },
                      [] { fs::create_directories(fs::path()); }),
              errc::invalid_argument);
}

TEST_F(FilesTest, RemovesFilesAndEmptyFolders) {
    machine.Has(In("file"), "content");
    machine.HasFolder(In("folder"));
    EXPECT_TRUE(fs::remove(In("file")));
    EXPECT_TRUE(fs::remove(In("folder")));
    EXPECT_TRUE(NamesIn(Folder).empty());
}

TEST_F(FilesTest, RemovingNothingIsNoError) {
    error_code code;
    EXPECT_FALSE(fs::remove(In("none"), code));
    EXPECT_FALSE(code);
    EXPECT_EQ(fs::remove_all(In("none"), code), 0u);
    EXPECT_FALSE(code);
    EXPECT_FALSE(fs::remove(In("none\\none")));
}

TEST_F(FilesTest, RemovesNoFolderThatHoldsSomething) {
    machine.Has(In("folder\\file"), "content");
    EXPECT_EQ(ErrorOf([](error_code& code) { EXPECT_FALSE(fs::remove(In("folder"), code)); },
                      [] { fs::remove(In("folder")); }),
              errc::directory_not_empty);
    EXPECT_TRUE(machine.Exists(In("folder\\file")));
}

TEST_F(FilesTest, RemovesReadOnlyFilesToo) {
    machine.HasReadOnly(In("file"), "content");
    EXPECT_TRUE(fs::remove(In("file")));
    EXPECT_FALSE(machine.Exists(In("file")));
}

TEST_F(FilesTest, RemovesATreeAndCountsIt) {
    machine.Has(In("tree\\a\\one"), "1");
    machine.Has(In("tree\\a\\two"), "2");
    machine.HasReadOnly(In("tree\\b\\three"), "3");
    EXPECT_EQ(fs::remove_all(In("tree")), 6u);
    EXPECT_FALSE(machine.Exists(In("tree")));
}

TEST_F(FilesTest, ListsAFolderWithoutItselfAndItsParent) {
    machine.Has(In("file"), "x");
    machine.Has(In("folder\\below"), "x");
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{"file", "folder"}));
    EXPECT_TRUE(NamesIn(In("folder\\..\\folder")).contains("below"));
}

TEST_F(FilesTest, ListsNamesInTheOrderOfTheirUpperCase) {
    const std::vector<std::string> sorted = {"-",   "1", "10", "2",  "A",  "a b", "a-b",      "a.b",     "a1",
                                             "a_b", "b", "Z",  "z1", "_x", "~",   "\xC3\x84", "\xC3\xBC"};
    for (std::size_t at = 0; at < sorted.size(); ++at) {
        machine.Has(In(sorted[(at * 5) % sorted.size()]), "x");
    }
    std::vector<std::string> listed;
    for (const fs::directory_entry& entry : fs::directory_iterator(Folder)) {
        listed.push_back(entry.path().filename().string());
    }
    EXPECT_EQ(listed, sorted);
    std::vector<std::string> walked;
    for (fs::recursive_directory_iterator i(Folder), end; i != end; ++i) {
        walked.push_back(i->path().filename().string());
    }
    EXPECT_EQ(walked, sorted);
}

TEST_F(FilesTest, AFileWithASeparatorBehindItsNameIsNotThere) {
    machine.Has(In("file"), "x");
    machine.HasFolder(In("folder"));
    int ran = 0;
    for (const char* separator : {"\\", "/", "\\\\"}) {
        EXPECT_FALSE(fs::exists(In("file") + separator)) << separator;
        EXPECT_FALSE(fs::is_regular_file(In("file") + separator)) << separator;
        EXPECT_TRUE(fs::is_directory(In("folder") + separator)) << separator;
        EXPECT_TRUE(CopyError("file", std::string("new") + separator)) << separator;
        ++ran;
    }
    EXPECT_EQ(ran, 3);
    EXPECT_TRUE(fs::create_directory(In("new\\")));
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{"file", "folder", "new"}));
}

TEST_F(FilesTest, AnOpenFileIsNeitherRemovedNorRenamedNorReplaced) {
    machine.Has(In("open"), "open");
    machine.Has(In("other"), "other");
    FILE* stream = nullptr;
    ASSERT_EQ(fopen_s(&stream, In("open").c_str(), "rb"), 0);
    error_code code;
    EXPECT_FALSE(fs::remove(In("open"), code));
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_EQ(RenameError("open", "new"), errc::permission_denied);
    EXPECT_TRUE(RenameError("other", "open"));
    EXPECT_TRUE(fs::copy_file(In("open"), In("copy")));
    std::fclose(stream);
    EXPECT_EQ(machine.Content(In("open")), "open");
    EXPECT_FALSE(RenameError("other", "open"));
    EXPECT_TRUE(fs::remove(In("open")));
}

TEST_F(FilesTest, AnOpenArchiveIsNotRemoved) {
    machine.Has(In("open"), "open");
    auto archive = platform::OpenRawFile(fs::path(In("open")).c_str(), platform::RawFile::Mode::Read);
    ASSERT_NE(archive, nullptr);
    error_code code;
    EXPECT_FALSE(fs::remove(In("open"), code));
    archive.reset();
    EXPECT_TRUE(fs::remove(In("open"), code));
}

TEST_F(FilesTest, NoFileIsMadeUnderTheNameOfADevice) {
    machine.Has(In("file"), "content");
    int ran = 0;
    for (const char* name : {"con", "CON.txt", "Prn", "aux.tar.gz"}) {
        EXPECT_TRUE(RenameError("file", name)) << name;
        ++ran;
    }
    EXPECT_EQ(ran, 4);
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{"file"}));
}

TEST_F(FilesTest, JoinsListedNamesToThePathAsItWasGiven) {
    machine.Has(In("file"), "x");
    EXPECT_EQ(fs::directory_iterator("C:/ProgramData/Test")->path().native(), L"C:/ProgramData/Test\\file");
    EXPECT_EQ(fs::directory_iterator("C:\\ProgramData\\Test\\")->path().native(), L"C:\\ProgramData\\Test\\file");
}

TEST_F(FilesTest, AnEntryKnowsWhatItIs) {
    machine.Has(In("file"), "x");
    machine.HasFolder(In("folder"));
    int files = 0;
    int folders = 0;
    for (const fs::directory_entry& entry : fs::directory_iterator(Folder)) {
        files += fs::is_regular_file(entry) && fs::is_regular_file(entry.status()) ? 1 : 0;
        folders += fs::is_directory(entry) && fs::is_directory(entry.symlink_status()) ? 1 : 0;
        EXPECT_FALSE(fs::is_symlink(entry));
    }
    EXPECT_EQ(files, 1);
    EXPECT_EQ(folders, 1);
}

TEST_F(FilesTest, NamesOutsideAsciiComeBackAsTheyWereWritten) {
    const std::string name = "\xC3\x9C\xE6\x97\xA5\xF0\x9D\x84\x9E.txt";
    machine.Has(In("plain"), "x");
    fs::rename(In("plain"), In(name));
    EXPECT_EQ(NamesIn(Folder), (std::set<std::string>{name}));
    EXPECT_TRUE(fs::exists(In(name)));
}

TEST_F(FilesTest, AnEmptyFolderIsAtItsEndAtOnce) {
    EXPECT_EQ(fs::directory_iterator(Folder), fs::directory_iterator());
    EXPECT_EQ(fs::recursive_directory_iterator(Folder), fs::recursive_directory_iterator());
}

TEST_F(FilesTest, ListsNeitherAMissingFolderNorAFile) {
    machine.Has(In("file"), "x");
    EXPECT_EQ(
        ErrorOf([](error_code& code) { EXPECT_EQ(fs::directory_iterator(In("none"), code), fs::directory_iterator()); },
                [] { fs::directory_iterator{In("none")}; }),
        errc::no_such_file_or_directory);
    EXPECT_TRUE(ErrorOf([](error_code& code) { fs::directory_iterator(In("file"), code); },
                        [] { fs::directory_iterator{In("file")}; }));
    EXPECT_TRUE(ErrorOf([](error_code& code) { fs::recursive_directory_iterator(In("none"), code); },
                        [] { fs::recursive_directory_iterator{In("none")}; }));
}

TEST_F(FilesTest, WalksATreeFoldersBeforeWhatTheyHold) {
    machine.Has(In("a\\b\\deep"), "x");
    machine.Has(In("a\\shallow"), "x");
    machine.HasFolder(In("empty"));
    std::set<fs::path> seen = {Folder};
    for (fs::recursive_directory_iterator i(Folder), end; i != end; ++i) {
        EXPECT_TRUE(seen.contains(i->path().parent_path())) << i->path();
        EXPECT_TRUE(seen.insert(i->path()).second) << i->path();
    }
    EXPECT_EQ(seen, (std::set<fs::path>{Folder, In("a"), In("a\\b"), In("a\\b\\deep"), In("a\\shallow"), In("empty")}));
}

TEST_F(FilesTest, TellsHowDeepAWalkIsAndPassesOverAFolder) {
    machine.Has(In("a\\b\\deep"), "x");
    int entries = 0;
    for (fs::recursive_directory_iterator i(Folder), end; i != end; ++i, ++entries) {
        EXPECT_EQ(i.depth(), entries);
        if (i->path().filename() == "b") {
            i.disable_recursion_pending();
        }
    }
    EXPECT_EQ(entries, 2);
}

TEST_F(FilesTest, MakesPathsAbsoluteAgainstTheCurrentFolder) {
    machine.Has(In("file"), "x");
    const fs::path before = fs::current_path();
    fs::current_path(Folder);
    EXPECT_EQ(fs::current_path(), fs::path(Folder));
    EXPECT_TRUE(fs::exists("file"));
    EXPECT_EQ(fs::absolute("file").native(), fs::path(In("file")).native());
    EXPECT_EQ(fs::absolute("\\x").native(), L"C:\\x");
    EXPECT_EQ(fs::absolute("D:\\x").native(), L"D:\\x");
    EXPECT_EQ(fs::absolute("").native(), fs::path(Folder).native());
    EXPECT_EQ(fs::absolute("x", "D:\\y").native(), L"D:\\y\\x");
    fs::current_path(before);
}

TEST_F(FilesTest, GoesToNoFolderThatIsMissing) {
    EXPECT_EQ(
        ErrorOf([](error_code& code) { fs::current_path(In("none"), code); }, [] { fs::current_path(In("none")); }),
        errc::no_such_file_or_directory);
}

}  // namespace
