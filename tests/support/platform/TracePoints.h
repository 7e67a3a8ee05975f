// Comparing what the provider traced with what it should have traced.
//
// Each trace point of the provider is one line in the log and the same line in the trace, in
// this order. tracePoints() checks that and turns each pair into one text, in which the line
// numbers and the addresses, which differ from build to build and run to run, are replaced
// by "#" and "@". ExpectedTrace builds the same texts.
#pragma once

#include "RecordingPlatform.h"

#include <string>
#include <vector>

namespace qelo::test {

// A source unit of the provider: the component it logs under and the name it gives itself.
struct Unit {
    const char* component;
    const char* file;
};

namespace unit {
inline constexpr Unit account{"Corvane.SimAccountObj", "SimAccount"};
inline constexpr Unit accountFactory{"Corvane.SimAccountObjFactory", "SimAccountObjFactory"};
inline constexpr Unit accountProvider{"Corvane.SimAccountProvider", "SimAccountProvider"};
inline constexpr Unit groupProvider{"Corvane.SimGroupProvider", "SimGroupProvider"};
} // namespace unit

// "level component function file: message", with the message normalised.
std::string pointText(const std::string& component, const std::string& function,
                      const std::string& file, int level, const std::string& message);

// The message with "Line: 12", "at line 12 in" and "0x7ffe..." made the same in each run.
std::string normalised(const std::string& message);

// One text per pair of lines. Records a test failure for a line without its twin, and for a
// line whose reserved arguments are not null, 0 and 0.
std::vector<std::string> tracePoints(const std::vector<LogLine>& lines);

// The same points without those of a record's destructor, whose number depends on how often
// the compiler copies.
std::vector<std::string> withoutDestructors(std::vector<std::string> points,
                                            const std::string& destructor);

// The events of the platform, each normalised.
std::vector<std::string> normalisedEvents();

// The events from the last one that is `first` to the end; none, and a failure, without it.
std::vector<std::string> eventsFromLast(const std::string& first);

// The events between the first entry line of a function and the exit line that follows it;
// none, and a failure, where they are not both there.
std::vector<std::string> eventsWithin(const std::string& function);

// Builds the points of an expected sequence, in order.
class ExpectedTrace {
public:
    ExpectedTrace& providerEntry(Unit unit, const std::string& function);
    ExpectedTrace& providerExit(Unit unit, const std::string& function);
    ExpectedTrace& entering(Unit unit, const std::string& function);
    ExpectedTrace& exiting(Unit unit, const std::string& function);
    // With a parameter list, which begins with a blank: " name=alice".
    ExpectedTrace& entering(Unit unit, const std::string& function, const std::string& params);
    ExpectedTrace& exiting(Unit unit, const std::string& function, const std::string& params);
    ExpectedTrace& method(Unit unit, const std::string& function);
    ExpectedTrace& variable(Unit unit, const std::string& function, const std::string& name,
                            const std::string& value);
    ExpectedTrace& message(Unit unit, const std::string& function, const std::string& text);
    ExpectedTrace& plain(Unit unit, const std::string& function, const std::string& text);
    ExpectedTrace& append(const ExpectedTrace& other);

    const std::vector<std::string>& points() const { return points_; }

private:
    ExpectedTrace& add(Unit unit, const std::string& function, int level,
                       const std::string& message);
    ExpectedTrace& marker(Unit unit, const std::string& function, const std::string& message);
    std::vector<std::string> points_;
};

// Fails the running test at the first difference and shows its surroundings.
void expectSamePoints(const std::vector<std::string>& recorded, const ExpectedTrace& expected);

} // namespace qelo::test
