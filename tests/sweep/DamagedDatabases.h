// Account databases with damage in them, for readers that have to live with it.
//
// Each has the undamaged account and group "first" at the beginning of its files and "last" at
// their end; the damage lies between, unless the database says that it cannot.
#pragma once

#include "SampleDatabase.h"

#include <cstdint>
#include <set>
#include <string>
#include <vector>

namespace qelo::test {

struct DamagedDatabase {
    std::string name;
    // The account files and those with the rules for passwords; a file that is not in it is
    // missing.
    Files files;
    // The file of that name is a directory, a pipe without a writer, a link to itself, or
    // readable to nobody.
    enum class Place { File, Directory, Pipe, LoopingLink, Unreadable };
    Place place = Place::File;
    std::string placeOf = {};
    // Properties of accounts that may have another value for the damage.
    std::set<std::string> open = {};
    // Whether the damaged file is one that enumerations read.
    bool isRead = true;
    // Whether the undamaged lines are known to be there. Else their state tells.
    bool firstAccount = true;
    bool lastAccount = true;
    bool firstGroup = true;
    bool lastGroup = true;
};

// Every field of every account file damaged in every way, every setting of the other files, and
// every file as a whole.
std::vector<DamagedDatabase> damagedDatabases();

// Bytes of the lines between, or of whole files, changed at random; the same for the same seed.
DamagedDatabase randomlyDamaged(std::uint32_t seed);

} // namespace qelo::test
