// Every operation of both associations while something outside it breaks down.
#include "AssociationFixture.h"

#include "support/operations/Sweeps.h"

#include <tuple>

namespace qelo::test {
namespace {

struct Kind {
    const char* name;
    bool distinct = true;   // whether two results can be told from each other
    bool readsStore = true; // whether the near objects are needed
};

constexpr Kind kinds[] = {
    {"EnumInstanceNames"},
    {"EnumInstances"},
    {"GetInstance"},
    {"AssociatorsFar"},
    {"AssociatorsNear"},
    {"AssociatorNamesFar"},
    {"AssociatorNamesNear"},
    {"ReferencesFar"},
    {"ReferencesNear", true, false},
    // The recording broker's instances have no keys in their path.
    {"ReferenceNamesFar", false},
    {"ReferenceNamesNear", false, false},
};

class AssociationFaults : public AssociationFixture {
protected:
    void prepare() {
        serveNear({"/b", "/a"});
        platform_.setPathAnswers({false, true});
    }

    Outcome runOne(const std::string& kind) {
        const bool far = kind.find("Far") != std::string::npos;
        const CMPIObjectPath* source = far ? far_ : near_;
        if (kind == "EnumInstanceNames") {
            return enumNames();
        }
        if (kind == "EnumInstances") {
            return enumInstances({{case_.farRole, case_.nearRole}});
        }
        if (kind == "GetInstance") {
            return getInstance({{case_.farRole, Value::ref(broker_.inspect(far_))}});
        }
        if (kind.find("AssociatorNames") == 0) {
            return associatorNames(source, along());
        }
        if (kind.find("Associators") == 0) {
            return associators(source, along());
        }
        return kind.find("ReferenceNames") == 0 ? referenceNames(source) : references(source);
    }

    // The answers to path comparisons count from here.
    Outcome runAfresh(const std::string& kind) {
        platform_.forget();
        return runOne(kind);
    }

    const CMPIObjectPath* far_ = farPath("zeta");
    const CMPIObjectPath* near_ = nearPath("/a");
};

TEST_P(AssociationFaults, The_broker_may_fail_at_any_call) {
    prepare();
    serveFar({"zeta", "alpha"});
    for (const Kind& kind : kinds) {
        SCOPED_TRACE(kind.name);
        sweepBrokerFaults(broker_, [&] { return runAfresh(kind.name); }, {0, kind.distinct});
    }
}

TEST_P(AssociationFaults, The_store_may_fail_at_any_call) {
    serveFar({"zeta", "alpha"});
    for (const Kind& kind : kinds) {
        SCOPED_TRACE(kind.name);
        for (const StoreFault fault : {StoreFault::ReturnsFalse, StoreFault::ThrowsRuntimeError,
                                       StoreFault::ThrowsForeign}) {
            const std::size_t calls = sweepStoreCalls(
                broker_, fault, [&] { prepare(); }, [&] { return runOne(kind.name); },
                {0, kind.distinct});
            EXPECT_TRUE(calls > 1 || !kind.readsStore);
        }
    }
}

TEST_P(AssociationFaults, Memory_may_run_out_at_any_allocation) {
    prepare();
    serveFar({"zeta", "alpha"});
    for (const Kind& kind : kinds) {
        SCOPED_TRACE(kind.name);
        EXPECT_GT(
            sweepAllocations(broker_, [&] { return runAfresh(kind.name); }, {0, kind.distinct}),
            1U);
    }
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationFaults);

} // namespace
} // namespace qelo::test
