// The lines with which a provider operation says that it begins, ends, or fails. Each style
// is used by some of the providers; the shared operations take any of them.
#pragma once

#include <UnitTrace.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// What every style knows: the provider's unit, and the operation that is running.
class OperationLines {
public:
    OperationLines(const UnitTrace& unit, TraceSite site) : unit_(unit), site_(site) {}

    const UnitTrace& unit() const { return unit_; }
    const TraceSite& site() const { return site_; }

private:
    const UnitTrace& unit_;
    TraceSite site_;
};

// Entry and exit markers, and a failure line when a factory fails.
class MarkerLines : public OperationLines {
public:
    explicit MarkerLines(const UnitTrace& unit, TraceSite site = TraceSite::here())
        : OperationLines(unit, site) {}

    void enter() const {
        markProviderEntry(unit().component(), site().function, unit().file(), site().line);
    }
    void leave() const {
        markProviderExit(unit().component(), site().function, unit().file(), site().line);
    }
    void failed(const char* text) const { unit().message(text, TraceLevel::failure, site()); }
};

// Plain lines "<operation>: entry" and "<operation>: exit"; a factory's failure is silent.
class PlainLines : public OperationLines {
public:
    explicit PlainLines(const UnitTrace& unit, TraceSite site = TraceSite::here())
        : OperationLines(unit, site) {}

    void enter() const { unit().plain((site().function + std::string(": entry")).c_str(), site()); }
    void leave() const { unit().plain((site().function + std::string(": exit")).c_str(), site()); }
    void failed(const char*) const {}
};

// Entry and exit lines with the operation's parameters; a factory's failure is silent.
// `Build` makes the parameter list when the operation is entered.
template <class Build> class ParameterLines : public OperationLines {
public:
    ParameterLines(const UnitTrace& unit, Build build, TraceSite site = TraceSite::here())
        : OperationLines(unit, site), build_(build) {}

    void enter() {
        params_ = build_();
        unit().withParameters(params_, ENTERING, site());
    }
    void leave() const { unit().withParameters(params_, EXITING, site()); }
    void failed(const char*) const {}

private:
    Build build_;
    std::string params_;
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
