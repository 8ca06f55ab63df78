#pragma once

#include <set>
#include <sstream>

#include "platform/hosted/registry_text.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/hvdeploy/engine/UndoScenario.h"

/// A suite of four packages in three phases, with scripts, registry entries and shortcuts around its files, on a
/// machine that has an older one.
///
/// What a way back undoes is files that were placed, and nothing else. What stays is known from the log alone: each
/// script that ran has left its word in a file, each entry that was written is in the registry, each shortcut that was
/// made is there, though it may point to nothing now. Said() reads that from the log, Left() from the machine.
class SideActionsUndoTest : public UndoTest {
protected:
    struct Effects {
        std::vector<std::string> scripts;            // the words that scripts left, in their order
        std::map<std::string, std::string> entries;  // full key and name to text
        std::set<std::string> links;
        std::set<std::string> program;  // names of the values in the list of installed programs
        bool operator==(const Effects&) const = default;
    };

    static constexpr const char* kWords = R"(C:\ProgramData\Halvorn\words.txt)";
    static constexpr const char* kKeptLink =
        R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Halvorn\Readme.txt.lnk)";
    static constexpr std::size_t kProgramValues = 8;

    static void HasOlderSuite(Machine& machine) {
        machine.Has(R"(C:\ProgramData\Halvorn\runtime.dll)", "old runtime");
        machine.Has(R"(C:\Hosts\ae22\Plug-ins\Glow.aex)", "old glow");
        machine.Has(R"(C:\Program Files\Halvorn\Tool.exe)", "old tool");
        machine.Has(R"(C:\Users\Public\Documents\Halvorn\soft.ffx)", "old soft");
        machine.Has(R"(C:\Users\Public\Documents\Halvorn\mine.ffx)", "the user's own");
        machine.Has(kKeptLink, "an older link");
        machine.Loads(
            "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\Undo]\n\"Runtime\"=\"old\"\n"
            "\"Mine\"=\"the user's own\"\n");
    }

    static void ShipsSuite(Machine& machine, bool fails) {
        machine.Has(std::string(kPackages) + R"(\suite.json)", kTessalyFile);
        (void)PackageBuilder("com.halvorn.runtime")
            .Named("preflight-runtime.hvpkg")
            .Payload("library")
            .Id("runtime")
            .To("programdata", "Halvorn")
            .File("runtime.dll", "new runtime")
            .Preflight(Leaves(machine, "prepare"))
            .RegistryEntry("", R"(SOFTWARE\Halvorn\Undo)", "Runtime", "Runtime", "windows")
            .Postflight(Leaves(machine, "prepared"))
            .WriteTo(kPackages);
        (void)PackageBuilder("com.halvorn.glow")
            .Payload("plugin")
            .Id("glow")
            .ForHost("aftereffects")
            .File("Glow.aex", "new glow")
            .RegistryEntry("", R"(SOFTWARE\Halvorn\Undo)", "Glow", "Glow", "windows")
            .RegistryEntry("", R"(SOFTWARE\Halvorn\Undo\Glow\Presets)", "Presets", "Presets", "windows")
            .Postflight(Leaves(machine, "glowing"))
            .Payload("app")
            .Id("tool")
            .Subpath("Halvorn")
            .File("app/Tool.exe", "new tool")
            .File("app/Readme.txt", "text")
            .Source("app/*")
            .Preflight(Leaves(machine, "tooling"))
            .Shortcut("Tool.exe", "", "startmenu", "Halvorn", true)
            .Shortcut("Readme.txt", "", "startmenu", "Halvorn", true)
            .Shortcut("Nothing.exe", "", "startmenu", "Halvorn", false)
            .WriteTo(kPackages);
        (void)PackageBuilder("com.halvorn.grain")
            .Policy("uninstall", "true")
            .Payload("presets")
            .Id("grain")
            .To("commondocs", "Halvorn")
            .Source("presets/*")
            .File("presets/soft.ffx", "new soft")
            .File("presets/more/hard.ffx", "new hard")
            .File("scripts/setup.bat", Leaves(machine, "setup") + "\n")
            .PreflightXml(R"(<preflight id="setup" source="scripts/setup.bat"/>)")
            .RegistryEntry("", R"(SOFTWARE\Halvorn\Undo)", "Grain", "Grain", "windows")
            .Shortcut("soft.ffx", "", "commondocs", "Halvorn", false)
            .WriteTo(kPackages);
        PackageBuilder support("com.halvorn.support");
        support.Named("postflight-support.hvpkg")
            .Policy("uninstall", "true")
            .Payload("resource")
            .Id("support")
            .To("programdata", "Halvorn")
            .File("support.dll", "support")
            .RegistryEntry("", R"(SOFTWARE\Halvorn\Undo)", "Support", "Support", "windows")
            .Postflight(Leaves(machine, "farewell"));
        if (fails) {
            support.Payload("resource").Id("lost").To("nowhere").File("lost.dll", "x");
        }
        (void)support.WriteTo(kPackages);
    }

    /// The files that a way back answers for: not the words of scripts, not the links.
    static Files Placed(Files files) {
        std::erase_if(files, [](const auto& item) { return item.first == kWords || item.first.ends_with(".lnk"); });
        return files;
    }

    /// What the machine says.
    static Effects Left(const Machine& machine) {
        Effects left;
        if (machine.HasFile(kWords)) {
            std::istringstream words(machine.Content(kWords));
            for (std::string word; words >> word;) {
                left.scripts.push_back(word);
            }
        }
        for (const hosted::RegistryChange& change : hosted::ParseRegistryText(machine.Registry())) {
            if (change.kind != hosted::RegistryChange::Kind::SetValue) {
                continue;  // a key that was made for an entry that then failed has no value
            }
            if (change.key.find(R"(\Uninstall\Tessaly Suite v3.1)") != std::string::npos) {
                left.program.insert(change.name);
            } else if (change.key.rfind(R"(HKEY_LOCAL_MACHINE\SOFTWARE\Halvorn)", 0) == 0) {
                // The system makes notes of its own elsewhere, such as with the first link that is saved.
                left.entries[change.key + '\\' + change.name] = change.data.c_str();
            }
        }
        for (const auto& file : machine.FilesWithoutFolders()) {
            if (file.first.ends_with(".lnk")) {
                left.links.insert(file.first);
            }
        }
        return left;
    }

    /// What the log says, on top of what there was before. Nobody logs the values in the list of installed programs.
    static Effects Said(const Outcome& outcome, Effects before) {
        Effects said = std::move(before);
        std::string payload;
        std::map<std::string, std::size_t> entries;
        std::map<std::string, std::size_t> links;
        for (std::size_t i = 0; i < outcome.lines.size(); ++i) {
            const std::string& line = outcome.lines[i];
            const std::string next = i + 1 < outcome.lines.size() ? outcome.lines[i + 1] : "";
            if (const auto begun = Behind(line, "HV::Deploy::DeployPayload "); !begun.empty()) {
                payload = begun.substr(0, begun.find(' '));
            } else if (const auto command = Behind(line, "Postflight command: echo "); !command.empty()) {
                said.scripts.push_back(command.substr(0, command.find('>')));
            } else if (const auto script = Behind(line, "Running payload script: [id: setup] : "); !script.empty()) {
                said.scripts.emplace_back("setup");
            } else if (line == DebugLine("HV::Deploy::HV::Deploy::MakeRegistryEntry")) {
                const auto& [key, name] = EntriesOf(payload).at(entries[payload]++);
                // Behind an entry that fails the package's files are cleared away at once.
                if (next.rfind(DebugLine("Cleaning up temp files at "), 0) != 0) {
                    said.entries[key + '\\' + name] = name;
                }
            } else if (line == DebugLine("HV::Deploy::HV::Deploy::MakeShortcut")) {
                const std::string link = LinksOf(payload).at(links[payload]++);
                if (next.rfind("ERROR", 0) != 0) {
                    said.links.insert(link);
                }
            }
        }
        return said;
    }

    /// How many sections the removal script has, and how many the log says were written to it.
    static std::pair<std::size_t, std::size_t> SectionsLeftAndSaid(const Machine& machine, const Outcome& outcome) {
        std::size_t left = 0;
        const std::string script = machine.HasFile(kScriptPath) ? machine.Content(kScriptPath) : "";
        for (auto at = script.find("CALL reg delete"); at != std::string::npos;
             at = script.find("CALL reg delete", at + 1)) {
            ++left;
        }
        const auto said = std::count_if(outcome.lines.begin(), outcome.lines.end(), [](const std::string& line) {
            return line.rfind(DebugLine("Writing standalone uninstall script for "), 0) == 0;
        });
        return {left, static_cast<std::size_t>(said)};
    }

    inline static const std::string kWayBack = DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback");

private:
    /// A command that both command processors know: it adds a word to a file of the machine.
    static std::string Leaves(const Machine& machine, const std::string& word) {
        return "echo " + word + ">>\"" + machine.HostName(kWords) + "\"";
    }
    static std::string Behind(const std::string& line, const std::string& start) {
        const std::string whole = DebugLine(start);
        return line.rfind(whole, 0) == 0 ? line.substr(whole.size()) : "";
    }
    static const std::vector<std::pair<std::string, std::string>>& EntriesOf(const std::string& payload) {
        const std::string key = R"(HKEY_LOCAL_MACHINE\SOFTWARE\Halvorn\Undo)";
        static const std::map<std::string, std::vector<std::pair<std::string, std::string>>> all{
            {"runtime", {{key, "Runtime"}}},
            {"glow", {{key, "Glow"}, {key + R"(\Glow\Presets)", "Presets"}}},
            {"grain", {{key, "Grain"}}},
            {"support", {{key, "Support"}}}};
        return all.at(payload);
    }
    static const std::vector<std::string>& LinksOf(const std::string& payload) {
        const std::string menu = R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Halvorn\)";
        static const std::map<std::string, std::vector<std::string>> all{
            {"tool", {menu + "Tool.lnk", kKeptLink, menu + "Nothing.lnk"}},
            {"grain", {R"(C:\Users\Public\Documents\Halvorn\soft.ffx.lnk)"}}};
        return all.at(payload);
    }
};
