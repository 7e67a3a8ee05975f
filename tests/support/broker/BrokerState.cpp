#include "support/broker/BrokerState.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>

namespace qelo::test {

namespace {

// Ended objects are kept for this many calls, to recognise them when they are used.
constexpr unsigned callsToRemember = 4;

struct World {
    std::recursive_mutex mutex;
    std::unordered_map<const void*, Object*> objects;
    std::vector<BrokerState*> brokers;
};

World& world() {
    static World instance;
    return instance;
}

constexpr std::array slotNames = {
    "prepareAttachThread",
    "attachThread",
    "detachThread",
    "deliverIndication",
    "enumerateInstanceNames",
    "getInstance",
    "createInstance",
    "modifyInstance",
    "deleteInstance",
    "execQuery",
    "enumerateInstances",
    "associators",
    "associatorNames",
    "references",
    "referenceNames",
    "invokeMethod",
    "broker.setProperty",
    "broker.getProperty",
    "newInstance",
    "newObjectPath",
    "newArgs",
    "newString",
    "newArray",
    "newDateTime",
    "newDateTimeFromBinary",
    "newDateTimeFromChars",
    "newSelectExp",
    "classPathIsA",
    "broker.toString",
    "isOfType",
    "getType",
    "getMessage",
    "logMessage",
    "trace",
    "newCMPIError",
    "openMessageFile",
    "closeMessageFile",
    "getMessage2",
    "release",
    "clone",
    "getEntry",
    "getEntryAt",
    "getEntryCount",
    "addEntry",
    "returnData",
    "returnInstance",
    "returnObjectPath",
    "returnDone",
    "returnError",
    "getCharPtr",
    "getSize",
    "getSimpleType",
    "getElementAt",
    "setElementAt",
    "getNext",
    "hasNext",
    "toArray",
    "getProperty",
    "getPropertyAt",
    "getPropertyCount",
    "setProperty",
    "getObjectPath",
    "setPropertyFilter",
    "setObjectPath",
    "setPropertyWithOrigin",
    "setNameSpace",
    "getNameSpace",
    "setHostname",
    "getHostname",
    "setClassName",
    "getClassName",
    "addKey",
    "getKey",
    "getKeyAt",
    "getKeyCount",
    "setNameSpaceFromObjectPath",
    "setHostAndNameSpaceFromObjectPath",
    "getClassQualifier",
    "getPropertyQualifier",
    "getMethodQualifier",
    "getParameterQualifier",
    "toString",
    "addArg",
    "getArg",
    "getArgAt",
    "getArgCount",
    "getBinaryFormat",
    "getStringFormat",
    "isInterval",
};

} // namespace

bool isSlotName(std::string_view name) {
    return std::find(slotNames.begin(), slotNames.end(), name) != slotNames.end();
}

void giveUp(const std::string& reason) {
    (void)std::fprintf(stderr, "recording broker: %s\n", reason.c_str());
    std::abort();
}

std::string lowerCase(std::string text) {
    for (char& c : text) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return text;
}

std::recursive_mutex& BrokerState::mutex() { return world().mutex; }

Object* BrokerState::objectAt(const void* address) {
    const auto found = world().objects.find(address);
    return found == world().objects.end() ? nullptr : found->second;
}

BrokerState& BrokerState::youngest() {
    if (world().brokers.empty()) {
        giveUp("a slot was called while no broker exists");
    }
    return *world().brokers.back();
}

BrokerState::BrokerState() : broker_(*this) {
    const std::lock_guard lock(mutex());
    world().brokers.push_back(this);
    world().objects[broker_.address()] = &broker_;
    context = make<CMPIContext>({{{CMPIInvocationFlags, Value::uint32(0)},
                                  {CMPIPrincipal, "tester"},
                                  {CMPIRole, ""},
                                  {CMPIAcceptLanguage, ""},
                                  {CMPIContentLanguage, ""}}},
                                Life::Test);
    beginCall();
}

BrokerState::~BrokerState() {
    const std::lock_guard lock(mutex());
    for (const auto& object : objects_) {
        world().objects.erase(object->address());
    }
    world().objects.erase(broker_.address());
    auto& brokers = world().brokers;
    brokers.erase(std::remove(brokers.begin(), brokers.end(), this), brokers.end());
}

void BrokerState::adopt(std::unique_ptr<Object> object) {
    world().objects[object->address()] = object.get();
    objects_.push_back(std::move(object));
}

void BrokerState::beginCall() {
    endCall();
    ++callNumber_;
    forgetOldObjects();
    record_ = CallRecord();
    result = make<CMPIResult>({});
}

void BrokerState::endCall() {
    for (const auto& object : objects_) {
        if (object->life == Life::Call) {
            endObject(*object);
        }
    }
}

void BrokerState::endObject(Object& object) {
    object.life = Life::Ended;
    object.endedInCall = object.owner->callNumber_;
    object.dropContent();
}

void BrokerState::forgetOldObjects() {
    const auto isOld = [this](const std::unique_ptr<Object>& object) {
        if (object->life != Life::Ended || object->endedInCall + callsToRemember > callNumber_) {
            return false;
        }
        world().objects.erase(object->address());
        return true;
    };
    objects_.erase(std::remove_if(objects_.begin(), objects_.end(), isOld), objects_.end());
}

unsigned BrokerState::liveClones() const {
    return static_cast<unsigned>(
        std::count_if(objects_.begin(), objects_.end(),
                      [](const auto& object) { return object->life == Life::Clone; }));
}

std::optional<Fault> BrokerState::record(const std::string& slot, const std::string& arguments) {
    if (!isSlotName(slot)) {
        giveUp("slot '" + slot + "' is missing in the list of slots");
    }
    record_.lines.push_back(arguments.empty() ? slot : slot + '(' + arguments + ')');
    const unsigned nOfSlot = ++record_.countBySlot[slot];
    const std::optional<Fault> fault =
        faultFor(slot, static_cast<unsigned>(record_.lines.size()), nOfSlot);
    if (fault) {
        record_.faultHit = true;
        record_.lines.back() += " [fault]";
    }
    if (observer) {
        observer(record_.lines.back());
    }
    return fault;
}

std::optional<Fault> BrokerState::faultFor(const std::string& slot, unsigned n,
                                           unsigned nOfSlot) const {
    if (const auto found = callFaults_.find(n); found != callFaults_.end()) {
        return found->second;
    }
    const auto ofSlot = slotFaults_.find(slot);
    if (ofSlot == slotFaults_.end()) {
        return std::nullopt;
    }
    for (const unsigned occurrence : {nOfSlot, 0u}) {
        if (const auto found = ofSlot->second.find(occurrence); found != ofSlot->second.end()) {
            return found->second;
        }
    }
    return std::nullopt;
}

void BrokerState::failSlot(std::string_view slot, unsigned n, const Fault& how) {
    if (!isSlotName(slot)) {
        giveUp("there is no slot '" + std::string(slot) + "'");
    }
    slotFaults_[std::string(slot)][n] = how;
}

void BrokerState::clearFaults() {
    callFaults_.clear();
    slotFaults_.clear();
}

} // namespace qelo::test
