#pragma once

#include <functional>
#include <string>

#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

constexpr const char* kPackages = R"(C:\Setup\packages)";

/// The path of a file in the packages folder.
std::string InPackages(const std::string& fileName);

/// What a release consists of: the packages folder beside the wizard's program, and the validation table that is
/// compiled into it. A program that links this has the rows that the test asks for, and its wizard lies in `C:\Setup`.
///
/// At first the table is empty and there is no packages folder. The wizard's model is forgotten with the object. One at
/// a time.
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
    /// What happens, once, when the table is next asked for: behind the listing of the folder, ahead of the look at its
    /// packages.
    void WhenTheTableIsAsked(std::function<void()> action);

private:
    Machine& machine_;
};
