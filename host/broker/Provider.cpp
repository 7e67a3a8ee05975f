#include "Provider.h"

#include "ProviderCall.h"

#include <utility>

namespace qelo::broker {
namespace {

constexpr std::size_t indexOf(ProviderType type) { return static_cast<std::size_t>(type); }

template <class MI> using Factory = MI*(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
template <class MI>
using GenericFactory = MI*(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);

constexpr unsigned int bitOf(ProviderType type) { return 1U << indexOf(type); }

// Counts the nested attempts to make interfaces and marks the one at hand.
struct Making {
    Making(int& count, bool& mark) : makers(count), beingMade(mark) {
        ++makers;
        beingMade = true;
    }
    ~Making() {
        --makers;
        beingMade = false;
    }
    Making(const Making&) = delete;
    Making& operator=(const Making&) = delete;

    int& makers;
    bool& beingMade;
};

// The named factory, or the generic one that makes any interface of the library by name.
template <class MI> struct Factories {
    Factory<MI>* named = nullptr;
    GenericFactory<MI>* generic = nullptr;

    MI* make(const CMPIBroker* mb, const CMPIContext* ctx, const char* name, CMPIStatus* st) const {
        return named ? named(mb, ctx, st) : generic(mb, ctx, name, st);
    }
};

template <class MI>
Factories<MI> factoriesOf(const SharedLibrary& library, const std::string& provider,
                          ProviderType type) {
    const std::string ending = std::string("_Create_") + providerTypeName(type) + "MI";
    Factories<MI> found;
    found.named = library.function<Factory<MI>>(provider + ending);
    if (!found.named) {
        found.generic = library.function<GenericFactory<MI>>("_Generic" + ending);
    }
    return found;
}

void tellNameSpace(ProviderCall& call, const std::string& nameSpace) {
    CMPIData data = {};
    data.type = CMPI_string;
    data.value.string = &newString(call.arena(), nameSpace, Ownership::Contained)->cmpi;
    call.contextObject().entries.set(call.arena(), CMPIInitNameSpace, data);
}

} // namespace

const char* providerTypeName(ProviderType type) {
    static constexpr std::array<const char*, providerTypeCount> names = {
        "Instance", "Association", "Method", "Property", "Indication"};
    // cppcheck-suppress CastIntegerToAddressAtReturn
    return names[indexOf(type)];
}

Provider::Provider(const Broker& broker, const std::vector<std::string>& directories,
                   std::recursive_mutex& loading, std::string library, std::string name)
    : broker_(broker), directories_(directories), loading_(loading),
      libraryName_(std::move(library)), name_(std::move(name)) {}

void Provider::fail(CMPIrc code, const std::string& text) const {
    throw client::CimError(cimStatusCode(code), "provider " + name_ + ": " + text);
}

void Provider::expect(ProviderTypes types) {
    for (const ProviderType type : allProviderTypes) {
        if (types.has(type)) {
            expected_ |= bitOf(type);
        }
    }
}

template <class MI> MI* Provider::interface(ProviderType type, const std::string& nameSpace) {
    const std::size_t index = indexOf(type);
    if (void* ready = interfaces_[index].load(std::memory_order_acquire)) {
        return static_cast<MI*>(ready);
    }
    const std::lock_guard lock(loading_);
    if (made_[index]) {
        return static_cast<MI*>(made_[index]);
    }
    if (stopped_) {
        fail(CMPI_RC_ERR_FAILED, "it is being shut down");
    }
    if (beingMade_[index]) {
        fail(CMPI_RC_ERR_FAILED, "it is asked for while it is being loaded");
    }
    const Making making{makers_, beingMade_[index]};
    MI* made = create<MI>(type, nameSpace);
    made_[index] = made;
    makeCompanions(nameSpace);
    if (makers_ == 1) {
        publish();
    }
    return made;
}

// What cannot be had is left for the request that needs it.
void Provider::makeCompanions(const std::string& nameSpace) {
    if (std::exchange(companionsMade_, true)) {
        return;
    }
    for (const ProviderType type : allProviderTypes) {
        if ((expected_ & bitOf(type)) == 0) {
            continue;
        }
        try {
            load(type, nameSpace);
        } catch (const client::CimError&) {
            continue;
        }
    }
}

void Provider::publish() {
    for (std::size_t i = 0; i < made_.size(); ++i) {
        interfaces_[i].store(made_[i], std::memory_order_release);
    }
}

template <class MI> MI* Provider::create(ProviderType type, const std::string& nameSpace) {
    try {
        if (!library_) {
            library_ = std::make_unique<SharedLibrary>(findLibrary(libraryName_, directories_));
        }
    } catch (const LibraryError& error) {
        fail(CMPI_RC_ERR_FAILED, error.what());
    }
    const auto factories = factoriesOf<MI>(*library_, name_, type);
    const std::string symbol = name_ + "_Create_" + providerTypeName(type) + "MI";
    if (!factories.named && !factories.generic) {
        fail(CMPI_RC_ERR_FAILED, library_->path() + " has no function " + symbol);
    }

    ProviderCall call(broker_, {}, ResultObject::Kind::Nothing);
    tellNameSpace(call, nameSpace);
    MI* made = nullptr;
    call.run(symbol, [&] {
        // Many factories never write the status.
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        made = factories.make(broker_.cmpi(), call.context(), name_.c_str(), &status);
        return made ? CMPIStatus{CMPI_RC_OK, nullptr} : status;
    });
    if (!made) {
        fail(CMPI_RC_ERR_FAILED, symbol + " gave nothing and no reason");
    }
    if (!made->ft || made->ft->ftVersion <= 0) {
        fail(CMPI_RC_ERR_FAILED, symbol + " gave an interface without a valid table");
    }
    return made;
}

CMPIInstanceMI* Provider::instanceMI(const std::string& nameSpace) {
    return interface<CMPIInstanceMI>(ProviderType::Instance, nameSpace);
}

CMPIAssociationMI* Provider::associationMI(const std::string& nameSpace) {
    return interface<CMPIAssociationMI>(ProviderType::Association, nameSpace);
}

CMPIMethodMI* Provider::methodMI(const std::string& nameSpace) {
    return interface<CMPIMethodMI>(ProviderType::Method, nameSpace);
}

CMPIPropertyMI* Provider::propertyMI(const std::string& nameSpace) {
    return interface<CMPIPropertyMI>(ProviderType::Property, nameSpace);
}

CMPIIndicationMI* Provider::indicationMI(const std::string& nameSpace) {
    return interface<CMPIIndicationMI>(ProviderType::Indication, nameSpace);
}

void Provider::load(ProviderType type, const std::string& nameSpace) {
    switch (type) {
    case ProviderType::Instance:
        (void)instanceMI(nameSpace);
        break;
    case ProviderType::Association:
        (void)associationMI(nameSpace);
        break;
    case ProviderType::Method:
        (void)methodMI(nameSpace);
        break;
    case ProviderType::Property:
        (void)propertyMI(nameSpace);
        break;
    case ProviderType::Indication:
        (void)indicationMI(nameSpace);
        break;
    }
}

template <class MI> void Provider::cleanUp(ProviderType type) {
    auto* made = static_cast<MI*>(std::exchange(made_[indexOf(type)], nullptr));
    interfaces_[indexOf(type)] = nullptr;
    if (!made || !made->ft->cleanup) {
        return;
    }
    ProviderCall call(broker_, {}, ResultObject::Kind::Nothing);
    const CMPIBoolean terminating = 1;
    const CMPIStatus status =
        call.guarded(name_, [&] { return made->ft->cleanup(made, call.context(), terminating); });
    // A provider that cannot stop now must not lose its code.
    if (status.rc == CMPI_RC_DO_NOT_UNLOAD || status.rc == CMPI_RC_NEVER_UNLOAD) {
        library_->keepLoaded();
    }
}

void Provider::cleanUp() {
    stopped_ = true;
    cleanUp<CMPIIndicationMI>(ProviderType::Indication);
    cleanUp<CMPIPropertyMI>(ProviderType::Property);
    cleanUp<CMPIMethodMI>(ProviderType::Method);
    cleanUp<CMPIAssociationMI>(ProviderType::Association);
    cleanUp<CMPIInstanceMI>(ProviderType::Instance);
}

void Provider::unload() {
    library_.reset();
    companionsMade_ = false;
    stopped_ = false;
}

} // namespace qelo::broker
