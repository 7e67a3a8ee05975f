// What stands behind a RecordingBroker: its objects and their lives, what was recorded,
// and which calls are to fail.
#pragma once

#include "support/broker/Objects.h"
#include "support/broker/RecordingBroker.h"

#include <map>
#include <mutex>
#include <optional>
#include <unordered_map>

namespace qelo::test {

// What one call of a provider left behind.
struct CallRecord {
    std::vector<std::string> lines;
    std::map<std::string, unsigned, std::less<>> countBySlot;
    std::vector<Instance> instances;
    std::vector<Path> paths;
    std::vector<Value> data;
    std::vector<BrokerTrace> traces;
    std::vector<BrokerTrace> logs;
    int doneCount = 0;
    bool faultHit = false;
};

class BrokerState {
public:
    BrokerState();
    ~BrokerState();
    BrokerState(const BrokerState&) = delete;
    BrokerState& operator=(const BrokerState&) = delete;

    // Held by every slot and every member of RecordingBroker; one for all brokers, since a
    // slot does not know whose object it was given until it has looked.
    static std::recursive_mutex& mutex();
    // The object of any broker at that address; NULL if there is none.
    static Object* objectAt(const void* address);
    // The youngest broker alive: the one that a call without an object is put down to.
    // Ends the test program if there is none.
    static BrokerState& youngest();

    template <typename Cmpi>
    Cmpi* make(typename Traits<Cmpi>::Content content, Life life = Life::Call) {
        return add<Cmpi>(std::make_unique<typename Traits<Cmpi>::Content>(std::move(content)),
                         life);
    }
    template <typename Cmpi> Cmpi* makeWithoutHandle(Life life = Life::Call) {
        return add<Cmpi>(nullptr, life);
    }
    const CMPIBroker* broker() const { return &broker_.cmpi; }

    void beginCall();
    void endCall();
    static void endObject(Object& object);
    unsigned liveClones() const;

    void violate(const std::string& text) { violations_.push_back(text); }
    // Counts and writes down one call; the fault that it is to meet, if any.
    std::optional<Fault> record(const std::string& slot, const std::string& arguments);

    void failCall(unsigned n, const Fault& how) { callFaults_[n] = how; }
    void failSlot(std::string_view slot, unsigned n, const Fault& how);
    void clearFaults();

    CallRecord& current() { return record_; }
    std::vector<std::string>& violations() { return violations_; }

    CMPIContext* context = nullptr;
    CMPIResult* result = nullptr;
    std::function<void(const std::string& line)> observer;
    bool ignoreFilter = false;
    bool refuseTraces = false;
    // by class name in lower case
    std::map<std::string, Answer<CMPIObjectPath>> nameAnswers;
    std::map<std::string, Answer<CMPIInstance>> instanceAnswers;

private:
    template <typename Cmpi>
    Cmpi* add(std::unique_ptr<typename Traits<Cmpi>::Content> content, Life life) {
        auto object = std::make_unique<ObjectOf<Cmpi>>(std::move(content), life, *this);
        Cmpi* cmpi = &object->cmpi;
        adopt(std::move(object));
        return cmpi;
    }
    void adopt(std::unique_ptr<Object> object);
    void forgetOldObjects();
    std::optional<Fault> faultFor(const std::string& slot, unsigned n, unsigned nOfSlot) const;

    BrokerObject broker_;
    std::vector<std::unique_ptr<Object>> objects_;
    unsigned callNumber_ = 0;
    CallRecord record_;
    std::vector<std::string> violations_;
    std::map<unsigned, Fault> callFaults_;
    std::map<std::string, std::map<unsigned, Fault>, std::less<>> slotFaults_;
};

// Whether a slot of that name exists.
bool isSlotName(std::string_view name);

// For mistakes in a test: says what is wrong and ends the program.
[[noreturn]] void giveUp(const std::string& reason);

std::string lowerCase(std::string text);

} // namespace qelo::test
