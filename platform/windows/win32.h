#pragma once

#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#ifndef NOMINMAX
#define NOMINMAX
#endif

#include <windows.h>

#include <aclapi.h>
#include <direct.h>
#include <errno.h>
#include <io.h>
#include <psapi.h>
#include <stdio.h>

// The headers turn these words into macros; the logic has operations and enumerators of the same names.
#undef CreateDirectory
#undef DELETE
#undef DeleteFile
#undef ERROR
#undef GetMessage
#undef GetObject
#undef GetSystemDirectory
#undef GetTempPath
#undef IN
#undef OUT
