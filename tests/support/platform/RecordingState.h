// Everything the recording platform holds, under one lock.
#pragma once

#include "RecordingPort.h"

#include <cstddef>
#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace qelo::test {

struct StoreModel {
    std::vector<std::shared_ptr<StoreNode>> nodes;
    std::map<Tesk::NodeLexicon::NodeType, std::optional<unsigned int>> entryCounts;
    std::set<Tesk::NodeLexicon::Properties> refused;
    std::optional<std::string> commandStatus = "Success";
    unsigned int cursorsOpened = 0;
    std::size_t cursorsOpen = 0;
};

// Which calls of the store fail; a second plan holds those of all other libraries.
struct StoreFaultPlan {
    std::map<std::size_t, StoreFault> byCall;
    std::map<std::pair<std::string, std::size_t>, StoreFault> byOperation;
    std::size_t calls = 0;
    std::map<std::string, std::size_t> callsOfOperation;

    // Counts one call and says what is to happen to it.
    std::optional<StoreFault> next(const std::string& operation);
    void restart();
};

struct Records {
    bool on = true;
    std::vector<std::string> events;
    std::vector<StoreCall> storeCalls;
    std::vector<std::string> commands;
    std::vector<LogLine> lines;
    std::size_t lineCount = 0;
    std::vector<LibraryRequest> libraryRequests;
    std::vector<TextRequest> textRequests;
    std::vector<PathComparison> pathComparisons;
    std::vector<InputCheck> inputChecks;

    void note(std::string event) {
        if (on) {
            events.push_back(std::move(event));
        }
    }
    void add(StoreCall call) {
        note("store: " + call.text);
        storeCalls.push_back(std::move(call));
    }
};

struct Support {
    std::string systemName = "host.example";
    std::string language = "en";
    std::map<std::pair<std::wstring, std::wstring>, std::wstring> texts;
    std::function<bool(const std::string&)> inputGate;
    std::vector<bool> pathAnswers;
};

struct RecordingPlatform::State {
    mutable std::mutex mutex;
    StoreModel store;
    StoreFaultPlan faults;
    StoreFaultPlan libraryFaults;
    Records records;

    // Counts a call of another library than the store; true when it is to answer with nothing.
    // Throws when it is to throw.
    bool refusesLibraryCall(const std::string& operation);
    Support support;
};

} // namespace qelo::test
