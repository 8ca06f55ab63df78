#pragma once

#include <string>

/// A file for what a stream gives, outside of everything that a Machine shows. It is gone when it is closed.
///
/// Gives a descriptor of the runtime, in binary mode; without one the test program cannot go on and is ended.
int OpenScratchFile();

/// All that was written to the file so far, CR LF read as LF. Writing goes on at its end.
std::string ReadScratchFile(int descriptor);
