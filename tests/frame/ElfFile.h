// What the dynamic section and the dynamic symbol table of a shared library say.
#pragma once

#include <string>
#include <vector>

namespace qelo::test {

struct ElfFile {
    std::string soname;
    std::vector<std::string> needed;         // in the file's order
    std::vector<std::string> definedSymbols; // of the dynamic symbol table, sorted
};

// Reads a 64-bit library of this machine's byte order. Throws std::runtime_error when the
// file is not one.
ElfFile readElfFile(const std::string& path);

} // namespace qelo::test
