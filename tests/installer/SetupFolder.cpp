#include "tests/installer/SetupFolder.h"

#include <deque>
#include <utility>
#include <vector>

#include "package/HeldFile.h"

namespace {

/// The texts of the table, which stay where they are when it grows.
std::deque<std::string> texts;
std::vector<HV::ValidationRow> table;
std::vector<HV::ReleaseDigest> digests;
std::function<void()> whenAsked;

const std::string& Keep(const std::string& text) {
    return texts.emplace_back(text);
}

std::span<const HV::ValidationRow> Rows() {
    if (const auto action = std::exchange(whenAsked, nullptr)) {
        action();
    }
    return table;
}

std::span<const HV::ReleaseDigest> Digests() {
    return digests;
}

}  // namespace

HV::Release SetupRelease() {
    return {kPackages, Rows, Digests};
}

std::string InPackages(const std::string& fileName) {
    return std::string(kPackages) + "\\" + fileName;
}

SetupFolder::SetupFolder(Machine& onMachine) : machine_(onMachine) {}

SetupFolder::~SetupFolder() {
    whenAsked = nullptr;
    table.clear();
    digests.clear();
    texts.clear();
}

std::string SetupFolder::Ships(const PackageBuilder& package) {
    std::string name = Has(package);
    const HV::FileDigests known = HV::HeldFile(fs::path(InPackages(name))).Digests();
    Knows(name, known.md5, known.sha256);
    return name;
}

std::string SetupFolder::Has(const PackageBuilder& package) {
    return package.WriteTo(kPackages).filename().string();
}

void SetupFolder::HasSuite(const std::string& json, const std::string& fileName) {
    machine_.Has(InPackages(fileName), json);
}

void SetupFolder::Knows(const std::string& fileName, const std::string& md5, const std::string& sha256) {
    table.push_back({Keep(fileName), "None", "", "", Keep(md5)});
    digests.push_back({Keep(fileName), Keep(sha256)});
}

void SetupFolder::WhenTheTableIsAsked(std::function<void()> action) {
    whenAsked = std::move(action);
}
