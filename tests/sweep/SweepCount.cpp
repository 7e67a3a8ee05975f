#include "SweepCount.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <iostream>

namespace qelo::test {

namespace {

std::size_t allFaults = 0;
std::size_t allOperations = 0; // of the parts without faults

class Summary : public testing::Environment {
public:
    void TearDown() override {
        if (allOperations != 0) {
            std::cout << "[  SWEEP   ] " << allOperations << " operations in all\n";
        } else {
            std::cout << "[  SWEEP   ] " << allFaults << " faults in all\n";
        }
    }
};

const testing::Environment* const summary = testing::AddGlobalTestEnvironment(new Summary);

} // namespace

bool isLongSweep() {
    const char* form = std::getenv("QELO_SWEEP");
    return form != nullptr && std::strcmp(form, "long") == 0;
}

void countFaults(const std::string& part, std::size_t operations, std::size_t faults) {
    allFaults += faults;
    testing::Test::RecordProperty("operations", std::to_string(operations));
    testing::Test::RecordProperty("faults", std::to_string(faults));
    std::cout << "[  SWEEP   ] " << part << ": " << faults << " faults in " << operations
              << " operations\n";
}

void countOperations(const std::string& part, std::size_t operations) {
    allOperations += operations;
    testing::Test::RecordProperty("operations", std::to_string(operations));
    std::cout << "[  SWEEP   ] " << part << ": " << operations << " operations\n";
}

} // namespace qelo::test
