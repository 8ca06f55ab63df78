#pragma once

#include <cstdint>
#include <string>

/// What the file of a shell link says. Texts are UTF-8.
struct LinkFileContent {
    std::string target;       // the local path of the link's information block
    std::string itemsTarget;  // the same path as the list of shell items spells it; empty without a list
    std::string description;
    std::string icon;
    std::int32_t iconIndex = 0;
    std::uint32_t attributes = 0;
    std::uint32_t size = 0;
};

/// Reads the bytes of a link file after Microsoft's published format for shell links, strictly: a length or an offset
/// that does not hold, or bytes left over, throw std::runtime_error that says what is wrong. It shares no code with
/// what writes links. Shell items are read where they are drives, folders and files with names of the third version.
LinkFileContent ReadLinkFile(const std::string& bytes);
