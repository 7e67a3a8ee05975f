// A platform for tests: five libraries under the sonames of the real ones, which record every
// call and answer from what a test has prepared here.
//
// A test program links to the target qelo_recording_platform. The libraries are then already
// loaded when the provider library is opened, so its sonames resolve to them.
//
// There is one RecordingPlatform per process. Every member may be called from any thread; the
// functions given to it are called without its lock held. What is recorded keeps the order in
// which it arrived, over all threads.
#pragma once

#include <NodeLexicon.h>

#include <platform/PlatformApi.h>

#include <cstddef>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <variant>
#include <vector>

namespace qelo::test {

using PropertyValue =
    std::variant<std::string, unsigned int, std::vector<unsigned int>, std::vector<std::string>>;

struct StoreNode {
    Tesk::NodeLexicon::NodeType type{};
    std::string path; // setFilter keeps the nodes whose path begins with the filter and "/"
    std::map<Tesk::NodeLexicon::Properties, PropertyValue> properties{};
};

// One call of a member of Tesk::Instrumentation.
struct StoreCall {
    unsigned int cursor = 0; // counts the cursors of this process since reset(), from 1
    std::string operation;   // member name: "selectNode", "operator bool", "Instrumentation" ...
    // The whole call, for example
    //   "Instrumentation()"  "selectNode(46)"  "setFilter(1,/admin)"  "operator bool()->1"
    //   "getProperty(108,string)->alice"  "getProperty(44,uint32)->absent"
    //   "getProperty(137,uint32 list)->[1,2]"  "setProperty(74,\"CreateUser\")->1"
    //   "operator++()"  "getPathToNode()->/admin"  "getNodeSize()->3"  "~Instrumentation()"
    // with "->threw" in place of a result when the call was made to throw.
    std::string text;
};

// What happens to a store call in place of its ordinary work.
enum class StoreFault {
    ReturnsFalse,       // answers false, 0 or the empty text; a select leaves nothing selected
    ThrowsRuntimeError, // throws std::runtime_error with the text of storeFailureText
    ThrowsForeign,      // throws a ForeignFailure, which derives from nothing
};
struct ForeignFailure {};
inline constexpr const char* storeFailureText = "the store failed";

enum class Sink { Log, Trace };

// One line that reached one of the two sinks, with all arguments of the call.
struct LogLine {
    Sink sink{};
    std::string function;
    std::string file;
    int line = 0;
    std::string component;
    int level = 0;
    const void* reserved1 = nullptr;
    int reserved2 = 0;
    int reserved3 = 0;
    std::string message;
};

struct InputCheck {
    std::string value;
    std::string extra;
};
struct LibraryRequest {
    unsigned long number = 0;
    std::string language;
};
struct TextRequest {
    std::wstring library;
    std::wstring id;
};
struct PathComparison {
    const void* wanted = nullptr; // the first of the two paths
    bool strict = false;
    bool equal = false;
};

class QELO_PLATFORM_API RecordingPlatform {
public:
    static RecordingPlatform& instance();

    // Back to the state of a new process: no nodes, no faults, nothing recorded, recording on.
    void reset();
    // Empties what has been recorded and keeps everything that was prepared.
    void forget();
    // Off: log lines and store calls are counted and dropped, for runs over many records.
    void setRecording(bool on);

    // ---- node store ----
    void addNode(StoreNode node);
    // What EntryCount answers on nodes of a type. Without an override it is the number of nodes
    // of that type; made unreadable, reading it fails.
    void setEntryCount(Tesk::NodeLexicon::NodeType type, unsigned int count);
    void makeEntryCountUnreadable(Tesk::NodeLexicon::NodeType type);
    // A property of a type of node that is there but refuses to be written.
    void refuseWrites(Tesk::NodeLexicon::Properties id);

    // What follows a command: AdminCommand answers `text` when read back, or cannot be read.
    void setCommandStatus(std::string text);
    void makeCommandStatusUnreadable();
    // Every text written to AdminCommand, accepted or not.
    std::vector<std::string> commands() const;

    // Makes the n-th store call since reset() or forget() fail (from 1; destructors do not
    // count), or the n-th of one operation. Several faults may be set.
    void failStoreCall(std::size_t n, StoreFault fault);
    void failOperation(const std::string& operation, std::size_t n, StoreFault fault);
    // The same for the calls of the other libraries: each text and answer asked for, each line,
    // each message buffer. Answering false stands for an empty text, a refusal, or a lost line.
    void failLibraryCall(std::size_t n, StoreFault fault);
    std::size_t libraryCallCount() const;
    std::size_t storeCallCount() const;
    std::vector<StoreCall> storeCalls() const;
    // The texts of storeCalls() alone.
    std::vector<std::string> storeCallTexts() const;
    // How many of storeCalls() have exactly this text.
    std::size_t countStoreCalls(const std::string& text) const;
    // The cursors constructed and not yet destroyed.
    std::size_t openCursors() const;

    // ---- log and trace ----
    std::vector<LogLine> lines() const; // both sinks, in order of arrival
    std::vector<LogLine> lines(Sink sink) const;
    std::size_t lineCount() const; // counts also while recording is off

    // ---- everything in one order ----
    // What the platform was called for, and what note() added, as it arrived: the message of
    // each line (of the log alone), "store: selectNode(46)" and "platform: getSystemName()".
    // The fixtures note each call of their broker as "broker: returnDone".
    std::vector<std::string> events() const;
    void note(std::string event);

    // ---- support ----
    void setSystemName(std::string name);   // "host.example" otherwise
    void setLanguage(std::string language); // "en" otherwise
    // A text of resource library `number` for a language. A text that is not set is its
    // identifier. Library names are built as resourceLibraryName() does.
    void setResourceText(unsigned long number, const std::string& language, std::wstring id,
                         std::wstring text);
    static std::wstring resourceLibraryName(unsigned long number, const std::string& language);
    std::vector<LibraryRequest> libraryRequests() const;
    std::vector<TextRequest> textRequests() const;
    // What isObjPathsEqual answers to the first, second ... comparison since forget(), false
    // after the last; an empty list, as at first, has it really compare.
    void setPathAnswers(std::vector<bool> answers);
    std::vector<PathComparison> pathComparisons() const;

    // ---- input gate ----
    // Decides ValidateInput; everything is accepted otherwise.
    void setInputGate(std::function<bool(const std::string& value)> gate);
    std::vector<InputCheck> inputChecks() const;

    struct State;

private:
    friend class RecordingPort;
    RecordingPlatform();
    ~RecordingPlatform();
    std::unique_ptr<State> state_;
};

} // namespace qelo::test
