#include "TracePoints.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <regex>

namespace qelo::test {

namespace {

constexpr int progressLevel = 3000;
constexpr int detailLevel = 4000;
constexpr int failureLevel = 6000;

std::string where(const std::string& function, Unit unit) {
    return function + "() in " + unit.file + " [Line: #]";
}

bool isTwin(const LogLine& log, const LogLine& trace) {
    return log.sink == Sink::Log && trace.sink == Sink::Trace && log.function == trace.function &&
           log.file == trace.file && log.line == trace.line && log.component == trace.component &&
           log.level == trace.level && log.message == trace.message;
}

void expectReservedUnused(const LogLine& line) {
    EXPECT_EQ(line.reserved1, nullptr) << line.message;
    EXPECT_EQ(line.reserved2, 0) << line.message;
    EXPECT_EQ(line.reserved3, 0) << line.message;
}

std::string excerpt(const std::vector<std::string>& points, std::size_t around) {
    std::string text;
    const std::size_t first = around < 3 ? 0 : around - 3;
    for (std::size_t i = first; i < points.size() && i < around + 4; ++i) {
        text += (i == around ? "  > " : "    ") + points[i] + "\n";
    }
    return text + (around >= points.size() ? "  > (the end)\n" : "");
}

} // namespace

std::string normalised(const std::string& message) {
    static const std::regex bracketed("Line: [0-9]+");
    static const std::regex variable("' at line [0-9]+ in ");
    static const std::regex address("0x[0-9a-f]+");
    std::string text = std::regex_replace(message, bracketed, "Line: #");
    text = std::regex_replace(text, variable, "' at line # in ");
    return std::regex_replace(text, address, "@");
}

std::string pointText(const std::string& component, const std::string& function,
                      const std::string& file, int level, const std::string& message) {
    return std::to_string(level) + " " + component + " " + function + " " + file + ": " + message;
}

std::vector<std::string> tracePoints(const std::vector<LogLine>& lines) {
    std::vector<std::string> points;
    EXPECT_EQ(lines.size() % 2, 0U) << "a line reached one sink only";
    for (std::size_t i = 0; i + 1 < lines.size(); i += 2) {
        const LogLine& log = lines[i];
        EXPECT_TRUE(isTwin(log, lines[i + 1])) << "not the same line in both sinks:\n  "
                                               << log.message << "\n  " << lines[i + 1].message;
        expectReservedUnused(log);
        expectReservedUnused(lines[i + 1]);
        points.push_back(
            pointText(log.component, log.function, log.file, log.level, normalised(log.message)));
    }
    return points;
}

std::vector<std::string> withoutDestructors(std::vector<std::string> points,
                                            const std::string& destructor) {
    const std::string text = "METHOD: " + destructor + "() was invoked in ";
    points.erase(std::remove_if(points.begin(), points.end(),
                                [&](const std::string& point) {
                                    return point.find(text) != std::string::npos;
                                }),
                 points.end());
    return points;
}

std::vector<std::string> normalisedEvents() {
    std::vector<std::string> events = RecordingPlatform::instance().events();
    std::transform(events.begin(), events.end(), events.begin(), normalised);
    return events;
}

std::vector<std::string> eventsFromLast(const std::string& first) {
    const std::vector<std::string> events = normalisedEvents();
    const auto found = std::find(events.rbegin(), events.rend(), first);
    if (found == events.rend()) {
        ADD_FAILURE() << "there is no event '" << first << "'";
        return {};
    }
    return {found.base() - 1, events.end()};
}

std::vector<std::string> eventsWithin(const std::string& function) {
    const std::vector<std::string> events = normalisedEvents();
    const auto line = [&](auto from, const std::string& kind) {
        const std::string start = kind + ": " + function + "() in ";
        return std::find_if(from, events.end(), [&](const std::string& event) {
            return event.compare(0, start.size(), start) == 0;
        });
    };
    const auto entry = line(events.begin(), "ENTERING");
    const auto exit = line(entry, "EXITING");
    if (exit == events.end()) {
        ADD_FAILURE() << function << " was not entered and left";
        return {};
    }
    return {entry + 1, exit};
}

ExpectedTrace& ExpectedTrace::add(Unit unit, const std::string& function, int level,
                                  const std::string& message) {
    points_.push_back(pointText(unit.component, function, unit.file, level, message));
    return *this;
}

ExpectedTrace& ExpectedTrace::marker(Unit unit, const std::string& function,
                                     const std::string& message) {
    points_.push_back(pointText(unit.component, function, "Trace", detailLevel, message));
    return *this;
}

ExpectedTrace& ExpectedTrace::providerEntry(Unit unit, const std::string& function) {
    marker(unit, "markProviderEntry", std::string(78, '='));
    return marker(unit, "markProviderEntry", "ENTERING: " + where(function, unit));
}

ExpectedTrace& ExpectedTrace::providerExit(Unit unit, const std::string& function) {
    marker(unit, "markProviderExit", "EXITING: " + where(function, unit));
    return marker(unit, "markProviderExit", std::string(78, '='));
}

ExpectedTrace& ExpectedTrace::entering(Unit unit, const std::string& function) {
    return add(unit, function, progressLevel, "ENTERING: " + where(function, unit));
}

ExpectedTrace& ExpectedTrace::exiting(Unit unit, const std::string& function) {
    return add(unit, function, progressLevel, "EXITING: " + where(function, unit));
}

ExpectedTrace& ExpectedTrace::entering(Unit unit, const std::string& function,
                                       const std::string& params) {
    return add(unit, function, progressLevel,
               "ENTERING: " + where(function, unit) + ",Parameters List: " + params);
}

ExpectedTrace& ExpectedTrace::exiting(Unit unit, const std::string& function,
                                      const std::string& params) {
    return add(unit, function, progressLevel,
               "EXITING: " + where(function, unit) + ",Parameters List: " + params);
}

ExpectedTrace& ExpectedTrace::method(Unit unit, const std::string& function) {
    return add(unit, function, progressLevel,
               "METHOD: " + function + "() was invoked in " + unit.file + " [Line: #]");
}

ExpectedTrace& ExpectedTrace::variable(Unit unit, const std::string& function,
                                       const std::string& name, const std::string& value) {
    return add(unit, function, detailLevel,
               "VARIABLE: '" + name + "' has Value '" + value + "' at line # in " + unit.file);
}

ExpectedTrace& ExpectedTrace::message(Unit unit, const std::string& function,
                                      const std::string& text) {
    return add(unit, function, failureLevel,
               std::string("MESSAGE [File: ") + unit.file + ", Line: #]: " + text);
}

ExpectedTrace& ExpectedTrace::plain(Unit unit, const std::string& function,
                                    const std::string& text) {
    return add(unit, function, progressLevel, text);
}

ExpectedTrace& ExpectedTrace::append(const ExpectedTrace& other) {
    points_.insert(points_.end(), other.points_.begin(), other.points_.end());
    return *this;
}

void expectSamePoints(const std::vector<std::string>& recorded, const ExpectedTrace& expected) {
    const std::vector<std::string>& wanted = expected.points();
    const auto [given, missing] =
        std::mismatch(recorded.begin(), recorded.end(), wanted.begin(), wanted.end());
    if (given == recorded.end() && missing == wanted.end()) {
        return;
    }
    const auto place = static_cast<std::size_t>(given - recorded.begin());
    ADD_FAILURE() << "the trace differs at point " << place << "\nexpected:\n"
                  << excerpt(wanted, place) << "recorded:\n"
                  << excerpt(recorded, place);
}

} // namespace qelo::test
