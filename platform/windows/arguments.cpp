#include "platform/arguments.h"

namespace platform {

std::vector<std::string> ProgramArguments(int count, const char* const* words) {
    return {words + (count > 0 ? 1 : 0), words + count};
}

}  // namespace platform
