#include "Scratch.h"

#include <gmock/gmock.h>

#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using namespace qelo::test;
using testing::HasSubstr;

int run(const char* program) {
    char* arguments[] = {const_cast<char*>(program), nullptr};
    pid_t child = -1;
    if (::posix_spawn(&child, program, nullptr, nullptr, arguments, environ) != 0) {
        return -1;
    }
    int status = -1;
    ::waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

TEST(LifeCycle, Every_moment_from_before_main_to_after_exit_can_log) {
    const Scratch scratch;
    const std::string log = scratch.at("log");
    writeFile(scratch.at("logging.conf"), "log = file:" + log + "\nlog.level = 0\n");
    ::setenv("QELO_LOG_CONFIG", scratch.at("logging.conf").c_str(), 1);
    EXPECT_EQ(run(LIFE_CYCLE_PROGRAM), 0);
    ::unsetenv("QELO_LOG_CONFIG");
    const std::string text = readFile(log);
    for (const char* moment : {"before main", "thread begins", "thread ends", "exit handler",
                               "second exit handler", "static destructor"}) {
        EXPECT_THAT(text, HasSubstr(std::string(" ") + moment + "\n"));
    }
}

} // namespace
