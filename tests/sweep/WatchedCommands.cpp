#include "WatchedCommands.h"

#include "endtoend/Process.h"

#include "ScratchRoot.h"

#include <fcntl.h>
#include <regex>
#include <sys/mman.h>
#include <unistd.h>

namespace qelo::test {

namespace fs = std::filesystem;

WatchedWorld::WatchedWorld(const WatchedCommand& command) : command_(command) {
    write(logConfig_, "log = none\nlog.level = off\n");
    makePlan();
    EXPECT_TRUE(store::initRoot(root_).accepted);
    for (const std::string& line : command.before) {
        const store::CommandOutcome outcome = store::executeAdminCommand(root_, line);
        EXPECT_TRUE(outcome.accepted) << line << ": " << outcome.status;
    }
    before_ = state();
    fs::create_directory(pristine_);
    EXPECT_EQ(endtoend::runProcess({"cp", "-a", root_, pristine_}).status, 0);
    const WatchedRun good = run(0, 0, 0);
    EXPECT_EQ(good.status, 0) << good.said;
    EXPECT_GT(good.calls, 0);
    after_ = state();
    EXPECT_NE(before_, after_);
    renew();
}

WatchedWorld::~WatchedWorld() {
    if (shared_ != nullptr) {
        ::munmap(shared_, sizeof *shared_);
    }
}

void WatchedWorld::makePlan() {
    write(plan_, std::string(sizeof(sweep::FaultPlan), '\0'));
    const int file = ::open(plan_.c_str(), O_RDWR | O_CLOEXEC);
    void* memory =
        ::mmap(nullptr, sizeof(sweep::FaultPlan), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
    ::close(file);
    if (memory == MAP_FAILED) {
        throw std::runtime_error("no plan of faults");
    }
    shared_ = static_cast<sweep::FaultPlan*>(memory);
}

WatchedRun WatchedWorld::run(long first, long last, int error) {
    *shared_ = sweep::FaultPlan{};
    shared_->failAt = first;
    shared_->failUntil = last;
    shared_->error = error;
    shared_->kill = error == 0 ? 1 : 0;
    std::vector<std::string> command{QELOSIM};
    command.insert(command.end(), command_.arguments.begin(), command_.arguments.end());
    command.insert(command.end(), {"--root", root_});
    const endtoend::Finished finished =
        endtoend::runProcessWithInput(command_.input, command,
                                      {{"LD_PRELOAD", QELO_FAILING_CALLS},
                                       {"ASAN_OPTIONS", "verify_asan_link_order=0"},
                                       {"QELO_LOG_CONFIG", logConfig_},
                                       {sweep::kPlanVariable, plan_},
                                       {sweep::kRootVariable, root_}});
    return {finished.status, finished.out + finished.err, shared_->failed, shared_->calls};
}

void WatchedWorld::renew() {
    fs::remove_all(root_);
    EXPECT_EQ(endtoend::runProcess({"cp", "-a", pristine_ / "root", root_}).status, 0);
}

WatchedWorld::State WatchedWorld::state() const {
    static const std::regex hash("\\$y\\$[^:\n]*");
    State state = stateOf(root_);
    std::string& shadow = state["etc/shadow"];
    shadow = std::regex_replace(shadow, hash, "HASH");
    return state;
}

WatchedWorld::State WatchedWorld::withoutRests(State state) {
    for (auto entry = state.begin(); entry != state.end();) {
        const bool rest = entry->first.find(".qelosim-old-") != std::string::npos;
        entry = rest ? state.erase(entry) : std::next(entry);
    }
    return state;
}

} // namespace qelo::test
