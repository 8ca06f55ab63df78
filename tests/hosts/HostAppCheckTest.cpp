#include "hosts/HostAppCheck.h"

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>
#include <stdexcept>
#include <string>
#include <vector>

#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

namespace {

using HV::HostAppCheck;
using HV::HostRecord;
using HV::HostType;

HostRecord Host(HostType type, const std::string& abbreviation, const std::string& version) {
    HostRecord host;
    host.hostType = type;
    host.hostAbbreviation = abbreviation;
    host.hostVersion = version;
    return host;
}

HostRecord AfterEffects(const std::string& version) {
    return Host(HostType::AfterEffects, "aftereffects", version);
}
HostRecord Premiere(const std::string& version) {
    return Host(HostType::Premiere, "premiere", version);
}
HostRecord Vegas(const std::string& version) {
    return Host(HostType::Vegas, "vegas", version);
}

/// Finds what the test tells it to find, and counts how often it was asked.
class ToldDetector : public HV::HostAppDetector {
public:
    explicit ToldDetector(std::vector<HostRecord> toFind, bool toAnswer = true)
        : found(std::move(toFind)), answer(toAnswer) {}
    bool Run(std::vector<HostRecord>& hosts) override {
        EXPECT_TRUE(hosts.empty());
        ++runs;
        hosts = found;
        return answer;
    }

    std::vector<HostRecord> found;
    bool answer;
    int runs = 0;
};

class BrokenDetector : public HV::HostAppDetector {
public:
    bool Run(std::vector<HostRecord>&) override { throw std::logic_error("a detector in two minds"); }
};

class HostAppCheckTest : public testing::Test {
protected:
    boost::shared_ptr<ToldDetector> Finds(std::vector<HostRecord> hosts, bool answer = true) {
        auto detector = boost::make_shared<ToldDetector>(std::move(hosts), answer);
        check.AddDetector(detector);
        return detector;
    }

    std::vector<std::string> VersionsOf(const std::string& hostRef) {
        std::vector<HostRecord> matches;
        EXPECT_EQ(check.FindHosts(hostRef, matches), check.HasHost(hostRef));
        std::vector<std::string> versions;
        for (const HostRecord& host : matches) {
            versions.push_back(host.hostVersion);
        }
        return versions;
    }

    using Texts = std::vector<std::string>;

    Machine machine;
    HostAppCheck check;
};

TEST_F(HostAppCheckTest, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(check.DetectHosts());
    EXPECT_TRUE(check.Hosts().empty());
}

TEST_F(HostAppCheckTest, KeepsTheOrderOfDetectorsAndOfTheirRecords) {
    Finds({AfterEffects("23"), AfterEffects("22")});
    Finds({Vegas("14")});
    Finds({AfterEffects("21")});
    EXPECT_TRUE(check.DetectHosts());
    EXPECT_EQ(VersionsOf("aftereffects"), (Texts{"23", "22", "21"}));
    ASSERT_EQ(check.Hosts().size(), 4U);
    EXPECT_EQ(check.Hosts()[2].hostVersion, "14");
}

TEST_F(HostAppCheckTest, LeavesOutWhatADetectorFoundThatAnswersFalse) {
    Finds({Vegas("13")}, false);
    Finds({Vegas("14")});
    EXPECT_TRUE(check.DetectHosts());
    EXPECT_EQ(VersionsOf("vegas"), Texts{"14"});
}

TEST_F(HostAppCheckTest, GoesOnAfterADetectorThatFindsNothing) {
    Finds({}, false);
    const auto second = Finds({Vegas("14")});
    EXPECT_TRUE(check.DetectHosts());
    EXPECT_EQ(second->runs, 1);
}

TEST_F(HostAppCheckTest, HasNoHostWhenADetectorAnswersTrueWithoutRecords) {
    Finds({}, true);
    EXPECT_FALSE(check.DetectHosts());
}

TEST_F(HostAppCheckTest, DetectsOnceAndKeepsTheFirstAnswer) {
    const auto detector = Finds({Vegas("14")});
    EXPECT_TRUE(check.DetectHosts());
    detector->found = {Vegas("15"), Vegas("16")};
    EXPECT_TRUE(check.DetectHosts());
    EXPECT_EQ(detector->runs, 1);
    EXPECT_EQ(VersionsOf("vegas"), Texts{"14"});
}

TEST_F(HostAppCheckTest, DoesNotLookAgainAfterItFoundNothing) {
    const auto detector = Finds({}, false);
    EXPECT_FALSE(check.DetectHosts());
    detector->found = {Vegas("15")};
    detector->answer = true;
    EXPECT_FALSE(check.DetectHosts());
    EXPECT_EQ(detector->runs, 1);
}

TEST_F(HostAppCheckTest, DoesNotSeeAHostThatIsInstalledAfterDetection) {
    EXPECT_FALSE(check.DetectHosts());
    machine.Loads("REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Blackmagic Design\\DaVinci Resolve]\n");
    EXPECT_FALSE(check.DetectHosts());
    EXPECT_TRUE(HostAppCheck().DetectHosts());
}

TEST_F(HostAppCheckTest, AnswersReferencesFromWhatIsKnownAndDetectsNothingByItself) {
    const auto detector = Finds({Vegas("14")});
    EXPECT_EQ(VersionsOf("vegas"), Texts{});
    EXPECT_EQ(detector->runs, 0);
}

TEST_F(HostAppCheckTest, EmptiesTheListOfMatchesFirst) {
    std::vector<HostRecord> matches{Vegas("left over")};
    EXPECT_FALSE(check.FindHosts("vegas", matches));
    EXPECT_TRUE(matches.empty());
}

TEST_F(HostAppCheckTest, MatchesEveryVersionOfAHostByItsAbbreviation) {
    Finds({AfterEffects("21"), Premiere("21"), AfterEffects("22"), AfterEffects("23")});
    check.DetectHosts();
    EXPECT_EQ(VersionsOf("aftereffects"), (Texts{"21", "22", "23"}));
    EXPECT_EQ(VersionsOf("premiere"), Texts{"21"});
}

TEST_F(HostAppCheckTest, ComparesAbbreviationsWholeAndExactly) {
    Finds({AfterEffects("21")});
    check.DetectHosts();
    int checked = 0;
    for (const char* hostRef :
         {"", "after", "AfterEffects", "aftereffects ", "aftereffectsmc", "premiere+aftereffects"}) {
        EXPECT_FALSE(check.HasHost(hostRef)) << hostRef;
        ++checked;
    }
    EXPECT_EQ(checked, 6);
}

TEST_F(HostAppCheckTest, MatchesARecordOfAnUnknownFamilyByItsAbbreviation) {
    Finds({Host(HostType::NotSet, "nuke", "13")});
    check.DetectHosts();
    EXPECT_EQ(VersionsOf("nuke"), Texts{"13"});
    EXPECT_FALSE(check.HasHost("other"));
}

TEST_F(HostAppCheckTest, MeansAfterEffectsAloneByItsMediaCoreReference) {
    Finds({Premiere("20"), AfterEffects("21"), Vegas("14")});
    check.DetectHosts();
    EXPECT_EQ(VersionsOf("aftereffectsMC"), Texts{"21"});
}

TEST_F(HostAppCheckTest, HasNoMediaCoreHostWithPremiereAlone) {
    Finds({Premiere("20")});
    check.DetectHosts();
    EXPECT_FALSE(check.HasHost("aftereffectsMC"));
}

TEST_F(HostAppCheckTest, MeansBothAdobeHostsByTheirCombinedReference) {
    Finds({AfterEffects("21"), Vegas("14"), Premiere("20")});
    check.DetectHosts();
    EXPECT_EQ(VersionsOf("aftereffects+premiere"), (Texts{"21", "20"}));
}

TEST_F(HostAppCheckTest, AnswersTheCombinedReferenceWithEitherHostAlone) {
    Finds({AfterEffects("21")});
    check.DetectHosts();
    EXPECT_EQ(VersionsOf("aftereffects+premiere"), Texts{"21"});
}

TEST_F(HostAppCheckTest, HasNoHostForReferencesWithoutADetector) {
    Finds({AfterEffects("21"), Premiere("20"), Vegas("14")});
    check.DetectHosts();
    int checked = 0;
    for (const char* hostRef : {"finalcutprox", "motion", "ofx"}) {
        EXPECT_EQ(VersionsOf(hostRef), Texts{}) << hostRef;
        ++checked;
    }
    EXPECT_EQ(checked, 3);
}

TEST_F(HostAppCheckTest, SaysThatItDetectsWhenItIsVerboseAndDoesSo) {
    check.SetVerbose(true);
    CapturedStreams streams;
    check.DetectHosts();
    check.DetectHosts();
    EXPECT_EQ(streams.Output(), "Running host detectors...");
}

TEST_F(HostAppCheckTest, SaysNothingWhenItIsNotVerbose) {
    CapturedStreams streams;
    check.DetectHosts();
    EXPECT_EQ(streams.Output(), "");
}

TEST_F(HostAppCheckTest, LetsADetectorsExceptionThrough) {
    check.AddDetector(boost::make_shared<BrokenDetector>());
    EXPECT_THROW(check.DetectHosts(), std::logic_error);
}

TEST_F(HostAppCheckTest, AsksThePlatformsDetectorsInTheirOrderAndAddedOnesLast) {
    machine.Loads(R"(REGEDIT4

[HKEY_LOCAL_MACHINE\SOFTWARE\Sony Creative Software\Vegas Pro\14.0]
"InstallPath"="C:\\Vegas\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Blackmagic Design\DaVinci Resolve]

[HKEY_LOCAL_MACHINE\SOFTWARE\Avid Technology\Avid Media Composer]

[HKEY_LOCAL_MACHINE\SOFTWARE\Avid Technology\AVX Plug-ins]

[HKEY_LOCAL_MACHINE\SOFTWARE\FXHOME\HitFilm Pro\Paths]

[HKEY_LOCAL_MACHINE\SOFTWARE\Grass Valley\EDIUS\9\Installation\EDIUS]
"DestDir"="C:\\Edius\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Adobe\Premiere Pro\14.0]
"PluginInstallPath"="C:\\Premiere\\Plug-ins\\Common\\"
"CommonPluginInstallPath"="C:\\MediaCore\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Adobe\After Effects\17.0]
"InstallPath"="C:\\AE\\Support Files\\"
"PluginInstallPath"="C:\\AE\\Plug-ins\\"
"CommonPluginInstallPath"="C:\\MediaCore\\"
)");
    Finds({AfterEffects("told")});
    EXPECT_TRUE(check.DetectHosts());
    Texts found;
    for (const HostRecord& host : check.Hosts()) {
        found.push_back(host.hostAbbreviation);
    }
    EXPECT_EQ(found, (Texts{"aftereffects", "premiere", "edius", "hitfilm", "mediacomposer", "resolve", "vegas",
                            "aftereffects"}));
}

}  // namespace
