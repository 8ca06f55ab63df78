#pragma once

/// The flat interface of GDI+ and its thin C++ names (namespace Gdiplus), for windows that draw with smooth edges.
#include "platform/windows/window.h"

#include <objidl.h>

#include <gdiplus.h>
