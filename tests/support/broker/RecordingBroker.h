// A CMPI 2.0 broker for tests of a provider. It answers every slot, writes down every call,
// complains about misuse, and fails where a test wants it to.
//
//     RecordingBroker broker;
//     CMPIInstanceMI* mi = SimAccountProvider_Create_InstanceMI(broker.get(), broker.context(),
//     &st); const CMPIObjectPath* path = broker.makePath("root/cimv2", "ZANTH_Account",
//                                                  {{"Name", "alice"}});
//     const Outcome outcome = broker.run([&](const CMPIContext* ctx, const CMPIResult* rslt) {
//         return mi->ft->getInstance(mi, ctx, rslt, path, nullptr);
//     });
//     EXPECT_EQ(outcome.rc, CMPI_RC_OK);
//     ASSERT_EQ(broker.returnedInstances().size(), 1u);
//     EXPECT_EQ(broker.returnedInstances()[0].propertyText("UserID"), "1000");
//     EXPECT_EQ(broker.doneCount(), 1);
//     EXPECT_THAT(broker.violations(), IsEmpty());
//
// Calls. A "call" is one operation of the provider. run() begins one, carries it out and
// ends it; beginCall() and endCall() do it by hand, for code under test that is not a
// management interface. Beginning a call forgets what was recorded about the call before
// (calls, results, traces, counts); faults, answers and violations stay. Ending it ends the
// life of every object that came from the broker: using one afterwards is a violation. What
// the make... functions return lives as long as the broker. The constructor begins a first
// call.
//
// Slot names are those of the tables ("newInstance", "setElementAt", "returnDone"). Where the
// broker and an object have the same name, the broker's are "broker.getProperty",
// "broker.setProperty" and "broker.toString". Every slot that takes a broker or an object counts as
// a broker call, CMPIBrokerExtFT does not. What the make... and inspect functions do is
// neither recorded nor counted.
//
// Faults hit the n-th call since the begin of the current call, over all slots or of one
// slot. A slot that is to fail does nothing else. To sweep:
//
//     for (unsigned n = 1;; ++n) {
//         RecordingBroker broker;
//         broker.failCall(n, Fault::null());
//         ... run ...
//         if (!broker.faultHit()) break;       // fewer than n calls were made
//     }
//
// Violations: a NULL or unknown object, one without a handle, one that has ended; a NULL
// name or text; a value of an encapsulated type that is any of these; another element type
// than the array's; an unknown type; a position out of range; a result used after
// returnDone, returnDone twice, a result used after its call; a release of something that
// is no clone, or twice. The slot then answers as a strict broker does (INVALID_HANDLE,
// INVALID_PARAMETER, TYPE_MISMATCH, INVALID_DATA_TYPE or NO_SUCH_PROPERTY). Asking for a
// name that is not there, and handing newDateTimeFromChars a text that is no date
// (NULL, INVALID_PARAMETER), are not violations.
//
// Not offered: CMPIBrokerMemFT (mft is NULL and its capability bit is off), queries and
// error objects, qualifiers, translated messages, and the up-calls other than the two
// enumerations. These slots exist, are recorded, and answer NOT_SUPPORTED.
//
// Threads: all slots and all members may be used by several threads at once; recorded calls
// are then in the order in which they happened. run(), beginCall() and endCall() concern
// the broker as a whole, so begin a call, run the threads, end it.
#pragma once

#include "support/broker/Recorded.h"

#include <cmpift.h>

#include <functional>
#include <initializer_list>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::test {

class BrokerState;

// How a slot fails.
struct Fault {
    enum class Kind { Null, Error, NullHandle };
    Kind kind = Kind::Null;
    CMPIrc rc = CMPI_RC_OK;
    std::string message;

    // A broker that says nothing: a NULL pointer, 0, false, or a NULL value, and CMPI_RC_OK
    // as status. Slots that return a status return CMPI_RC_ERR_FAILED without message.
    static Fault null() { return {}; }
    // The same results with that status; an empty message is a NULL one.
    static Fault error(CMPIrc rc = CMPI_RC_ERR_FAILED, const std::string& message = {}) {
        return {Kind::Error, rc, message};
    }
    // An object whose hdl is NULL, with CMPI_RC_OK; for CMPIData a value holding such a
    // string, path or instance. As null() where a slot returns no object.
    static Fault nullHandle() { return {Kind::NullHandle, CMPI_RC_OK, {}}; }
};

// What the broker answers when the provider enumerates a class.
template <typename Object> struct Answer {
    // Handed out as copies, in this order. nullptr gives an element without a value;
    // nullHandlePath() and nullHandleInstance() give one without a handle.
    std::vector<const Object*> elements = {};
    // NULL instead of an enumeration.
    bool nullEnumeration = false;
    // The status; other codes than CMPI_RC_OK do not make the enumeration NULL by
    // themselves.
    CMPIrc rc = CMPI_RC_OK;
    std::string message = {};
};

// What an operation returned.
struct Outcome {
    CMPIrc rc = CMPI_RC_OK;
    bool hasMessage = false;
    std::string message;
};

// A CMTraceMessage or CMLogMessage.
struct BrokerTrace {
    int level = 0;         // CMPILevel, or CMPISeverity of a log message
    std::string component; // or the id of a log message; "" for NULL
    std::string text;

    friend bool operator==(const BrokerTrace& a, const BrokerTrace& b) {
        return a.level == b.level && a.component == b.component && a.text == b.text;
    }
};
std::ostream& operator<<(std::ostream& out, const BrokerTrace& trace);

// Arguments of a method, made by RecordingBroker::makeArgs(); lives as long as the broker.
class ArgsBuilder {
public:
    ArgsBuilder& add(const std::string& name, const Value& value);
    ArgsBuilder& string(const std::string& name, const std::string& value);
    ArgsBuilder& nullString(const std::string& name);
    // A CMPI_string that is not NULL by its state but holds no string, as a sloppy broker
    // passes it.
    ArgsBuilder& stringWithoutValue(const std::string& name);
    ArgsBuilder& boolean(const std::string& name, bool value);
    ArgsBuilder& uint8(const std::string& name, CMPIUint8 value);
    ArgsBuilder& uint16(const std::string& name, CMPIUint16 value);
    ArgsBuilder& uint32(const std::string& name, CMPIUint32 value);
    ArgsBuilder& uint64(const std::string& name, CMPIUint64 value);
    ArgsBuilder& sint32(const std::string& name, CMPISint32 value);
    ArgsBuilder& dateTime(const std::string& name, const std::string& text);
    ArgsBuilder& nullOf(const std::string& name, CMPIType type);
    CMPIArgs* get() const { return args_; }
    operator CMPIArgs*() const { return args_; }

private:
    friend class RecordingBroker;
    explicit ArgsBuilder(CMPIArgs* args) : args_(args) {}
    CMPIArgs* args_;
};

class RecordingBroker {
public:
    RecordingBroker();
    // Frees everything that ever came from this broker.
    ~RecordingBroker();
    RecordingBroker(const RecordingBroker&) = delete;
    RecordingBroker& operator=(const RecordingBroker&) = delete;

    const CMPIBroker* get() const;
    // Holds CMPIInvocationFlags 0, CMPIPrincipal "tester", CMPIRole, CMPIAcceptLanguage and
    // CMPIContentLanguage "". Lives as long as the broker.
    const CMPIContext* context() const;
    void setContextEntry(const std::string& name, const Value& value);
    // The result of the current call; each call has a new one.
    const CMPIResult* result() const;

    // ---- Calls
    void beginCall();
    void endCall();
    using Operation = std::function<CMPIStatus(const CMPIContext*, const CMPIResult*)>;
    Outcome run(const Operation& operation);
    // The status as plain data. To be taken before the call ends.
    Outcome outcomeOf(const CMPIStatus& status);

    // ---- What was recorded of the current or last call
    // newObjectPath(root/cimv2,ZANTH_Account)   newInstance(root/cimv2:ZANTH_Account)
    // setProperty(Name,chars,"alice")           setPropertyFilter({A,B},null)
    // newString("text")                         newArray(1,string)
    // trace(1,SimAccountProvider,text)          enumerateInstances(root/cimv2:C,null)
    // getKey(Name)   getCharPtr   returnInstance   returnData(uint32,0)   returnDone
    // with " [fault]" after those that were made to fail.
    std::vector<std::string> calls() const;
    // Is given each of these lines at the time of the call, with the broker's lock held.
    void observeCalls(std::function<void(const std::string& line)> observer);
    unsigned callCount() const;
    // Calls of one slot.
    unsigned callCount(std::string_view slot) const;
    std::vector<Instance> returnedInstances() const;
    std::vector<Path> returnedPaths() const;
    std::vector<Value> returnedData() const;
    int doneCount() const;
    std::vector<BrokerTrace> traces() const;
    std::vector<BrokerTrace> logs() const;
    // Since the broker was made, each with the slot's name in front.
    std::vector<std::string> violations() const;
    void clearViolations();
    // Clones that nobody has released yet.
    unsigned liveClones() const;

    // ---- Faults
    // The n-th broker call of a call, counted from 1.
    void failCall(unsigned n, const Fault& how);
    // The n-th call of that slot, counted from 1; 0 is every call of it. An unknown slot
    // name ends the test program: the test could not fail otherwise.
    void failSlot(std::string_view slot, unsigned n, const Fault& how);
    void clearFaults();
    // Whether a fault was met in the current or last call.
    bool faultHit() const;

    // ---- Behaviour
    // true: property filters are taken and have no effect.
    void ignorePropertyFilter(bool ignore);
    // true: trace and logMessage answer NOT_SUPPORTED, as some brokers do; they are
    // recorded all the same.
    void refuseTraces(bool refuse);

    // ---- Answers to up-calls, by class ignoring case. Without one: nothing found, OK.
    void answerInstanceNames(const std::string& className, const Answer<CMPIObjectPath>& answer);
    void answerInstances(const std::string& className, const Answer<CMPIInstance>& answer);

    // ---- Objects for a test to pass in
    CMPIObjectPath* makePath(const std::string& nameSpace, const std::string& className,
                             const std::vector<NamedValue>& keys = {},
                             const std::string& host = {});
    CMPIInstance* makeInstance(const Path& path, const std::vector<NamedValue>& properties = {});
    ArgsBuilder makeArgs();
    CMPIString* makeString(const std::string& text);
    // Alive in no sense: their handle is NULL.
    CMPIObjectPath* nullHandlePath();
    CMPIInstance* nullHandleInstance();
    CMPIString* nullHandleString();

    // ---- A look into an object without a broker call. Ends the test program if the
    // object is not a live one of this broker.
    Path inspect(const CMPIObjectPath* path) const;
    Instance inspect(const CMPIInstance* instance) const;
    std::vector<NamedValue> inspect(const CMPIArgs* args) const;
    std::string inspect(const CMPIString* string) const;

private:
    std::unique_ptr<BrokerState> state_;
};

} // namespace qelo::test
