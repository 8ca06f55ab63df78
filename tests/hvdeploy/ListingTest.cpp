// What "list=" prints, byte for byte.
#include "tests/hvdeploy/CommandLineTest.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr const char* kHistory = R"(C:\ProgramData\Halvorn\.hvdeploy\history\)";

constexpr const char* kResolve = R"(REGEDIT4

[HKEY_LOCAL_MACHINE\SOFTWARE\Blackmagic Design\DaVinci Resolve]
"Version"="17.4.6"
)";

constexpr const char* kVegas = R"(REGEDIT4

[HKEY_LOCAL_MACHINE\SOFTWARE\Sony Creative Software\Shared Information]
"SharedComponentsFolder"="C:\\Program Files\\VEGAS\\Shared Plug-Ins\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Sony Creative Software\Vegas Pro\17.0]
"InstallPath"="C:\\Program Files\\VEGAS\\VEGAS Pro 17.0\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Sony Creative Software\Vegas Pro\18.0]
"InstallPath"="C:\\Program Files\\VEGAS\\VEGAS Pro 18.0\\"
)";

class ListingTest : public CommandLineTest {
protected:
    /// What "list=" with this value prints.
    std::string Listed(const std::string& value) {
        CapturedStreams streams;
        EXPECT_EQ(Run("list=" + value), 0);
        EXPECT_EQ(streams.Errors(), "");
        return streams.Output();
    }
    /// The same from the shipped program, with its log switched off as far as it goes.
    static std::string ListedByProgram(const std::string& value) {
        const ProgramResult result = RunProgram("hvdeploy", {"list=" + value, "loglevel=emerg"});
        EXPECT_EQ(result.exitStatus, 0);
        EXPECT_EQ(result.errors, "");
        return result.output;
    }
    /// The listing of the hosts that the machine has, made of their records.
    static std::string TextOfHosts() {
        HV::HostAppCheck check;
        (void)check.DetectHosts();
        std::string text;
        for (const HV::HostRecord& host : check.Hosts()) {
            text += (text.empty() ? "" : ",\n") + host.ToText();
        }
        return "[\n" + text + "\n]\n";
    }
    void HasRecord(const std::string& stem) { machine.Has(kHistory + stem + "_hvmanifest.xml", "<x/>"); }
};

TEST_F(ListingTest, HasNoHostsOnACleanMachine) {
    EXPECT_EQ(Listed("hosts"), "[]\n");
    EXPECT_EQ(ListedByProgram("hosts"), "[]\n");
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::DoListCommand")));
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::ListHosts")));
    EXPECT_TRUE(log.LinesStartingWith(DebugLine("HV::HostAppCheck found ")).empty());
}

TEST_F(ListingTest, ShowsASingleHostWithoutAComma) {
    machine.Loads(kResolve);
    const std::string text = Listed("hosts");
    EXPECT_EQ(text.rfind("[\n{", 0), 0U) << text;
    EXPECT_NE(text.find("  \"hostAbbreviation\": \"resolve\",\n"), std::string::npos) << text;
    EXPECT_NE(text.find("  \"hostVersion\": \"17.4.6\""), std::string::npos) << text;
    EXPECT_EQ(text.find("},"), std::string::npos) << text;
    EXPECT_EQ(text.substr(text.size() - 5), "\n}\n]\n");
    EXPECT_EQ(text, TextOfHosts());
    EXPECT_EQ(ListedByProgram("hosts"), text);
    EXPECT_TRUE(log.Has(DebugLine("HV::HostAppCheck found 1 host apps... ")));
}

TEST_F(ListingTest, SeparatesHostsByCommas) {
    machine.Loads(kResolve);
    machine.Loads(kVegas);
    const std::string text = Listed("hosts");
    EXPECT_EQ(text, TextOfHosts());
    std::size_t commas = 0;
    for (auto at = text.find("},\n{"); at != std::string::npos; at = text.find("},\n{", at + 1)) {
        ++commas;
    }
    EXPECT_EQ(commas, 2U) << text;
    EXPECT_EQ(text.substr(text.size() - 5), "\n}\n]\n");
    EXPECT_EQ(ListedByProgram("hosts"), text);
    EXPECT_TRUE(log.Has(DebugLine("HV::HostAppCheck found 3 host apps... ")));
}

TEST_F(ListingTest, HasNothingInstalledWithoutAHistory) {
    EXPECT_EQ(Listed("installed"), "");
    EXPECT_EQ(ListedByProgram("installed"), "");
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::ListInstalled")));
}

TEST_F(ListingTest, SortsWhatIsInstalledByBytes) {
    HasRecord("com.halvorn.keyer_v1.0");
    HasRecord("com.halvorn.Zebra_v1.0");
    HasRecord("com.halvorn.glow_v2.0");
    HasRecord("com.halvorn.glow_v10.0");
    const std::string text =
        "com.halvorn.Zebra_v1.0\ncom.halvorn.glow_v10.0\ncom.halvorn.glow_v2.0\ncom.halvorn.keyer_v1.0\n";
    EXPECT_EQ(Listed("installed"), text);
    EXPECT_EQ(ListedByProgram("installed"), text);
}

TEST_F(ListingTest, ShowsNothingButRecordsOfTheHistory) {
    HasRecord("com.halvorn.glow_v2.0");
    machine.Has(kHistory + std::string("notes.txt"), "x");
    machine.Has(kHistory + std::string("com.halvorn.upper_v1_HVMANIFEST.XML"), "x");
    machine.Has(kHistory + std::string("com.halvorn.cut_v1_hvmanifest.xml.bak"), "x");
    machine.HasFolder(kHistory + std::string("folder_v1_hvmanifest.xml"));
    EXPECT_EQ(Listed("installed"), "com.halvorn.glow_v2.0\n");
}

TEST_F(ListingTest, ShowsAnEmptyStem) {
    HasRecord("");
    EXPECT_EQ(Listed("installed"), "\n");
}

TEST_F(ListingTest, ShowsWhatAnInstallationHasRecorded) {
    (void)PackageBuilder("com.halvorn.glow")
        .Version("2.0")
        .Payload("resource")
        .To("programdata", R"(Halvorn\.hvdeploy\history)")
        .File("record/com.halvorn.glow_v2.0_hvmanifest.xml", "<x/>")
        .WriteTo(R"(C:\Packages)");
    EXPECT_EQ(RunProgram("hvdeploy", {R"(dir=C:\Packages)"}).exitStatus, 0);
    EXPECT_EQ(ListedByProgram("installed"), "com.halvorn.glow_v2.0\n");
}

TEST_F(ListingTest, HasNoListingOfPackages) {
    EXPECT_EQ(Listed("packages"), "");
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::ListPackages")));
    EXPECT_EQ(log.Count("WARN hvdeploy-detail: ListPackages not yet implemented."), 1U);
    EXPECT_EQ(ListedByProgram("packages"), "");
}

TEST_F(ListingTest, SaysTheSameOfCommandsAsOfPackages) {
    EXPECT_EQ(Listed("commands"), "");
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::ListCommands")));
    EXPECT_EQ(log.Count("WARN hvdeploy-detail: ListPackages not yet implemented."), 1U);
    EXPECT_EQ(ListedByProgram("commands"), "");
}

TEST_F(ListingTest, PrintsNothingForAnyOtherValue) {
    HasRecord("com.halvorn.glow_v2.0");
    int asked = 0;
    for (const char* value : {"", "HOSTS", "Installed", "host", "hosts,installed", "\"hosts\""}) {
        HV::DeployCLI other(nullptr);
        CapturedStreams streams;
        ASSERT_EQ(other.ParseLine(std::string("list=") + value), 0);
        EXPECT_EQ(other.Run(), 0) << value;
        EXPECT_EQ(streams.Output(), "") << value;
        ++asked;
    }
    EXPECT_EQ(asked, 6);
}

TEST_F(ListingTest, PrintsTheBannerBeforeTheList) {
    EXPECT_EQ(Listed("hosts --version"), "hvdeploy version 2.0-d1\n[]\n");
}

}  // namespace
