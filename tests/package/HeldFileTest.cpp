#include "package/HeldFile.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <system_error>

#include "platform/filesystem.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kFile = R"(C:\Release\glow.hvpkg)";
const std::string kMd5OfAbc = "900150983cd24fb0d6963f7d28e17f72";
const std::string kSha256OfAbc = "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad";
const std::string kMd5OfNothing = "d41d8cd98f00b204e9800998ecf8427e";
const std::string kSha256OfNothing = "e3b0c44298fc1c149afbf4c8996fb92427ae41e4649b934ca495991b7852b855";

class HeldFileTest : public testing::Test {
protected:
    HeldFileTest() { machine.Has(kFile, "abc"); }

    /// By the host's own means, as another program has them: on the hosted machine itself a file that this process has
    /// open stays where it is.
    bool MovesOver(const char* path) {
        std::error_code error;
        std::filesystem::rename(machine.HostName(R"(C:\Release\other)"), machine.HostName(path), error);
        return !error;
    }

    static constexpr bool kSystemHoldsFiles = HV_SYSTEM_HOLDS_FILES;
    Machine machine;
};

TEST_F(HeldFileTest, HasBothDigestsOfItsBytes) {
    const HV::HeldFile file{fs::path(kFile)};
    EXPECT_EQ(file.Digests(), (HV::FileDigests{kMd5OfAbc, kSha256OfAbc}));
    EXPECT_EQ(file.Digests(), (HV::FileDigests{kMd5OfAbc, kSha256OfAbc})) << "at another reading";
}

TEST_F(HeldFileTest, HasDigestsOfFilesOfEverySizeAroundItsBlocks) {
    for (const std::size_t size : {65535U, 65536U, 65537U, 200000U}) {
        machine.Has(R"(C:\Release\one)", std::string(size, 'x'));
        machine.Has(R"(C:\Release\two)", std::string(size, 'x'));
        machine.Has(R"(C:\Release\three)", std::string(size - 1, 'x') + "y");
        const HV::FileDigests one = HV::HeldFile{fs::path(R"(C:\Release\one)")}.Digests();
        EXPECT_EQ(one, HV::HeldFile{fs::path(R"(C:\Release\two)")}.Digests());
        const HV::FileDigests three = HV::HeldFile{fs::path(R"(C:\Release\three)")}.Digests();
        EXPECT_NE(one.md5, three.md5);
        EXPECT_NE(one.sha256, three.sha256);
    }
}

TEST_F(HeldFileTest, HasNoBytesWhenItIsNotThere) {
    const HV::HeldFile file{fs::path(R"(C:\Release\none)")};
    EXPECT_EQ(file.Digests(), (HV::FileDigests{kMd5OfNothing, kSha256OfNothing}));
    EXPECT_FALSE(file.IsUntouched());
}

TEST_F(HeldFileTest, IsUntouchedAsLongAsItIsOnlyRead) {
    const HV::HeldFile file{fs::path(kFile)};
    EXPECT_EQ(machine.Content(kFile), "abc");
    EXPECT_EQ((HV::HeldFile{fs::path(kFile)}.Digests().md5), kMd5OfAbc);
    EXPECT_TRUE(file.IsUntouched());
}

TEST_F(HeldFileTest, IsReplacedByNobodyOrNotUnnoticed) {
    machine.Has(R"(C:\Release\other)", "abd");
    const HV::HeldFile file{fs::path(kFile)};
    const bool done = MovesOver(kFile);
    EXPECT_EQ(done, !kSystemHoldsFiles);
    EXPECT_EQ(file.IsUntouched(), !done);
}

TEST_F(HeldFileTest, IsDeletedByNobodyOrNotUnnoticed) {
    const HV::HeldFile file{fs::path(kFile)};
    std::error_code error;
    const bool done = std::filesystem::remove(machine.HostName(kFile), error) && !error;
    EXPECT_EQ(done, !kSystemHoldsFiles);
    EXPECT_EQ(file.IsUntouched(), !done);
}

TEST_F(HeldFileTest, IsLetGoAtItsEnd) {
    machine.Has(R"(C:\Release\other)", "abd");
    { const HV::HeldFile file{fs::path(kFile)}; }
    EXPECT_TRUE(MovesOver(kFile));
    EXPECT_EQ(machine.Content(kFile), "abd");
}

}  // namespace
