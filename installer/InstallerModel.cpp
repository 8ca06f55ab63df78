#include "installer/InstallerModel.h"

#include <algorithm>
#include <iostream>
#include <utility>

#include "installer/StartUp.h"

namespace HV {
namespace {

// Never released when the process ends: pages that are still there may ask it.
InstallerModel* theModel = nullptr;

bool LacksHost(const PackageInfo& package) {
    return package.requiresHost && !package.hostFound;
}

}  // namespace

InstallerModel& InstallerModel::Instance() {
    if (theModel == nullptr) {
        theModel = new InstallerModel({.packagesDirectory = PackagesDirectoryPath()});
    }
    if (!theModel->loaded) {
        theModel->Load();
    }
    return *theModel;
}

void InstallerModel::Forget() {
    delete theModel;
    theModel = nullptr;
}

InstallerModel::InstallerModel(Release release) : release_(std::move(release)) {}

void InstallerModel::Load() {
    // First of all, so that nothing is loaded twice, whatever becomes of the rest.
    loaded = true;
    hostCheck.DetectHosts();
    if (ScanPackages()) {
        valid = ValidatePackages();
    }
    LoadStringsResource();
    // The name goes first: a name that holds "${VERSION}" or "${endl}" has that filled in too.
    strings.ReplaceAll("${PRODUCTNAME}", suite.GetDisplayName());
    strings.ReplaceAll("${VERSION}", suite.GetVersion());
    strings.ReplaceAll("${endl}", "\r\n");
}

// A table that cannot be read leaves the windows without titles, which is no reason not to install.
void InstallerModel::LoadStringsResource() {
    if (!strings.Parse(LoadStringsText())) {
        std::cerr << "ERROR: xml strings resource parsing failed." << std::endl;
    }
}

std::string InstallerModel::GetString(const std::string& key) const {
    return strings.GetString(key);
}

std::vector<std::string> InstallerModel::ShownIdentifiers() const {
    std::vector<std::string> identifiers;
    for (const PackageInfo& package : packages) {
        if (package.show) {
            identifiers.push_back(package.identifier);
        }
    }
    return identifiers;
}

PackageInfo InstallerModel::FindPackage(const std::string& identifier) const {
    const auto found = std::ranges::find(packages, identifier, &PackageInfo::identifier);
    return found == packages.end() ? PackageInfo() : *found;
}

// Hidden packages do not count here: they are not the user's to choose, and one that needs no host does not save a
// wizard that has nothing to offer.
bool InstallerModel::AllProductsLackHosts() const {
    bool anyShown = false;
    for (const PackageInfo& package : packages) {
        if (package.show && !LacksHost(package)) {
            return false;
        }
        anyShown = anyShown || package.show;
    }
    return anyShown;
}

bool InstallerModel::SomeProductLacksHost() const {
    return std::ranges::any_of(packages, [](const PackageInfo& package) { return package.show && LacksHost(package); });
}

}  // namespace HV
