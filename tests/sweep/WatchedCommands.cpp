#include "WatchedCommands.h"

#include "endtoend/Process.h"

#include "ScratchRoot.h"

#include <cstdlib>
#include <fcntl.h>
#include <regex>
#include <stdexcept>
#include <sys/mman.h>
#include <unistd.h>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

// A report of a sanitizer ends a program with a status that nothing else has. Suppressions and
// the like that were asked for stay.
constexpr int kReportStatus = 199;

std::string sanitizerOptions(const char* variable, const std::string& own) {
    const char* given = std::getenv(variable);
    const std::string options = "exitcode=" + std::to_string(kReportStatus) + own;
    return given == nullptr ? options : std::string(given) + ":" + options;
}

} // namespace

bool isSane(const WatchedRun& run) {
    return run.status != kReportStatus && run.said.find("Sanitizer") == std::string::npos &&
           run.said.find("runtime error:") == std::string::npos;
}

WatchedWorld::WatchedWorld(const WatchedCommand& command) : command_(command) {
    write(logConfig_, "log = none\nlog.level = off\n");
    makePlan();
    fs::create_directory(pristine_);
    if (!command.makesRoot) {
        prepareRoot();
    }
    before_ = state();
    const WatchedRun good = run(0, {sweep::FaultWay::Error, 0});
    EXPECT_EQ(good.status, 0) << good.said;
    EXPECT_GT(good.calls, 0);
    after_ = state();
    EXPECT_NE(before_, after_);
    renew();
}

void WatchedWorld::prepareRoot() {
    EXPECT_TRUE(store::initRoot(root_).accepted);
    for (const std::string& line : command_.before) {
        const store::CommandOutcome outcome = store::executeAdminCommand(root_, line);
        EXPECT_TRUE(outcome.accepted) << line << ": " << outcome.status;
    }
    EXPECT_EQ(endtoend::runProcess({"cp", "-a", root_, pristine_}).status, 0);
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

std::vector<std::string> WatchedWorld::commandLine() const {
    std::vector<std::string> line{QELOSIM};
    line.insert(line.end(), command_.arguments.begin(), command_.arguments.end());
    if (!command_.makesRoot) {
        line.emplace_back("--root");
    }
    line.push_back(root_);
    return line;
}

WatchedRun WatchedWorld::run(long number, Fault fault) {
    *shared_ = sweep::FaultPlan{};
    shared_->failAt = number;
    shared_->way = fault.way;
    shared_->error = fault.error;
    const endtoend::Finished finished = endtoend::runProcessWithInput(
        command_.input, commandLine(),
        {{"LD_PRELOAD", QELO_FAILING_CALLS},
         {"ASAN_OPTIONS", sanitizerOptions("ASAN_OPTIONS", ":verify_asan_link_order=0")},
         {"LSAN_OPTIONS", sanitizerOptions("LSAN_OPTIONS", "")},
         {"TSAN_OPTIONS", sanitizerOptions("TSAN_OPTIONS", "")},
         {"UBSAN_OPTIONS", sanitizerOptions("UBSAN_OPTIONS", ":halt_on_error=1")},
         {"QELO_LOG_CONFIG", logConfig_},
         {sweep::kPlanVariable, plan_},
         {sweep::kRootVariable, root_}});
    return {finished.status, finished.out + finished.err, shared_->failed, shared_->calls};
}

void WatchedWorld::renew() {
    fs::remove_all(root_);
    if (!command_.makesRoot) {
        EXPECT_EQ(endtoend::runProcess({"cp", "-a", pristine_ / "root", root_}).status, 0);
    }
}

RootState WatchedWorld::state() const {
    static const std::regex hash("\\$y\\$[^:\n]*");
    RootState state = fs::exists(root_) ? stateOf(root_) : RootState{};
    const auto shadow = state.find("etc/shadow");
    if (shadow != state.end()) {
        shadow->second = std::regex_replace(shadow->second, hash, "HASH");
    }
    return state;
}

RootState WatchedWorld::withoutRests(RootState state) {
    for (auto entry = state.begin(); entry != state.end();) {
        const bool rest = entry->first.find(".qelosim-old-") != std::string::npos;
        entry = rest ? state.erase(entry) : std::next(entry);
    }
    return state;
}

} // namespace qelo::test
