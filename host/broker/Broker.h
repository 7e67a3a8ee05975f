// The broker as an object of the host: the CMPIBroker that providers get, and what stands
// behind it.
#pragma once

#include "DeclaredClass.h"
#include "Hooks.h"
#include "OperationContext.h"
#include "Router.h"

#include <cmpi/cmpift.h>

#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace qelo::broker {

class Arena;
struct ContextObject;

// The tables of every broker of this process.
extern const CMPIBrokerFT brokerTable;
extern const CMPIBrokerEncFT encapsulationTable;
extern const CMPIBrokerExtFT systemTable;
extern const CMPIBrokerMemFT memoryTable;

class Broker {
public:
    // `router` answers the up-calls and must outlive the broker.
    Broker(Router& router, BrokerHooks hooks);
    // Frees what providers left: prepared contexts, open message files, memory blocks.
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    const CMPIBroker* cmpi() const { return &cmpi_; }
    Router& router() const { return router_; }
    const BrokerHooks& hooks() const { return hooks_; }

    // The broker behind a provider's pointer, or null.
    static Broker* from(const CMPIBroker* mb);

    void trace(int level, const std::string& component, const std::string& text) const;
    void log(int severity, const std::string& id, const std::string& text) const;

    bool isA(const std::string& nameSpace, const std::string& sub, const std::string& super) const;
    // What the schema declares of a class, or null. Valid as long as the broker.
    const DeclaredClass* declaredClass(std::string_view nameSpace,
                                       std::string_view className) const;
    std::optional<std::vector<std::string>> keyNames(std::string_view nameSpace,
                                                     std::string_view className) const;

    // Contexts prepared for threads, each in an arena of its own until its thread detaches.
    ContextObject* prepareContext(const ContextObject& source);
    void dropPreparedContext(const CMPIContext* context);

    // Message files. The handle is null when there is no such catalog.
    CMPIMsgFileHandle openCatalog(const std::string& file);
    bool closeCatalog(CMPIMsgFileHandle handle);
    std::shared_ptr<const MessageCatalog> catalog(CMPIMsgFileHandle handle) const;

    // Memory that lasts until it is freed or the broker's providers are shut down. Freeing
    // what is not such memory does nothing. Null when there is none, or for an overflow.
    void* allocate(std::size_t count, std::size_t size);
    void* reallocate(void* block, std::size_t size);
    void freeBlock(void* block);
    void freeAllBlocks();

private:
    CMPIBroker cmpi_;
    Router& router_;
    BrokerHooks hooks_;

    mutable std::mutex mutex_;
    std::map<const CMPIContext*, std::unique_ptr<Arena>> prepared_;
    // The handle of a catalog is the address of its entry.
    using Catalog = std::shared_ptr<const MessageCatalog>;
    std::map<CMPIMsgFileHandle, std::unique_ptr<Catalog>> catalogs_;

    mutable std::shared_mutex declaredMutex_;
    mutable std::unordered_map<const cim::Class*, std::unique_ptr<const DeclaredClass>> declared_;

    std::mutex blocksMutex_;
    std::unordered_map<void*, std::size_t> blocks_;
};

// The broker behind `mb`, or Refusal with INVALID_HANDLE.
Broker& aliveBroker(const CMPIBroker* mb);

} // namespace qelo::broker
