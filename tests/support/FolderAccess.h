#pragma once

#include <string>

class Machine;

/// Whether users of the machine other than the folder's owner may write into it. Looked up on the host's disk: under
/// Wine the list that is read back is made from the rights there, and leaves the group of users out.
bool OthersMayWrite(const Machine& machine, const std::string& folder);
