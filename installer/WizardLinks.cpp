// The links of the last page.
#include "installer/InstallerModel.h"
#include "installer/ProductLinks.h"
#include "installer/WinWizardController.h"

namespace HV {
namespace {

std::string ProductUrl() {
    return InstallerModel::Instance().suite.GetValue("product_url");
}

}  // namespace

void WinWizardController::OpenWhatsNew() {
    OpenUrl(WhatsNewUrl(ProductUrl()));
}

void WinWizardController::OpenResources() {
    OpenUrl(ResourcesUrl(ProductUrl()));
}

void WinWizardController::OpenUrl(const std::string& url) {
    if (!url.empty()) {
        toolkit_.ShellExecuteA(*window, url);
    }
}

}  // namespace HV
