#include "Freshness.h"

#include <algorithm>

namespace qelo::nodes {

namespace {

constexpr std::int64_t nsPerSecond = 1'000'000'000;
constexpr std::int64_t nsPerDay = 86'400 * nsPerSecond;

// The kernel stamps files with a clock that moves in ticks of up to 10 ms; some file systems
// keep whole seconds only. A second change within one tick leaves the stamp as it was.
constexpr std::int64_t fineGrainNs = 50'000'000;
constexpr std::int64_t coarseGrainNs = 2 * nsPerSecond;

bool isSettled(const FileStamp& stamp, std::int64_t readNs) {
    if (stamp.error != 0) {
        return true;
    }
    const bool coarse = stamp.changedNs % nsPerSecond == 0;
    const std::int64_t grain = coarse ? coarseGrainNs : fineGrainNs;
    const std::int64_t age = readNs - stamp.changedNs;
    // Far in the future: the clock was set back, and waiting would not settle anything.
    return age > grain || age < -coarseGrainNs;
}

} // namespace

std::int64_t dayOf(std::int64_t nanoseconds) { return nanoseconds / nsPerDay; }

bool filesUnchanged(const Snapshot& snapshot, Files& files) {
    return std::all_of(snapshot.files.begin(), snapshot.files.end(), [&](const WatchedFile& file) {
        return files.stamp(file.path) == file.stamp;
    });
}

bool isCurrent(const Snapshot& snapshot, Files& files) {
    const bool trusted =
        std::all_of(snapshot.files.begin(), snapshot.files.end(), [&](const WatchedFile& file) {
            return !file.passing && isSettled(file.stamp, snapshot.takenNs);
        });
    const bool sameDay = !snapshot.day || *snapshot.day == dayOf(files.now());
    return trusted && sameDay && filesUnchanged(snapshot, files);
}

} // namespace qelo::nodes
