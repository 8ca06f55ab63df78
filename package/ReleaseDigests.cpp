#include "package/ValidationTable.h"

namespace HV {

// A build without release rows; see ValidationRows.cpp.
std::span<const ReleaseDigest> ReleaseDigests() {
    return {};
}

}  // namespace HV
