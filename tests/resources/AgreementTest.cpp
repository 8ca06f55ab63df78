#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "platform/win32.h"
#include "tests/resources/ResourceFile.h"
#include "tests/support/Machine.h"

namespace {

/// How deep the groups are nested before each character, followed to the end of the text. A negative depth stays.
int DepthAt(const std::string& text, std::size_t end) {
    int depth = 0;
    for (std::size_t i = 0; i < end && depth >= 0; ++i) {
        if (text[i] == '\\') {
            ++i;
        } else if (text[i] == '{') {
            ++depth;
        } else if (text[i] == '}') {
            --depth;
        }
    }
    return depth;
}

}  // namespace

TEST(Agreement, IsOneGroupOfRichText) {
    const std::string document = ResourceFile("agreement.rtf");
    EXPECT_EQ(document.rfind("{\\rtf1\\ansi", 0), 0U);
    EXPECT_EQ(DepthAt(document, document.size()), 0);
    EXPECT_EQ(DepthAt(document, document.size() - 1), 1) << "the last brace closes the first";
}

TEST(Agreement, IsPlainAsciiWithoutLineEnds) {
    std::size_t foreign = 0;
    for (const char c : ResourceFile("agreement.rtf")) {
        foreign += c < ' ' || c > '~' ? 1U : 0U;
    }
    EXPECT_EQ(foreign, 0U);
}

TEST(Agreement, KeepsEveryByteWhenSavedInTextMode) {
    const Machine machine;
    const std::string document = ResourceFile("agreement.rtf");
    const std::string path = machine.TempFolder() + "\\license.rtf";
    FILE* file = nullptr;
    ASSERT_EQ(fopen_s(&file, path.c_str(), "w"), 0);
    EXPECT_EQ(fwrite(document.data(), 1, document.size(), file), document.size());
    EXPECT_EQ(fclose(file), 0);
    EXPECT_EQ(machine.Content(path), document);
}

TEST(Agreement, NumbersItsSectionsFromOneToEleven) {
    const std::string document = ResourceFile("agreement.rtf");
    const std::string heading = "\\b\\fs22 ";
    int sections = 0;
    for (auto at = document.find(heading); at != std::string::npos; at = document.find(heading, at + 1)) {
        const std::string number = std::to_string(++sections) + ". ";
        EXPECT_EQ(document.compare(at + heading.size(), number.size(), number), 0) << "section " << number;
    }
    EXPECT_EQ(sections, 11);
}

TEST(Agreement, SetsTheLeadInsOfItsClausesInBold) {
    const std::string document = ResourceFile("agreement.rtf");
    int leadIns = 0;
    for (const char* leadIn : {"License.", "Computers.", "Rendering.", "Copies.", "Your work stays yours."}) {
        const std::string bold = "\\tab \\b " + std::string(leadIn) + "\\b0  ";
        EXPECT_NE(document.find(bold), std::string::npos) << leadIn;
        ++leadIns;
    }
    EXPECT_EQ(leadIns, 5);
    EXPECT_EQ(document.find('*'), std::string::npos) << "a mark of the text's own form is left";
}

TEST(Agreement, SetsItsLastLineApart) {
    const std::string document = ResourceFile("agreement.rtf");
    const std::size_t last = document.rfind("\\pard");
    EXPECT_EQ(document.substr(last), "\\pard\\sb240\\sa120 \\'a9 2026 Halvorn LLC. All rights reserved.\\par}");
}

// The wizard's process is gone before the way back is finished.
TEST(Agreement, PromisesNothingForACancelAndSaysWhereReplacedFilesLie) {
    const std::string document = ResourceFile("agreement.rtf");
    const std::size_t clause = document.find("3.2\\tab ");
    ASSERT_NE(clause, std::string::npos);
    const std::string words = document.substr(clause, document.find("\\par", clause) - clause);
    EXPECT_EQ(words.find("fails or is cancelled"), std::string::npos) << words;
    EXPECT_NE(words.find("may put back nothing"), std::string::npos) << words;
    EXPECT_NE(words.find("\\ldblquote hvdeploystash\\rdblquote , in the temporary folder"), std::string::npos) << words;
}
