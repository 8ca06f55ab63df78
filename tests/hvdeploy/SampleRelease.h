#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "hvframework/FileUtils.h"
#include "platform/filesystem.h"
#include "tests/support/Machine.h"
#include "tests/support/RunProgram.h"

/// The sample release, installed by the shipped program on a machine that has every host, where other makers and the
/// user have files in the folders that the suite goes into. It takes seconds, so the tests of a suite share one.
class SampleInstallation {
public:
    using Files = std::map<std::string, std::string>;

    static constexpr const char* kPackageFolder = R"(C:\Packages\)";
    static constexpr const char* kScripts = R"(C:\ProgramData\Halvorn\uninstall\)";
    static constexpr const char* kEntry =
        R"(HKEY_LOCAL_MACHINE\SOFTWARE\Microsoft\Windows\CurrentVersion\Uninstall\Tessaly Suite v4.2.0)";

    SampleInstallation() {
        machine.Loads(HostFile("machines/everything.reg"));
        HasFilesOfOthers();
        Ships();
        before = FilesBesideTheRelease();
        result = RunProgram("hvdeploy", {R"(dir=C:\Packages)", "loglevel=error"});
        installed = FilesBesideTheRelease();
        std::erase_if(installed, [this](const auto& file) { return before.count(file.first) != 0; });
        for (const auto& [path, content] : installed) {
            if (path.starts_with(kScripts)) {
                scripts[path] = content;
            }
        }
        std::erase_if(installed, [](const auto& file) { return file.first.starts_with(kScripts); });
    }

    Files FilesBesideTheRelease() const {
        Files files = machine.FilesWithoutFolders();
        std::erase_if(files, [](const auto& file) { return file.first.starts_with(kPackageFolder); });
        return files;
    }

    /// The paths that the lines of a script delete, each once, in Windows 10's spelling: the environment of a machine
    /// here spells the folder of the users as Wine does.
    static std::set<std::string> Deleted(const std::string& script) {
        const std::string start = "CALL DEL /S /F /Q \"";
        std::set<std::string> paths;
        for (auto at = script.find(start); at != std::string::npos; at = script.find(start, at + 1)) {
            const std::size_t from = at + start.size();
            std::string path = script.substr(from, script.find('"', from) - from);
            if (path.starts_with(R"(C:\users\)")) {
                path.replace(0, 9, R"(C:\Users\)");
            }
            paths.insert(path);
        }
        return paths;
    }

    Machine machine;
    Files before;     // without the packages
    Files installed;  // what the run has added, without the scripts for removal
    Files scripts;
    ProgramResult result;

private:
    /// The folder is the host's, which is drive Z on both targets.
    static std::string InSamples(const std::string& name) { return "Z:" HV_SAMPLES "/" + name; }

    static std::string HostFile(const std::string& name) {
        std::string content;
        EXPECT_EQ(HVL::FileUtils::ReadFileToString(InSamples(name), content), 0) << name;
        return content;
    }

    void HasFilesOfOthers() {
        for (const char* path :
             {R"(C:\Program Files\Common Files\OFX\Plugins\Other.ofx.bundle\Contents\Win64\Other.ofx)",
              R"(C:\Program Files\Common Files\OFX\Plugins\Loose.ofx)",
              R"(C:\Program Files\Adobe\Common\Plug-ins\7.0\MediaCore\Other.aex)",
              R"(C:\Program Files\Adobe\Common\Plug-ins\7.0\MediaCore\Halvorn\Tessaly\Mine.aex)",
              R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Presets\Halvorn\Tessaly Glow\mine.ffx)",
              R"(C:\Program Files\Halvorn\Tessaly Viewer\licence.key)",
              R"(C:\Program Files\Halvorn\Tessaly\Libraries\OfAnotherSuite.dll)",
              R"(C:\ProgramData\Halvorn\Tessaly\my own.settings.xml)",
              R"(C:\ProgramData\Halvorn\.hvdeploy\history\com.halvorn.other_v1.0_hvmanifest.xml)",
              R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Halvorn\Tessaly Suite\Other.url)",
              R"(C:\Users\Public\Documents\Halvorn\Tessaly Suite\notes.txt)"}) {
            machine.Has(path, "of another maker");
        }
    }

    /// Packs the release with the shipped program, once for all tests.
    void Ships() {
        static Files release;
        if (release.empty()) {
            machine.HasFolder(kPackageFolder);
            for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(InSamples("tessaly-suite")))) {
                if (fs::is_directory(entry.status())) {
                    const std::string package = kPackageFolder + entry.path().filename().string() + ".hvpkg";
                    const ProgramResult made = RunProgram("hvpack", {"make", entry.path().string(), package});
                    EXPECT_EQ(made.exitStatus, 0) << made.output << made.errors;
                    release[package] = machine.Content(package);
                }
            }
            release[std::string(kPackageFolder) + "suite.json"] = HostFile("tessaly-suite/suite.json");
            EXPECT_EQ(release.size(), 15U);
        }
        for (const auto& [path, content] : release) {
            machine.Has(path, content);
        }
    }
};
