// The built qelosim.
#pragma once

#include "Process.h"
#include "Scratch.h"

#include <nlohmann/json.hpp>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace qelo::endtoend {

inline std::vector<std::string> qelosimCommand(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), QELOSIM);
    return arguments;
}

inline Finished qelosim(std::vector<std::string> arguments) {
    return runProcess(qelosimCommand(std::move(arguments)), {{"LC_ALL", "C.UTF-8"}});
}

// What the command prints as JSON; it must succeed without a word of complaint.
inline nlohmann::json qelosimJson(std::vector<std::string> arguments) {
    arguments.emplace_back("--json");
    const Finished finished = qelosim(std::move(arguments));
    EXPECT_EQ(finished.status, 0) << finished.err;
    EXPECT_EQ(finished.err, "");
    return nlohmann::json::parse(finished.out, nullptr, false);
}

// A root directory with two people, a system account and four groups.
class AccountDatabase : public ::testing::Test {
protected:
    void SetUp() override {
        scratch.write("etc/passwd",
                      "root:x:0:0:root:/root:/bin/bash\n"
                      "daemon:x:1:1:daemon:/usr/sbin:/usr/sbin/nologin\n"
                      "alice:x:1000:1000:Alice Example,Room 7,,:/home/alice:/bin/bash\n"
                      "hanako:x:1001:1001:山田 花子:/home/hanako:/bin/zsh\n");
        scratch.write("etc/shadow", "root:$6$salt$hash:19000:0:99999:7:::\n"
                                    "daemon:*:19000:0:99999:7:::\n"
                                    "alice:!$6$salt$hash:19000:0:99999:7:::\n"
                                    "hanako:$6$salt$hash:19000:0:99999:7::10000:\n");
        scratch.write("etc/group", "root:x:0:\n"
                                   "adm:x:4:root,alice\n"
                                   "alice:x:1000:\n"
                                   "hanako:x:1001:\n");
        scratch.write("etc/gshadow", "root:*::\nadm:*::root,alice\nalice:!::\nhanako:!::\n");
    }

    std::string store() const { return "accounts:" + scratch.path(); }

    Finished run(std::vector<std::string> arguments) const {
        arguments.insert(arguments.end(), {"--store", store()});
        return qelosim(std::move(arguments));
    }
    nlohmann::json json(std::vector<std::string> arguments) const {
        arguments.insert(arguments.end(), {"--store", store()});
        return qelosimJson(std::move(arguments));
    }

    // The path of the instance whose Name is given.
    std::string pathOf(const std::string& className, const std::string& name) const {
        for (const auto& instance : json({"ein", className})) {
            if (instance["keys"]["Name"] == name) {
                return instance["path"];
            }
        }
        ADD_FAILURE() << className << " has no " << name;
        return {};
    }

    Scratch scratch;
};

} // namespace qelo::endtoend
