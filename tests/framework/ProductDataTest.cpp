#include "hvframework/ProductData.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

namespace HVL {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

ProductData Read(const std::string& json) {
    ProductData product;
    EXPECT_TRUE(product.ReadJSON(json)) << json;
    return product;
}

ProductData Product(const std::string& displayName, const std::string& identifier, const std::string& version) {
    ProductData product;
    product.SetValue("display_name", displayName);
    product.SetValue("identifier", identifier);
    product.SetValue("version", version);
    return product;
}

TEST(ProductData, StartsWithItsDefaults) {
    const ProductData product;
    EXPECT_THAT(product.values, IsEmpty());
    EXPECT_EQ(product.installState, -1);
    EXPECT_EQ(product.installedDatetime, "");
    EXPECT_FALSE(product.uninstall);
    EXPECT_EQ(product.upgrade, "");
    EXPECT_THAT(product.installedFilePaths, IsEmpty());
}

TEST(ProductData, ReadsTheMembersOfAnObject) {
    const ProductData suite = Read(R"({"identifier": "com.halvorn.tessaly", "version": "2.0", "product_type": "0",
                                       "display_name": "Tessaly", "product_url": "https://example.com"})");
    EXPECT_EQ(suite.GetIdentifier(), "com.halvorn.tessaly");
    EXPECT_EQ(suite.GetVersion(), "2.0");
    EXPECT_EQ(suite.GetDisplayName(), "Tessaly");
    EXPECT_EQ(suite.GetProductType(), 0);
    EXPECT_EQ(suite.GetValue("product_url"), "https://example.com");
}

TEST(ProductData, ReadsTheKeysThatHaveFieldsOfTheirOwn) {
    const ProductData product = Read(R"({"install_state": "3", "installed_datetime": "today", "uninstall": "true",
                                         "upgrade": "yes", "installed_file_paths": ["a", "b"]})");
    EXPECT_EQ(product.installState, 3);
    EXPECT_EQ(product.installedDatetime, "today");
    EXPECT_TRUE(product.uninstall);
    EXPECT_EQ(product.upgrade, "yes");
    EXPECT_THAT(product.installedFilePaths, ElementsAre("a", "b"));
    EXPECT_THAT(product.values, IsEmpty());
}

TEST(ProductData, KeepsKeysThatNothingActsOn) {
    EXPECT_THAT(Read(R"({"category_name": "Light", "": "empty"})").values,
                ElementsAre(Pair("", "empty"), Pair("category_name", "Light")));
}

TEST(ProductData, IgnoresMembersOfOtherKinds) {
    const ProductData product = Read(R"({"a": 1, "b": true, "c": null, "d": {"identifier": "x"}, "e": ["f"]})");
    EXPECT_THAT(product.values, IsEmpty());
    EXPECT_THAT(product.installedFilePaths, IsEmpty());
}

TEST(ProductData, IsNoSuiteWhenItsTypeIsANumber) {
    EXPECT_EQ(Read(R"({"product_type": 0})").GetProductType(), -1);
}

TEST(ProductData, KeepsItsInstallStateWhenANumberIsGiven) {
    EXPECT_EQ(Read(R"({"install_state": 3})").installState, -1);
}

TEST(ProductData, RefusesASyntaxErrorAndStaysAsItWas) {
    ProductData product = Product("Glow", "com.halvorn.glow", "1.0");
    EXPECT_FALSE(product.ReadJSON(R"({"identifier": "other",)"));
    EXPECT_FALSE(product.ReadJSON(""));
    EXPECT_FALSE(product.ReadJSON(R"({ "identifier": "a","display_name": "the "big" suite"})"));
    EXPECT_EQ(product.GetIdentifier(), "com.halvorn.glow");
    EXPECT_EQ(product.GetDisplayName(), "Glow");
}

std::string Repeated(const std::string& text, std::size_t times) {
    std::string all;
    for (std::size_t i = 0; i < times; ++i) {
        all += text;
    }
    return all;
}

/// An object with this many objects in each other.
std::string Nested(std::size_t depth) {
    return Repeated(R"({"a":)", depth) + "0" + Repeated("}", depth);
}

TEST(ProductData, ReadsAHundredValuesInEachOtherAndRefusesMore) {
    ProductData product;
    EXPECT_TRUE(product.ReadJSON(Nested(100)));
    EXPECT_FALSE(product.ReadJSON(Nested(101)));
    EXPECT_FALSE(product.ReadJSON(Repeated("[", 101) + Repeated("]", 101)));
}

TEST(ProductData, SurvivesObjectsThatNestWithoutEnd) {
    ProductData product = Product("Glow", "com.halvorn.glow", "1.0");
    EXPECT_FALSE(product.ReadJSON(Nested(300000)));
    EXPECT_FALSE(product.ReadJSON(Repeated(R"({"a\\":)", 300000)));
    EXPECT_EQ(product.GetIdentifier(), "com.halvorn.glow");
}

TEST(ProductData, TakesNoBracketInATextForAValue) {
    ProductData product;
    EXPECT_TRUE(product.ReadJSON(R"({"display_name": "\"{)" + Repeated("[{", 200) + R"("})"));
    EXPECT_EQ(product.GetDisplayName(), "\"{" + Repeated("[{", 200));
}

TEST(ProductData, ThrowsWhenTheTextIsNoObject) {
    ProductData product;
    int cases = 0;
    for (const char* json : {"[1, 2]", "\"text\"", "7", "null"}) {
        EXPECT_THROW((void)product.ReadJSON(json), std::runtime_error) << json;
        ++cases;
    }
    EXPECT_EQ(cases, 4);
}

TEST(ProductData, ThrowsWhenAnInstalledPathIsNoString) {
    ProductData product;
    EXPECT_THROW((void)product.ReadJSON(R"({"installed_file_paths": ["a", 1]})"), std::runtime_error);
    EXPECT_THAT(product.installedFilePaths, ElementsAre("a"));
}

TEST(ProductData, ThrowsForANumberThatNoDoubleHolds) {
    ProductData product;
    try {
        (void)product.ReadJSON(R"({"size": 1e999})");
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "a number is too large to be read");
    }
}

TEST(ProductData, AddsASecondReadingToTheFirst) {
    ProductData product = Read(R"({"version": "1.0", "upgrade": "x", "installed_file_paths": ["a"]})");
    EXPECT_TRUE(product.ReadJSON(R"({"version": "2.0", "identifier": "i", "installed_file_paths": ["b"]})"));
    EXPECT_EQ(product.GetVersion(), "2.0");
    EXPECT_EQ(product.GetIdentifier(), "i");
    EXPECT_EQ(product.upgrade, "x");
    EXPECT_THAT(product.installedFilePaths, ElementsAre("a", "b"));
}

TEST(ProductData, TakesOnlyTheFirstCharacterOfUninstall) {
    struct Case {
        const char* text;
        bool expected;
    };
    int cases = 0;
    for (const Case& c : {Case{"tuesday", true}, Case{"True", true}, Case{"1", true}, Case{"0", false}, Case{"", false},
                          Case{"yes", false}, Case{" true", false}}) {
        ProductData product;
        product.uninstall = !c.expected;
        EXPECT_TRUE(product.ReadJSON(std::string(R"({"uninstall": ")") + c.text + "\"}"));
        EXPECT_EQ(product.uninstall, c.expected) << c.text;
        EXPECT_EQ(product.GetValue("uninstall"), c.expected ? "true" : "false");
        ++cases;
    }
    EXPECT_EQ(cases, 7);
}

TEST(ProductData, ReadsInstallStateAsTheRuntimeDoes) {
    ProductData product;
    product.SetValue("install_state", "12 months");
    EXPECT_EQ(product.installState, 12);
    product.SetValue("install_state", "none");
    EXPECT_EQ(product.installState, 0);
}

TEST(ProductData, ReplacesAnEarlierValue) {
    ProductData product;
    product.SetValue("version", "1.0");
    product.SetValue("version", "2.0");
    EXPECT_THAT(product.values, ElementsAre(Pair("version", "2.0")));
}

TEST(ProductData, GivesTheTextsOfItsFields) {
    ProductData product;
    EXPECT_EQ(product.GetValue("install_state"), "-1");
    EXPECT_EQ(product.GetValue("installed_file_paths"), "[]");
    EXPECT_EQ(product.GetValue("uninstall"), "false");
    product.SetValue("installed_datetime", "today");
    product.SetValue("upgrade", "yes");
    EXPECT_EQ(product.GetValue("installed_datetime"), "today");
    EXPECT_EQ(product.GetValue("upgrade"), "yes");
}

TEST(ProductData, GivesNothingForAnAbsentKey) {
    EXPECT_EQ(ProductData().GetValue("product_url"), "");
    EXPECT_EQ(ProductData().GetIdentifier(), "");
}

TEST(ProductData, LetsAStoredValueWinOverAField) {
    const ProductData product = Read(R"({"installed_file_paths": "x"})");
    EXPECT_THAT(product.values, ElementsAre(Pair("installed_file_paths", "x")));
    EXPECT_EQ(product.GetValue("installed_file_paths"), "x");
    EXPECT_EQ(product.GetInstalledFilePathsText(), "[]");
}

TEST(ProductData, TakesKeysInTheirExactCase) {
    ProductData product;
    product.SetValue("Uninstall", "true");
    EXPECT_FALSE(product.uninstall);
    EXPECT_EQ(product.GetValue("Uninstall"), "true");
}

TEST(ProductData, HasNoProductTypeWithoutAText) {
    ProductData product;
    EXPECT_EQ(product.GetProductType(), -1);
    product.SetValue("product_type", "");
    EXPECT_EQ(product.GetProductType(), -1);
}

TEST(ProductData, ReadsATypeThatIsNoNumberAsZero) {
    ProductData product;
    product.SetValue("product_type", "suite");
    EXPECT_EQ(product.GetProductType(), 0);
    product.SetValue("product_type", "2");
    EXPECT_EQ(product.GetProductType(), 2);
}

TEST(ProductData, WritesInstalledPathsWithTwoBlanksBetweenThem) {
    ProductData product;
    product.installedFilePaths = {"a", "b"};
    EXPECT_EQ(product.GetValue("installed_file_paths"), R"([ "a",  "b"])");
}

TEST(ProductData, EscapesNothingInInstalledPaths) {
    ProductData product;
    product.installedFilePaths = {R"(C:\x"y)"};
    EXPECT_EQ(product.GetInstalledFilePathsText(), R"([ "C:\x"y"])");
}

TEST(ProductOrder, GoesByDisplayNameFirst) {
    EXPECT_LT(Product("A", "z", "9"), Product("B", "a", "1"));
    EXPECT_FALSE(Product("B", "a", "1") < Product("A", "z", "9"));
    EXPECT_LT(Product("Z", "i", "1"), Product("a", "i", "1"));
    EXPECT_LT(Product("a", "i", "1"), Product("\xc3\xa4", "i", "1"));
}

TEST(ProductOrder, GoesByIdentifierForEqualNames) {
    EXPECT_LT(Product("A", "a", "9"), Product("A", "b", "1"));
    EXPECT_FALSE(Product("A", "b", "1") < Product("A", "a", "9"));
}

TEST(ProductOrder, GoesByTheNumbersOfTheVersionLast) {
    EXPECT_LT(Product("A", "a", "1.9"), Product("A", "a", "1.10"));
    EXPECT_FALSE(Product("A", "a", "1.10") < Product("A", "a", "1.9"));
}

TEST(ProductOrder, DoesNotTellEqualVersionsApart) {
    EXPECT_FALSE(Product("A", "a", "1.0") < Product("A", "a", "1.0"));
    EXPECT_FALSE(Product("A", "a", "1.0") < Product("A", "a", "1"));
    EXPECT_FALSE(Product("A", "a", "1") < Product("A", "a", "1.0"));
}

}  // namespace
}  // namespace HVL
