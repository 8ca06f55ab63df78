// The shipped program as a user starts it: what it prints, what it gives back, what the machine looks like.
#include <gtest/gtest.h>

#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr const char* kFolder = R"(C:\Packages)";
const std::string kHome = R"(C:\ProgramData\Halvorn\)";

PackageBuilder Product(const std::string& name) {
    return PackageBuilder("com.halvorn." + name)
        .Version("1.0")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File(name + ".txt", "text of " + name);
}

class EndToEndTest : public testing::Test {
protected:
    static ProgramResult Deploy(const std::vector<std::string>& more = {}) {
        std::vector<std::string> arguments{std::string("dir=") + kFolder};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return RunProgram("hvdeploy", arguments);
    }
    /// The files besides the packages.
    std::map<std::string, std::string> Files() const {
        auto files = machine.FilesWithoutFolders();
        std::erase_if(files, [](const auto& file) { return file.first.rfind(kFolder, 0) == 0; });
        return files;
    }
    using Contents = std::map<std::string, std::string>;

    Machine machine;
};

TEST_F(EndToEndTest, InstallsThreePhasesOfPackages) {
    (void)Product("before").Named("preflight-before.hvpkg").WriteTo(kFolder);
    (void)Product("glow").WriteTo(kFolder);
    (void)Product("flare").Named("FLARE.zip").WriteTo(kFolder);
    (void)Product("after").Named("postflight-after.hvpkg").WriteTo(kFolder);
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(result.errors, "hvdeploy: installed\n");
    EXPECT_EQ(Files(), (Contents{{kHome + "before.txt", "text of before"},
                                 {kHome + "glow.txt", "text of glow"},
                                 {kHome + "flare.txt", "text of flare"},
                                 {kHome + "after.txt", "text of after"}}));
    const auto placeOf = [&](const std::string& text) { return result.output.find("INFO hvdeploy-detail : " + text); };
    EXPECT_LT(placeOf("Installing preflight-before.hvpkg..."), placeOf("Deploying Main Packages"));
    EXPECT_LT(placeOf("Deploying Main Packages"), placeOf("Installing com.halvorn.glow.hvpkg..."));
    EXPECT_LT(placeOf("Completing installation."), placeOf("Installing postflight-after.hvpkg..."));
    EXPECT_LT(placeOf("Installing postflight-after.hvpkg..."), placeOf("Installation complete."));
    EXPECT_NE(placeOf("Installation complete."), std::string::npos);
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST_F(EndToEndTest, PrintsTheBannerAndEachPackageWhenItIsVerbose) {
    (void)Product("glow").DisplayName("Glow").WriteTo(kFolder);
    const ProgramResult result = Deploy({"--verbose", "loglevel=emerg"});
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_EQ(result.output,
              "hvdeploy version 2.0-d1\n"
              "Copyright (c) Halvorn LLC. All rights reserved.\n"
              "Use of this program and of what it installs is subject to the licence agreement.\n"
              "=====\n"
              "Installing com.halvorn.glow.hvpkg...\n"
              "[v] Deploying payload payload-1\n");
}

TEST_F(EndToEndTest, LeavesASuiteThatCanBeRemoved) {
    machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
    (void)Product("glow").Policy("uninstall", "true").WriteTo(kFolder);
    EXPECT_EQ(Deploy().exitStatus, 0);
    EXPECT_TRUE(machine.HasFile(kScriptPath));
    EXPECT_NE(machine.Registry().find(R"(\Uninstall\Tessaly Suite v3.1])"), std::string::npos) << machine.Registry();
}

TEST_F(EndToEndTest, PutsTheMachineBackWhenALaterPackageFails) {
    machine.Has(kHome + "before.txt", "the old one");
    const Contents before = Files();
    const std::string registry = machine.Registry();
    (void)Product("before").Named("preflight-before.hvpkg").WriteTo(kFolder);
    (void)Product("glow").Payload("resource").File("x.dll", "x").To("nowhere").WriteTo(kFolder);
    (void)Product("after").Named("postflight-after.hvpkg").WriteTo(kFolder);
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find("ERROR hvdeploy-detail : UNSUPPORTED payload sysdir value: nowhere\n"),
              std::string::npos);
    EXPECT_NE(result.output.find("INFO hvdeploy-detail : An error has occured\n"), std::string::npos);
    EXPECT_EQ(Files(), before);
    EXPECT_EQ(machine.Registry(), registry);
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST_F(EndToEndTest, FailsForAPackageWhoseExtensionIsInUpperCase) {
    // The folder takes it for a package, and the package does not: it has no name then.
    (void)Product("flare").Named("FLARE.ZIP").WriteTo(kFolder);
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find("WARN hvdeploy-detail : In HV::Package::Validate - zip does not exist at \n"),
              std::string::npos)
        << result.output;
    EXPECT_EQ(Files(), Contents{});
}

TEST_F(EndToEndTest, FailsOnGarbageAndLeavesTheMachineAsItWas) {
    machine.Has(R"(C:\Packages\broken.hvpkg)", "this is no archive");
    const Contents before = Files();
    EXPECT_EQ(Deploy().exitStatus, 1);
    EXPECT_EQ(Files(), before);
}

TEST_F(EndToEndTest, FailsWithTheErrorForTesting) {
    (void)Product("glow").WriteTo(kFolder);
    const ProgramResult result = Deploy({"--error"});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find("creating a fatal error for testing purposes."), std::string::npos);
    EXPECT_EQ(Files(), Contents{});
}

TEST_F(EndToEndTest, LeavesOutWhatItIsToldToSkip) {
    (void)Product("glow").WriteTo(kFolder);
    (void)Product("flare").WriteTo(kFolder);
    EXPECT_EQ(Deploy({"skip=com.halvorn.glow"}).exitStatus, 0);
    EXPECT_EQ(Files(), (Contents{{kHome + "flare.txt", "text of flare"}}));
}

TEST_F(EndToEndTest, InstallsOnePackage) {
    (void)Product("glow").Named("my glow.hvpkg").WriteTo(kFolder);
    (void)Product("flare").WriteTo(kFolder);
    // The name of a file is taken with its quotes.
    const ProgramResult quoted = RunProgram("hvdeploy", {R"(file="C:\Packages\com.halvorn.flare.hvpkg")"});
    EXPECT_EQ(quoted.exitStatus, 1);
    EXPECT_EQ(Files(), Contents{});
    const ProgramResult plain = RunProgram("hvdeploy", {R"(file=C:\Packages\my glow.hvpkg)"});
    EXPECT_EQ(plain.exitStatus, 0);
    EXPECT_EQ(Files(), (Contents{{kHome + "glow.txt", "text of glow"}}));
}

TEST_F(EndToEndTest, InstallsTheSameAgain) {
    (void)Product("glow").WriteTo(kFolder);
    EXPECT_EQ(Deploy().exitStatus, 0);
    const Contents once = Files();
    machine.Has(kHome + "glow.txt", "changed by hand");
    EXPECT_EQ(Deploy().exitStatus, 0);
    EXPECT_EQ(Files(), once);
}

TEST_F(EndToEndTest, KeepsANewerVersionThatTheHistoryKnows) {
    machine.Has(R"(C:\ProgramData\Halvorn\.hvdeploy\history\com.halvorn.glow_v1.1_hvmanifest.xml)", "<x/>");
    (void)Product("glow").WriteTo(kFolder);
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_NE(result.output.find("Skipping package com.halvorn.glow (v. 1.0)\n"), std::string::npos);
    EXPECT_FALSE(machine.Exists(kHome + "glow.txt"));
}

TEST_F(EndToEndTest, FailsForAMissingProductButKeepsWhatItPlaced) {
    (void)Product("glow").DependsOn("com.halvorn.core").WriteTo(kFolder);
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find("requires package com.halvorn.core, not found or installed."), std::string::npos);
    EXPECT_EQ(Files(), (Contents{{kHome + "glow.txt", "text of glow"}}));
}

}  // namespace
