#include <gtest/gtest.h>

#include "installer/windows/EULAWindow.h"

namespace {

TEST(MissingAgreement, IsReplacedByALineThatSaysSo) {
    EXPECT_EQ(HV::LoadAgreementText(), "ERROR: license agreement data failed to load from resource.");
}

}  // namespace
