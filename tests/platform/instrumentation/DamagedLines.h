// Damaged lines of account files, for every test that needs some.
#pragma once

#include <string>
#include <vector>

namespace qelo::nodes::tests {

struct DamagedLine {
    std::string text;
    bool served; // whether the system's own look-ups make a record of it
};

// In each damaged record the name is "bad", unless its damage is the name.
std::vector<DamagedLine> damagedAccountLines();
std::vector<DamagedLine> damagedShadowLines();
std::vector<DamagedLine> damagedGroupLines();

} // namespace qelo::nodes::tests
