#include "tests/installer/WizardTest.h"

#include "hvframework/FileUtils.h"

WizardTest::WizardTest() : WizardWalk(SetupRelease()) {
    ShipsSuiteWithUrl("https://www.example.com/tessaly");
}

// Ahead of the setup folder's end.
WizardTest::~WizardTest() {
    EndTheRun();
}

PackageBuilder WizardTest::Product(const std::string& name) {
    return Hidden(name).Policy("show", "true");
}

PackageBuilder WizardTest::HostProduct(const std::string& name, const std::string& hostRef) {
    return PackageBuilder("com.halvorn." + name)
        .DisplayName(name)
        .Policy("show", "true")
        .Payload("plugin")
        .ForHost(hostRef)
        .File(name + ".aex", TextOf(name));
}

PackageBuilder WizardTest::Hidden(const std::string& name) {
    return PackageBuilder("com.halvorn." + name)
        .DisplayName(name)
        .Payload("resource")
        .To("programdata", "Products")
        .File(name + ".txt", TextOf(name));
}

void WizardTest::ShipsSuiteWithUrl(const std::string& url) {
    setup.HasSuite(R"({"identifier": "com.halvorn.tessaly-suite", "version": "4.2.0", "product_type": "0", )"
                   R"("display_name": "Tessaly Suite", "product_url": ")" +
                   url + R"("})");
}

void WizardTest::RemovePackagesFolder() const {
    ASSERT_EQ(HVL::FileUtils::DeleteFileOrDirectory(kPackages), 0);
}
