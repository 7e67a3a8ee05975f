// Damaged node files, read by the real store and served by the real provider library.
#include "HostileStore.h"
#include "SweepCount.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <random>

namespace qelo::test {
namespace {

namespace fs = std::filesystem;

// One node of each type that is served.
constexpr const char* kDocument =
    R"({"nodes": [{"type": 17, "path": "/UserAdministration/1"},
 {"type": 46, "path": "/UserAdministration/1/UserAccount/MARK", "properties":
  {"108": "MARK", "89": "1000", "123": 1, "137": [1, 7, 3], "312": "F\u00e4ll", "158": "/home/x"}},
 {"type": 51, "path": "/UserAdministration/1/UserGroup/MARK", "properties":
  {"108": "MARK", "165": ["root", "MARK"]}},
 {"type": 40, "path": "/AccountServiceRoot/1", "properties": {}}]}
)";

std::string replaced(std::string text, const std::string& from, const std::string& to) {
    for (std::size_t at = text.find(from); at != std::string::npos;
         at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
    return text;
}

std::vector<std::string> badDocuments() {
    const std::string good = kDocument;
    std::vector<std::string> all = {"",
                                    "\n",
                                    "{}",
                                    "[]",
                                    "null",
                                    "{\"nodes\": {}}",
                                    std::string(5000, '\0'),
                                    good + good,
                                    good + "x",
                                    "\xEF\xBB\xBF" + good,
                                    "{\"other\": 1, " + good.substr(1),
                                    replaced(good, "\n", "\r"),
                                    std::string(200000, '['),
                                    "{\"nodes\": [" + std::string(200000, '{')};
    const std::vector<std::string> values = {"null",
                                             "-1",
                                             "1.5",
                                             "1e9",
                                             "4294967296",
                                             "18446744073709551616",
                                             "true",
                                             "[[1]]",
                                             "[1, \"a\"]",
                                             "{}",
                                             "\"\\u0000\"",
                                             "\"\\ud800\"",
                                             "\"\xC3\x28\"",
                                             "\"" + std::string(300000, 'x') + "\"",
                                             "[" + std::string(50000, ' ') + "]"};
    for (const char* place : {"17", "\"/home/x\"", "\"1000\"", "[1, 7, 3]", "[\"root\", \"MARK\"]",
                              "\"/AccountServiceRoot/1\"", "{}"}) {
        for (const std::string& value : values) {
            all.push_back(replaced(good, place, value));
        }
    }
    for (const char* name : {"\"type\"", "\"path\"", "\"108\"", "\"properties\"", "\"nodes\""}) {
        for (const char* other :
             {"\"123\"", "\"99999999999\"", "\"-1\"", "\"\"", "\"path\"", "5"}) {
            all.push_back(replaced(good, name, other));
        }
    }
    return all;
}

class HostileNodeFile : public HostileStore {
protected:
    void SetUp() override {
        HostileStore::SetUp();
        file_ = root() / "nodes.json";
        ::setenv("QELO_NODE_STORE", ("file:" + file_.native()).c_str(), 1);
    }

    void put(const std::string& document) {
        std::ofstream(file_, std::ios::binary | std::ios::trunc) << document;
    }

    // Served is what is in the file, or nothing at all: nothing of a file that is refused, and
    // nothing of the file that was there before.
    void serve(const std::string& document) {
        const std::string before = "seen" + std::to_string(count_);
        const std::string now = "seen" + std::to_string(++count_);
        put(replaced(document, "MARK", now));
        for (const ServedClass& kind : kServedClasses) {
            SCOPED_TRACE(kind.className);
            const Served served = enumerate(kind);
            EXPECT_THAT(served.names, testing::Each(testing::Ne(before)));
            EXPECT_LE(served.names.size(), 2U);
        }
        ++faults_;
    }

    // The next file is none the worse for it.
    void expectGoodFile() {
        const std::string now = "seen" + std::to_string(++count_);
        put(replaced(kDocument, "MARK", now));
        EXPECT_THAT(enumerate(kServedClasses[0]).names, testing::ElementsAre(now));
        const Served groups = enumerate(kServedClasses[1]);
        EXPECT_THAT(groups.names, testing::ElementsAre(now));
        EXPECT_EQ(groups.rc, CMPI_RC_OK);
        EXPECT_THAT(groups.propertiesOf(now).at("GroupMembers"), testing::HasSubstr(now));
        EXPECT_EQ(enumerate(kServedClasses[3]).names.size(), 1U);
    }

    void serveAll(const std::vector<std::string>& documents) {
        for (const std::string& document : documents) {
            SCOPED_TRACE(document.substr(0, 300));
            serve(document);
            expectGoodFile();
        }
    }

    // Nothing is served of a file that cannot be read.
    void expectNothing() {
        for (std::size_t kind = 0; kind < 2; ++kind) {
            const Served served = enumerate(kServedClasses[kind]);
            EXPECT_THAT(served.names, testing::IsEmpty());
        }
        ++faults_;
    }

    fs::path file_;
    std::size_t count_ = 0;
    std::size_t faults_ = 0;
};

TEST_F(HostileNodeFile, Of_every_kind_is_served_whole_or_not_at_all) {
    expectGoodFile();
    serveAll(badDocuments());
    countFaults("damaged node files", std::size(kServedClasses) * 2, faults_);
}

TEST_F(HostileNodeFile, That_ends_too_early_is_not_served) {
    const std::string good = kDocument;
    const std::size_t end = good.rfind('}');
    for (std::size_t length = 0; length <= end; length += isLongSweep() ? 1 : 5) {
        SCOPED_TRACE(length);
        put(good.substr(0, length));
        expectNothing();
        expectGoodFile();
    }
    countFaults("node files that end too early", 4, faults_);
}

TEST_F(HostileNodeFile, In_whose_place_is_something_else_is_not_served) {
    for (const char* kind : {"missing", "directory", "link", "unreadable"}) {
        SCOPED_TRACE(kind);
        fs::remove_all(file_);
        if (kind == std::string("directory")) {
            fs::create_directory(file_);
        } else if (kind == std::string("link")) {
            fs::create_symlink(file_.filename(), file_);
        } else if (kind == std::string("unreadable")) {
            put("");
            fs::permissions(file_, fs::perms::none);
        }
        expectNothing();
        fs::remove_all(file_);
        expectGoodFile();
    }
    countFaults("what is no node file", 4, faults_);
}

TEST_F(HostileNodeFile, At_random_is_served_whole_or_not_at_all) {
    std::mt19937 random(1); // NOLINT(cert-msc32-c,cert-msc51-cpp): the same each time
    const std::size_t count = isLongSweep() ? 20000 : 500;
    for (std::size_t i = 0; i < count; ++i) {
        std::string document = kDocument;
        for (std::size_t changes = 1 + random() % 3; changes > 0; --changes) {
            document[random() % document.size()] = static_cast<char>(random() & 0xFFU);
        }
        serveAll({document});
    }
    countFaults("randomly damaged node files", std::size(kServedClasses) * 2, faults_);
}

} // namespace
} // namespace qelo::test
