// Account databases with damage in them, for readers that have to live with it.
//
// Each has the undamaged account and group "first" at the beginning of its files and "last" at
// their end; the damage lies between, unless the database says that it cannot.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace qelo::test {

struct DamagedDatabase {
    std::string name;
    // Content by file name (passwd, shadow, group, gshadow); a file that is not in it is
    // missing.
    std::map<std::string, std::string> files;
    // The file of that name is a directory, a pipe without a writer, a link to itself, or
    // readable to nobody.
    enum class Place { File, Directory, Pipe, LoopingLink, Unreadable };
    Place place = Place::File;
    std::string placeOf = {};
    // Whether the undamaged lines are there to be read.
    bool firstAccount = true;
    bool lastAccount = true;
    bool firstGroup = true;
    bool lastGroup = true;
};

// Every field of every file damaged in every way, and every file as a whole.
std::vector<DamagedDatabase> damagedDatabases();

// Bytes of the lines between, or of whole files, changed at random; the same for the same seed.
DamagedDatabase randomlyDamaged(std::uint32_t seed);

} // namespace qelo::test
