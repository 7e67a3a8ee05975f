#include "CommandLives.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <set>

namespace qelo::test {

namespace {

constexpr const char* kAccount = "ZANTH_Account";
constexpr const char* kGroup = "ZANTH_Group";

bool holds(const std::vector<std::string>& results, const std::string& result) {
    return std::find(results.begin(), results.end(), result) != results.end();
}

// Whether ";name=value" stands in the text, with another ";" behind it.
bool hasProperty(const std::string& text, const std::string& property) {
    const std::size_t found = text.find(property);
    return found != std::string::npos && text.compare(found + property.size(), 1, ";") == 0;
}

std::string lackOf(const std::string& property, const Answer& answer) {
    return "\"" + property + "\" is missing: " + describe(answer);
}

} // namespace

// One thread's account and group.
class CommandLife {
public:
    CommandLife(const CommandLives& lives, std::size_t thread, Tally& tally)
        : lives_(lives), tally_(tally), random_(static_cast<std::mt19937::result_type>(thread)),
          user_("user" + std::to_string(thread)), group_("group" + std::to_string(thread)),
          number_(static_cast<std::uint32_t>(5000 + thread)) {}

    void live() {
        beBorn();
        change();
        haveGroup();
        call(kAccount, "DeleteUser", {textArgument("Name", user_)});
        expectNone(kAccount, user_);
    }

private:
    using Properties = std::vector<std::string>; // ";name=value"

    void beBorn() {
        call(kAccount, "CreateUser",
             {textArgument("Name", user_), textArgument("FullName", "First " + user_),
              numberArgument("UserID", number_)});
        expect(kAccount, user_,
               {";Description=First " + user_, ";UserID=" + std::to_string(number_),
                ";AccountDisable=true"});
        call(kAccount, "SetPassword",
             {textArgument("Name", user_), textArgument("UserPassword", "open sesame")});
        expect(kAccount, user_, {";AccountDisable=false", ";EnabledState=2"});
    }

    void change() {
        call(kAccount, "ModifyUser",
             {textArgument("Name", user_), textArgument("FullName", "Second " + user_),
              numberArgument("daysMustKeepPassword", number_)});
        expect(
            kAccount, user_,
            {";Description=Second " + user_, ";daysMustKeepPassword=" + std::to_string(number_)});
        call(kAccount, "DisableUser", {textArgument("Name", user_)});
        expect(kAccount, user_, {";AccountDisable=true", ";EnabledState=3"});
        call(kAccount, "EnableUser", {textArgument("Name", user_)});
        expect(kAccount, user_, {";AccountDisable=false", ";EnabledState=2"});
    }

    void haveGroup() {
        call(kGroup, "CreateGroup", {textArgument("Name", group_)});
        expect(kGroup, group_, {";GroupMembers="});
        const client::Arguments member = {textArgument("Name", group_),
                                          textArgument("Member", user_)};
        call(kGroup, "AddMember", member);
        expect(kGroup, group_, {";GroupMembers=" + user_});
        call(kGroup, "RemoveMember", member);
        expect(kGroup, group_, {";GroupMembers="});
        call(kGroup, "DeleteGroup", {textArgument("Name", group_)});
        expectNone(kGroup, group_);
    }

    void call(const char* className, const std::string& method,
              const client::Arguments& arguments) {
        const Answer answer = callMethod(lives_.router_, className, method, arguments);
        tally_.count("InvokeMethod " + method);
        require(answer.status == 0, method + " of " + user_ + ": " + describe(answer));
        lookAround();
    }

    void expect(const char* className, const std::string& name, const Properties& properties) {
        const Answer answer = getNamed(lives_.router_, className, name);
        tally_.count("GetInstance");
        std::string text = answer.results.empty() ? "" : answer.results.front();
        text += ";";
        for (const std::string& property : properties) {
            require(hasProperty(text, property), lackOf(property, answer));
        }
        expectServed(className, name, 1);
    }

    void expectNone(const char* className, const std::string& name) {
        constexpr unsigned int notFound = 6;
        const Answer answer = getNamed(lives_.router_, className, name);
        tally_.count("GetInstance");
        require(answer.status == notFound, name + " is still there: " + describe(answer));
        expectServed(className, name, 0);
    }

    // Among the names of all.
    void expectServed(const char* className, const std::string& name, int times) {
        const auto isOfName = [&](const std::string& result) {
            return result.find('.') != std::string::npos &&
                   result.find("Name=\"" + name + "\"") != std::string::npos;
        };
        for (std::size_t i = 0; i < lives_.operations_.size(); ++i) {
            const Operation& operation = lives_.operations_[i];
            if (operation.kind == "EnumInstanceNames" && operation.className == className) {
                const Answer answer = ask(i);
                require(std::count_if(answer.results.begin(), answer.results.end(), isOfName) ==
                            times,
                        name + " has to be served " + std::to_string(times) +
                            " times: " + describe(answer));
            }
        }
    }

    // A few of all operations.
    void lookAround() {
        constexpr std::size_t some = 12;
        std::uniform_int_distribution<std::size_t> any(0, lives_.operations_.size() - 1);
        for (std::size_t i = 0; i < some; ++i) {
            ask(any(random_));
        }
    }

    // What was there at first is there as it was, once each. Only accounts and groups may
    // have come since.
    Answer ask(std::size_t number) {
        const Operation& operation = lives_.operations_[number];
        const Answer& first = lives_.atFirst_[number];
        Answer answer = operation.run(lives_.router_);
        tally_.count(operation.kind);
        const std::set<std::string> distinct(answer.results.begin(), answer.results.end());
        const bool grows = operation.className == kAccount || operation.className == kGroup;
        const bool right =
            answer.status == first.status && distinct.size() == answer.results.size() &&
            (grows || answer.results.size() == first.results.size()) &&
            std::all_of(first.results.begin(), first.results.end(),
                        [&](const auto& result) { return holds(answer.results, result); });
        require(right, operation.name() + ": " + describe(answer));
        return answer;
    }

    void require(bool right, const std::string& finding) {
        if (!right) {
            lives_.findings_.add(finding);
        }
    }

    const CommandLives& lives_;
    Tally& tally_;
    std::mt19937 random_;
    std::string user_;
    std::string group_;
    std::uint32_t number_;
};

CommandLives::CommandLives(broker::Router& router, Findings& findings)
    : router_(router), findings_(findings),
      operations_(mixedOperations(router, {"root", "nobody", "root", "nobody-here",
                                           "/AccountServiceRoot/1", "/AccountServiceRoot/2"})) {
    for (const Operation& operation : operations_) {
        atFirst_.push_back(operation.run(router));
    }
}

void CommandLives::live(std::size_t thread, const ConcurrentRun& run, Tally& tally) const {
    CommandLife life(*this, thread, tally);
    do {
        life.live();
    } while (run.goesOn());
}

void CommandLives::expectAllKinds(const Tally& tally) const {
    for (const Operation& operation : operations_) {
        EXPECT_GT(tally.of(operation.kind), 0U) << operation.kind;
    }
}

} // namespace qelo::test
