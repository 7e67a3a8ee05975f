// The management interfaces that the factory functions hand out.
#include "ProviderList.h"

#include "support/platform/ProviderLibrary.h"
#include "support/platform/RecordingPlatform.h"

#include <gtest/gtest.h>

#include <set>
#include <stdexcept>
#include <string>

namespace qelo::test {
namespace {

constexpr int tableVersion = 200;

template <class MI> void expectTable(const MI* mi, const std::string& name) {
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    ASSERT_NE(mi->ft, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, tableVersion);
    EXPECT_EQ(mi->ft->miVersion, tableVersion);
    EXPECT_EQ(std::string(mi->ft->miName), name);
    EXPECT_NE(mi->ft->cleanup, nullptr);
}

class ProviderTables : public testing::TestWithParam<ProviderKind> {
protected:
    const ProviderLibrary& library_ = ProviderLibrary::instance();
    CMPIBroker broker_{};
    CMPIBroker secondBroker_{};
    std::string name_ = GetParam().provider;
};

TEST_P(ProviderTables, The_instance_interface_has_its_name_and_every_slot) {
    const CMPIInstanceMI* mi = library_.instanceMI(name_, &broker_);
    expectTable(mi, "instance" + name_);
    EXPECT_NE(mi->ft->enumerateInstanceNames, nullptr);
    EXPECT_NE(mi->ft->enumerateInstances, nullptr);
    EXPECT_NE(mi->ft->getInstance, nullptr);
    EXPECT_NE(mi->ft->createInstance, nullptr);
    EXPECT_NE(mi->ft->modifyInstance, nullptr);
    EXPECT_NE(mi->ft->deleteInstance, nullptr);
    EXPECT_NE(mi->ft->execQuery, nullptr);
}

TEST_P(ProviderTables, The_method_interface_has_its_name_and_every_slot) {
    if (!GetParam().methods) {
        EXPECT_THROW(library_.function(name_ + "_Create_MethodMI"), std::runtime_error);
        return;
    }
    const CMPIMethodMI* mi = library_.methodMI(name_, &broker_);
    expectTable(mi, "method" + name_);
    EXPECT_NE(mi->ft->invokeMethod, nullptr);
}

TEST_P(ProviderTables, The_association_interface_has_its_name_and_every_slot) {
    if (!GetParam().associations) {
        EXPECT_THROW(library_.function(name_ + "_Create_AssociationMI"), std::runtime_error);
        return;
    }
    const CMPIAssociationMI* mi = library_.associationMI(name_, &broker_);
    expectTable(mi, "association" + name_);
    EXPECT_NE(mi->ft->associators, nullptr);
    EXPECT_NE(mi->ft->associatorNames, nullptr);
    EXPECT_NE(mi->ft->references, nullptr);
    EXPECT_NE(mi->ft->referenceNames, nullptr);
}

TEST_P(ProviderTables, No_indication_or_property_interface_is_exported) {
    EXPECT_THROW(library_.function(name_ + "_Create_IndicationMI"), std::runtime_error);
    EXPECT_THROW(library_.function(name_ + "_Create_PropertyMI"), std::runtime_error);
}

TEST_P(ProviderTables, Creating_twice_returns_the_same_object) {
    EXPECT_EQ(library_.instanceMI(name_, &broker_), library_.instanceMI(name_, &secondBroker_));
    if (GetParam().methods) {
        EXPECT_EQ(library_.methodMI(name_, &broker_), library_.methodMI(name_, &secondBroker_));
    }
    if (GetParam().associations) {
        EXPECT_EQ(library_.associationMI(name_, &broker_),
                  library_.associationMI(name_, &secondBroker_));
    }
}

TEST_P(ProviderTables, Creating_ignores_a_missing_broker_context_and_status) {
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    void* address = library_.function(name_ + "_Create_InstanceMI");
    const CMPIInstanceMI* mi = reinterpret_cast<Factory>(address)(nullptr, nullptr, nullptr);
    EXPECT_EQ(mi, library_.instanceMI(name_, &broker_));
}

TEST_P(ProviderTables, Creating_never_sets_the_status) {
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    CMPIString text{};
    CMPIStatus status{CMPI_RC_ERR_ALREADY_EXISTS, &text};
    void* address = library_.function(name_ + "_Create_InstanceMI");
    reinterpret_cast<Factory>(address)(&broker_, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_EQ(status.msg, &text);
}

TEST_P(ProviderTables, Creating_traces_nothing_and_reads_nothing) {
    RecordingPlatform::instance().reset();
    library_.instanceMI(name_, &broker_);
    EXPECT_EQ(RecordingPlatform::instance().lineCount(), 0U);
    EXPECT_EQ(RecordingPlatform::instance().storeCallCount(), 0U);
}

TEST(ProviderTablesOfAll, No_two_interfaces_share_an_object) {
    const ProviderLibrary& library = ProviderLibrary::instance();
    std::set<const void*> objects;
    for (const ProviderKind& kind : providerKinds()) {
        objects.insert(library.instanceMI(kind.provider, nullptr));
        if (kind.methods) {
            objects.insert(library.methodMI(kind.provider, nullptr));
        }
        if (kind.associations) {
            objects.insert(library.associationMI(kind.provider, nullptr));
        }
    }
    EXPECT_EQ(objects.size(), 11U);
}

INSTANTIATE_TEST_SUITE_P(Each, ProviderTables, testing::ValuesIn(providerKinds()),
                         providerName<testing::TestParamInfo<ProviderKind>>);

} // namespace
} // namespace qelo::test
