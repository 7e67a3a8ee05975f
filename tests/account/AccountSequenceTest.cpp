// Whole requests against a kept record of everything that they do: each call of the platform
// and of the broker, each line of the log and of the trace, in one order, destructors
// included. Made faster, the provider must still do all of it.
//
// The record is golden/accounts.txt. After a change that is meant to be seen from outside,
// run this test with QELO_WRITE_GOLDEN=1, read the difference, and keep the new record.
#include "AccountFixture.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using Record = std::vector<std::string>;

class AccountSequence : public AccountFixture {
protected:
    AccountSequence() {
        StoreNode locked = fullAccountNode("zoe");
        locked.properties[AccountState] = 16U;
        locked.properties[PasswordRules] = std::vector<unsigned int>{};
        serve({locked, fullAccountNode("alice"), accountNode("bob")});
        platform_.setResourceText(2, "en", L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION", L"Caption");
    }

    // Adds what one request does to the record, under its title.
    template <class Request> void add(const std::string& title, Request request) {
        platform_.forget();
        const Outcome outcome = request();
        record_.push_back("==== " + title);
        record_.push_back("status " + std::to_string(outcome.rc) + " " + outcome.message);
        append("in one order", normalisedEvents());
        append("log and trace", points());
        Record texts;
        for (const TextRequest& text : platform_.textRequests()) {
            texts.push_back(narrow(text.library) + " " + narrow(text.id));
        }
        append("localised texts", texts);
    }

    Record record_;

private:
    void append(const std::string& title, const Record& lines) {
        record_.push_back("-- " + title + ": " + std::to_string(lines.size()));
        for (const std::string& line : lines) {
            record_.push_back(line);
        }
    }

    static std::string narrow(const std::wstring& text) { return {text.begin(), text.end()}; }
};

Record readRecord(const std::string& path) {
    Record lines;
    std::ifstream file(path);
    EXPECT_TRUE(file.is_open()) << path;
    for (std::string line; std::getline(file, line);) {
        lines.push_back(line);
    }
    return lines;
}

void writeRecord(const std::string& path, const Record& lines) {
    std::ofstream file(path);
    for (const std::string& line : lines) {
        file << line << "\n";
    }
    EXPECT_TRUE(file.good()) << path;
}

// A line of the record holds no line end; a message may.
Record escaped(Record lines) {
    for (std::string& line : lines) {
        for (std::size_t at = 0; (at = line.find('\n', at)) != std::string::npos;) {
            line.replace(at, 1, "\\n");
        }
    }
    return lines;
}

void expectSame(const Record& recorded, const Record& kept) {
    const std::size_t common = std::min(recorded.size(), kept.size());
    for (std::size_t i = 0; i < common; ++i) {
        ASSERT_EQ(recorded[i], kept[i]) << "line " << i + 1;
    }
    EXPECT_EQ(recorded.size(), kept.size());
}

TEST_F(AccountSequence, Whole_requests_do_what_they_always_did) {
    add("EnumInstanceNames", [&] { return enumNames(); });
    add("EnumInstances", [&] { return enumInstances(); });
    add("EnumInstances of three properties", [&] {
        return enumInstances(std::vector<const char*>{"UserID", "Caption", "PasswordExpiration"});
    });
    add("GetInstance", [&] { return getInstance(accountKeys("alice")); });
    add("GetInstance by its path", [&] { return getInstance({{"SystemName", "host.example"}}); });
    add("GetInstance of an unknown account", [&] { return getInstance(accountKeys("nobody")); });
    add("InvokeMethod", [&] {
        return invoke("CreateUser", broker_.makeArgs()
                                        .string("Name", "dave")
                                        .uint32("GroupId", 100)
                                        .dateTime("Expires", "20300307123005.000000+000"));
    });
    platform_.setEntryCount(UserAccount, 7);
    add("EnumInstances of a changed store", [&] { return enumInstances(); });
    platform_.failOperation("getProperty", 40, StoreFault::ThrowsRuntimeError);
    add("EnumInstances of a store that fails", [&] { return enumInstances(); });

    const std::string path = std::string(QELO_ACCOUNT_GOLDEN) + "/accounts.txt";
    if (std::getenv("QELO_WRITE_GOLDEN") != nullptr) {
        writeRecord(path, escaped(record_));
    }
    expectSame(escaped(record_), readRecord(path));
}

} // namespace
} // namespace qelo::test
