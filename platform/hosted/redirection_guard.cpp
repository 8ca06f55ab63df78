#include "platform/redirection_guard.h"

namespace platform {

bool RefusePlantedJunctions() {
    return false;
}

}  // namespace platform
