#include "installer/ProductLinks.h"

#include "hvframework/StringUtils.h"

namespace HV {
namespace {

std::string PageBelow(const std::string& url, const char* page) {
    return url + (HVL::StringUtils::EndsWith(url, "/") ? "" : "/") + page;
}

bool Names(const std::string& url, const char* suite) {
    return url.find(suite) != std::string::npos;
}

}  // namespace

// The sites of these two suites tell their news on the product's own page. They do have resources.
std::string WhatsNewUrl(const std::string& productUrl) {
    const bool hasNewsPage = !Names(productUrl, "lantern-suite") && !Names(productUrl, "harbour-suite");
    return productUrl.empty() || !hasNewsPage ? productUrl : PageBelow(productUrl, "whats-new/");
}

std::string ResourcesUrl(const std::string& productUrl) {
    return productUrl.empty() ? productUrl : PageBelow(productUrl, "resources/");
}

}  // namespace HV
