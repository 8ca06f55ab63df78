#include "tools/hvpack/Commands.h"

#include <log4cpp/OstreamAppender.hh>
#include <log4cpp/PatternLayout.hh>

#include <exception>

#include "hvframework/Log.h"
#include "package/ZipEntries.h"
#include "tools/hvpack/ManifestWarnings.h"
#include "tools/hvpack/PackageError.h"
#include "tools/hvpack/PackageMaker.h"
#include "tools/hvpack/ReleaseNames.h"
#include "tools/hvpack/ReleaseTable.h"
#include "tools/hvpack/ValidatedPackage.h"

namespace HVPack {
namespace {

constexpr const char* kUsage =
    "usage: hvpack make FOLDER OUT.hvpkg   make a package of a folder that holds a _hvmanifest.xml\n"
    "       hvpack check FILE...           check packages, and suite files (.json)\n"
    "       hvpack list FILE               list what a package holds, folders first\n"
    "       hvpack table FOLDER [OUT.cpp]  write the validation table of a release, a C++ source\n";

using Arguments = std::vector<std::string>;

/// While it lives, warnings and errors of the engine are lines on a stream, and nowhere else.
class EngineLines {
public:
    explicit EngineLines(std::ostream& stream)
        : category_(HVL::Log::Detail()),
          appender_("hvpack", &stream),
          additivity_(category_.getAdditivity()),
          priority_(category_.getPriority()) {
        auto* layout = new log4cpp::PatternLayout();  // the appender's, from here on
        layout->setConversionPattern("%p: %m%n");
        appender_.setLayout(layout);
        category_.addAppender(appender_);
        category_.setAdditivity(false);
        category_.setPriority(log4cpp::Priority::WARN);
    }
    ~EngineLines() {
        category_.removeAppender(&appender_);
        category_.setAdditivity(additivity_);
        category_.setPriority(priority_);
    }
    EngineLines(const EngineLines&) = delete;
    EngineLines& operator=(const EngineLines&) = delete;

private:
    log4cpp::Category& category_;
    log4cpp::OstreamAppender appender_;
    bool additivity_;
    log4cpp::Priority::Value priority_;
};

/// Runs `step` and gives what it says; a failure that is thrown becomes a line and false.
template <typename Step>
bool Report(std::ostream& err, Step step) {
    try {
        return step();
    } catch (const std::exception& error) {
        err << "hvpack: " << error.what() << '\n';
        return false;
    }
}

/// Warns of what the engine takes without a word. The exit status does not know of it.
void Warn(const HV::Manifest& manifest, const std::string& file, std::ostream& err) {
    for (const std::string& warning : WarningsAbout(manifest)) {
        err << "hvpack: WARNING: " << file << ": " << warning << '\n';
    }
}

bool Make(const Arguments& arguments, std::ostream& out, std::ostream& err) {
    return Report(err, [&] {
        Warn(MakePackage(fs::path(arguments[1]), fs::path(arguments[2])), arguments[2], err);
        out << "OK " << arguments[2] << '\n';
        return true;
    });
}

bool IsSuiteFile(const fs::path& file) {
    return file.extension().string() == ".json";
}

bool CheckOne(const std::string& file, std::ostream& out, std::ostream& err) {
    if (IsSuiteFile(fs::path(file))) {
        RefuseUnlessSuite(file);
    } else {
        Warn(ValidatedPackage(file).manifest, file, err);
    }
    out << "OK " << file << '\n';
    return true;
}

bool Check(const Arguments& arguments, std::ostream& out, std::ostream& err) {
    bool sound = true;
    for (std::size_t file = 1; file < arguments.size(); ++file) {
        sound &= Report(err, [&] { return CheckOne(arguments[file], out, err); });
    }
    return sound;
}

bool List(const Arguments& arguments, std::ostream& out, std::ostream& err) {
    std::vector<std::string> files;
    std::vector<std::string> directories;
    if (HV::ReadZipEntries(arguments[1], files, directories) != 0) {
        err << "hvpack: " << arguments[1] << " cannot be opened as a package\n";
        return false;
    }
    for (const auto* names : {&directories, &files}) {
        for (const std::string& name : *names) {
            out << name << '\n';
        }
    }
    return true;
}

/// Whether every suite file of the folder is one. A folder without any is a release all the same.
bool CheckSuites(const fs::path& folder, std::ostream& err) {
    bool sound = true;
    for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
        if (IsSuiteFile(entry.path())) {
            sound &= Report(err, [&] {
                RefuseUnlessSuite(entry.path().string());
                return true;
            });
        }
    }
    return sound;
}

/// Rows for all packages that are sound, and whether that is every one of them, and the suite too.
bool ReadRelease(const fs::path& folder, std::vector<ReleaseRow>& rows, std::ostream& err) {
    bool sound = true;
    for (const fs::path& package : PackagesIn(folder)) {
        sound &= Report(err, [&] {
            rows.push_back(RowOf(package));
            return true;
        });
    }
    return CheckSuites(folder, err) && sound;
}

void PrintSource(const std::string& source, std::ostream& out) {
    if (!(out << source << std::flush)) {
        throw PackageError("cannot write the table");
    }
}

bool Table(const Arguments& arguments, std::ostream& out, std::ostream& err) {
    return Report(err, [&] {
        std::vector<ReleaseRow> rows;
        if (!ReadRelease(fs::path(arguments[1]), rows, err)) {
            return false;
        }
        if (arguments.size() == 2) {
            PrintSource(TableSource(rows), out);
        } else {
            WriteSource(fs::path(arguments[2]), TableSource(rows));
            out << "OK " << arguments[2] << '\n';
        }
        return true;
    });
}

}  // namespace

int RunCommand(const Arguments& arguments, std::ostream& out, std::ostream& err) {
    const EngineLines lines(err);
    const std::string command = arguments.empty() ? "" : arguments[0];
    if (command == "make" && arguments.size() == 3) {
        return Make(arguments, out, err) ? 0 : 1;
    }
    if (command == "check" && arguments.size() > 1) {
        return Check(arguments, out, err) ? 0 : 1;
    }
    if (command == "list" && arguments.size() == 2) {
        return List(arguments, out, err) ? 0 : 1;
    }
    if (command == "table" && (arguments.size() == 2 || arguments.size() == 3)) {
        return Table(arguments, out, err) ? 0 : 1;
    }
    err << kUsage;
    return 1;
}

}  // namespace HVPack
