#include "package/ValidationTable.h"

#include <gtest/gtest.h>

namespace {

TEST(ValidationTable, OfABuildWithoutReleaseRowsHasNoNames) {
    std::vector<std::string> names{"left over"};
    HV::GetValidationFileNames(names);
    EXPECT_TRUE(names.empty());
}

TEST(ValidationTable, OfABuildWithoutReleaseRowsLeavesTheRecordAlone) {
    HV::ValidationInfo info{"name", "id", "1.0", "digest"};
    HV::GetValidationInfo("com.halvorn.glow.zip", info);
    EXPECT_EQ(info.displayName, "name");
    EXPECT_EQ(info.productId, "id");
    EXPECT_EQ(info.version, "1.0");
    EXPECT_EQ(info.md5, "digest");
}

TEST(ValidationTable, OfABuildWithoutReleaseRowsHasNoSecondDigests) {
    EXPECT_EQ(HV::SecondDigestOf("com.halvorn.glow.zip"), "");
}

}  // namespace
