#include <gtest/gtest.h>

#include "platform/program.h"
#include "tests/resources/ResourceFile.h"

TEST(ProgramResources, CarryTheStringTableAs136) {
    EXPECT_EQ(platform::CompiledResource(136, "HVSTRINGS_XML"), ResourceFile("hvstrings.xml"));
}

TEST(ProgramResources, CarryTheAgreementAs137) {
    EXPECT_EQ(platform::CompiledResource(137, "RICHTEXTFORMAT"), ResourceFile("agreement.rtf"));
}

TEST(ProgramResources, AreFoundByNumberAndTypeTogether) {
    EXPECT_EQ(platform::CompiledResource(137, "HVSTRINGS_XML"), "");
    EXPECT_EQ(platform::CompiledResource(136, "RICHTEXTFORMAT"), "");
    EXPECT_EQ(platform::CompiledResource(138, "RICHTEXTFORMAT"), "");
}
