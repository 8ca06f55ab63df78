#include "platform/libraries.h"

namespace platform {

std::string LibraryFileName(const fs::path& file) {
    return file.string();
}

std::string LibraryPropertyFile(const fs::path& file) {
    return file.string();
}

}  // namespace platform
