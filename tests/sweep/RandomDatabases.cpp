#include "DamagedDatabases.h"

#include <algorithm>
#include <iterator>
#include <random>

namespace qelo::test {

namespace {

using Random = std::mt19937;

std::size_t below(Random& random, std::size_t bound) { return random() % bound; }

char anyByte(Random& random) {
    static const std::string favourites(":\n,:\n\0\r+-#!*0129 \xFF\xC3", 19);
    return below(random, 2) == 0 ? favourites[below(random, favourites.size())]
                                 : static_cast<char>(random() & 0xFFU);
}

void damageOnce(Random& random, std::string& text) {
    const std::size_t at = below(random, text.size() + 1);
    const std::size_t length = std::min(below(random, 20), text.size() - at);
    switch (below(random, 5)) {
    case 0:
        text.erase(at, length);
        break;
    case 1:
        text.insert(at, 1, anyByte(random));
        break;
    case 2:
        text.insert(below(random, text.size() + 1), text.substr(at, length));
        break;
    case 3:
        text.insert(at, below(random, 3000), anyByte(random));
        break;
    default:
        if (at < text.size()) {
            text[at] = anyByte(random);
        }
        break;
    }
}

void damage(Random& random, std::string& text) {
    for (std::size_t count = 1 + below(random, 8); count > 0; --count) {
        damageOnce(random, text);
    }
}

} // namespace

// The lines of "first" and "last" may be among those that are damaged: what stands there tells.
DamagedDatabase randomlyDamaged(std::uint32_t seed) {
    Random random(seed);
    DamagedDatabase database{"seed " + std::to_string(seed), undamagedFiles()};
    const bool whole = below(random, 3) == 0;
    for (const auto& [file, frame] : frames()) {
        std::string line = joined(victims().at(file)) + "\n";
        if (!whole) {
            damage(random, line);
            database.files[file] = frame.first + line + "\n" + frame.second;
        } else {
            damage(random, database.files[file]);
        }
    }
    database.firstAccount = database.lastAccount = !whole;
    database.firstGroup = database.lastGroup = !whole;
    if (below(random, 4) == 0) {
        const auto rules =
            std::next(policyFiles().begin(),
                      static_cast<std::ptrdiff_t>(below(random, policyFiles().size())));
        damage(random, database.files[rules->first]);
        database.open = {"MaximumSuccessiveLoginFailures", "PasswordHistoryDepth",
                         "ComplexPasswordRulesEnforced"};
    }
    return database;
}

} // namespace qelo::test
