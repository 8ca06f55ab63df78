// Another program that may do as it likes in the folder for temporary files polls it during a run, moves away whatever
// appears there and puts something else in its place. Here it is another thread: a system that is asked to rename a
// folder does not ask which program does. HostedAttackTest.cpp has another account do it.
#include <atomic>
#include <filesystem>
#include <fstream>
#include <optional>
#include <thread>

#include "tests/hvdeploy/engine/EngineTest.h"

namespace {

// The host's own names and calls: another program does not go by what this one holds.
namespace host = std::filesystem;

constexpr int kRounds = 50;
constexpr const char* kAway = ".away";
constexpr const char* kOwnFile = R"(C:\ProgramData\Halvorn\glow.dll)";

void Write(const host::path& file, const std::string& text) {
    std::ofstream(file, std::ios::binary) << text;
}

/// The names in a folder that may vanish at any moment.
std::vector<std::string> Names(const host::path& folder) {
    std::vector<std::string> names;
    std::error_code error;
    for (host::directory_iterator entry(folder, error), end; !error && entry != end; entry.increment(error)) {
        names.push_back(entry->path().filename().string());
    }
    return names;
}

/// Polls until the object ends.
class Attacker {
public:
    explicit Attacker(std::function<void()> attack)
        : thread_([this, attack = std::move(attack)] {
              while (!over_) {
                  attack();
                  ++tries_;
              }
          }) {}
    ~Attacker() {
        over_ = true;
        thread_.join();
    }
    Attacker(const Attacker&) = delete;
    Attacker& operator=(const Attacker&) = delete;

    /// Until the attacker has looked around twice more.
    void Wait() const {
        const int before = tries_;
        while (tries_ < before + 2) {
            std::this_thread::yield();
        }
    }

private:
    std::atomic<bool> over_ = false;
    std::atomic<int> tries_ = 0;
    std::thread thread_;
};

class SwapTest : public testing::Test {
protected:
    /// Moves the folders away whose names begin so, once `ripe` says so, and has `plant` fill the new ones.
    static void Swap(const host::path& temp, const std::string& prefix,
                     const std::function<bool(const host::path&)>& ripe,
                     const std::function<void(const host::path&)>& plant) {
        for (const std::string& name : Names(temp)) {
            const host::path folder = temp / name;
            std::error_code error;
            if (name.rfind(prefix, 0) == 0 && !name.ends_with(kAway) && ripe(folder)) {
                host::rename(folder, folder.string() + kAway, error);
                if (!error) {
                    host::create_directory(folder, error);
                    plant(folder);
                }
            }
        }
    }

    /// A command that leaves this word in a file, for the command processor of either target.
    static std::string Says(const Machine& machine, const std::string& word) {
        return "echo " + word + ">\"" + machine.HostName(R"(C:\mark)") + "\"\n";
    }
};

}  // namespace

TEST_F(SwapTest, NeitherAScriptNorAPayloadCanBeSwapped) {
    std::atomic<int> seen = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        Machine machine;
        const fs::path package = PackageBuilder("com.halvorn.glow")
                                     .Payload("resource")
                                     .To("programdata", "Halvorn")
                                     .File("glow.dll", "honest")
                                     .PreflightXml(R"(<preflight source="scripts/mark.bat"/>)")
                                     .File("scripts/mark.bat", Says(machine, "honest"))
                                     .WriteTo(kPackages);
        const std::string planted = Says(machine, "planted");
        const host::path temp(machine.HostName(machine.TempFolder()));
        const auto attack = [&] {
            Swap(
                temp, "tmp",
                [&](const host::path& folder) {
                    std::error_code ignored;
                    const bool ripe = host::exists(folder / "scripts/mark.bat", ignored);
                    seen += ripe ? 1 : 0;
                    return ripe;
                },
                [&](const host::path& folder) {
                    std::error_code ignored;
                    host::create_directory(folder / "scripts", ignored);
                    Write(folder / "scripts/mark.bat", planted);
                    Write(folder / "glow.dll", "planted");
                });
        };
        // The first round shows that the package installs where nobody disturbs it: an attacker may stop a run.
        std::optional<Attacker> attacker;
        if (round > 0) {
            attacker.emplace(attack);
        }
        HV::EngineResult result = 0;
        {
            HV::Deploy engine(nullptr);
            result = engine.DeployPackage(package);
        }
        EXPECT_TRUE(round > 0 || result == 1) << result;
        if (result == 1) {
            EXPECT_EQ(machine.Content(R"(C:\mark)").substr(0, 6), "honest");
            EXPECT_EQ(machine.Content(kOwnFile), "honest");
        }
        EXPECT_TRUE(result == 1 || !machine.HasFile(kOwnFile)) << result;
    }
    EXPECT_GT(seen, 0);
}

TEST_F(SwapTest, NoStashedFileCanBeSwapped) {
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        Machine machine;
        machine.Has(kOwnFile, "the machine's own");
        const host::path temp(machine.HostName(machine.TempFolder()));
        {
            const Attacker attacker([&] {
                std::vector<std::string> stashed;
                Swap(
                    temp, "hvdeploystash",
                    [&](const host::path& folder) {
                        stashed = Names(folder);
                        return !stashed.empty();
                    },
                    [&](const host::path& folder) {
                        for (const std::string& name : stashed) {
                            Write(folder / name, "planted");
                        }
                    });
            });
            HV::DeployRollback rollback;
            rollback.StashExistingFile(fs::path(kOwnFile));
            attacker.Wait();
            rollback.Rollback();
        }
        EXPECT_EQ(machine.Content(kOwnFile), "the machine's own");
    }
}
