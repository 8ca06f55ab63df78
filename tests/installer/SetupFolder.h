#pragma once

#include <functional>
#include <string>

#include "installer/InstallerModel.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

constexpr const char* kPackages = R"(C:\Setup\packages)";

/// The release that the setup folder of a test consists of: what SetupFolder is told goes into its tables.
HV::Release SetupRelease();

/// The path of a file in the packages folder.
std::string InPackages(const std::string& fileName);

/// What SetupRelease() consists of: the packages folder of a wizard in `C:\Setup`, and the validation table by which
/// the wizard knows it.
///
/// At first the table is empty and there is no packages folder. One at a time.
class SetupFolder {
public:
    explicit SetupFolder(Machine& onMachine);
    ~SetupFolder();
    SetupFolder(const SetupFolder&) = delete;
    SetupFolder& operator=(const SetupFolder&) = delete;

    /// A package in the folder that the table knows. Gives the name of its file.
    std::string Ships(const PackageBuilder& package);
    /// A package in the folder that the table does not know.
    std::string Has(const PackageBuilder& package);
    void HasSuite(const std::string& json = R"({"identifier": "com.halvorn.suite", "version": "4.2.0",)"
                                            R"( "display_name": "Tessaly Suite", "product_type": "0"})",
                  const std::string& fileName = "suite.json");
    /// Another row of the table, and its second digest: the one of no bytes unless it is given.
    void Knows(const std::string& fileName, const std::string& md5,
               const std::string& sha256 = "e3b0c44298fc1c149afbf4c8996fb92427ae41e4649b934ca495991b7852b855");
    /// What happens, once, when the table is next asked for: after the listing of the folder, before the look at its
    /// packages.
    void WhenTheTableIsAsked(std::function<void()> action);

private:
    Machine& machine_;
};
