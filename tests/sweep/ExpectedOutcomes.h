// What every operation answers when one call fails, against a file that states it
// (tests/sweep/expected). Such a file is to be read and checked by people: it says, for each
// operation and each kind of call, what the caller of the operation gets.
//
//     EnumInstanceNames
//         good: OK, done, 2 results, 44 calls
//         any: newObjectPath 1 -> FAILED "Create CMPIObjectPath failed.", not done, none
//
// reads: without a fault the operation answers OK, calls returnDone, and returns two results;
// when the first call of newObjectPath fails in any way, it answers FAILED with that message,
// without returnDone, and returns nothing. "its status" is the one that the failing call left,
// OK where it only gave null; "with its text" means that of what was thrown. Operations that
// agree in all of it share one entry.
//
// Calls that are many and much alike are not told apart:
//         throws: somewhere -> OK, done, all
// says that there are calls for which this holds.
//
// QELO_SWEEP_WRITE=1 in the environment writes the files anew, from a sweep in every way.
#pragma once

#include <cstddef>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace qelo::test {

// Whether the environment asks for the files to be written rather than compared.
bool writesExpectations();

// The n-th call of a kind, counted from 1.
using NthCall = std::pair<std::string, std::size_t>;

// The calls of one run by kind, each with its number among those of its kind.
std::vector<NthCall> numbered(const std::vector<std::string>& kinds);

// What one operation does: its answer without a fault, and that to each fault.
struct OperationOutcomes {
    std::string good;
    // By way and call. More than one text where an answer can be told in several ways.
    std::map<std::string, std::map<NthCall, std::set<std::string>>> faulty;
    // By way, of the calls that are not told apart.
    std::map<std::string, std::set<std::string>> somewhere;
};

class ExpectedOutcomes {
public:
    // `name` is that of the file, without its ending. `ways` are all ways to fail.
    ExpectedOutcomes(std::string name, std::vector<std::string> ways);

    // Tells what an operation did without a fault.
    void good(const std::string& operation, const std::string& outcome);
    // Tells what it did with one. When a way is told several times of a call, it has to be in
    // texts that have one in common.
    void faulty(const std::string& operation, const NthCall& call, const std::string& way,
                const std::set<std::string>& texts);
    // The same for a call that is not told apart from others.
    void faultySomewhere(const std::string& operation, const std::string& way,
                         const std::string& text);

    // Tells what it did with several faults: fails the test unless one fault leads to such an
    // answer, or would but for a message that could not be made. `texts` tell it in all ways.
    void faultyOften(const std::string& operation, const std::set<std::string>& texts);

    // Compares what was told with the file, and fails the test for every difference; or writes
    // the file. `complete` is false when the form of the sweep has left something out that is
    // not told apart.
    void finish(bool complete = true);

private:
    using Table = std::map<std::string, OperationOutcomes>;

    void compare(bool complete) const;
    void write() const;
    void expectOften() const;

    std::string file_;
    std::vector<std::string> ways_;
    Table stated_;
    Table told_;
    std::vector<std::string> order_; // of the operations told
    // The answers to several faults, each in all ways to tell it.
    std::map<std::string, std::set<std::set<std::string>>> often_;
};

} // namespace qelo::test
