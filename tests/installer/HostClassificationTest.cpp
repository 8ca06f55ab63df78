// Which packages need a host, and which hosts they will use. The machine has After Effects and Media Composer.
#include "tests/installer/ModelTest.h"

namespace {

class HostClassificationTest : public ModelTest {
protected:
    HostClassificationTest() {
        setup.HasSuite();
        HasTwoHosts();
    }

    /// What the wizard knows of this package, which is alone in its release.
    HV::PackageInfo Classify(const PackageBuilder& package) {
        setup.Ships(package);
        const HV::InstallerModel& model = Load();
        EXPECT_TRUE(model.valid) << log.Text();
        return model.packages.empty() ? HV::PackageInfo() : model.packages.front();
    }

    static PackageBuilder Glow() { return PackageBuilder("com.halvorn.glow").Policy("show", "true"); }

    /// A payload for After Effects.
    static PackageBuilder& AddPlugin(PackageBuilder& package, const Texts& hosts) {
        package.Payload("plugin").File("Glow.aex", "plugin");
        for (const std::string& host : hosts) {
            package.ForHost(host);
        }
        return package;
    }
    /// A payload that any machine can take.
    static PackageBuilder& AddProgram(PackageBuilder& package) {
        return package.Payload("app").To("programfiles", "Halvorn").File("Glow.exe", "program");
    }
};

TEST_F(HostClassificationTest, EveryKindOfPayloadIsClassifiedByTypeDeploymentSystemAndHosts) {
    const Texts types{"app",      "plugin", "presets", "library", "framework",
                      "resource", "help",   "script",  "patch",   "anything"};
    const Texts deployments{"", "app", "sysdir", "hostplugins", "hostapp", "hostpresets", "run", "hostscripts"};
    const Texts systems{"", "*", "win", "windows10", "mac", "Win"};
    const Texts hosts{"", "mediacomposer", "vegas"};
    std::map<std::string, std::string> expected;  // product to "requires found refs"
    for (const std::string& type : types) {
        for (const std::string& deployment : deployments) {
            if (deployment.empty() && type != "app" && type != "plugin") {
                continue;  // such a payload is no payload
            }
            for (const std::string& system : systems) {
                for (const std::string& host : hosts) {
                    const std::string id = "p" + std::to_string(expected.size());
                    PackageBuilder package(id);
                    package.Payload(type).Deployment(deployment).Os(system).SysDir("programfiles").File("f", id);
                    if (!host.empty()) {
                        package.ForHost(host);
                    }
                    setup.Ships(package);
                    const bool goesIntoHosts = type == "plugin" || (deployment.starts_with("host"));
                    const bool isForUs = system != "mac" && system != "Win";
                    const bool free = isForUs && !goesIntoHosts && host.empty();
                    const bool found = isForUs && host == "mediacomposer";
                    expected[id] = std::string(free ? "free" : "needs") + (found ? " found mediacomposer" : "");
                }
            }
        }
    }
    const HV::InstallerModel& model = Load();
    ASSERT_TRUE(model.valid) << log.Text();
    std::size_t compared = 0;
    for (const HV::PackageInfo& package : model.packages) {
        std::string actual = package.requiresHost ? "needs" : "free";
        actual += package.hostFound ? " found" : "";
        for (const std::string& ref : package.hostRefs) {
            actual += " " + ref;
        }
        EXPECT_EQ(actual, expected.at(package.identifier)) << package.identifier;
        ++compared;
    }
    EXPECT_EQ(compared, (10U * 7U + 2U) * 6U * 3U);
}

TEST_F(HostClassificationTest, AnEmptySystemIsNobodys) {
    const HV::PackageInfo info =
        Classify(PackageBuilder("com.halvorn.glow")
                     .ManifestText(R"(<hvmanifest version="1.0" product="com.halvorn.glow")"
                                   R"( productversion="1"><contents>)"
                                   R"(<payload id="a" type="app" os=""/></contents></hvmanifest>)"));
    EXPECT_TRUE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
}

TEST_F(HostClassificationTest, APackageWithoutPayloadsNeedsAHostThatIsNotThere) {
    const HV::PackageInfo info = Classify(Glow());
    EXPECT_TRUE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{});
}

TEST_F(HostClassificationTest, APluginWithoutHostsNeedsAHostThatIsNotThere) {
    PackageBuilder package = Glow();
    const HV::PackageInfo info = Classify(AddPlugin(package, {}));
    EXPECT_TRUE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
}

TEST_F(HostClassificationTest, APayloadThatNeedsNoHostMakesThePackageFree) {
    PackageBuilder package = Glow();
    AddProgram(package);
    const HV::PackageInfo info = Classify(AddPlugin(package, {"aftereffects"}));
    EXPECT_FALSE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{}) << "the look ends before the plug-in";
}

TEST_F(HostClassificationTest, TheHostsAheadOfAFreePayloadAreKept) {
    PackageBuilder package = Glow();
    AddPlugin(package, {"aftereffects"});
    AddProgram(package);
    const HV::PackageInfo info = Classify(AddPlugin(package, {"mediacomposer"}));
    EXPECT_FALSE(info.requiresHost);
    EXPECT_FALSE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{"aftereffects"});
}

TEST_F(HostClassificationTest, AFreePayloadForAnotherSystemDoesNotCount) {
    PackageBuilder package = Glow();
    AddProgram(package).Os("mac");
    const HV::PackageInfo info = Classify(AddPlugin(package, {"aftereffects"}));
    EXPECT_TRUE(info.requiresHost);
    EXPECT_TRUE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{"aftereffects"});
}

TEST_F(HostClassificationTest, OnlyTheFirstFoundHostOfAPayloadIsUsed) {
    PackageBuilder package = Glow();
    const HV::PackageInfo info = Classify(AddPlugin(package, {"vegas", "mediacomposer", "aftereffects", "resolve"}));
    EXPECT_TRUE(info.requiresHost);
    EXPECT_TRUE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{"mediacomposer"});
}

TEST_F(HostClassificationTest, EveryPayloadAddsItsHostOnce) {
    PackageBuilder package = Glow();
    AddPlugin(package, {"mediacomposer"});
    AddPlugin(package, {"aftereffects"});
    AddPlugin(package, {"vegas"});
    AddPlugin(package, {"mediacomposer"});
    const HV::PackageInfo info = Classify(AddPlugin(package, {"aftereffectsMC"}));
    EXPECT_EQ(info.hostRefs, (Texts{"mediacomposer", "aftereffects", "aftereffectsMC"}));
}

TEST_F(HostClassificationTest, ALaterPayloadWithoutItsHostTakesNothingBack) {
    PackageBuilder package = Glow();
    AddPlugin(package, {"aftereffects"});
    const HV::PackageInfo info = Classify(AddPlugin(package, {"vegas"}));
    EXPECT_TRUE(info.requiresHost);
    EXPECT_TRUE(info.hostFound);
}

TEST_F(HostClassificationTest, CombinedReferencesAreKeptAsTheManifestWritesThem) {
    PackageBuilder package = Glow();
    const HV::PackageInfo info = Classify(AddPlugin(package, {"aftereffects+premiere"}));
    EXPECT_TRUE(info.hostFound);
    EXPECT_EQ(info.hostRefs, Texts{"aftereffects+premiere"});
}

}  // namespace
