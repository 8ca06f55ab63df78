#pragma once

#include <map>
#include <string>

namespace HV {

/// The texts of the wizard that a release may change: a table by language and key.
///
/// Filled once, read from then on, by one thread.
class XMLStringsResource {
public:
    virtual ~XMLStringsResource() = default;

    /// Reads a table in the XML form, replacing what was here. Returns whether it was read without a fault and holds a
    /// language; after a fault the languages before it stay. Faults of the table get a line on standard error; a text
    /// that is no XML, and a table without languages, are refused in silence.
    [[nodiscard]] bool Parse(const std::string& xml);

    /// The text of a key in English, or an empty string and a line of warning.
    [[nodiscard]] std::string GetString(const std::string& key) const;

    /// Puts `replacement` for `token` in every text of every language. What is put in is not looked at again, and a
    /// token that longer replacements have pushed to where its text ended before, or beyond, stays. Without a token
    /// nothing is replaced.
    void ReplaceAll(const std::string& token, const std::string& replacement);

protected:
    // Texts by language and key. Those of other languages than English are kept up to date and asked by tests alone.
    std::map<std::string, std::map<std::string, std::string>> languages;

private:
    std::string version;  // of the form; a table has to have one, and nobody asks which
};

/// The table that is compiled into this program (number 136, type "HVSTRINGS_XML"), or an empty text.
[[nodiscard]] std::string LoadStringsText();

}  // namespace HV
