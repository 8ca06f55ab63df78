#pragma once

#include <string>

/// The links of the wizard's last page, made from the suite's "product_url". Without that there is no link: an empty
/// text gives an empty text.
namespace HV {

[[nodiscard]] std::string WhatsNewUrl(const std::string& productUrl);
[[nodiscard]] std::string ResourcesUrl(const std::string& productUrl);

}  // namespace HV
