// The classes of the trivial provider: their declarations and registrations, written to a
// scratch folder that goes with its owner.
#pragma once

#include <filesystem>
#include <string>

namespace qelo::bench {

// Every class comes with these numbers of instances.
inline constexpr unsigned int trivialCounts[] = {1, 1000, 10'000, 60'000, 500'000};

// BENCH_Account1000: one instance that is returned so many times.
std::string readyClass(unsigned int count);
// BENCH_FreshAccount1000: each instance is made anew.
std::string freshClass(unsigned int count);

class TrivialClasses {
public:
    TrivialClasses();
    ~TrivialClasses();
    TrivialClasses(const TrivialClasses&) = delete;
    TrivialClasses& operator=(const TrivialClasses&) = delete;

    const std::filesystem::path& folder() const { return folder_; }

private:
    std::filesystem::path folder_;
};

} // namespace qelo::bench
