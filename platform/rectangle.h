#pragma once

#include "platform/win32.h"

/// The platform's rectangle, for logic that says where windows stand: RECT, whose `right` and `bottom` lie outside it.
#ifndef _WIN32
struct RECT {
    LONG left;
    LONG top;
    LONG right;
    LONG bottom;
};
#endif
