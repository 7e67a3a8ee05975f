#include "ExpectedOutcomes.h"

#include "ExpectationText.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <sstream>

namespace qelo::test {

namespace {

constexpr const char* kHead =
    "# What each operation answers when a call that it makes fails; ExpectedOutcomes.h tells how\n"
    "# to read this and how to write it anew.\n";

std::string contentOf(const std::string& file) {
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream text;
    text << stream.rdbuf();
    return text.str();
}

// The calls of an operation, as the ways that were tried on each of them show them.
std::set<NthCall> callsIn(const OperationOutcomes& outcomes) {
    std::set<NthCall> calls;
    for (const auto& way : outcomes.faulty) {
        for (const auto& entry : way.second) {
            calls.insert(entry.first);
        }
    }
    return calls;
}

// What differs in one operation, alike differences together.
std::string differences(const OperationOutcomes& stated, const OperationOutcomes& told) {
    std::map<std::string, std::set<NthCall>> found;
    for (const auto& [way, entries] : told.faulty) {
        for (const auto& [call, texts] : entries) {
            const auto ofWay = stated.faulty.find(way);
            const bool known = ofWay != stated.faulty.end() && ofWay->second.count(call) != 0;
            const std::string wanted = known ? *ofWay->second.at(call).begin() : "(not stated)";
            if (texts.count(wanted) == 0) {
                found[way + ": %s\n        stated " + wanted + "\n        is     " +
                      (texts.empty() ? "not the same each time" : *texts.begin())]
                    .insert(call);
            }
        }
    }
    std::string text;
    for (const auto& [difference, calls] : found) {
        const std::size_t place = difference.find("%s");
        text += "    " + difference.substr(0, place) + callsText(calls) +
                difference.substr(place + 2) + "\n";
    }
    return text;
}

// The same of the calls that are not told apart.
std::string differencesSomewhere(const OperationOutcomes& stated, const OperationOutcomes& told,
                                 bool complete) {
    std::string text;
    const auto tell = [&](const OperationOutcomes& all, const OperationOutcomes& known,
                          const char* what) {
        for (const auto& [way, texts] : all.somewhere) {
            const auto found = known.somewhere.find(way);
            for (const std::string& one : texts) {
                if (found == known.somewhere.end() || found->second.count(one) == 0) {
                    text += "    " + way + ": somewhere " + what + one + "\n";
                }
            }
        }
    };
    tell(told, stated, "not stated ");
    if (complete) {
        tell(stated, told, "stated, not there ");
    }
    return text;
}

// An outcome without what it says of the results.
std::string answerOf(const std::string& outcome) {
    const std::size_t end = outcome.rfind("done, ");
    return outcome.substr(0, end + std::strlen("done"));
}

// An answer whose message could not be made.
std::string withoutMessage(const std::string& answer) {
    const std::size_t first = answer.find(" \"");
    const std::size_t last = answer.rfind('"');
    return first < last && last != std::string::npos
               ? answer.substr(0, first) + answer.substr(last + 1)
               : answer;
}

std::set<std::string> answersIn(const OperationOutcomes& outcomes) {
    std::set<std::string> texts = {outcomes.good};
    for (const auto& way : outcomes.faulty) {
        for (const auto& entry : way.second) {
            texts.insert(entry.second.begin(), entry.second.end());
        }
    }
    for (const auto& way : outcomes.somewhere) {
        texts.insert(way.second.begin(), way.second.end());
    }
    std::set<std::string> answers;
    for (const std::string& text : texts) {
        answers.insert(answerOf(text));
        answers.insert(withoutMessage(answerOf(text)));
    }
    return answers;
}

} // namespace

bool writesExpectations() {
    const char* wanted = std::getenv("QELO_SWEEP_WRITE");
    return wanted != nullptr && *wanted != '\0';
}

std::vector<NthCall> numbered(const std::vector<std::string>& kinds) {
    std::map<std::string, std::size_t> counts;
    std::vector<NthCall> calls;
    for (const std::string& kind : kinds) {
        calls.emplace_back(kind, ++counts[kind]);
    }
    return calls;
}

ExpectedOutcomes::ExpectedOutcomes(std::string name, std::vector<std::string> ways)
    : file_(QELO_SWEEP_EXPECTED + ("/" + std::move(name)) + ".txt"), ways_(std::move(ways)) {
    if (!writesExpectations()) {
        stated_ = parsed(contentOf(file_), ways_);
    }
}

void ExpectedOutcomes::good(const std::string& operation, const std::string& outcome) {
    order_.push_back(operation);
    told_[operation].good = outcome;
}

void ExpectedOutcomes::faulty(const std::string& operation, const NthCall& call,
                              const std::string& way, const std::set<std::string>& texts) {
    auto& entries = told_[operation].faulty[way];
    const auto [entry, first] = entries.insert({call, texts});
    if (!first) {
        std::set<std::string> common;
        std::set_intersection(entry->second.begin(), entry->second.end(), texts.begin(),
                              texts.end(), std::inserter(common, common.end()));
        entry->second = std::move(common);
    }
}

void ExpectedOutcomes::faultySomewhere(const std::string& operation, const std::string& way,
                                       const std::string& text) {
    told_[operation].somewhere[way].insert(text);
}

void ExpectedOutcomes::faultyOften(const std::string& operation,
                                   const std::set<std::string>& texts) {
    std::set<std::string> answers;
    for (const std::string& text : texts) {
        answers.insert(answerOf(text));
    }
    often_[operation].insert(std::move(answers));
}

void ExpectedOutcomes::expectOften() const {
    for (const auto& [operation, all] : often_) {
        const std::set<std::string> known = answersIn(told_.at(operation));
        for (const std::set<std::string>& answers : all) {
            EXPECT_TRUE(std::any_of(answers.begin(), answers.end(),
                                    [&](const auto& answer) { return known.count(answer) != 0; }))
                << operation
                << " answers several faults as it answers no single one: " << *answers.begin();
        }
    }
}

void ExpectedOutcomes::finish(bool complete) {
    expectOften();
    if (writesExpectations()) {
        write();
    } else {
        compare(complete);
    }
}

void ExpectedOutcomes::compare(bool complete) const {
    for (const auto& entry : stated_) {
        EXPECT_NE(told_.count(entry.first), 0U) << entry.first << " is stated and not there";
    }
    for (const auto& [operation, outcomes] : told_) {
        const auto found = stated_.find(operation);
        if (found == stated_.end()) {
            ADD_FAILURE() << operation << " is not stated";
            continue;
        }
        const OperationOutcomes& stated = found->second;
        EXPECT_EQ(outcomes.good, stated.good) << operation;
        EXPECT_EQ(callsText(callsIn(outcomes)), callsText(callsIn(stated))) << operation;
        const std::string text =
            differences(stated, outcomes) + differencesSomewhere(stated, outcomes, complete);
        EXPECT_TRUE(text.empty()) << operation << ", other than " << file_ << " says:\n" << text;
    }
}

void ExpectedOutcomes::write() const {
    std::vector<std::string> bodies;
    std::map<std::string, std::string> names;
    for (const std::string& operation : order_) {
        const std::string body = bodyText(told_.at(operation), ways_);
        if (names[body].empty()) {
            bodies.push_back(body);
        }
        names[body] += operation + "\n";
    }
    std::ofstream stream(file_, std::ios::binary | std::ios::trunc);
    stream << kHead;
    for (const std::string& body : bodies) {
        stream << "\n" << names[body] << body;
    }
    stream.close();
    EXPECT_TRUE(stream) << file_ << " cannot be written";
}

} // namespace qelo::test
