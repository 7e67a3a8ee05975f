// A result that passes everything on to the broker's and notes which objects it was given. Some
// results of a run read alike though they are of different records: nothing in them tells
// whether one was delivered twice.
#pragma once

#include <cmpift.h>

#include <string>
#include <vector>

namespace qelo::test {

class WatchedResult {
public:
    // `real` must outlive this.
    explicit WatchedResult(const CMPIResult* real);
    WatchedResult(const WatchedResult&) = delete;
    WatchedResult& operator=(const WatchedResult&) = delete;

    const CMPIResult* get() const { return &cmpi_; }
    // Whether the same object was given to it more than once.
    bool gotOneTwice() const;

private:
    static CMPIStatus returnInstance(const CMPIResult* self, const CMPIInstance* instance);
    static CMPIStatus returnObjectPath(const CMPIResult* self, const CMPIObjectPath* path);
    static CMPIStatus returnData(const CMPIResult* self, const CMPIValue* value, CMPIType type);
    static CMPIStatus returnDone(const CMPIResult* self);

    CMPIResultFT table_;
    CMPIResult cmpi_;
    const CMPIResult* real_;
    mutable std::vector<const void*> given_; // the interface knows results as constant
};

// Of the recorded calls of a run: those that make an instance, or hand out its path, which were
// made before with the same values. An instance is known by what is set in it, whether or not
// setting it fails.
std::vector<std::string> madeTwice(const std::vector<std::string>& calls);

} // namespace qelo::test
