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
    std::string url;                              // of a server; empty: this process serves
    std::string passwordFile;                     // for the user of the url
    std::string caCertificate;                    // a file of certificates to trust
    bool insecure = false;                        // trust any certificate
    std::vector<std::string> schemaDirectories;   // empty: the usual place
    bool changes = false;                         // whether the command changes accounts or groups
};

} // namespace qelo::cli
