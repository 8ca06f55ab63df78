#include <gtest/gtest.h>

#include <array>

#include "package/ValidationTable.h"

namespace {

constexpr std::array<HV::ValidationRow, 3> kRows{{
    {"com.halvorn.glow.zip", "Glow", "com.halvorn.glow", "2.0.1", "0123456789abcdef0123456789abcdef"},
    {"com.halvorn.core.zip", "None", "com.halvorn.core", "5.0", "00000000000000000000000000000000"},
    {"com.halvorn.blur.zip", "Blur", "com.halvorn.blur", "1.0", "ffffffffffffffffffffffffffffffff"},
}};

}  // namespace

// What a release links in place of the empty list.
std::span<const HV::ValidationRow> HV::ValidationRows() {
    return kRows;
}

std::span<const HV::ReleaseDigest> HV::ReleaseDigests() {
    static constexpr std::array<HV::ReleaseDigest, 1> kDigests{{{"com.halvorn.glow.zip", "ab12"}}};
    return kDigests;
}

namespace {

TEST(ReleaseRows, NamesComeInTableOrder) {
    std::vector<std::string> names{"left over"};
    HV::GetValidationFileNames(names);
    EXPECT_EQ(names,
              (std::vector<std::string>{"com.halvorn.glow.zip", "com.halvorn.core.zip", "com.halvorn.blur.zip"}));
}

TEST(ReleaseRows, SecondDigestsStandByTheirNames) {
    EXPECT_EQ(HV::SecondDigestOf("com.halvorn.glow.zip"), "ab12");
    for (const char* name : {"com.halvorn.core.zip", "com.halvorn.Glow.zip", "com.halvorn.glow", ""}) {
        EXPECT_EQ(HV::SecondDigestOf(name), "") << name;
    }
}

TEST(ReleaseRows, AKnownNameFillsTheWholeRecord) {
    HV::ValidationInfo info;
    HV::GetValidationInfo("com.halvorn.core.zip", info);
    EXPECT_EQ(info.displayName, "None");
    EXPECT_EQ(info.productId, "com.halvorn.core");
    EXPECT_EQ(info.version, "5.0");
    EXPECT_EQ(info.md5, "00000000000000000000000000000000");
}

TEST(ReleaseRows, NamesAreComparedExactly) {
    for (const std::string name : {"com.halvorn.GLOW.zip", "com.halvorn.glow", "com.halvorn.glow.zip ", ""}) {
        HV::ValidationInfo info;
        HV::GetValidationInfo(name, info);
        EXPECT_EQ(info.md5, "") << name;
    }
}

TEST(ReleaseRows, AnUnknownNameLeavesTheRecordAlone) {
    HV::ValidationInfo info{"name", "product", "version", "digest"};
    HV::GetValidationInfo("com.halvorn.stranger.zip", info);
    EXPECT_EQ(info.displayName, "name");
    EXPECT_EQ(info.productId, "product");
    EXPECT_EQ(info.version, "version");
    EXPECT_EQ(info.md5, "digest");
}

}  // namespace
