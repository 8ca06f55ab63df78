#include "package/Manifest.h"

#include <gtest/gtest.h>

#include <utility>

#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"

namespace {

const std::string kAttributes = R"( version="1.0" product="com.halvorn.tessaly.glow" productversion="2.1.0")";

/// A manifest with the three required attributes and these children.
std::string ManifestOf(const std::string& children, const std::string& more = "") {
    return "<hvmanifest" + kAttributes + more + ">" + children + "</hvmanifest>";
}

std::string Error(const std::string& text) {
    return "ERROR hvdeploy-detail: " + text;
}

class ManifestTest : public testing::Test {
protected:
    LogRecorder log;
    HV::Manifest manifest;
};

TEST_F(ManifestTest, WithThreeAttributesAndNothingElseParses) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("")));
    EXPECT_TRUE(manifest.payloads.empty());
    EXPECT_FALSE(manifest.policy.show);
    EXPECT_FALSE(manifest.policy.doRegister);
    EXPECT_FALSE(manifest.policy.uninstall);
    EXPECT_FALSE(manifest.policy.uninstallOnUpgrade);
    EXPECT_FALSE(manifest.policy.timeWarning);
    EXPECT_EQ(manifest.policy.upgrade, "");
    EXPECT_TRUE(manifest.productData.empty());
    EXPECT_TRUE(manifest.macLegacyUninstallToolArgs.empty());
    EXPECT_TRUE(manifest.documentPath.empty());
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(ManifestTest, KeepsItsIdentityAndText) {
    const std::string text = ManifestOf("", R"( productshortname="Glow")");
    EXPECT_TRUE(manifest.Parse(text));
    EXPECT_EQ(manifest.manifestVersion, "1.0");
    EXPECT_EQ(manifest.productId, "com.halvorn.tessaly.glow");
    EXPECT_EQ(manifest.productVersion, "2.1.0");
    EXPECT_EQ(manifest.productShortName, "Glow");
    EXPECT_EQ(manifest.packageIdentifier, "com.halvorn.tessaly.glow_v2.1.0");
    EXPECT_EQ(manifest.xmlText, text);
    ASSERT_NE(manifest.document.Get(), nullptr);
    EXPECT_STREQ(manifest.document.Get()->RootElement()->Value(), "hvmanifest");
}

TEST_F(ManifestTest, MissingShortNameIsTheEndOfTheIdentifierWithItsDot) {
    EXPECT_TRUE(manifest.Parse(R"(<hvmanifest version="1" product="com.halvorn.x" productversion="1"/>)"));
    EXPECT_EQ(manifest.productShortName, ".x");
}

TEST_F(ManifestTest, MissingShortNameIsTheWholeIdentifierWithoutADot) {
    EXPECT_TRUE(manifest.Parse(R"(<hvmanifest version="1" product="abc" productversion="1"/>)"));
    EXPECT_EQ(manifest.productShortName, "abc");
}

TEST_F(ManifestTest, AnEmptyShortNameIsNotMissing) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("", R"( productshortname="")")));
    EXPECT_EQ(manifest.productShortName, "");
}

TEST_F(ManifestTest, ThatIsNoXmlFailsWithTheLibrarysReason) {
    EXPECT_FALSE(manifest.Parse("<hvmanifest"));
    ASSERT_EQ(log.Lines().size(), 1U);
    EXPECT_EQ(log.LinesStartingWith(Error("XML parsing failed: ")).size(), 1U) << log.Text();
    EXPECT_GT(log.Lines()[0].size(), Error("XML parsing failed: ").size());
}

TEST_F(ManifestTest, ThatIsEmptyFailsWithTheLibrarysReason) {
    EXPECT_FALSE(manifest.Parse(""));
    EXPECT_EQ(log.LinesStartingWith(Error("XML parsing failed: ")).size(), 1U) << log.Text();
}

TEST_F(ManifestTest, WithoutAnyElementFailsWithoutAWord) {
    EXPECT_FALSE(manifest.Parse("<!-- nothing here -->"));
    EXPECT_TRUE(log.Lines().empty()) << log.Text();
}

TEST_F(ManifestTest, WithAnotherRootFails) {
    EXPECT_FALSE(manifest.Parse("<HVManifest" + kAttributes + "/>"));
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - hvmanifest does not have expected document root.")});
}

TEST_F(ManifestTest, WithoutAVersionFails) {
    EXPECT_FALSE(manifest.Parse(R"(<hvmanifest product="a" productversion="1"/>)"));
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - hvmanifest is missing manifest version.")});
}

TEST_F(ManifestTest, WithoutAProductFails) {
    EXPECT_FALSE(manifest.Parse(R"(<hvmanifest version="1" productversion="1"/>)"));
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - hvmanifest is missing product identifier.")});
}

TEST_F(ManifestTest, WithoutAProductVersionFailsAndKeepsWhatItRead) {
    EXPECT_FALSE(manifest.Parse(R"(<hvmanifest version="1" product="a.b"/>)"));
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - hvmanifest is missing product version.")});
    EXPECT_EQ(manifest.productId, "a.b");
    EXPECT_EQ(manifest.packageIdentifier, "");
}

TEST_F(ManifestTest, ReadsThePolicy) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy show="true" register="1" uninstall="true"
        uninstall-on-upgrade="1" upgrade="replace" time-warning="true"/>)")));
    EXPECT_TRUE(manifest.policy.show);
    EXPECT_TRUE(manifest.policy.doRegister);
    EXPECT_TRUE(manifest.policy.uninstall);
    EXPECT_TRUE(manifest.policy.uninstallOnUpgrade);
    EXPECT_EQ(manifest.policy.upgrade, "replace");
    EXPECT_TRUE(manifest.policy.timeWarning);
}

TEST_F(ManifestTest, IsShownForOneAndTrueOnly) {
    const std::vector<std::pair<std::string, bool>> cases{{"1", true},     {"true", true}, {"True", false},
                                                          {"TRUE", false}, {"yes", false}, {"", false}};
    std::size_t tried = 0;
    for (const auto& [value, shown] : cases) {
        HV::Manifest fresh;
        EXPECT_TRUE(fresh.Parse(ManifestOf("<installer-policy show=\"" + value + "\"/>")));
        EXPECT_EQ(fresh.policy.show, shown) << value;
        ++tried;
    }
    EXPECT_EQ(tried, 6U);
}

TEST_F(ManifestTest, ReadsTheFirstPolicyOnly) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy/><installer-policy show="true"/>)")));
    EXPECT_FALSE(manifest.policy.show);
}

TEST_F(ManifestTest, KeepsUninstallToolArgumentsThatBeginWithText) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy><mac-legacy-uninstallToolArgs>
        <arg>--first</arg><arg/><arg></arg><arg><!-- hides -->this</arg><arg>second<b/></arg>
        </mac-legacy-uninstallToolArgs></installer-policy>)")));
    EXPECT_EQ(manifest.macLegacyUninstallToolArgs, (std::vector<std::string>{"--first", "second"}));
}

TEST_F(ManifestTest, ReadsProductData) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<product-data><value key="display_name">Glow</value>
        <value>without a key</value><other key="x">y</other><value key="size">3 &amp; 4</value></product-data>)")));
    EXPECT_EQ(manifest.productData, (std::map<std::string, std::string>{{"display_name", "Glow"}, {"size", "3 & 4"}}));
    EXPECT_EQ(manifest.GetProductData("display_name"), "Glow");
}

TEST_F(ManifestTest, UnknownProductDataIsEmpty) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("")));
    EXPECT_EQ(manifest.GetProductData("display_name"), "");
    EXPECT_TRUE(manifest.productData.empty());
}

TEST_F(ManifestTest, AValueWithoutTextIsStoredEmpty) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<product-data><value key="note"/></product-data>)")));
    EXPECT_EQ(manifest.productData, (std::map<std::string, std::string>{{"note", ""}}));
    EXPECT_EQ(manifest.GetProductData("note"), manifest.GetProductData("unknown"));
}

TEST_F(ManifestTest, TheLastOfTwoValuesWithOneKeyWins) {
    EXPECT_TRUE(manifest.Parse(
        ManifestOf(R"(<product-data><value key="k">first</value><value key="k">last</value></product-data>)")));
    EXPECT_EQ(manifest.GetProductData("k"), "last");
}

TEST_F(ManifestTest, ReadsPayloadsInOrder) {
    EXPECT_TRUE(manifest.Parse(
        ManifestOf(R"(<contents><payload id="one" type="app"/><payload id="two" type="plugin"/></contents>)")));
    ASSERT_EQ(manifest.payloads.size(), 2U);
    EXPECT_EQ(manifest.payloads[0].id, "one");
    EXPECT_EQ(manifest.payloads[1].id, "two");
}

TEST_F(ManifestTest, WithEmptyContentsIsValid) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("<contents/>")));
    EXPECT_TRUE(manifest.payloads.empty());
}

TEST_F(ManifestTest, AFailingPayloadFailsItAndTheOnesBeforeStay) {
    EXPECT_FALSE(manifest.Parse(ManifestOf(
        R"(<contents><payload id="one" type="app"/><payload id="two"/><payload id="three" type="app"/></contents>)")));
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - failed to parse payload entry")});
    ASSERT_EQ(manifest.payloads.size(), 1U);
    EXPECT_EQ(manifest.payloads[0].id, "one");
}

TEST_F(ManifestTest, PresetsWithoutDeploymentFailItWithALineOnEachSide) {
    CapturedStreams streams;
    EXPECT_FALSE(manifest.Parse(ManifestOf(R"(<contents><payload id="p" type="presets"/></contents>)")));
    EXPECT_EQ(streams.Errors(), "ERROR: invalid deployment type: \"\"\n");
    EXPECT_EQ(log.Lines(), std::vector{Error("xml document - failed to parse payload entry")});
}

TEST_F(ManifestTest, IgnoresWhatItDoesNotKnow) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("<future kind=\"x\"><contents/></future><Contents/>", R"( extra="1")")));
}

TEST_F(ManifestTest, KeepsTokensAsTheyStand) {
    const std::string tokens = "${HostAppVKey} ${HostAppVName} ${Files-to-uninstall}";
    EXPECT_TRUE(manifest.Parse(ManifestOf("<product-data><value key=\"k\">" + tokens + "</value></product-data>")));
    EXPECT_EQ(manifest.GetProductData("k"),
              std::string(HV::kHostAppVKeyToken) + " " + HV::kHostAppVNameToken + " " + HV::kFilesToUninstallToken);
}

TEST_F(ManifestTest, ParsingASecondTextForgetsTheFirst) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy show="1" register="1" uninstall="1" upgrade="u"/>
        <product-data><value key="k">v</value></product-data><contents><payload id="a" type="app"/></contents>)")));
    EXPECT_TRUE(manifest.Parse(R"(<hvmanifest version="2" product="b" productversion="3"/>)"));
    EXPECT_EQ(manifest.productId, "b");
    EXPECT_EQ(manifest.packageIdentifier, "b_v3");
    EXPECT_TRUE(manifest.payloads.empty());
    EXPECT_TRUE(manifest.productData.empty());
    EXPECT_FALSE(manifest.policy.show);
    EXPECT_FALSE(manifest.policy.doRegister);
    EXPECT_FALSE(manifest.policy.uninstall);
    EXPECT_EQ(manifest.policy.upgrade, "");
}

TEST_F(ManifestTest, ParsingASecondTextKeepsWhatClearLeaves) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy uninstall-on-upgrade="1"><mac-legacy-uninstallToolArgs>
        <arg>x</arg></mac-legacy-uninstallToolArgs></installer-policy>)")));
    EXPECT_FALSE(manifest.Parse(R"(<hvmanifest version="2" product="b"/>)"));
    EXPECT_TRUE(manifest.policy.uninstallOnUpgrade);
    EXPECT_EQ(manifest.macLegacyUninstallToolArgs, std::vector<std::string>{"x"});
    EXPECT_EQ(manifest.packageIdentifier, "com.halvorn.tessaly.glow_v2.1.0");
}

TEST_F(ManifestTest, TimeWarningEndsWithAManifestThatHasNoPolicy) {
    EXPECT_TRUE(manifest.Parse(ManifestOf(R"(<installer-policy time-warning="1"/>)")));
    EXPECT_TRUE(manifest.Parse(ManifestOf("")));
    EXPECT_FALSE(manifest.policy.timeWarning);
}

TEST_F(ManifestTest, AFailedTextLeavesTheRecordsOfTheOneBefore) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("")));
    EXPECT_FALSE(manifest.Parse("<hvmanifest"));
    EXPECT_EQ(manifest.productId, "com.halvorn.tessaly.glow");
    EXPECT_EQ(manifest.xmlText, "<hvmanifest");
}

TEST_F(ManifestTest, CopiesAreIndependentWithTheirTrees) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("<contents/>")));
    HV::Manifest copy = manifest;
    EXPECT_NE(copy.document.Get(), manifest.document.Get());
    EXPECT_TRUE(manifest.Parse(R"(<hvmanifest version="2" product="b" productversion="3"/>)"));
    EXPECT_EQ(copy.productId, "com.halvorn.tessaly.glow");
    EXPECT_STREQ(copy.document.Get()->RootElement()->Attribute("product"), "com.halvorn.tessaly.glow");
    copy = manifest;
    EXPECT_STREQ(copy.document.Get()->RootElement()->Attribute("product"), "b");
}

TEST_F(ManifestTest, MovingTakesTheTreeAlong) {
    EXPECT_TRUE(manifest.Parse(ManifestOf("")));
    const TiXmlDocument* tree = manifest.document.Get();
    const HV::Manifest moved = std::move(manifest);
    EXPECT_EQ(moved.document.Get(), tree);
}

TEST_F(ManifestTest, NestedBeyondAllReasonFailsWithAReason) {
    std::string text;
    for (int depth = 0; depth < 100000; ++depth) {
        text += "<a>";
    }
    EXPECT_FALSE(manifest.Parse(text));
    EXPECT_EQ(log.Lines(), std::vector{Error("XML parsing failed: elements are nested more than 200 deep")});
    EXPECT_EQ(manifest.xmlText, text);
}

TEST_F(ManifestTest, NestedUpToTheLimitParses) {
    std::string nested;
    for (int depth = 1; depth < 200; ++depth) {
        nested = "<a>" + nested + "</a>";
    }
    EXPECT_TRUE(manifest.Parse(ManifestOf(nested)));
    EXPECT_FALSE(manifest.Parse(ManifestOf("<a>" + nested + "</a>")));
}

/// This many attributes, each with a name of its own.
std::string Attributes(int count) {
    std::string attributes;
    for (int number = 0; number < count; ++number) {
        attributes += " a" + std::to_string(number) + "=''";
    }
    return attributes;
}

TEST_F(ManifestTest, WithMoreAttributesThanAnyoneWritesFailsWithAReason) {
    const std::string line = Error("XML parsing failed: an element has more than 256 attributes");
    EXPECT_FALSE(manifest.Parse(ManifestOf("<x" + Attributes(257) + "/>")));
    EXPECT_EQ(log.Lines(), std::vector{line});
    log.Clear();
    EXPECT_FALSE(manifest.Parse(ManifestOf("<x" + Attributes(80000) + "/>"))) << "and that at once, not in a minute";
    EXPECT_EQ(log.Lines(), std::vector{line});
    EXPECT_TRUE(manifest.Parse(ManifestOf("<x" + Attributes(256) + "/>")));
}

TEST_F(ManifestTest, LongerThanAnyoneWritesFailsWithAReason) {
    const std::size_t longest = std::size_t{4} << 20;
    const std::string room(longest - ManifestOf("").size(), ' ');
    EXPECT_TRUE(manifest.Parse(ManifestOf(room)));
    EXPECT_TRUE(log.Lines().empty());
    EXPECT_FALSE(manifest.Parse(ManifestOf(room + " ")));
    EXPECT_EQ(log.Lines(), std::vector{Error("XML parsing failed: the text is longer than 4194304 bytes")});
}

TEST_F(ManifestTest, ThatEndsWithinACharacterIsReadToItsEnd) {
    int tried = 0;
    for (const std::string cut : {"\xC3", "\xE2", "\xE2\x82", "\xF0", "\xF0\x9F", "\xF0\x9F\x98"}) {
        const std::string start = "\xEF\xBB\xBF<hvmanifest" + kAttributes;
        EXPECT_FALSE(manifest.Parse(start + ">" + cut));
        EXPECT_FALSE(manifest.Parse(start + " x='" + cut));
        EXPECT_TRUE(manifest.Parse(start + "/>" + cut));
        ++tried;
    }
    EXPECT_EQ(tried, 6);
}

TEST_F(ManifestTest, KeepsTextOfAnyScript) {
    EXPECT_TRUE(
        manifest.Parse("<?xml version=\"1.0\" encoding=\"UTF-8\"?>" +
                       ManifestOf("<product-data><value key=\"k\">Gl\xC3\xBChen \xE5\x85\x89</value></product-data>")));
    EXPECT_EQ(manifest.GetProductData("k"), "Gl\xC3\xBChen \xE5\x85\x89");
}

TEST_F(ManifestTest, NoCutOfAManifestIsTakenForAWholeOne) {
    const std::string whole =
        ManifestOf(R"(<contents><payload id="a" type="app"><source>x/y</source></payload></contents>)");
    std::size_t tried = 0;
    for (std::size_t length = 0; length < whole.size(); ++length, ++tried) {
        EXPECT_FALSE(HV::Manifest().Parse(whole.substr(0, length))) << length;
    }
    EXPECT_EQ(tried, whole.size());
}

}  // namespace
