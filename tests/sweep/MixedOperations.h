// Every operation of every class that is served, asked of the object manager of this process
// with the built provider libraries, and its answer in a form that can be compared.
//
// Everything here may be used by several threads at once.
#pragma once

#include <broker/Dispatcher.h>

#include <cstddef>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace qelo::test {

// The providers as `qelosim` serves them.
class ObjectManager {
public:
    ObjectManager();
    ~ObjectManager();
    ObjectManager(const ObjectManager&) = delete;
    ObjectManager& operator=(const ObjectManager&) = delete;

    broker::Router& router() { return *dispatcher_; }

    // What providers and broker complained about: thrown exceptions and objects misused.
    std::vector<std::string> complaints() const;

private:
    mutable std::mutex mutex_;
    std::vector<std::string> complaints_;
    std::unique_ptr<broker::Dispatcher> dispatcher_;
};

struct Answer {
    unsigned int status = 0; // 0, or the code of the error
    std::vector<std::string> results;
};

inline bool operator==(const Answer& left, const Answer& right) {
    return left.status == right.status && left.results == right.results;
}

std::string describe(const Answer& answer);

// Stands in the text of an association between its two ends, and in no other text.
constexpr char kBetweenEnds = '\n';

struct Operation {
    std::string kind; // "EnumInstances", or "InvokeMethod CreateUser"
    std::string className;
    std::string variant;
    // Each result is an association of two objects, whose provider reads each kind of object
    // by a request of its own.
    bool pairs = false;
    std::function<Answer(broker::Router&)> run;

    std::string name() const { return kind + " of " + className + " " + variant; }
};

// What the operations name. Those "of one" need not be there.
struct Subjects {
    std::string account;
    std::string accountOfOne;
    std::string group;
    std::string groupOfOne;
    std::string service; // the store's path of its node
    std::string serviceOfOne;
};

// All of them. The methods among them are called in such a way that the store refuses each,
// as long as it has the account and the group but nobody called "nobody-here".
std::vector<Operation> mixedOperations(broker::Router& router, const Subjects& subjects);

// Calls a method of a class; what it returns is left out, as the status tells.
Answer callMethod(broker::Router& router, const std::string& className, const std::string& method,
                  const client::Arguments& arguments);

// Asks for one instance by the key "Name".
Answer getNamed(broker::Router& router, const std::string& className, const std::string& name);

client::Arguments::value_type textArgument(const std::string& name, const std::string& value);
client::Arguments::value_type numberArgument(const std::string& name, std::uint32_t value);

} // namespace qelo::test
