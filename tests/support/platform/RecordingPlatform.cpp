#include "RecordingState.h"

#include <algorithm>

namespace qelo::test {

namespace {

// Reads one member of the state under its lock.
template <class State, class Read> auto locked(State& state, Read read) {
    std::lock_guard lock(state.mutex);
    return read();
}

} // namespace

std::optional<StoreFault> StoreFaultPlan::next(const std::string& operation) {
    const auto call = byCall.find(++calls);
    const auto named = byOperation.find({operation, ++callsOfOperation[operation]});
    if (call != byCall.end()) {
        return call->second;
    }
    if (named != byOperation.end()) {
        return named->second;
    }
    return std::nullopt;
}

void StoreFaultPlan::restart() {
    calls = 0;
    callsOfOperation.clear();
}

RecordingPlatform::RecordingPlatform() : state_(std::make_unique<State>()) {}
RecordingPlatform::~RecordingPlatform() = default;

RecordingPlatform& RecordingPlatform::instance() {
    static RecordingPlatform platform;
    return platform;
}

void RecordingPlatform::reset() {
    std::lock_guard lock(state_->mutex);
    const std::size_t open = state_->store.cursorsOpen;
    state_->store = StoreModel{};
    state_->store.cursorsOpen = open;
    state_->faults = StoreFaultPlan{};
    state_->libraryFaults = StoreFaultPlan{};
    state_->records = Records{};
    state_->support = Support{};
}

void RecordingPlatform::forget() {
    std::lock_guard lock(state_->mutex);
    const bool on = state_->records.on;
    state_->records = Records{};
    state_->records.on = on;
    state_->faults.restart();
    state_->libraryFaults.restart();
}

void RecordingPlatform::setRecording(bool on) {
    locked(*state_, [&] { state_->records.on = on; });
}

void RecordingPlatform::addNode(StoreNode node) {
    auto shared = std::make_shared<StoreNode>(std::move(node));
    locked(*state_, [&] { state_->store.nodes.push_back(std::move(shared)); });
}

void RecordingPlatform::setEntryCount(Tesk::NodeLexicon::NodeType type, unsigned int count) {
    locked(*state_, [&] { state_->store.entryCounts[type] = count; });
}

void RecordingPlatform::makeEntryCountUnreadable(Tesk::NodeLexicon::NodeType type) {
    locked(*state_, [&] { state_->store.entryCounts[type] = std::nullopt; });
}

void RecordingPlatform::refuseWrites(Tesk::NodeLexicon::Properties id) {
    locked(*state_, [&] { state_->store.refused.insert(id); });
}

void RecordingPlatform::setCommandStatus(std::string text) {
    locked(*state_, [&] { state_->store.commandStatus = std::move(text); });
}

void RecordingPlatform::makeCommandStatusUnreadable() {
    locked(*state_, [&] { state_->store.commandStatus = std::nullopt; });
}

std::vector<std::string> RecordingPlatform::commands() const {
    return locked(*state_, [&] { return state_->records.commands; });
}

void RecordingPlatform::failStoreCall(std::size_t n, StoreFault fault) {
    locked(*state_, [&] { state_->faults.byCall[n] = fault; });
}

void RecordingPlatform::failOperation(const std::string& operation, std::size_t n,
                                      StoreFault fault) {
    locked(*state_, [&] { state_->faults.byOperation[{operation, n}] = fault; });
}

void RecordingPlatform::failLibraryCall(std::size_t n, StoreFault fault) {
    locked(*state_, [&] { state_->libraryFaults.byCall[n] = fault; });
}

std::size_t RecordingPlatform::libraryCallCount() const {
    return locked(*state_, [&] { return state_->libraryFaults.calls; });
}

std::size_t RecordingPlatform::storeCallCount() const {
    return locked(*state_, [&] { return state_->faults.calls; });
}

std::vector<StoreCall> RecordingPlatform::storeCalls() const {
    return locked(*state_, [&] { return state_->records.storeCalls; });
}

std::vector<std::string> RecordingPlatform::storeCallTexts() const {
    std::vector<std::string> texts;
    for (const StoreCall& call : storeCalls()) {
        texts.push_back(call.text);
    }
    return texts;
}

std::size_t RecordingPlatform::countStoreCalls(const std::string& text) const {
    const std::vector<std::string> texts = storeCallTexts();
    return static_cast<std::size_t>(std::count(texts.begin(), texts.end(), text));
}

std::size_t RecordingPlatform::openCursors() const {
    return locked(*state_, [&] { return state_->store.cursorsOpen; });
}

std::vector<LogLine> RecordingPlatform::lines() const {
    return locked(*state_, [&] { return state_->records.lines; });
}

std::vector<LogLine> RecordingPlatform::lines(Sink sink) const {
    std::vector<LogLine> all = lines();
    all.erase(std::remove_if(all.begin(), all.end(),
                             [sink](const LogLine& line) { return line.sink != sink; }),
              all.end());
    return all;
}

std::size_t RecordingPlatform::lineCount() const {
    return locked(*state_, [&] { return state_->records.lineCount; });
}

std::vector<std::string> RecordingPlatform::events() const {
    return locked(*state_, [&] { return state_->records.events; });
}

void RecordingPlatform::note(std::string event) {
    locked(*state_, [&] { state_->records.note(std::move(event)); });
}

void RecordingPlatform::setSystemName(std::string name) {
    locked(*state_, [&] { state_->support.systemName = std::move(name); });
}

void RecordingPlatform::setLanguage(std::string language) {
    locked(*state_, [&] { state_->support.language = std::move(language); });
}

void RecordingPlatform::setResourceText(unsigned long number, const std::string& language,
                                        std::wstring id, std::wstring text) {
    auto key = std::make_pair(resourceLibraryName(number, language), std::move(id));
    locked(*state_, [&] { state_->support.texts[std::move(key)] = std::move(text); });
}

std::wstring RecordingPlatform::resourceLibraryName(unsigned long number,
                                                    const std::string& language) {
    return L"library-" + std::to_wstring(number) + L"-" +
           std::wstring(language.begin(), language.end());
}

std::vector<LibraryRequest> RecordingPlatform::libraryRequests() const {
    return locked(*state_, [&] { return state_->records.libraryRequests; });
}

std::vector<TextRequest> RecordingPlatform::textRequests() const {
    return locked(*state_, [&] { return state_->records.textRequests; });
}

void RecordingPlatform::setPathAnswers(std::vector<bool> answers) {
    locked(*state_, [&] { state_->support.pathAnswers = std::move(answers); });
}

std::vector<PathComparison> RecordingPlatform::pathComparisons() const {
    return locked(*state_, [&] { return state_->records.pathComparisons; });
}

void RecordingPlatform::setInputGate(std::function<bool(const std::string&)> gate) {
    locked(*state_, [&] { state_->support.inputGate = std::move(gate); });
}

std::vector<InputCheck> RecordingPlatform::inputChecks() const {
    return locked(*state_, [&] { return state_->records.inputChecks; });
}

} // namespace qelo::test
