// Nested lifetimes, memory blocks, and the early end of single objects.
#include "Broker.h"
#include "Frame.h"
#include "Slot.h"

#include <cstring>

namespace qelo::broker {
namespace {

CMPIGcStat* mark(const CMPIBroker* mb, CMPIStatus* st) {
    return slot<CMPIGcStat*>(st, nullptr, [&]() -> CMPIGcStat* {
        (void)aliveBroker(mb);
        return const_cast<Arena*>(currentFrame().mark());
    });
}

CMPIStatus release(const CMPIBroker* mb, const CMPIGcStat* level) {
    return statusSlot([&] {
        (void)aliveBroker(mb);
        switch (currentFrame().release(level)) {
        case Frame::ReleaseResult::Released:
            return;
        case Frame::ReleaseResult::NotInnermost:
            throw Refusal{CMPI_RC_ERR_FAILED};
        case Frame::ReleaseResult::Unknown:
            throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
        }
    });
}

void* cmpiMalloc(const CMPIBroker* mb, size_t size) {
    return slot<void*>(nullptr, nullptr, [&] { return aliveBroker(mb).allocate(1, size); });
}

void* cmpiCalloc(const CMPIBroker* mb, size_t count, size_t size) {
    return slot<void*>(nullptr, nullptr, [&] { return aliveBroker(mb).allocate(count, size); });
}

void* cmpiRealloc(const CMPIBroker* mb, void* block, size_t size) {
    return slot<void*>(nullptr, nullptr, [&] { return aliveBroker(mb).reallocate(block, size); });
}

char* cmpiStrDup(const CMPIBroker* mb, const char* text) {
    return slot<char*>(nullptr, nullptr, [&]() -> char* {
        Broker& broker = aliveBroker(mb);
        if (!text) {
            return nullptr;
        }
        const std::size_t size = std::strlen(text) + 1;
        void* copy = broker.allocate(1, size);
        return copy ? static_cast<char*>(std::memcpy(copy, text, size)) : nullptr;
    });
}

void cmpiFree(const CMPIBroker* mb, void* block) {
    statusSlot([&] { aliveBroker(mb).freeBlock(block); });
}

// Only what a factory made in this call ends here; clones are released, not freed.
template <class T> void freeObject(const CMPIBroker* mb, typename T::Cmpi* object) {
    T* made = Broker::from(mb) ? liveObject<T>(object) : nullptr;
    if (made && made->ownership == Ownership::Call) {
        made->cmpi.hdl = nullptr;
    }
}

// There are none.
void freeSelectExp(const CMPIBroker*, CMPISelectExp*) {}

} // namespace

const CMPIBrokerMemFT memoryTable = {
    CMPIVersion200,
    mark,
    release,
    cmpiMalloc,
    cmpiCalloc,
    cmpiRealloc,
    cmpiStrDup,
    cmpiFree,
    freeObject<InstanceObject>,
    freeObject<ObjectPathObject>,
    freeObject<ArgsObject>,
    freeObject<StringObject>,
    freeObject<ArrayObject>,
    freeObject<DateTimeObject>,
    freeSelectExp,
};

} // namespace qelo::broker
