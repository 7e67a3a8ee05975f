// What every command can be told on the command line.
#pragma once

#include <string>
#include <vector>

namespace qelo::cli {

enum class Format { Text, Json, Mof };

struct Options {
    Format format = Format::Text;
    std::string nameSpace = "root/cimv2";
    std::string store;                            // empty: as the environment says
    std::vector<std::string> providerDirectories; // empty: the usual places
    bool changes = false;                         // whether the command changes accounts or groups
};

} // namespace qelo::cli
