#pragma once

/// The system's headers for sources that make windows and draw in them: the windows of the wizard and what serves them.
///
/// They need the drawing interface, which the flags of all other rooms leave out. A source that includes this links
/// hv_window, which puts it back.
#ifdef NOGDI
#error "windows are drawn: link hv_window"
#endif

#include "platform/windows/win32.h"

#include <objbase.h>
#include <ole2.h>

#include <commctrl.h>
#include <commdlg.h>
#include <richedit.h>
#include <shellapi.h>

// The headers turn these words into macros, which would hit any name of ours.
#undef interface
#undef small
