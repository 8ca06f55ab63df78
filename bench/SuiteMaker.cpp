#include "bench/SuiteMaker.h"

#include <array>
#include <cstdio>
#include <fstream>
#include <random>
#include <stdexcept>

#include "bench/Process.h"

namespace HVBench {
namespace {

namespace disk = std::filesystem;

/// People keep folders apart, not one of a hundred thousand files.
constexpr int kFilesPerFolder = 200;

constexpr const char* kFailingProduct = "postflight-fails";

std::string Numbered(const char* format, int number) {
    std::array<char, 64> text{};
    std::snprintf(text.data(), text.size(), format, number);
    return text.data();
}

std::string Manifest(const std::string& product, const std::string& contents) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<hvmanifest version=\"1.0\" product=\"" + product +
           "\" productversion=\"1.0.0\">\n<installer-policy uninstall=\"true\"/>\n<product-data>"
           "<value key=\"display_name\">" +
           product + "</value><value key=\"version\">1.0.0</value></product-data>\n<contents>\n" + contents +
           "</contents>\n</hvmanifest>\n";
}

std::string Payload(const std::string& id, const std::string& source, const std::string& sysdir,
                    const std::string& subpath) {
    return "<payload id=\"" + id + "\" type=\"resource\" deployment=\"sysdir\" os=\"win\"><source>" + source +
           "</source><subpath>" + subpath + "</subpath><sysdir type=\"" + sysdir + "\"/></payload>\n";
}

void Pack(const std::string& hvpack, const disk::path& folder, const disk::path& packages, const std::string& product) {
    const disk::path machine = packages.parent_path() / "packing";
    disk::create_directories(machine);
    RunProgram({hvpack, "make", folder.string(), (packages / (product + ".hvpkg")).string()}, machine.string());
    disk::remove_all(folder);
}

void WritePayload(const SuiteShape& shape, const disk::path& folder, std::uint64_t seed) {
    std::mt19937_64 random(seed);
    const std::size_t quarter = shape.averageSize / 4;
    for (int file = 0; file < shape.filesPerPackage; ++file) {
        const disk::path parent = folder / Numbered("set-%04d", file / kFilesPerFolder);
        if (file % kFilesPerFolder == 0) {
            disk::create_directories(parent);
        }
        const bool isPlugin = file == 0 && shape.pluginSize > 0;
        const std::size_t size = isPlugin ? shape.pluginSize : quarter + random() % (quarter * 6 + 1);
        WriteFile(parent / Numbered("Preset %06d.ffx", file), MakeBytes(size, random()));
    }
}

void MakePackage(const SuiteShape& shape, int number, const std::string& hvpack, const disk::path& work,
                 const disk::path& packages) {
    const std::string product = Numbered("com.halvorn.bench.p%04d", number);
    const disk::path folder = work / product;
    disk::create_directories(folder / "history");
    WritePayload(shape, folder / "payload", shape.seed * 100003 + static_cast<std::uint64_t>(number));
    const std::string record = "history/" + product + "_v1.0.0_hvmanifest.xml";
    WriteFile(folder / record, Manifest(product, ""));
    WriteFile(folder / "_hvmanifest.xml",
              Manifest(product, Payload("files", "payload", "programfiles", "Halvorn/" + product) +
                                    Payload("history", record, "history", "")));
    Pack(hvpack, folder, packages, product);
}

void MakeFailingPackage(const std::string& hvpack, const disk::path& work, const disk::path& packages) {
    const disk::path folder = work / kFailingProduct;
    disk::create_directories(folder / "payload");
    WriteFile(folder / "_hvmanifest.xml", Manifest(kFailingProduct, Payload("lost", "payload", "nowhere", "Lost")));
    Pack(hvpack, folder, packages, kFailingProduct);
}

}  // namespace

std::string MakeBytes(std::size_t size, std::uint64_t seed) {
    constexpr std::size_t kWords = 512;
    std::mt19937_64 random(seed);
    std::array<std::uint64_t, kWords> words{};
    for (std::uint64_t& word : words) {
        word = random();
    }
    std::string bytes;
    bytes.reserve(size + sizeof(std::uint64_t));
    while (bytes.size() < size) {
        const std::uint64_t draw = random();
        const std::uint64_t word = draw % 8 < 3 ? draw : words[(draw >> 8) % kWords];
        bytes.append(reinterpret_cast<const char*>(&word), sizeof word);
    }
    bytes.resize(size);
    return bytes;
}

void WriteFile(const disk::path& path, const std::string& bytes) {
    std::ofstream file(path, std::ios::binary);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    if (!file.flush()) {
        throw std::runtime_error("cannot write " + path.string());
    }
}

void MakeSuite(const SuiteShape& shape, const std::string& hvpack, const disk::path& work, const disk::path& packages) {
    disk::create_directories(packages);
    for (int number = 0; number < shape.packages; ++number) {
        MakePackage(shape, number, hvpack, work, packages);
    }
    if (shape.lastFails) {
        MakeFailingPackage(hvpack, work, packages);
    }
    WriteFile(packages / "suite.json",
              "{\"identifier\": \"com.halvorn.bench\", \"version\": \"1.0.0\", \"product_type\": \"0\", "
              "\"display_name\": \"Bench Suite\"}\n");
}

}  // namespace HVBench
