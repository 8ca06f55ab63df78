#pragma once

#include "platform/hosted/win32.h"

/// Child processes, under the runtime's names.
///
/// The command processor is /bin/sh. A line that is nothing but the quoted path of a file on the machine runs that
/// file, as cmd would run a batch file: by /bin/sh, whether or not it has the execute bit, and with its host's name as
/// `$0`. A line with one more pair of quotes around the whole (`""C:\a b\x.bat" y"`) loses that pair, as with cmd. Any
/// other line is handed to /bin/sh as it stands. The child works in this process's current directory, and
/// its environment is this process's with HV_MACHINE naming the machine's folder: a script reaches drive C as
/// `$HV_MACHINE/drive_c`, and a program of this house that it starts works on the same machine. The machine's own
/// variables (ProgramData and so on) are Windows paths, which a shell has no use for; they are not added.
///
/// May be called from any thread: no child inherits the pipe of another.

/// A stream from the standard output of the child, whose other streams stay those of this process. Only "r" is known
/// as `mode`. Null when no process or pipe can be made. The bytes come as the child wrote them.
FILE* _popen(const char* line, const char* mode);
/// Waits for the child's end and gives its exit code as it stands, also one above 255 when /bin/sh itself ends by
/// `exit` (`exit 512` gives 512): a host's process can only report eight bits of it, so the shell is made to tell the
/// whole number aside. That holds for a shell that keeps it whole, as Debian's does. A child that a signal has ended
/// gives 0xC000013A, with which Windows ends interrupted programs. -1 for a stream that is not from _popen.
int _pclose(FILE* stream);
