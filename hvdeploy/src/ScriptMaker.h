#pragma once

#include <sstream>
#include <string>

namespace HV {

/// Builds the text of a batch file, or of a segment of one, line by line. Lines end in a single line feed here; who
/// writes the text opens the file in text mode.
class ScriptMaker {
public:
    virtual ~ScriptMaker() = default;

    std::string GetScriptExtension() const { return ".bat"; }

    /// What every script begins with. Its lines end in single carriage returns, and no line end follows the last.
    std::string GetHeader() const;

    /// A line that prints `text`, which stands in it as it is: quotes would be printed too.
    std::string MakeEchoLine(const std::string& text) const { return "echo " + text; }

    /// A line that deletes `path`, with all that matches it below.
    std::string MakeDeleteLine(const std::string& path) const { return "CALL DEL /S /F /Q \"" + path + "\""; }

    /// Appends `line` and a line feed.
    void AddLine(const std::string& line) { buffer << line << '\n'; }
    void AddEmptyLine() { buffer << '\n'; }

    /// Everything that was added so far.
    std::string GetText() const { return buffer.str(); }

private:
    std::ostringstream buffer;
};

}  // namespace HV
