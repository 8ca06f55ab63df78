#include "tools/hvpack/ReleaseTable.h"

#include <algorithm>
#include <cstdio>
#include <map>
#include <string_view>

#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"
#include "package/HeldFile.h"
#include "package/PackageNames.h"
#include "platform/win32.h"
#include "tools/hvpack/PackageError.h"
#include "tools/hvpack/ValidatedPackage.h"

namespace HVPack {
namespace {

constexpr std::string_view kHead =
    "// Made by hvpack table from the package files of a release. The next build replaces what is changed here.\n"
    "#include <array>\n"
    "\n"
    "#include \"package/ValidationTable.h\"\n"
    "\n"
    "namespace {\n"
    "\n";
constexpr std::string_view kFoot =
    "}};\n"
    "\n"
    "}  // namespace\n"
    "\n"
    "std::span<const HV::ValidationRow> HV::ValidationRows() {\n"
    "    return kRows;\n"
    "}\n"
    "\n"
    "std::span<const HV::ReleaseDigest> HV::ReleaseDigests() {\n"
    "    return kDigests;\n"
    "}\n";

using HVL::StringUtils::ToLower;

std::string FileName(const fs::path& path) {
    return path.filename().string();
}

void RefuseOneNameForTwo(const std::vector<fs::path>& packages) {
    std::map<std::string, std::string> known;
    for (const fs::path& package : packages) {
        const auto [other, isNew] = known.emplace(ToLower(FileName(package)), FileName(package));
        if (!isNew) {
            throw PackageError(other->second + " and " + FileName(package) + " are one name on Windows");
        }
    }
}

std::string DisplayName(const HV::Manifest& manifest) {
    if (!manifest.policy.show) {
        return "None";
    }
    const auto name = manifest.productData.find("display_name");
    return name != manifest.productData.end() ? name->second : manifest.productId;
}

/// Three digits always: with fewer, a digit that follows in the text would count as part of the number.
std::string OctalEscape(unsigned char byte) {
    std::string escape = "\\";
    for (const int shift : {6, 3, 0}) {
        escape += static_cast<char>('0' + ((byte >> shift) & 7));
    }
    return escape;
}

/// A literal with exactly these bytes, in plain characters alone: what the source's encoding is does not matter. A
/// question mark is escaped because two of them begin what once was another character, which compilers warn of.
std::string Literal(std::string_view text) {
    std::string literal = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\' || c == '?') {
            literal += '\\';
            literal += c;
        } else if (c < ' ' || c > '~') {
            literal += OctalEscape(static_cast<unsigned char>(c));
        } else {
            literal += c;
        }
    }
    return literal + "\"";
}

std::string RowSource(const ReleaseRow& row) {
    return "    {" + Literal(row.fileName) + ", " + Literal(row.info.displayName) + ", " + Literal(row.info.productId) +
           ", " + Literal(row.info.version) + ",\n     " + Literal(row.info.md5) + "},\n";
}

std::string DigestSource(const ReleaseRow& row) {
    return "    {" + Literal(row.fileName) + ",\n     " + Literal(row.sha256) + "},\n";
}

/// `count` elements of HV::`type`, ready for their list.
std::string ArrayHead(const std::string& type, const std::string& name, std::size_t count) {
    return "constexpr std::array<HV::" + type + ", " + std::to_string(count) + "> " + name + "{{\n";
}

bool WriteFile(const fs::path& path, const std::string& text) {
    std::FILE* file = nullptr;
    if (fopen_s(&file, path.string().c_str(), "wb") != 0) {
        return false;
    }
    const bool written = std::fwrite(text.data(), 1, text.size(), file) == text.size();
    return std::fclose(file) == 0 && written;
}

}  // namespace

std::vector<fs::path> PackagesIn(const fs::path& folder) {
    if (!fs::is_directory(folder)) {
        throw PackageError(folder.string() + " is not a folder");
    }
    std::vector<fs::path> packages;
    for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
        if (HV::IsNamedAsPackage(fs::path(ToLower(FileName(entry.path())))) && fs::is_regular_file(entry.path())) {
            packages.push_back(entry.path());
        }
    }
    if (packages.empty()) {
        throw PackageError("no packages in " + folder.string());
    }
    std::ranges::sort(packages, {}, FileName);
    RefuseOneNameForTwo(packages);
    return packages;
}

ReleaseRow RowOf(const fs::path& package) {
    const HV::Manifest manifest = ValidatedPackage(package.string()).manifest;
    const HV::FileDigests digests = HV::HeldFile(package).Digests();
    return {FileName(package),
            {DisplayName(manifest), manifest.productId, manifest.productVersion, digests.md5},
            digests.sha256};
}

std::string TableSource(const std::vector<ReleaseRow>& rows) {
    std::string source(kHead);
    source += ArrayHead("ValidationRow", "kRows", rows.size());
    for (const ReleaseRow& row : rows) {
        source += RowSource(row);
    }
    source += "}};\n\n" + ArrayHead("ReleaseDigest", "kDigests", rows.size());
    for (const ReleaseRow& row : rows) {
        source += DigestSource(row);
    }
    return source.append(kFoot);
}

void WriteSource(const fs::path& output, const std::string& text) {
    if (HV::IsNamedAsPackage(output)) {
        throw PackageError("a table is not named as a package is: " + output.string());
    }
    std::string present;
    if (HVL::FileUtils::ReadFileToString(output.string(), present) == 0 && present == text) {
        return;
    }
    const fs::path aside(output.string() + ".part");
    boost::system::error_code error;
    const bool written = WriteFile(aside, text);
    if (written) {
        fs::rename(aside, output, error);
    }
    if (!written || error) {
        fs::remove(aside, error);
        throw PackageError("cannot write " + output.string());
    }
}

}  // namespace HVPack
