#pragma once

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hvframework/FileUtils.h"
#include "installer/InstallerModel.h"
#include "tests/installer/SetupFolder.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

using Texts = std::vector<std::string>;

/// A machine with a setup folder, and the wizard's model of both.
class ModelTest : public testing::Test {
protected:
    /// The model as the start of the wizard makes it.
    HV::InstallerModel& Load() {
        LetGo();
        CapturedStreams streams;
        model_ = std::make_unique<HV::InstallerModel>(SetupRelease());
        model_->Load();
        errors = streams.Errors();
        return *model_;
    }

    /// The files that the model holds are free again.
    void LetGo() { model_.reset(); }

    /// After Effects 22 and Media Composer; no other host.
    void HasTwoHosts() {
        machine.Loads(R"(REGEDIT4

[HKEY_LOCAL_MACHINE\SOFTWARE\Adobe\After Effects\22.0]
"InstallPath"="C:\\Program Files\\Adobe\\Adobe After Effects 2022\\Support Files\\"
"PluginInstallPath"="C:\\Program Files\\Adobe\\Adobe After Effects 2022\\Support Files\\Plug-ins\\"
"CommonPluginInstallPath"="C:\\Program Files\\Adobe\\Common\\Plug-ins\\7.0\\MediaCore\\"

[HKEY_LOCAL_MACHINE\SOFTWARE\Avid Technology\Avid Media Composer]
"InstallDir"="C:\\Program Files\\Avid\\Avid Media Composer\\"
"InstallFile"="C:\\Program Files\\Avid\\Avid Media Composer\\AvidMediaComposer.exe"
"Version"="20.12.1.56139"

[HKEY_LOCAL_MACHINE\SOFTWARE\Avid Technology\AVX Plug-ins]
"AVX2Directory"="C:\\Program Files\\Avid\\AVX2_Plug-ins"
)");
    }

    /// A product that the user sees and that needs no host.
    static PackageBuilder Product(const std::string& name) {
        return PackageBuilder("com.halvorn." + name)
            .Policy("show", "true")
            .Payload("resource")
            .To("programfiles", "Halvorn")
            .File(name + ".dat", "data of " + name);
    }

    static std::string DetailError(const std::string& text) { return "ERROR hvdeploy-detail: " + text; }

    Machine machine;
    LogRecorder log;
    SetupFolder setup{machine};
    std::string errors;  // what the last Load() wrote to standard error

private:
    std::unique_ptr<HV::InstallerModel> model_;
};
