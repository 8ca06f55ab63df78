#pragma once

#include "platform/hosted/win32.h"

/// The platform's names for the version blocks of Windows executables, read from the files themselves.
///
/// An executable is somebody else's file: it may be cut, garbled or made to do harm. Every offset and length in it is
/// checked against the file before it is followed, and the walk is as deep as a good file's and never deeper.
///
/// Known are 32- and 64-bit images, and of a block its root value: what the logic asks for. The block is the image's
/// resource of type 16 and name 1, in the first language that it has. Failures leave no last error.

using UINT = unsigned int;
using PUINT = UINT*;

struct VS_FIXEDFILEINFO {
    DWORD dwSignature;
    DWORD dwStrucVersion;
    DWORD dwFileVersionMS;
    DWORD dwFileVersionLS;
    DWORD dwProductVersionMS;
    DWORD dwProductVersionLS;
    DWORD dwFileFlagsMask;
    DWORD dwFileFlags;
    DWORD dwFileOS;
    DWORD dwFileType;
    DWORD dwFileSubtype;
    DWORD dwFileDateMS;
    DWORD dwFileDateLS;
};

/// The bytes that the block of `fileName` takes, at most 65,535; 0 when the file cannot be read, is no image, has no
/// such resource, or when the resource does not hold a well-formed head and the whole root value that it announces.
DWORD GetFileVersionInfoSizeA(LPCSTR fileName, LPDWORD handle);
/// Copies the block into `data`. FALSE when there is none, or `size` bytes do not hold it.
BOOL GetFileVersionInfoA(LPCSTR fileName, DWORD handle, DWORD size, LPVOID data);
/// The root value (`subBlock` is "\\") of a block that GetFileVersionInfoA gave, within that block. FALSE for any other
/// `subBlock`. The value may be of any length; who reads a VS_FIXEDFILEINFO asks for `length` first.
BOOL VerQueryValueA(LPCVOID block, LPCSTR subBlock, LPVOID* value, PUINT length);
