#include "support/broker/RecordingBroker.h"

#include "support/broker/BrokerState.h"

#include <ostream>

namespace qelo::test {

namespace {

using Lock = std::lock_guard<std::recursive_mutex>;

// The content of a live object.
template <typename Cmpi> const typename Traits<Cmpi>::Content& look(const Cmpi* object) {
    const Object* const known = BrokerState::objectAt(object);
    if (known == nullptr || known->kind != Traits<Cmpi>::kind) {
        giveUp(std::string("inspect: not a ") + kindName(Traits<Cmpi>::kind) + " of a broker");
    }
    if (known->life == Life::Ended || !known->hasHandle()) {
        giveUp("inspect: the object has ended or has no handle");
    }
    return *static_cast<const ObjectOf<Cmpi>*>(known)->content;
}

} // namespace

std::ostream& operator<<(std::ostream& out, const BrokerTrace& trace) {
    return out << trace.level << ',' << trace.component << ',' << trace.text;
}

// ---- ArgsBuilder

ArgsBuilder& ArgsBuilder::add(const std::string& name, const Value& value) {
    const Lock lock(BrokerState::mutex());
    auto* const object = static_cast<ObjectOf<CMPIArgs>*>(BrokerState::objectAt(args_));
    put(object->content->values, name, value);
    return *this;
}

ArgsBuilder& ArgsBuilder::string(const std::string& name, const std::string& value) {
    return add(name, Value::string(value));
}
ArgsBuilder& ArgsBuilder::nullString(const std::string& name) {
    return add(name, Value::nullOf(CMPI_string));
}
ArgsBuilder& ArgsBuilder::stringWithoutValue(const std::string& name) {
    return add(name, Value::missing(CMPI_string));
}
ArgsBuilder& ArgsBuilder::boolean(const std::string& name, bool value) {
    return add(name, Value::boolean(value));
}
ArgsBuilder& ArgsBuilder::uint8(const std::string& name, CMPIUint8 value) {
    return add(name, Value::uint8(value));
}
ArgsBuilder& ArgsBuilder::uint16(const std::string& name, CMPIUint16 value) {
    return add(name, Value::uint16(value));
}
ArgsBuilder& ArgsBuilder::uint32(const std::string& name, CMPIUint32 value) {
    return add(name, Value::uint32(value));
}
ArgsBuilder& ArgsBuilder::uint64(const std::string& name, CMPIUint64 value) {
    return add(name, Value::uint64(value));
}
ArgsBuilder& ArgsBuilder::sint32(const std::string& name, CMPISint32 value) {
    return add(name, Value::sint32(value));
}
ArgsBuilder& ArgsBuilder::dateTime(const std::string& name, const std::string& text) {
    return add(name, Value::dateTime(text));
}
ArgsBuilder& ArgsBuilder::nullOf(const std::string& name, CMPIType type) {
    return add(name, Value::nullOf(type));
}

// ---- RecordingBroker

RecordingBroker::RecordingBroker() : state_(std::make_unique<BrokerState>()) {}
RecordingBroker::~RecordingBroker() = default;

const CMPIBroker* RecordingBroker::get() const { return state_->broker(); }
const CMPIContext* RecordingBroker::context() const { return state_->context; }

void RecordingBroker::setContextEntry(const std::string& name, const Value& value) {
    const Lock lock(BrokerState::mutex());
    auto* const object = static_cast<ObjectOf<CMPIContext>*>(BrokerState::objectAt(context()));
    put(object->content->entries, name, value);
}

const CMPIResult* RecordingBroker::result() const {
    const Lock lock(BrokerState::mutex());
    return state_->result;
}

void RecordingBroker::beginCall() {
    const Lock lock(BrokerState::mutex());
    state_->beginCall();
}

void RecordingBroker::endCall() {
    const Lock lock(BrokerState::mutex());
    state_->endCall();
}

Outcome RecordingBroker::run(const Operation& operation) {
    beginCall();
    const CMPIStatus status = operation(context(), result());
    const Outcome outcome = outcomeOf(status);
    endCall();
    return outcome;
}

Outcome RecordingBroker::outcomeOf(const CMPIStatus& status) {
    const Lock lock(BrokerState::mutex());
    Outcome outcome;
    outcome.rc = status.rc;
    outcome.hasMessage = status.msg != nullptr;
    if (!outcome.hasMessage) {
        return outcome;
    }
    const Object* const known = BrokerState::objectAt(status.msg);
    if (known == nullptr || known->kind != Kind::String || known->life == Life::Ended ||
        !known->hasHandle()) {
        state_->violate("status: the message is no live CMPIString");
    } else {
        outcome.message = *static_cast<const ObjectOf<CMPIString>*>(known)->content;
    }
    return outcome;
}

std::vector<std::string> RecordingBroker::calls() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().lines;
}

void RecordingBroker::observeCalls(std::function<void(const std::string& line)> observer) {
    const Lock lock(BrokerState::mutex());
    state_->observer = std::move(observer);
}

unsigned RecordingBroker::callCount() const {
    const Lock lock(BrokerState::mutex());
    return static_cast<unsigned>(state_->current().lines.size());
}

unsigned RecordingBroker::callCount(std::string_view slot) const {
    const Lock lock(BrokerState::mutex());
    if (!isSlotName(slot)) {
        giveUp("there is no slot '" + std::string(slot) + "'");
    }
    const auto& counts = state_->current().countBySlot;
    const auto found = counts.find(slot);
    return found == counts.end() ? 0 : found->second;
}

std::vector<Instance> RecordingBroker::returnedInstances() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().instances;
}
std::vector<Path> RecordingBroker::returnedPaths() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().paths;
}
std::vector<Value> RecordingBroker::returnedData() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().data;
}
int RecordingBroker::doneCount() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().doneCount;
}
std::vector<BrokerTrace> RecordingBroker::traces() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().traces;
}
std::vector<BrokerTrace> RecordingBroker::logs() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().logs;
}
std::vector<std::string> RecordingBroker::violations() const {
    const Lock lock(BrokerState::mutex());
    return state_->violations();
}
void RecordingBroker::clearViolations() {
    const Lock lock(BrokerState::mutex());
    state_->violations().clear();
}
unsigned RecordingBroker::liveClones() const {
    const Lock lock(BrokerState::mutex());
    return state_->liveClones();
}

void RecordingBroker::failCall(unsigned n, const Fault& how) {
    const Lock lock(BrokerState::mutex());
    state_->failCall(n, how);
}
void RecordingBroker::failSlot(std::string_view slot, unsigned n, const Fault& how) {
    const Lock lock(BrokerState::mutex());
    state_->failSlot(slot, n, how);
}
void RecordingBroker::clearFaults() {
    const Lock lock(BrokerState::mutex());
    state_->clearFaults();
}
bool RecordingBroker::faultHit() const {
    const Lock lock(BrokerState::mutex());
    return state_->current().faultHit;
}

void RecordingBroker::ignorePropertyFilter(bool ignore) {
    const Lock lock(BrokerState::mutex());
    state_->ignoreFilter = ignore;
}
void RecordingBroker::refuseTraces(bool refuse) {
    const Lock lock(BrokerState::mutex());
    state_->refuseTraces = refuse;
}

void RecordingBroker::answerInstanceNames(const std::string& className,
                                          const Answer<CMPIObjectPath>& answer) {
    const Lock lock(BrokerState::mutex());
    state_->nameAnswers[lowerCase(className)] = answer;
}
void RecordingBroker::answerInstances(const std::string& className,
                                      const Answer<CMPIInstance>& answer) {
    const Lock lock(BrokerState::mutex());
    state_->instanceAnswers[lowerCase(className)] = answer;
}

CMPIObjectPath* RecordingBroker::makePath(const std::string& nameSpace,
                                          const std::string& className,
                                          const std::vector<NamedValue>& keys,
                                          const std::string& host) {
    const Lock lock(BrokerState::mutex());
    return state_->make<CMPIObjectPath>({host, nameSpace, className, keys}, Life::Test);
}

CMPIInstance* RecordingBroker::makeInstance(const Path& path,
                                            const std::vector<NamedValue>& properties) {
    const Lock lock(BrokerState::mutex());
    InstanceContent content;
    content.data.path = path;
    content.data.properties = properties;
    return state_->make<CMPIInstance>(std::move(content), Life::Test);
}

ArgsBuilder RecordingBroker::makeArgs() {
    const Lock lock(BrokerState::mutex());
    return ArgsBuilder(state_->make<CMPIArgs>({}, Life::Test));
}

CMPIString* RecordingBroker::makeString(const std::string& text) {
    const Lock lock(BrokerState::mutex());
    return state_->make<CMPIString>(text, Life::Test);
}

CMPIObjectPath* RecordingBroker::nullHandlePath() {
    const Lock lock(BrokerState::mutex());
    return state_->makeWithoutHandle<CMPIObjectPath>(Life::Test);
}
CMPIInstance* RecordingBroker::nullHandleInstance() {
    const Lock lock(BrokerState::mutex());
    return state_->makeWithoutHandle<CMPIInstance>(Life::Test);
}
CMPIString* RecordingBroker::nullHandleString() {
    const Lock lock(BrokerState::mutex());
    return state_->makeWithoutHandle<CMPIString>(Life::Test);
}

Path RecordingBroker::inspect(const CMPIObjectPath* path) const {
    const Lock lock(BrokerState::mutex());
    return look(path);
}
Instance RecordingBroker::inspect(const CMPIInstance* instance) const {
    const Lock lock(BrokerState::mutex());
    return look(instance).visible();
}
std::vector<NamedValue> RecordingBroker::inspect(const CMPIArgs* args) const {
    const Lock lock(BrokerState::mutex());
    return look(args).values;
}
std::string RecordingBroker::inspect(const CMPIString* string) const {
    const Lock lock(BrokerState::mutex());
    return look(string);
}

} // namespace qelo::test
