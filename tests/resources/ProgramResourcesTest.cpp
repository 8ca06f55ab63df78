#include <gtest/gtest.h>

#include "tests/resources/ProgramResource.h"
#include "tests/resources/ResourceFile.h"

TEST(ProgramResources, CarryTheStringTableAs136) {
    EXPECT_EQ(ProgramResource(136, "HVSTRINGS_XML"), ResourceFile("hvstrings.xml"));
}

TEST(ProgramResources, CarryTheAgreementAs137) {
    EXPECT_EQ(ProgramResource(137, "RICHTEXTFORMAT"), ResourceFile("agreement.rtf"));
}

TEST(ProgramResources, AreFoundByNumberAndTypeTogether) {
    EXPECT_EQ(ProgramResource(137, "HVSTRINGS_XML"), "");
    EXPECT_EQ(ProgramResource(136, "RICHTEXTFORMAT"), "");
    EXPECT_EQ(ProgramResource(138, "RICHTEXTFORMAT"), "");
}
