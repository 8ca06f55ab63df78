#include <gtest/gtest.h>

#include <utility>

#include "package/Manifest.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"

namespace {

/// Reads one `payload` element, and remembers how that went.
class PayloadTest : public testing::Test {
protected:
    bool Parse(const std::string& attributes, const std::string& inside = "") {
        TiXmlDocument document;
        const std::string text = "<payload " + attributes + ">" + inside + "</payload>";
        document.Parse(text.c_str(), nullptr, TIXML_ENCODING_UTF8);
        payload = HV::Payload();
        CapturedStreams streams;
        const bool parsed = payload.Parse(*document.RootElement());
        errors = streams.Errors();
        return parsed;
    }

    /// A payload that is sound but for what stands inside it.
    bool ParseInside(const std::string& inside) { return Parse(R"(id="p" type="plugin")", inside); }

    HV::Payload payload;
    std::string errors;
};

TEST_F(PayloadTest, FreshOneIsEmpty) {
    const HV::Payload fresh;
    EXPECT_EQ(fresh.type, HV::PayloadType::Unknown);
    EXPECT_EQ(fresh.deployment, HV::DeploymentType::Unknown);
    EXPECT_EQ(fresh.id + fresh.os + fresh.source + fresh.subpath + fresh.sysdir, "");
    EXPECT_TRUE(fresh.hosts.empty());
    EXPECT_TRUE(fresh.preconditions.empty());
}

TEST_F(PayloadTest, WithoutIdFailsWithoutAWord) {
    const LogRecorder log;
    EXPECT_FALSE(Parse(R"(type="app")"));
    EXPECT_EQ(errors, "");
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(PayloadTest, WithoutTypeFailsWithoutAWord) {
    EXPECT_FALSE(Parse(R"(id="p" deployment="app")"));
    EXPECT_EQ(errors, "");
}

TEST_F(PayloadTest, AnEmptyIdPasses) {
    EXPECT_TRUE(Parse(R"(id="" type="app")"));
    EXPECT_EQ(payload.id, "");
}

TEST_F(PayloadTest, EveryTypeHasItsNumber) {
    const std::vector<std::pair<std::string, int>> words{
        {"other", 0},    {"app", 1},  {"plugin", 2}, {"presets", 3}, {"library", 4}, {"framework", 5},
        {"resource", 6}, {"help", 7}, {"script", 8}, {"patch", 9},   {"App", 0},     {"", 0}};
    int tried = 0;
    for (const auto& [word, number] : words) {
        EXPECT_TRUE(Parse("id=\"p\" deployment=\"sysdir\" type=\"" + word + "\"")) << word;
        EXPECT_EQ(static_cast<int>(payload.type), number) << word;
        ++tried;
    }
    EXPECT_EQ(tried, 12);
}

TEST_F(PayloadTest, EveryDeploymentHasItsNumber) {
    const std::vector<std::pair<std::string, int>> words{{"app", 1},     {"sysdir", 2},      {"hostplugins", 3},
                                                         {"hostapp", 3}, {"hostpresets", 4}, {"hostscripts", 5},
                                                         {"run", 6}};
    int tried = 0;
    for (const auto& [word, number] : words) {
        EXPECT_TRUE(Parse("id=\"p\" type=\"presets\" deployment=\"" + word + "\"")) << word;
        EXPECT_EQ(static_cast<int>(payload.deployment), number) << word;
        ++tried;
    }
    EXPECT_EQ(tried, 7);
}

TEST_F(PayloadTest, AppAndPluginNeedNoDeployment) {
    EXPECT_TRUE(Parse(R"(id="p" type="app")"));
    EXPECT_EQ(payload.deployment, HV::DeploymentType::App);
    EXPECT_TRUE(Parse(R"(id="p" type="plugin")"));
    EXPECT_EQ(payload.deployment, HV::DeploymentType::HostPlugins);
    EXPECT_TRUE(Parse(R"(id="p" type="plugin" deployment="nonsense")"));
    EXPECT_EQ(payload.deployment, HV::DeploymentType::HostPlugins);
}

TEST_F(PayloadTest, AnyOtherTypeNeedsADeployment) {
    int tried = 0;
    for (const std::string type : {"presets", "library", "framework", "resource", "help", "script", "patch", "other"}) {
        EXPECT_FALSE(Parse("id=\"p\" type=\"" + type + "\"")) << type;
        EXPECT_EQ(errors, "ERROR: invalid deployment type: \"\"\n") << type;
        ++tried;
    }
    EXPECT_EQ(tried, 8);
}

TEST_F(PayloadTest, AnUnknownDeploymentIsNamedInTheLine) {
    EXPECT_FALSE(Parse(R"(id="p" type="help" deployment="Sysdir")"));
    EXPECT_EQ(errors, "ERROR: invalid deployment type: \"Sysdir\"\n");
}

TEST_F(PayloadTest, AnUnknownTypeWithAKnownDeploymentPasses) {
    EXPECT_TRUE(Parse(R"(id="p" type="novelty" deployment="sysdir")"));
    EXPECT_EQ(payload.type, HV::PayloadType::Unknown);
    EXPECT_EQ(payload.deployment, HV::DeploymentType::SysDir);
}

TEST_F(PayloadTest, IsForEverySystemWithoutOs) {
    EXPECT_TRUE(Parse(R"(id="p" type="app")"));
    EXPECT_EQ(payload.os, "*");
    EXPECT_TRUE(payload.MatchesOS());
}

TEST_F(PayloadTest, MatchesWhatBeginsWithWin) {
    const std::vector<std::pair<std::string, bool>> cases{{"*", true},     {"win", true},  {"windows", true},
                                                          {"win64", true}, {"mac", false}, {"Win", false},
                                                          {"", false},     {"**", false},  {"darwin", false}};
    int tried = 0;
    for (const auto& [os, matches] : cases) {
        EXPECT_TRUE(Parse("id=\"p\" type=\"app\" os=\"" + os + "\""));
        EXPECT_EQ(payload.MatchesOS(), matches) << os;
        ++tried;
    }
    EXPECT_EQ(tried, 9);
}

TEST_F(PayloadTest, SourceAndSubpathGetBackslashes) {
    EXPECT_TRUE(ParseInside("<source>a/b/c.dll</source><subpath>Halvorn/Glow\\x</subpath>"));
    EXPECT_EQ(payload.source, R"(a\b\c.dll)");
    EXPECT_EQ(payload.subpath, R"(Halvorn\Glow\x)");
}

TEST_F(PayloadTest, SysDirKeepsItsSlashes) {
    EXPECT_TRUE(ParseInside("<sysdir>a/b</sysdir>"));
    EXPECT_EQ(payload.sysdir, "a/b");
}

TEST_F(PayloadTest, SysDirIsTheAttributeBeforeTheText) {
    EXPECT_TRUE(ParseInside("<sysdir type='ofx'>temp</sysdir>"));
    EXPECT_EQ(payload.sysdir, "ofx");
    EXPECT_TRUE(ParseInside("<sysdir type=''>temp</sysdir>"));
    EXPECT_EQ(payload.sysdir, "");
}

TEST_F(PayloadTest, ReadsTheFirstElementOfAName) {
    EXPECT_TRUE(ParseInside("<source>first</source><source>second</source>"));
    EXPECT_EQ(payload.source, "first");
}

TEST_F(PayloadTest, HasAWildcardWhereverTheStarStands) {
    int tried = 0;
    for (const auto& [source, wild] : {std::pair("a/b.dll", false), {"a/*", true}, {"*/b", true}, {"a?b", false}}) {
        EXPECT_TRUE(ParseInside("<source>" + std::string(source) + "</source>"));
        EXPECT_EQ(payload.HasWildcardSource(), wild) << source;
        ++tried;
    }
    EXPECT_EQ(tried, 4);
}

TEST_F(PayloadTest, ReadsHostsInOrderAndPassesOverThoseWithoutText) {
    EXPECT_TRUE(
        ParseInside("<hosts><host-ref>aftereffects</host-ref><host-ref/><host-ref>premiere</host-ref></hosts>"));
    EXPECT_EQ(payload.hosts, (std::vector<std::string>{"aftereffects", "premiere"}));
}

TEST_F(PayloadTest, ReadsDependenciesAndPassesOverHalfOnes) {
    EXPECT_TRUE(ParseInside(R"(<dependencies><dependency product="a" type="library"/><dependency product="b"/>
        <dependency type="library"/><dependency product="c" type="what"/></dependencies>)"));
    EXPECT_EQ(errors, "");
    ASSERT_EQ(payload.dependencies.size(), 2U);
    EXPECT_EQ(payload.dependencies[0].product, "a");
    EXPECT_EQ(payload.dependencies[0].type, HV::PayloadType::Library);
    EXPECT_EQ(payload.dependencies[1].product, "c");
    EXPECT_EQ(payload.dependencies[1].type, HV::PayloadType::Unknown);
}

TEST_F(PayloadTest, ReadsParentsAndPassesOverThoseWithoutReference) {
    EXPECT_TRUE(ParseInside(R"(<parents><parent idref="x"/><parent/><parent idref="y"/></parents>)"));
    EXPECT_EQ(payload.parents, (std::vector<std::string>{"x", "y"}));
    EXPECT_EQ(errors, "");
}

TEST_F(PayloadTest, ReadsPreconditions) {
    EXPECT_TRUE(ParseInside(R"(<preconditions><condition type="regkey" matchpolicy="skip">HKEY_X\y</condition>
        <condition type="file" matchpolicy="force">C:/a</condition></preconditions>)"));
    ASSERT_EQ(payload.preconditions.size(), 2U);
    EXPECT_EQ(payload.preconditions[0].type, HV::PreconditionType::RegKey);
    EXPECT_EQ(payload.preconditions[0].matchPolicy, HV::MatchPolicy::Skip);
    EXPECT_EQ(payload.preconditions[0].target, R"(HKEY_X\y)");
    EXPECT_EQ(payload.preconditions[1].type, HV::PreconditionType::File);
    EXPECT_EQ(payload.preconditions[1].matchPolicy, HV::MatchPolicy::Force);
    EXPECT_EQ(payload.preconditions[1].target, "C:/a");
}

TEST_F(PayloadTest, DropsAConditionOfNoOrUnknownType) {
    EXPECT_TRUE(ParseInside(R"(<preconditions><condition matchpolicy="skip">x</condition>
        <condition type="File" matchpolicy="skip">x</condition></preconditions>)"));
    EXPECT_TRUE(payload.preconditions.empty());
    EXPECT_EQ(errors,
              "WARNING: unsupported/unset precondition type encountered.\n"
              "WARNING: unsupported/unset precondition type encountered.\n");
}

TEST_F(PayloadTest, DropsAConditionOfNoOrUnknownMatchPolicy) {
    EXPECT_TRUE(ParseInside(R"(<preconditions><condition type="regkey">x</condition>
        <condition type="file" matchpolicy="maybe">x</condition></preconditions>)"));
    EXPECT_TRUE(payload.preconditions.empty());
    EXPECT_EQ(errors,
              "WARNING: precondition with unsupported/unset match policy encountered.\n"
              "WARNING: precondition with unsupported/unset match policy encountered.\n");
}

TEST_F(PayloadTest, DropsAConditionWithoutText) {
    EXPECT_TRUE(ParseInside(R"(<preconditions><condition type="file" matchpolicy="skip"/></preconditions>)"));
    EXPECT_TRUE(payload.preconditions.empty());
    EXPECT_EQ(errors, "WARNING: precondition missing child text.\n");
}

TEST_F(PayloadTest, ADroppedConditionDoesNotEndTheOthers) {
    EXPECT_TRUE(ParseInside(R"(<preconditions><condition/><condition type="file" matchpolicy="skip">x</condition>
        </preconditions>)"));
    EXPECT_EQ(payload.preconditions.size(), 1U);
}

TEST_F(PayloadTest, ReadsRegistryEntriesWithWhateverTheyHave) {
    EXPECT_TRUE(ParseInside(R"(<registry-entries><registry os="win" root="HKLM" key="a/b" name="n">v</registry>
        <registry/></registry-entries>)"));
    ASSERT_EQ(payload.registryEntries.size(), 2U);
    const HV::RegistryEntry& entry = payload.registryEntries[0];
    EXPECT_EQ(entry.os + "|" + entry.root + "|" + entry.key + "|" + entry.name + "|" + entry.value, "win|HKLM|a/b|n|v");
    const HV::RegistryEntry& bare = payload.registryEntries[1];
    EXPECT_EQ(bare.os + bare.root + bare.key + bare.name + bare.value, "");
}

TEST_F(PayloadTest, ReadsShortcuts) {
    EXPECT_TRUE(
        ParseInside(R"(<shortcuts><shortcut failonerror="1"><sysdir type="startmenu"/><subdir>Halvorn/Glow</subdir>
        <original type="programfiles">Halvorn/Glow.exe</original></shortcut></shortcuts>)"));
    ASSERT_EQ(payload.shortcuts.size(), 1U);
    const HV::Shortcut& shortcut = payload.shortcuts[0];
    EXPECT_EQ(shortcut.sysdir, "startmenu");
    EXPECT_EQ(shortcut.subdir, R"(Halvorn\Glow)");
    EXPECT_EQ(shortcut.original, "Halvorn/Glow.exe");
    EXPECT_EQ(shortcut.originalType, "programfiles");
    EXPECT_TRUE(shortcut.failOnError);
}

TEST_F(PayloadTest, AShortcutFailsNothingUnlessToldTo) {
    EXPECT_TRUE(
        ParseInside("<shortcuts><shortcut><sysdir type='startmenu'/><original>x</original></shortcut></shortcuts>"));
    ASSERT_EQ(payload.shortcuts.size(), 1U);
    EXPECT_FALSE(payload.shortcuts[0].failOnError);
    EXPECT_EQ(payload.shortcuts[0].originalType, "");
}

TEST_F(PayloadTest, DropsShortcutsThatLackOriginalOrSysDir) {
    EXPECT_TRUE(
        ParseInside("<shortcuts><shortcut><sysdir type='startmenu'/></shortcut>"
                    "<shortcut><original>x</original></shortcut>"
                    "<shortcut><sysdir>startmenu</sysdir><original>x</original></shortcut></shortcuts>"));
    EXPECT_TRUE(payload.shortcuts.empty());
    const std::string line = "WARNING: invalid shortcut encountered, missing original and/or sysdir value.\n";
    EXPECT_EQ(errors, line + line + line);
}

TEST_F(PayloadTest, ReadsScripts) {
    EXPECT_TRUE(ParseInside(R"(<preflights><preflight id="first" os="win" failonerror="false"><command>echo a</command>
        </preflight></preflights><postflights><postflight id="last" source="clean.cmd"/></postflights>)"));
    ASSERT_EQ(payload.preflights.size(), 1U);
    EXPECT_EQ(payload.preflights[0].id, "first");
    EXPECT_EQ(payload.preflights[0].os, "win");
    EXPECT_EQ(payload.preflights[0].command, "echo a");
    EXPECT_EQ(payload.preflights[0].source, "");
    EXPECT_FALSE(payload.preflights[0].failOnError);
    EXPECT_TRUE(payload.preflights[0].isPreflight);
    ASSERT_EQ(payload.postflights.size(), 1U);
    EXPECT_EQ(payload.postflights[0].id, "last");
    EXPECT_EQ(payload.postflights[0].source, "clean.cmd");
    EXPECT_EQ(payload.postflights[0].command, "");
    EXPECT_TRUE(payload.postflights[0].failOnError);
    EXPECT_FALSE(payload.postflights[0].isPreflight);
}

TEST_F(PayloadTest, ACommandHidesTheSource) {
    EXPECT_TRUE(
        ParseInside("<postflights><postflight source='x.cmd'><command>echo</command></postflight></postflights>"));
    ASSERT_EQ(payload.postflights.size(), 1U);
    EXPECT_EQ(payload.postflights[0].command, "echo");
    EXPECT_EQ(payload.postflights[0].source, "");
}

TEST_F(PayloadTest, ScriptsWithNeitherCommandNorSourceArePassedOver) {
    EXPECT_TRUE(
        ParseInside("<preflights><preflight/><preflight source=''/><preflight><command/></preflight></preflights>"
                    "<postflights><postflight id='x'/></postflights>"));
    EXPECT_TRUE(payload.preflights.empty());
    EXPECT_TRUE(payload.postflights.empty());
    EXPECT_EQ(errors, "");
}

TEST_F(PayloadTest, APreflightWithoutIdGetsOne) {
    EXPECT_TRUE(ParseInside("<preflights><preflight source='a'/><preflight id='' source='b'/></preflights>"));
    ASSERT_EQ(payload.preflights.size(), 2U);
    EXPECT_EQ(payload.preflights[0].id, "preflight");
    EXPECT_EQ(payload.preflights[1].id, "preflight");
}

TEST_F(PayloadTest, APostflightWithoutIdGetsNone) {
    EXPECT_TRUE(ParseInside("<postflights><postflight source='a'/></postflights>"));
    ASSERT_EQ(payload.postflights.size(), 1U);
    EXPECT_EQ(payload.postflights[0].id, "");
    EXPECT_EQ(payload.id, "p");
}

TEST_F(PayloadTest, APostflightNamesAPayloadWhoseIdIsEmpty) {
    EXPECT_TRUE(Parse(R"(id="" type="plugin")", "<postflights><postflight id='x' source='a'/></postflights>"));
    EXPECT_EQ(payload.id, "postflight");
    EXPECT_EQ(payload.postflights[0].id, "x");
}

TEST_F(PayloadTest, APostflightThatIsPassedOverNamesNothing) {
    EXPECT_TRUE(Parse(R"(id="" type="plugin")", "<postflights><postflight/></postflights>"));
    EXPECT_EQ(payload.id, "");
}

TEST_F(PayloadTest, APreflightLeavesAnEmptyPayloadIdAlone) {
    EXPECT_TRUE(Parse(R"(id="" type="plugin")", "<preflights><preflight source='a'/></preflights>"));
    EXPECT_EQ(payload.id, "");
}

}  // namespace
