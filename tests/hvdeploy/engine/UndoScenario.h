#pragma once

#include <map>
#include <memory>

#include "tests/hvdeploy/engine/EngineTest.h"

/// A suite of three phases that replaces files and folders of an older one: files, a folder bundle, a wildcard, host
/// payloads and system directories. Its last package fails when `fails`, so that everything before it is undone.
class UndoTest : public testing::Test {
protected:
    using Files = std::map<std::string, std::string>;

    struct Outcome {
        HV::EngineResult result = 0;
        Files files;
        std::vector<std::string> temp;  // when the engine is gone
        std::size_t reports = 0;
        std::vector<std::string> lines;
    };

    static void HasOlderSuite(Machine& machine) {
        machine.Has(R"(C:\ProgramData\Halvorn\runtime.dll)", "old runtime");
        machine.Has(R"(C:\Hosts\ae22\Plug-ins\Glow.aex)", "old glow");
        machine.Has(R"(C:\Hosts\MediaCore\Grain.aex)", "old grain");
        machine.Has(R"(C:\Program Files\Common Files\OFX\Plugins\Glow.ofx.bundle\Contents\Old.ofx)", "old ofx");
        machine.Has(R"(C:\Users\Public\Documents\Halvorn\soft.ffx)", "old soft");
        machine.Has(R"(C:\Users\Public\Documents\Halvorn\mine.ffx)", "the user's own");
    }

    static void ShipsSuite(bool fails) {
        (void)PackageBuilder("com.halvorn.runtime")
            .Named("preflight-runtime.hvpkg")
            .Payload("library")
            .To("programdata", "Halvorn")
            .File("runtime.dll", "new runtime")
            .WriteTo(kPackages);
        (void)PackageBuilder("com.halvorn.glow")
            .Payload("plugin")
            .ForHost("aftereffects")
            .File("Glow.aex", "new glow")
            .Payload("plugin")
            .ForHost("aftereffects+premiere")
            .File("Grain.aex", "new grain")
            .Payload("resource")
            .To("ofx")
            .Source("ofx/Glow.ofx.bundle")
            .File("ofx/Glow.ofx.bundle/Contents/New.ofx", "new ofx")
            .Payload("presets")
            .To("commondocs", "Halvorn")
            .Source("presets/*")
            .File("presets/soft.ffx", "new soft")
            .File("presets/more/hard.ffx", "new hard")
            .WriteTo(kPackages);
        PackageBuilder support("com.halvorn.support");
        support.Named("postflight-support.hvpkg")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("support.dll", "support");
        if (fails) {
            support.Payload("resource").To("nowhere").File("lost.dll", "x");
        }
        (void)support.WriteTo(kPackages);
    }

    /// What counts of a machine: not the packages, not the scripts for removal, which a way back does not take away.
    static Files FilesOf(const Machine& machine) {
        Files files = machine.FilesWithoutFolders();
        std::erase_if(files, [](const auto& item) {
            return item.first.rfind(kPackages, 0) == 0 ||
                   item.first.rfind(R"(C:\ProgramData\Halvorn\uninstall\)", 0) == 0;
        });
        return files;
    }

    /// Runs the suite on `machine`; `onReport` hears of each report, with the engine.
    static Outcome Run(const Machine& machine, const std::function<void(std::size_t, HV::Deploy*)>& onReport = {}) {
        Outcome outcome;
        LogRecorder log;
        RecordingListener listener;
        {
            std::unique_ptr<HV::Deploy> engine;
            listener.onReport = [&](std::size_t report) {
                if (onReport) {
                    onReport(report, engine.get());
                }
            };
            engine = std::make_unique<HV::Deploy>(&listener);
            engine->HostCheck().AddDetector(
                boost::make_shared<TestHosts>(std::vector{AfterEffects("ae22"), Premiere("pr22")}));
            outcome.result = engine->DeployPackagesFromDirectory(fs::path(kPackages), {});
        }
        outcome.files = FilesOf(machine);
        outcome.temp = machine.TempEntries();
        outcome.reports = listener.reports.size();
        outcome.lines = log.Lines();
        return outcome;
    }

    static bool Has(const Outcome& outcome, const std::string& start) {
        return std::any_of(outcome.lines.begin(), outcome.lines.end(),
                           [&](const std::string& line) { return line.rfind(start, 0) == 0; });
    }
    static std::string Text(const Outcome& outcome) {
        std::string text;
        for (const std::string& line : outcome.lines) {
            text += line + "\n";
        }
        return text;
    }
};
