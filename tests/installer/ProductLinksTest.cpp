// Where the links of the last page lead.
#include "installer/ProductLinks.h"

#include <gtest/gtest.h>

namespace {

TEST(WhatsNewLink, LeadsBelowTheProductsPage) {
    EXPECT_EQ(HV::WhatsNewUrl("https://www.example.com/tessaly"), "https://www.example.com/tessaly/whats-new/");
}

TEST(WhatsNewLink, DoesNotDoubleTheSlash) {
    EXPECT_EQ(HV::WhatsNewUrl("https://www.example.com/tessaly/"), "https://www.example.com/tessaly/whats-new/");
}

TEST(WhatsNewLink, IsThePageItselfForTwoSuites) {
    for (const std::string url : {"https://www.example.com/lantern-suite", "https://www.example.com/harbour-suite/",
                                  "https://lantern-suite.example.com/a/b?c"}) {
        EXPECT_EQ(HV::WhatsNewUrl(url), url);
    }
}

TEST(WhatsNewLink, LooksForTheSuitesInThisCaseAlone) {
    EXPECT_EQ(HV::WhatsNewUrl("https://x/Lantern-Suite"), "https://x/Lantern-Suite/whats-new/");
    EXPECT_EQ(HV::WhatsNewUrl("https://x/lantern"), "https://x/lantern/whats-new/");
}

TEST(WhatsNewLink, IsNoneWithoutAPage) {
    EXPECT_EQ(HV::WhatsNewUrl(""), "");
}

TEST(ResourcesLink, LeadsBelowTheProductsPage) {
    EXPECT_EQ(HV::ResourcesUrl("https://www.example.com/tessaly"), "https://www.example.com/tessaly/resources/");
}

TEST(ResourcesLink, DoesNotDoubleTheSlash) {
    EXPECT_EQ(HV::ResourcesUrl("https://www.example.com/tessaly/"), "https://www.example.com/tessaly/resources/");
}

TEST(ResourcesLink, LeadsBelowThePageOfEverySuite) {
    EXPECT_EQ(HV::ResourcesUrl("https://x/lantern-suite"), "https://x/lantern-suite/resources/");
    EXPECT_EQ(HV::ResourcesUrl("https://x/harbour-suite/"), "https://x/harbour-suite/resources/");
}

TEST(ResourcesLink, IsNoneWithoutAPage) {
    EXPECT_EQ(HV::ResourcesUrl(""), "");
}

}  // namespace
