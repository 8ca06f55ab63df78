// The runtime's file calls and the environment, held against those of Windows: what is said here is so on both targets.

#include <gtest/gtest.h>

#include <cerrno>
#include <string>

#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* Folder = R"(C:\ProgramData\Test)";

std::string In(const std::string& name) {
    return std::string(Folder) + '\\' + name;
}

class RuntimeCalls : public testing::Test {
protected:
    RuntimeCalls() { machine.HasFolder(Folder); }

    static FILE* Open(const std::string& path, const char* mode) {
        FILE* stream = nullptr;
        const errno_t error = fopen_s(&stream, path.c_str(), mode);
        EXPECT_EQ(error == 0, stream != nullptr);
        return stream;
    }
    static errno_t ErrorOfOpening(const std::string& path, const char* mode) {
        FILE* stream = nullptr;
        const errno_t error = fopen_s(&stream, path.c_str(), mode);
        if (stream != nullptr) {
            std::fclose(stream);
        }
        return error;
    }
    static void Write(const std::string& path, const char* mode, const std::string& content) {
        FILE* stream = Open(path, mode);
        ASSERT_NE(stream, nullptr) << path;
        EXPECT_EQ(std::fwrite(content.data(), 1, content.size(), stream), content.size());
        EXPECT_EQ(std::fclose(stream), 0);
    }
    static std::string Read(const std::string& path, const char* mode) {
        FILE* stream = Open(path, mode);
        if (stream == nullptr) {
            return "(not there)";
        }
        std::string content;
        for (int c = std::fgetc(stream); c != EOF; c = std::fgetc(stream)) {
            content += static_cast<char>(c);
        }
        std::fclose(stream);
        return content;
    }

    Machine machine;
};

TEST_F(RuntimeCalls, TextModeWritesLineFeedsWithCarriageReturns) {
    Write(In("text"), "w", "one\ntwo\r\nthree\r\n\n");
    EXPECT_EQ(machine.Content(In("text")), "one\r\ntwo\r\r\nthree\r\r\n\r\n");
}

TEST_F(RuntimeCalls, ALoneCarriageReturnStaysBareInText) {
    Write(In("text"), "w", "a\rb\r");
    EXPECT_EQ(machine.Content(In("text")), "a\rb\r");
}

TEST_F(RuntimeCalls, BinaryModeWritesBytesAsTheyAre) {
    const std::string bytes("\n\r\n\0\x1A\xFF", 6);
    Write(In("bytes"), "wb", bytes);
    EXPECT_EQ(machine.Content(In("bytes")), bytes);
}

TEST_F(RuntimeCalls, AppendingGoesOnBehindTheEnd) {
    Write(In("text"), "a", "one\n");
    Write(In("text"), "a", "two\n");
    EXPECT_EQ(machine.Content(In("text")), "one\r\ntwo\r\n");
    Write(In("text"), "ab", "3\n");
    EXPECT_EQ(machine.Content(In("text")), "one\r\ntwo\r\n3\n");
}

TEST_F(RuntimeCalls, WritingReplacesWhatWasThere) {
    machine.Has(In("file"), "much more than before");
    Write(In("file"), "wb", "new");
    EXPECT_EQ(machine.Content(In("file")), "new");
}

TEST_F(RuntimeCalls, TextModeReadsLineEndsAsLineFeeds) {
    machine.Has(In("text"), "one\r\ntwo\nthree\r\r\nfour\r");
    EXPECT_EQ(Read(In("text"), "r"), "one\ntwo\nthree\r\nfour\r");
    EXPECT_EQ(Read(In("text"), "rb"), "one\r\ntwo\nthree\r\r\nfour\r");
}

TEST_F(RuntimeCalls, TextEndsAtControlZ) {
    machine.Has(In("text"),
                "before\x1A"
                "after");
    EXPECT_EQ(Read(In("text"), "r"), "before");
    EXPECT_EQ(Read(In("text"), "rb"),
              "before\x1A"
              "after");
}

TEST_F(RuntimeCalls, LineEndsAcrossBuffersAreFound) {
    std::string written;
    std::string stored;
    for (int line = 0; line < 20000; ++line) {
        written += "x\n";
        stored += "x\r\n";
    }
    Write(In("text"), "w", written);
    EXPECT_EQ(machine.Content(In("text")), stored);
    EXPECT_EQ(Read(In("text"), "r"), written);
}

TEST_F(RuntimeCalls, NamesMayHoldAnyCharacterOfWindows) {
    const std::string name = In("\xC3\xBC\xE2\x82\xAC\xF0\x9F\x8E\xAC & (1).txt");
    Write(name, "wb", "x");
    EXPECT_TRUE(machine.HasFile(name));
    EXPECT_EQ(Read(name, "rb"), "x");
    EXPECT_EQ(_unlink(name.c_str()), 0);
    EXPECT_FALSE(machine.Exists(name));
}

TEST_F(RuntimeCalls, SlashesSeparateToo) {
    Write("C:/ProgramData/Test/file", "wb", "x");
    EXPECT_EQ(machine.Content(In("file")), "x");
}

TEST_F(RuntimeCalls, OpeningWhatIsMissingSaysSo) {
    EXPECT_EQ(ErrorOfOpening(In("missing"), "rb"), ENOENT);
    EXPECT_EQ(ErrorOfOpening(In(R"(missing\file)"), "wb"), ENOENT);
    EXPECT_EQ(ErrorOfOpening("", "wb"), ENOENT);
}

TEST_F(RuntimeCalls, ANameThatWindowsRefusesIsAnInvalidArgument) {
    std::size_t ran = 0;
    for (const char* name : {"a<b", "a?b", "a\"b"}) {
        EXPECT_EQ(ErrorOfOpening(In(name), "rb"), EINVAL) << name;
        EXPECT_EQ(ErrorOfOpening(In(name), "wb"), EINVAL) << name;
        EXPECT_EQ(_mkdir(In(name).c_str()), -1) << name;
        EXPECT_EQ(errno, EINVAL) << name;
        EXPECT_EQ(_unlink(In(name).c_str()), -1) << name;
        EXPECT_EQ(errno, EINVAL) << name;
        EXPECT_FALSE(RemoveDirectoryA(In(name).c_str())) << name;
        EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INVALID_NAME)) << name;
        ++ran;
    }
    EXPECT_EQ(ran, 3u);
}

TEST_F(RuntimeCalls, WhatCannotBeThereIsMissing) {
    EXPECT_EQ(ErrorOfOpening(R"(Q:\x)", "wb"), ENOENT);
    EXPECT_EQ(ErrorOfOpening(R"(\\server.invalid\share\x)", "wb"), ENOENT);
}

TEST_F(RuntimeCalls, ASeparatorBehindAFilesNameIsAnInvalidArgument) {
    machine.Has(In("file"), "x");
    std::size_t ran = 0;
    for (const char* name : {"file\\", "file/"}) {
        EXPECT_EQ(ErrorOfOpening(In(name), "rb"), EINVAL) << name;
        EXPECT_EQ(ErrorOfOpening(In(name), "wb"), EINVAL) << name;
        EXPECT_EQ(_unlink(In(name).c_str()), -1) << name;
        EXPECT_EQ(errno, EINVAL) << name;
        ++ran;
    }
    EXPECT_EQ(ran, 2u);
    EXPECT_EQ(ErrorOfOpening(In("new\\"), "rb"), ENOENT);
    EXPECT_EQ(ErrorOfOpening(In("new\\"), "wb"), EINVAL);
    EXPECT_EQ(machine.Content(In("file")), "x");
    EXPECT_FALSE(machine.Exists(In("new")));
    EXPECT_EQ(_mkdir(In("new\\").c_str()), 0);
}

TEST_F(RuntimeCalls, AnOpenFileIsNotDeleted) {
    std::size_t ran = 0;
    for (const char* mode : {"wb", "rb", "r", "ab", "w"}) {
        FILE* stream = Open(In("file"), mode);
        ASSERT_NE(stream, nullptr) << mode;
        EXPECT_EQ(_unlink(In("file").c_str()), -1) << mode;
        EXPECT_EQ(errno, EACCES) << mode;
        std::fclose(stream);
        EXPECT_TRUE(machine.HasFile(In("file"))) << mode;
        ++ran;
    }
    EXPECT_EQ(ran, 5u);
    EXPECT_EQ(_unlink(In("file").c_str()), 0);
}

TEST_F(RuntimeCalls, AMalformedNameIsTheSameFileForEveryCall) {
    const std::string name = In("a\xFF.txt");
    Write(name, "wb", "x");
    EXPECT_EQ(machine.Files().count(In("a\xEF\xBF\xBD.txt")), 1u);
    EXPECT_EQ(Read(name, "rb"), "x");
    EXPECT_EQ(_unlink(In("a\xEF\xBF\xBD.txt").c_str()), 0);
}

TEST_F(RuntimeCalls, AFileIsNoFolderOnTheWay) {
    machine.Has(In("file"), "x");
    EXPECT_EQ(ErrorOfOpening(In(R"(file\below)"), "wb"), ENOENT);
}

TEST_F(RuntimeCalls, AFolderCannotBeOpened) {
    EXPECT_EQ(ErrorOfOpening(Folder, "rb"), EACCES);
    EXPECT_EQ(ErrorOfOpening(Folder, "wb"), EACCES);
}

TEST_F(RuntimeCalls, AReadOnlyFileCanBeRead) {
    machine.HasReadOnly(In("file"), "kept");
    EXPECT_EQ(Read(In("file"), "rb"), "kept");
}

TEST_F(RuntimeCalls, AReadOnlyFileIsNotDeleted) {
    machine.HasReadOnly(In("file"), "kept");
    EXPECT_NE(_unlink(In("file").c_str()), 0);
    EXPECT_EQ(errno, EACCES);
    EXPECT_EQ(machine.Content(In("file")), "kept");
}

TEST_F(RuntimeCalls, AFolderIsMadeOnce) {
    EXPECT_EQ(_mkdir(In("new").c_str()), 0);
    EXPECT_TRUE(machine.Exists(In("new")));
    EXPECT_EQ(_mkdir(In("new").c_str()), -1);
    EXPECT_EQ(errno, EEXIST);
}

TEST_F(RuntimeCalls, AFolderNeedsItsParent) {
    EXPECT_EQ(_mkdir(In(R"(missing\new)").c_str()), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(RuntimeCalls, AFolderOnADriveThatIsMissingCannotBeMade) {
    EXPECT_EQ(_mkdir(R"(Q:\new)"), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(RuntimeCalls, NamesThatWindowsRefusesCannotBeMade) {
    std::size_t ran = 0;
    for (const char* name : {"a<b", "a>b", "a|b", "a\"b", "a?b", "a*b",
                             "a\x01"
                             "b"}) {
        EXPECT_NE(ErrorOfOpening(In(name), "wb"), 0) << name;
        EXPECT_EQ(_mkdir(In(name).c_str()), -1) << name;
        ++ran;
    }
    EXPECT_EQ(ran, 7u);
    EXPECT_EQ(machine.FilesWithoutFolders().size(), 0u);
}

TEST_F(RuntimeCalls, DotsAndBlanksAtTheEndOfANameFallAway) {
    Write(In("name. . "), "wb", "x");
    EXPECT_EQ(machine.Files().count(In("name")), 1u);
    EXPECT_EQ(_mkdir(In("folder.").c_str()), 0);
    EXPECT_EQ(machine.Files().count(In("folder\\")), 1u);
}

TEST_F(RuntimeCalls, TwoDotsLeaveAFolderThatNeedNotBeThere) {
    Write(In(R"(missing\..\file)"), "wb", "x");
    EXPECT_EQ(machine.Content(In("file")), "x");
}

TEST_F(RuntimeCalls, TwoDotsNeverLeaveTheDrive) {
    Write(R"(C:\..\..\..\ProgramData\Test\file)", "wb", "x");
    EXPECT_EQ(machine.Content(In("file")), "x");
}

TEST_F(RuntimeCalls, DeletingAMissingFileSaysSo) {
    EXPECT_EQ(_unlink(In("missing").c_str()), -1);
    EXPECT_EQ(errno, ENOENT);
}

TEST_F(RuntimeCalls, AFolderIsNotDeletedAsAFile) {
    machine.HasFolder(In("folder"));
    EXPECT_EQ(_unlink(In("folder").c_str()), -1);
    EXPECT_EQ(errno, EACCES);
    EXPECT_TRUE(machine.Exists(In("folder")));
}

TEST_F(RuntimeCalls, AnEmptyFolderIsRemoved) {
    machine.HasFolder(In("folder"));
    EXPECT_TRUE(RemoveDirectoryA(In("folder").c_str()));
    EXPECT_FALSE(machine.Exists(In("folder")));
}

TEST_F(RuntimeCalls, AFolderWithAFileIsNotRemoved) {
    machine.Has(In(R"(folder\file)"), "x");
    EXPECT_FALSE(RemoveDirectoryA(In("folder").c_str()));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_DIR_NOT_EMPTY));
    EXPECT_TRUE(machine.Exists(In(R"(folder\file)")));
}

TEST_F(RuntimeCalls, AFileIsNotRemovedAsAFolder) {
    machine.Has(In("file"), "x");
    EXPECT_FALSE(RemoveDirectoryA(In("file").c_str()));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_DIRECTORY));
}

TEST_F(RuntimeCalls, RemovingAMissingFolderSaysSo) {
    EXPECT_FALSE(RemoveDirectoryA(In("missing").c_str()));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_FILE_NOT_FOUND));
}

TEST_F(RuntimeCalls, BaseFoldersAreFoundInAnyCase) {
    Write(R"(c:\USERS\public\DOCUMENTS\file)", "wb", "x");
    EXPECT_EQ(machine.Files().count(R"(C:\Users\Public\Documents\file)"), 1u);
    EXPECT_TRUE(machine.Exists(R"(C:\Windows\System32)"));
    EXPECT_TRUE(machine.Exists(R"(C:\WINDOWS\system32)"));
}

TEST_F(RuntimeCalls, AFileIsNoTerminal) {
    FILE* stream = Open(In("file"), "wb");
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(_isatty(_fileno(stream)), 0);
    std::fclose(stream);
}

class EnvironmentCalls : public testing::Test {
protected:
    static std::string Get(const char* name) {
        char buffer[1024];
        const DWORD length = GetEnvironmentVariableA(name, buffer, sizeof buffer);
        return length > 0 && length < sizeof buffer ? std::string(buffer, length) : "(none)";
    }
    Machine machine;
};

TEST_F(EnvironmentCalls, HasTheFoldersOfTheMachine) {
    EXPECT_EQ(Get("ProgramData"), R"(C:\ProgramData)");
    EXPECT_EQ(Get("PROGRAMFILES"), R"(C:\Program Files)");
    EXPECT_EQ(Get("ProgramFiles(x86)"), R"(C:\Program Files (x86))");
}

TEST_F(EnvironmentCalls, NamesFoldersThatAreThere) {
    std::size_t ran = 0;
    for (const char* name : {"LOCALAPPDATA", "AppData", "USERPROFILE", "Temp", "Public", "SystemRoot", "ProgramData",
                             "ProgramFiles", "ProgramFiles(x86)"}) {
        EXPECT_TRUE(machine.Exists(Get(name))) << name << " is " << Get(name);
        ++ran;
    }
    EXPECT_EQ(ran, 9u);
}

TEST_F(EnvironmentCalls, TheUsersFoldersLieInTheProfile) {
    const std::string profile = Get("USERPROFILE");
    EXPECT_EQ(Get("AppData"), profile + R"(\AppData\Roaming)");
    EXPECT_EQ(Get("LOCALAPPDATA"), profile + R"(\AppData\Local)");
    EXPECT_EQ(Get("Temp").substr(0, profile.size() + 1), profile + '\\');
}

TEST_F(EnvironmentCalls, FindsNamesInAnyCase) {
    SetEnvironmentVariableA("Hv_Test_Case", "x");
    EXPECT_EQ(Get("HV_TEST_CASE"), "x");
    SetEnvironmentVariableA("HV_TEST_CASE", "y");
    EXPECT_EQ(Get("Hv_Test_Case"), "y");
}

TEST_F(EnvironmentCalls, ASetVariableCoversTheMachinesOwn) {
    SetEnvironmentVariableA("programdata", R"(D:\Elsewhere)");
    EXPECT_EQ(Get("ProgramData"), R"(D:\Elsewhere)");
}

TEST_F(EnvironmentCalls, ARemovedVariableIsGone) {
    SetEnvironmentVariableA("PROGRAMDATA", nullptr);
    char buffer[8];
    EXPECT_EQ(GetEnvironmentVariableA("ProgramData", buffer, sizeof buffer), 0u);
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_ENVVAR_NOT_FOUND));
}

TEST_F(EnvironmentCalls, TheNextMachineHasItsOwnValuesAgain) {
    EXPECT_EQ(Get("ProgramData"), R"(C:\ProgramData)");
    EXPECT_EQ(Get("HV_TEST_CASE"), "(none)");
}

TEST_F(EnvironmentCalls, ASmallBufferIsToldTheSizeNeeded) {
    SetEnvironmentVariableA("HV_TEST", "12345");
    char buffer[6];
    EXPECT_EQ(GetEnvironmentVariableA("HV_TEST", buffer, 5), 6u);
    EXPECT_EQ(GetEnvironmentVariableA("HV_TEST", nullptr, 0), 6u);
    EXPECT_EQ(GetEnvironmentVariableA("HV_TEST", buffer, 6), 5u);
    EXPECT_STREQ(buffer, "12345");
}

}  // namespace
