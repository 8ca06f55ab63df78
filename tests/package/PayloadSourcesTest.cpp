#include "package/PayloadSources.h"

#include <gtest/gtest.h>

namespace {

const std::vector<std::string> kDirectories{"plugins/", "plugins/sub/", "back\\slashed\\", "presets/"};
const std::vector<std::string> kFiles{"_hvmanifest.xml",      "plugins/Glow.aex",        "plugins/core.dll",
                                      "plugins/sub/deep.dat", "back\\slashed\\file.txt", "top.txt",
                                      "presets/a/b.ffx"};

bool Has(const std::string& source) {
    return HV::PayloadSources(kDirectories, kFiles).Has(source);
}

TEST(PayloadSources, KnowsAFileByItsName) {
    EXPECT_TRUE(Has("top.txt"));
    EXPECT_TRUE(Has(R"(plugins\Glow.aex)"));
    EXPECT_FALSE(Has(R"(plugins\glow.aex)"));
    EXPECT_FALSE(Has("Glow.aex"));
    EXPECT_FALSE(Has(R"(plugins\Glow.ae)"));
}

TEST(PayloadSources, KnowsADirectoryWithAndWithoutATrailingSlash) {
    EXPECT_TRUE(Has("plugins"));
    EXPECT_TRUE(Has(R"(plugins\)"));
    EXPECT_TRUE(Has("plugins/"));
    EXPECT_TRUE(Has(R"(plugins\sub)"));
    EXPECT_TRUE(HV::PayloadSources({"plain/"}, {}).Has("plain"));
    EXPECT_TRUE(HV::PayloadSources({"plain\\"}, {}).Has(R"(plain\)"));
}

TEST(PayloadSources, TakesBothSeparatorsOfAnEntryForOne) {
    EXPECT_TRUE(Has(R"(back\slashed)"));
    EXPECT_TRUE(Has(R"(back\slashed\file.txt)"));
    EXPECT_TRUE(Has(R"(back\slashed\*)"));
}

TEST(PayloadSources, OnlyOneTrailingSlashIsDropped) {
    EXPECT_FALSE(Has(R"(plugins\\)"));
    EXPECT_FALSE(HV::PayloadSources({"plain//"}, {}).Has("plain"));
}

TEST(PayloadSources, ADirectoryThatIsOnlyImpliedByItsFilesIsNotThere) {
    EXPECT_FALSE(Has(R"(presets\a)"));
}

TEST(PayloadSources, ATrailingStarWantsAFileThatBeginsWithTheRest) {
    EXPECT_TRUE(Has(R"(plugins\*)"));
    EXPECT_TRUE(Has(R"(presets\a\*)"));
    EXPECT_TRUE(Has(R"(plugins\Gl*)"));
    EXPECT_FALSE(Has(R"(nothing\*)"));
    EXPECT_TRUE(Has("*"));
}

TEST(PayloadSources, TheSlashBeforeATrailingStarIsDroppedToo) {
    EXPECT_TRUE(HV::PayloadSources({}, {"plugins-extra/x"}).Has(R"(plugins\*)"));
}

TEST(PayloadSources, AStarInsideWantsAFileThatMatches) {
    EXPECT_TRUE(Has(R"(plugins\*.dll)"));
    EXPECT_TRUE(Has(R"(*\Glow.aex)"));
    EXPECT_FALSE(Has(R"(plugins\*.exe)"));
    EXPECT_TRUE(Has("*.xml"));
}

TEST(PayloadSources, AStarMatchesAcrossFolders) {
    EXPECT_TRUE(Has(R"(plugins\*.dat)"));
}

TEST(PayloadSources, AQuestionMarkCountsOnlyBesideAStar) {
    EXPECT_FALSE(Has("top.tx?"));
    EXPECT_TRUE(Has("*op.tx?"));
    EXPECT_TRUE(Has(R"(plugins\?low.a*x)"));
}

TEST(PayloadSources, WildcardsFindTopLevelDirectories) {
    const HV::PayloadSources sources({"Glow.bundle/"}, {});
    EXPECT_TRUE(sources.Has("*.bundle"));
    EXPECT_TRUE(sources.Has("Glow*"));
    EXPECT_TRUE(sources.Has("G?ow*"));
    EXPECT_FALSE(sources.Has("*.plugin"));
}

TEST(PayloadSources, WildcardsWithASeparatorFindNoDirectory) {
    const HV::PayloadSources sources({"plugins/", "plugins/Glow.bundle/"}, {});
    EXPECT_FALSE(sources.Has(R"(plugins\*.bundle)"));
    EXPECT_FALSE(sources.Has(R"(plugins\Gl*)"));
    EXPECT_TRUE(sources.Has(R"(plugins\Glow.bundle)"));
}

TEST(PayloadSources, ATrailingStarAfterADirectoryIsThatDirectory) {
    EXPECT_TRUE(HV::PayloadSources({"plugins/sub/"}, {}).Has(R"(plugins\sub\*)"));
}

TEST(PayloadSources, TwoStarsOneOfThemTrailingTakeTheFirstLiterallyForFiles) {
    EXPECT_FALSE(Has(R"(pl*\*)"));
    EXPECT_TRUE(HV::PayloadSources({}, {"pl*/x"}).Has(R"(pl*\*)"));
    EXPECT_TRUE(HV::PayloadSources({"plugins/"}, {}).Has("pl*n*"));
}

TEST(PayloadSources, AnEmptySourceIsNotThere) {
    EXPECT_FALSE(Has(""));
}

}  // namespace
