// Names that end in file names, registry keys, the removal script or a browser: what no release may be called.
#include <gtest/gtest.h>

#include <map>
#include <sstream>

#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/tools/HvpackRun.h"

namespace {

constexpr const char* kFolder = R"(C:\packages)";
constexpr const char* kSuite = R"(C:\packages\suite.json)";
const std::string kBadInNames = R"(\/%&|<>^!":*?)";
const std::string kBadInSuiteNames = R"(\/%&|<>^!")";

class ReleaseNamesTest : public HvpackRun {
protected:
    ReleaseNamesTest() { machine.HasFolder(kFolder); }

    /// Whether all three commands that look at packages refuse this one, with one line, and leave nothing behind.
    void ExpectRefused(const PackageBuilder& package, const std::string& name, const std::string& line) {
        PackageBuilder named = package;
        const std::string path = named.Named(name).WriteTo(kFolder).string();
        EXPECT_EQ(Run({"check", path}), 1) << line;
        EXPECT_EQ(err, "hvpack: " + line + "\n");
        EXPECT_EQ(Run({"table", kFolder}), 1) << line;
        EXPECT_EQ(err, "hvpack: " + line + "\n");
        EXPECT_EQ(out, "");
        machine.Has(R"(C:\sources\_hvmanifest.xml)", package.Manifest());
        EXPECT_EQ(Run({"make", R"(C:\sources)", R"(C:\made\)" + name}), 1) << line;
        EXPECT_EQ(err, "hvpack: " + line + "\n");
        EXPECT_FALSE(machine.Exists(R"(C:\made\)" + name));
        fs::remove(fs::path(path));
    }

    /// A suite file with these texts in place of good ones.
    void HasSuite(const std::map<std::string, std::string>& changed) {
        std::map<std::string, std::string> members{{"identifier", "com.example.lumen"},
                                                   {"version", "1.5"},
                                                   {"display_name", "Lumen Suite"},
                                                   {"product_type", "0"},
                                                   {"product_url", "https://www.example.com/lumen"}};
        std::string text;
        for (const auto& [key, value] : changed) {
            members[key] = value;
        }
        for (const auto& [key, value] : members) {
            text += (text.empty() ? "{\"" : ", \"") + key + "\": \"" + value + "\"";
        }
        machine.Has(kSuite, text + "}");
    }

    void ExpectSuiteRefused(const std::string& line) {
        EXPECT_EQ(Run({"check", kSuite}), 1) << line;
        EXPECT_EQ(err, "hvpack: " + line + "\n");
        (void)PackageBuilder("com.example.lumen").WriteTo(kFolder);
        EXPECT_EQ(Run({"table", kFolder}), 1) << line;
        EXPECT_EQ(err, "hvpack: " + line + "\n");
    }

    Machine machine;
};

std::string NamesFiles(const std::string& field, const std::string& value, char c) {
    return field + " is \"" + value + "\", and must not hold the character " + std::string(1, c) +
           ": file names and the removal script are made of it";
}

/// As it stands in a JSON text.
std::string Escaped(char c) {
    return (c == '"' || c == '\\' ? "\\" : "") + std::string(1, c);
}

TEST_F(ReleaseNamesTest, RefusesIdentifiersAndVersionsThatAreMoreThanNames) {
    int tried = 0;
    for (const char c : kBadInNames) {
        const std::string name = std::string("lumen") + c + "pro";
        ExpectRefused(PackageBuilder(name), "lumen.zip", "lumen.zip: " + NamesFiles("product", name, c));
        ExpectRefused(PackageBuilder("com.example.lumen").Version("1.0" + std::string(1, c)), "lumen.zip",
                      "lumen.zip: " + NamesFiles("productversion", "1.0" + std::string(1, c), c));
        ++tried;
    }
    EXPECT_EQ(tried, 13);
}

// Of the characters that a command processor knows, these can stand in the name of a file.
TEST_F(ReleaseNamesTest, RefusesFileNamesThatTheRemovalScriptWouldRun) {
    int tried = 0;
    for (const char c : std::string("%&^!")) {
        const std::string name = std::string("lumen") + c + "pro.zip";
        ExpectRefused(PackageBuilder("com.example.lumen"), name, name + ": " + NamesFiles("its name", name, c));
        ++tried;
    }
    EXPECT_EQ(tried, 4);
}

TEST_F(ReleaseNamesTest, RefusesControlCharactersInEveryName) {
    ExpectRefused(
        PackageBuilder("com.example\x01"), "a.zip",
        "a.zip: product is \"com.example<0x01>\", and must not hold the control character 0x01: file names and "
        "the removal script are made of it");
    ExpectRefused(PackageBuilder("com.example").DisplayName("two\x7Flines"), "a.zip",
                  "a.zip: display_name in product-data is \"two<0x7F>lines\", and must not hold the control character "
                  "0x7F: it is shown in one line");
}

// It is shown, and no command line or path is made of it.
TEST_F(ReleaseNamesTest, LetsAProductBeShownUnderAnyName) {
    const fs::path package =
        PackageBuilder("com.example.lumen").DisplayName("Lumen & S\xC3\xB6hne (Pro) <50%>!").WriteTo(kFolder);
    HasSuite({{"display_name", "Lumen S\xC3\xB6hne (Pro)"}});
    EXPECT_EQ(Run({"check", package.string(), kSuite}), 0) << err;
    EXPECT_EQ(err, "");
    EXPECT_EQ(Run({"table", kFolder}), 0) << err;
}

TEST_F(ReleaseNamesTest, RefusesSuitesThatAreMoreThanNames) {
    int tried = 0;
    for (const std::string field : {"identifier", "version", "display_name"}) {
        const bool isShown = field == "display_name";
        for (const char c : isShown ? kBadInSuiteNames : kBadInNames) {
            HasSuite({{field, "Lumen " + Escaped(c)}});
            const std::string value = "Lumen " + std::string(1, c);
            ExpectSuiteRefused("suite.json: " +
                               (isShown
                                    ? field + " is \"" + value + "\", and must not hold the character " +
                                          std::string(1, c) + ": the removal script and a registry key are made of it"
                                    : NamesFiles(field, value, c)));
            ++tried;
        }
    }
    EXPECT_EQ(tried, 36);
    HasSuite({{"display_name", "Lumen\\r\\nshutdown"}});
    ExpectSuiteRefused(
        "suite.json: display_name is \"Lumen<0x0D><0x0A>shutdown\", and must not hold the control character 0x0D: the "
        "removal script and a registry key are made of it");
}

TEST_F(ReleaseNamesTest, RefusesAddressesThatAreNotOfTheWeb) {
    int tried = 0;
    for (const std::string address :
         {"calc.exe", "file:///C:/Windows/System32/calc.exe", "ftp://www.example.com", "javascript:alert(1)",
          "//server/share/x.exe", "https:", "http://", "https:///x", " https://www.example.com"}) {
        HasSuite({{"product_url", address}});
        ExpectSuiteRefused("suite.json: product_url is \"" + address +
                           "\", and is no address that begins with http:// or https://");
        ++tried;
    }
    EXPECT_EQ(tried, 9);
    for (const char c : std::string(R"(\<>^|" )")) {
        HasSuite({{"product_url", "https://www.example.com/" + Escaped(c)}});
        ExpectSuiteRefused("suite.json: product_url is \"https://www.example.com/" + std::string(1, c) +
                           "\", and must not hold the character " + std::string(1, c) +
                           ": a browser is started with it");
        ++tried;
    }
    EXPECT_EQ(tried, 16);
}

TEST_F(ReleaseNamesTest, TakesAddressesOfTheWeb) {
    for (const std::string address :
         {"https://www.example.com/tessaly", "HTTP://example.com/?a=1&b=%20#c", "https://user@example.com:8443/", ""}) {
        HasSuite({{"product_url", address}});
        EXPECT_EQ(Run({"check", kSuite}), 0) << err;
        EXPECT_EQ(out, std::string("OK ") + kSuite + "\n");
    }
}

TEST_F(ReleaseNamesTest, RefusesSuiteFilesThatTheEngineDoesNotTake) {
    const std::map<std::string, std::string> files{
        {"{", "suite.json is not JSON"},
        {"\xEF\xBB\xBF{}", "suite.json is not JSON"},
        {"{}", "suite.json is no suite's: product_type has to be \"0\", in quotes"},
        {R"({"product_type": 0})", "suite.json is no suite's: product_type has to be \"0\", in quotes"},
        {R"({"product_type": "0", "identifier": "a", "version": "1"})", "suite.json has no text for display_name"},
        {R"({"product_type": "0", "identifier": 7, "version": "1"})", "suite.json has no text for identifier"}};
    for (const auto& [text, line] : files) {
        machine.Has(kSuite, text);
        ExpectSuiteRefused(line);
    }
    machine.Has(kSuite, "[1]");
    EXPECT_EQ(Run({"check", kSuite}), 1);
    EXPECT_EQ(err.rfind("hvpack: suite.json is not a suite file: ", 0), 0U) << err;
    EXPECT_EQ(Run({"check", R"(C:\none.json)"}), 1);
    EXPECT_EQ(err, "hvpack: cannot read C:\\none.json\n");
}

}  // namespace
