#include "hvframework/Md5.h"

#include <gtest/gtest.h>

#include <string_view>

namespace HVL {
namespace {

std::string DigestOf(std::string_view message) {
    Md5 md5;
    md5.Update(message.data(), message.size());
    return md5.Finish();
}

std::string Pattern(std::size_t size) {
    std::string message;
    for (std::size_t index = 0; index < size; ++index) {
        message += static_cast<char>(index * 7 + 3);
    }
    return message;
}

TEST(Md5, GivesTheDigestsOfItsStandard) {
    EXPECT_EQ(DigestOf(""), "d41d8cd98f00b204e9800998ecf8427e");
    EXPECT_EQ(DigestOf("a"), "0cc175b9c0f1b6a831c399e269772661");
    EXPECT_EQ(DigestOf("abc"), "900150983cd24fb0d6963f7d28e17f72");
    EXPECT_EQ(DigestOf("message digest"), "f96b697d7cb7938d525a2f31aaf161d0");
    EXPECT_EQ(DigestOf("abcdefghijklmnopqrstuvwxyz"), "c3fcd3d76192e4007dfb496cca67e13b");
    EXPECT_EQ(DigestOf("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789"),
              "d174ab98d277d9f5a5611c2c9f419d9f");
    EXPECT_EQ(DigestOf("12345678901234567890123456789012345678901234567890123456789012345678901234567890"),
              "57edf4a22be3c955ac49da2e2107b67a");
}

// Another program made the digest of all these digests.
TEST(Md5, IsRightForEveryLengthAroundItsBlocks) {
    std::string digests;
    for (std::size_t size = 0; size <= 300; ++size) {
        digests += DigestOf(Pattern(size));
    }
    EXPECT_EQ(digests.size(), 301U * 32U);
    EXPECT_EQ(DigestOf(digests), "cb441f7270246a6108bd418c9a9c94d1");
}

TEST(Md5, DoesNotDependOnHowTheMessageIsCut) {
    const std::string message = Pattern(200);
    const std::string expected = DigestOf(message);
    int cuts = 0;
    for (std::size_t first = 0; first <= message.size(); ++first) {
        for (std::size_t second = first; second <= message.size(); second += 13) {
            Md5 md5;
            md5.Update(message.data(), first);
            md5.Update(message.data() + first, second - first);
            md5.Update(message.data() + second, message.size() - second);
            ASSERT_EQ(md5.Finish(), expected) << first << ", " << second;
            ++cuts;
        }
    }
    EXPECT_GT(cuts, 1500);
}

TEST(Md5, TakesALongMessageAtOnce) {
    EXPECT_EQ(DigestOf(std::string(1000003, 'x')), "55a76be3046fa1e602ae663deccfcd78");
}

}  // namespace
}  // namespace HVL
