// The links of the last page.
#include "installer/InstallerModel.h"
#include "installer/ProductLinks.h"
#include "installer/WinWizardController.h"

namespace HV {

void WinWizardController::OpenWhatsNew() {
    OpenUrl(WhatsNewUrl(model_.suite.GetValue("product_url")));
}

void WinWizardController::OpenResources() {
    OpenUrl(ResourcesUrl(model_.suite.GetValue("product_url")));
}

void WinWizardController::OpenUrl(const std::string& url) {
    if (!url.empty()) {
        toolkit_.ShellExecuteA(*window, url);
    }
}

}  // namespace HV
