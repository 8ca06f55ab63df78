#pragma once

#include "platform/windows/win32.h"

#include <objbase.h>
#include <shobjidl.h>

// The headers turn these words into macros, which would hit any name of ours.
#undef interface
#undef small
