#include "package/ValidationTable.h"

namespace HV {

// A build without release rows. This is the only definition in this file, so that a program which brings rows of its
// own links those instead.
std::span<const ValidationRow> ValidationRows() {
    return {};
}

}  // namespace HV
