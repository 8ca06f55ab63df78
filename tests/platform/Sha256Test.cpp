#include "platform/sha256.h"

#include <gtest/gtest.h>

#include <string_view>

namespace {

std::string DigestOf(std::string_view message) {
    platform::Sha256 sha256;
    sha256.Update(message.data(), message.size());
    return sha256.Finish();
}

std::string Pattern(std::size_t size) {
    std::string message;
    for (std::size_t index = 0; index < size; ++index) {
        message += static_cast<char>(index * 7 + 3);
    }
    return message;
}

TEST(Sha256, GivesTheDigestsOfItsStandard) {
    EXPECT_EQ(DigestOf(""), "e3b0c44298fc1c149afbf4c8996fb92427ae41e4649b934ca495991b7852b855");
    EXPECT_EQ(DigestOf("abc"), "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad");
    EXPECT_EQ(DigestOf("abcdbcdecdefdefgefghfghighijhijkijkljklmklmnlmnomnopnopq"),
              "248d6a61d20638b8e5c026930c3e6039a33ce45964ff2167f6ecedd419db06c1");
    EXPECT_EQ(
        DigestOf("abcdefghbcdefghicdefghijdefghijkefghijklfghijklmghijklmnhijklmnoijklmnopjklmnopqklmnopqrlmnopqrsmno"
                 "pqrstnopqrstu"),
        "cf5b16a778af8380036ce59e7b0492370b249b11e8f07a51afac45037afee9d1");
    EXPECT_EQ(DigestOf(std::string(1000000, 'a')), "cdc76e5c9914fb9281a1c7e284d73e67f1809a48a497200e046d39ccc7112cd0");
}

// Another program made the digest of all these digests.
TEST(Sha256, IsRightForEveryLengthAroundItsBlocks) {
    std::string digests;
    for (std::size_t size = 0; size <= 300; ++size) {
        digests += DigestOf(Pattern(size));
    }
    EXPECT_EQ(digests.size(), 301U * 64U);
    EXPECT_EQ(DigestOf(digests), "9ab015b3431ba48c0f99e81c5bb7d903f6bfea343d7d7b190120d07cc51e653b");
}

TEST(Sha256, DoesNotDependOnHowTheMessageIsCut) {
    const std::string message = Pattern(200);
    const std::string expected = DigestOf(message);
    int cuts = 0;
    for (std::size_t first = 0; first <= message.size(); ++first) {
        for (std::size_t second = first; second <= message.size(); second += 13) {
            platform::Sha256 sha256;
            sha256.Update(message.data(), first);
            sha256.Update(message.data() + first, second - first);
            sha256.Update(message.data() + second, message.size() - second);
            ASSERT_EQ(sha256.Finish(), expected) << first << ", " << second;
            ++cuts;
        }
    }
    EXPECT_GT(cuts, 1500);
}

}  // namespace
