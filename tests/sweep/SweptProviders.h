// The providers on a platform that can be made to fail too, with something to serve for each
// of them.
#pragma once

#include "SweptLibrary.h"

#include "support/platform/RecordingPlatform.h"

namespace qelo::test {

class SweptProviders : public SweptLibrary {
public:
    SweptProviders();

    // A store as the operations find it at first: two accounts, groups and service nodes.
    void prepareStore();
    // Forgets what was recorded, so that scripted answers and counts begin again.
    void restart() { platform_.forget(); }

    RecordingPlatform& platform() { return platform_; }

private:
    RecordingPlatform& platform_ = RecordingPlatform::instance();
};

// As SweptLibrary.h says, and no cursor of the store is left open.
void judgeFaultyRun(SweptProviders& providers, const SweptOperation& operation,
                    const SweptRun& good, const SweptRun& run);
void expectGoodRun(SweptProviders& providers, const SweptRun& good, const SweptRun& run);

} // namespace qelo::test
