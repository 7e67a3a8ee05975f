#include "Broker.h"

#include "Slot.h"

#include <cim/ObjectPath.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace qelo::broker {
namespace {

// What goes to a terminal or a log file stays on one line.
std::string oneLine(std::string text) {
    std::replace_if(
        text.begin(), text.end(), [](unsigned char c) { return c < 0x20 || c == 0x7f; }, ' ');
    return text;
}

} // namespace

Broker::Broker(Router& router, BrokerHooks hooks)
    : cmpi_{this, &brokerTable, &encapsulationTable, &systemTable, &memoryTable}, router_(router),
      hooks_(std::move(hooks)) {}

Broker::~Broker() {
    freeAllBlocks();
    cmpi_.hdl = nullptr;
}

Broker* Broker::from(const CMPIBroker* mb) {
    if (!mb || !mb->hdl || mb->bft != &brokerTable) {
        return nullptr;
    }
    return static_cast<Broker*>(const_cast<void*>(mb->hdl));
}

Broker& aliveBroker(const CMPIBroker* mb) {
    Broker* broker = Broker::from(mb);
    if (!broker) {
        throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
    }
    return *broker;
}

void Broker::trace(int level, const std::string& component, const std::string& text) const {
    if (hooks_.log.trace) {
        hooks_.log.trace(level, component, text);
    }
}

void Broker::log(int severity, const std::string& id, const std::string& text) const {
    if (hooks_.log.log) {
        hooks_.log.log(severity, id, text);
        return;
    }
    const std::string line = id.empty() ? oneLine(text) : oneLine(id + ": " + text);
    // Nobody is left to tell when even this fails.
    (void)std::fprintf(stderr, "%s\n", line.c_str());
}

bool Broker::isA(const std::string& nameSpace, const std::string& sub,
                 const std::string& super) const {
    if (cim::sameName(sub, super)) {
        return true;
    }
    return hooks_.schema.isA && hooks_.schema.isA(nameSpace, sub, super);
}

const DeclaredClass* Broker::declaredClass(std::string_view nameSpace,
                                           std::string_view className) const {
    if (!hooks_.schema.findClass) {
        return nullptr;
    }
    const cim::Class* known =
        hooks_.schema.findClass(std::string(nameSpace), std::string(className));
    if (!known) {
        return nullptr;
    }
    {
        const std::shared_lock lock(declaredMutex_);
        const auto found = declared_.find(known);
        if (found != declared_.end()) {
            return found->second.get();
        }
    }
    auto made = std::make_unique<const DeclaredClass>(*known);
    const std::unique_lock lock(declaredMutex_);
    // Another thread may have been faster: then its object stays.
    return declared_.emplace(known, std::move(made)).first->second.get();
}

std::optional<std::vector<std::string>> Broker::keyNames(std::string_view nameSpace,
                                                         std::string_view className) const {
    if (!hooks_.schema.keyNames) {
        return std::nullopt;
    }
    return hooks_.schema.keyNames(std::string(nameSpace), std::string(className));
}

ContextObject* Broker::prepareContext(const ContextObject& source) {
    auto arena = std::make_unique<Arena>();
    ContextObject* context = copyOf(source, *arena, Ownership::Contained);
    std::lock_guard lock(mutex_);
    prepared_.emplace(&context->cmpi, std::move(arena));
    return context;
}

void Broker::dropPreparedContext(const CMPIContext* context) {
    std::lock_guard lock(mutex_);
    prepared_.erase(context);
}

CMPIMsgFileHandle Broker::openCatalog(const std::string& file) {
    if (!hooks_.openCatalog) {
        return nullptr;
    }
    // One entry for each opening, also of the same file.
    auto catalog = std::make_unique<Catalog>(hooks_.openCatalog(file));
    if (!*catalog) {
        return nullptr;
    }
    CMPIMsgFileHandle handle = catalog.get();
    std::lock_guard lock(mutex_);
    catalogs_.emplace(handle, std::move(catalog));
    return handle;
}

bool Broker::closeCatalog(CMPIMsgFileHandle handle) {
    std::lock_guard lock(mutex_);
    return catalogs_.erase(handle) != 0;
}

std::shared_ptr<const MessageCatalog> Broker::catalog(CMPIMsgFileHandle handle) const {
    std::lock_guard lock(mutex_);
    const auto found = catalogs_.find(handle);
    return found == catalogs_.end() ? nullptr : *found->second;
}

void* Broker::allocate(std::size_t count, std::size_t size) {
    if (size != 0 && count > PTRDIFF_MAX / size) {
        return nullptr;
    }
    void* block = std::calloc(std::max<std::size_t>(count, 1), std::max<std::size_t>(size, 1));
    if (!block) {
        return nullptr;
    }
    try {
        std::lock_guard lock(blocksMutex_);
        blocks_.emplace(block, count * size);
        return block;
    } catch (...) {
        std::free(block);
        throw;
    }
}

void* Broker::reallocate(void* block, std::size_t size) {
    if (!block) {
        return allocate(1, size);
    }
    std::size_t oldSize = 0;
    {
        std::lock_guard lock(blocksMutex_);
        const auto found = blocks_.find(block);
        if (found == blocks_.end()) {
            return nullptr;
        }
        oldSize = found->second;
    }
    void* moved = allocate(1, size);
    if (!moved) {
        return nullptr;
    }
    std::memcpy(moved, block, std::min(oldSize, size));
    freeBlock(block);
    return moved;
}

void Broker::freeBlock(void* block) {
    std::lock_guard lock(blocksMutex_);
    if (blocks_.erase(block) != 0) {
        std::free(block);
    }
}

void Broker::freeAllBlocks() {
    std::lock_guard lock(blocksMutex_);
    for (const auto& block : blocks_) {
        std::free(block.first);
    }
    blocks_.clear();
}

} // namespace qelo::broker
