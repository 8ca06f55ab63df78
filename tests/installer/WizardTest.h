#pragma once

#include <string>

#include "tests/installer/SetupFolder.h"
#include "tests/installer/WizardWalk.h"

/// A wizard with packages that its test ships, and a suite file beside them.
class WizardTest : public WizardWalk {
protected:
    WizardTest();
    ~WizardTest() override;

    static PackageBuilder Product(const std::string& name);
    /// A product whose one payload goes into the plug-in folders of a host.
    static PackageBuilder HostProduct(const std::string& name, const std::string& hostRef);
    static PackageBuilder Hidden(const std::string& name);
    /// The file that Product() and Hidden() place, and what is in it.
    static std::string PlaceOf(const std::string& name) { return R"(C:\ProgramData\Products\)" + name + ".txt"; }
    static std::string TextOf(const std::string& name) { return "text of " + name; }

    void Ships(const PackageBuilder& package) { (void)setup.Ships(package); }
    void ShipsSuiteWithUrl(const std::string& url);
    void RemovePackagesFolder() const;

    SetupFolder setup{machine};
};
