#pragma once

#include <sys/types.h>

#include <string>

#include "platform/hosted/win32.h"

/// The processes that run on the host, under the platform's names, read from /proc.
///
/// A process is a whole program, never one of its threads. What this process may not look into, it cannot open: other
/// users' processes, unless it is root, and the kernel's own. A process that has ended and only waits for its parent to
/// notice cannot be opened either. Handles name a process by its number and are good only while it runs.

enum TOKEN_INFORMATION_CLASS { TokenUser = 1 };

inline constexpr DWORD PROCESS_VM_READ = 0x0010;
inline constexpr DWORD PROCESS_QUERY_INFORMATION = 0x0400;
inline constexpr DWORD TOKEN_QUERY = 0x0008;
inline constexpr DWORD TOKEN_READ = 0x20008;

/// The numbers of the processes, in rising order, as many as `size` bytes hold; `needed` tells how many bytes were
/// filled. FALSE when the list cannot be had.
BOOL K32EnumProcesses(LPDWORD processes, DWORD size, LPDWORD needed);
/// Null when there is no such process or this one may not look into it. `access` and `inherit` are not looked at.
HANDLE OpenProcess(DWORD access, BOOL inherit, DWORD process);
/// A process has one module here, its program.
BOOL K32EnumProcessModules(HANDLE process, PHMODULE modules, DWORD size, LPDWORD needed);
/// The Windows path of the program, the one under which it was started also when the file has gone since. Returns its
/// length; a path that `size` characters do not hold is cut, terminated, and gives `size`. 0 when it cannot be read.
DWORD K32GetModuleFileNameExA(HANDLE process, HMODULE module, LPSTR buffer, DWORD size);
BOOL OpenProcessToken(HANDLE process, DWORD access, PHANDLE token);
/// Knows TokenUser alone; the block is four bytes, the number of the user who runs the process.
BOOL GetTokenInformation(HANDLE token, TOKEN_INFORMATION_CLASS what, LPVOID block, DWORD size, LPDWORD needed);

namespace hosted {

/// The Windows path of the program that this process runs; empty when it may not be known.
[[nodiscard]] std::string ProgramOfProcess(pid_t process);

}  // namespace hosted
