// The stubs: their factories, and that every function lands in its own slot.

#include "cmpi/StubsInC.h"

#include <cmpi/cmpimacs.h>

#include <gtest/gtest.h>

#include <string>

namespace {

const CMPIBroker* theBroker = nullptr;
std::string called;
CMPIStatus initialized = {CMPI_RC_OK, nullptr};

CMPIStatus note(const char* name) {
    called = name;
    return {CMPI_RC_OK, nullptr};
}

using Ctx = const CMPIContext*;
using Rslt = const CMPIResult*;
using Op = const CMPIObjectPath*;
using Str = const char*;
using StrV = const char**;
using Se = const CMPISelectExp*;

CMPIStatus fullCleanup(CMPIInstanceMI*, Ctx, CMPIBoolean) { return note("Cleanup"); }
CMPIStatus fullEnumInstanceNames(CMPIInstanceMI*, Ctx, Rslt, Op) {
    return note("EnumInstanceNames");
}
CMPIStatus fullEnumInstances(CMPIInstanceMI*, Ctx, Rslt, Op, StrV) { return note("EnumInstances"); }
CMPIStatus fullGetInstance(CMPIInstanceMI*, Ctx, Rslt, Op, StrV) { return note("GetInstance"); }
CMPIStatus fullCreateInstance(CMPIInstanceMI*, Ctx, Rslt, Op, const CMPIInstance*) {
    return note("CreateInstance");
}
CMPIStatus fullModifyInstance(CMPIInstanceMI*, Ctx, Rslt, Op, const CMPIInstance*, StrV) {
    return note("ModifyInstance");
}
CMPIStatus fullDeleteInstance(CMPIInstanceMI*, Ctx, Rslt, Op) { return note("DeleteInstance"); }
CMPIStatus fullExecQuery(CMPIInstanceMI*, Ctx, Rslt, Op, Str, Str) { return note("ExecQuery"); }
CMPIStatus fullInstanceInitialize(CMPIInstanceMI*, Ctx) { return initialized; }

CMPIStatus fullAssociationCleanup(CMPIAssociationMI*, Ctx, CMPIBoolean) {
    return note("AssociationCleanup");
}
CMPIStatus fullAssociators(CMPIAssociationMI*, Ctx, Rslt, Op, Str, Str, Str, Str, StrV) {
    return note("Associators");
}
CMPIStatus fullAssociatorNames(CMPIAssociationMI*, Ctx, Rslt, Op, Str, Str, Str, Str) {
    return note("AssociatorNames");
}
CMPIStatus fullReferences(CMPIAssociationMI*, Ctx, Rslt, Op, Str, Str, StrV) {
    return note("References");
}
CMPIStatus fullReferenceNames(CMPIAssociationMI*, Ctx, Rslt, Op, Str, Str) {
    return note("ReferenceNames");
}

CMPIStatus fullMethodCleanup(CMPIMethodMI*, Ctx, CMPIBoolean) { return note("MethodCleanup"); }
CMPIStatus fullInvokeMethod(CMPIMethodMI*, Ctx, Rslt, Op, Str, const CMPIArgs*, CMPIArgs*) {
    return note("InvokeMethod");
}

CMPIStatus fullPropertyCleanup(CMPIPropertyMI*, Ctx, CMPIBoolean) {
    return note("PropertyCleanup");
}
CMPIStatus fullSetProperty(CMPIPropertyMI*, Ctx, Rslt, Op, Str, const CMPIData) {
    return note("SetProperty");
}
CMPIStatus fullGetProperty(CMPIPropertyMI*, Ctx, Rslt, Op, Str) { return note("GetProperty"); }

CMPIStatus fullIndicationCleanup(CMPIIndicationMI*, Ctx, CMPIBoolean) {
    return note("IndicationCleanup");
}
CMPIStatus fullAuthorizeFilter(CMPIIndicationMI*, Ctx, Se, Str, Op, Str) {
    return note("AuthorizeFilter");
}
CMPIStatus fullMustPoll(CMPIIndicationMI*, Ctx, Se, Str, Op) { return note("MustPoll"); }
CMPIStatus fullActivateFilter(CMPIIndicationMI*, Ctx, Se, Str, Op, CMPIBoolean) {
    return note("ActivateFilter");
}
CMPIStatus fullDeActivateFilter(CMPIIndicationMI*, Ctx, Se, Str, Op, CMPIBoolean) {
    return note("DeActivateFilter");
}
CMPIStatus fullEnableIndications(CMPIIndicationMI*, Ctx) { return note("EnableIndications"); }
CMPIStatus fullDisableIndications(CMPIIndicationMI*, Ctx) { return note("DisableIndications"); }

CMInstanceMIStub(full, Full, theBroker, CMInitHook(full, Instance))
    CMAssociationMIStub(full, Full, theBroker, CMNoHook)
        CMMethodMIStub(full, Full, theBroker, CMNoHook)
            CMPropertyMIStub(full, Full, theBroker, CMNoHook)
                CMIndicationMIStub(full, Full, theBroker, CMNoHook)

    // Calls the slot with zero arguments of its types; the name of the function it led to.
    template <typename MI, typename FT, typename... Args>
    std::string reached(MI* mi, CMPIStatus (*FT::*slot)(MI*, Args...)) {
    called.clear();
    (mi->ft->*slot)(mi, Args{}...);
    return called;
}

template <typename MI> void expectHeader(const MI* mi, const char* name) {
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, name);
}

class CmpiStubs : public testing::Test {
protected:
    CmpiStubs() {
        theBroker = nullptr;
        initialized = {CMPI_RC_OK, nullptr};
    }
    CMPIBroker broker_ = {};
    CMPIStatus status_ = {CMPI_RC_ERROR, nullptr};
};

TEST_F(CmpiStubs, The_factory_stores_the_broker_and_returns_one_static_interface) {
    CMPIInstanceMI* const mi = Full_Create_InstanceMI(&broker_, nullptr, &status_);
    EXPECT_EQ(theBroker, &broker_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    CMPIBroker other = {};
    EXPECT_EQ(Full_Create_InstanceMI(&other, nullptr, nullptr), mi);
    EXPECT_EQ(theBroker, &other);
}

TEST_F(CmpiStubs, A_failing_hook_makes_the_factory_fail_with_its_status) {
    CMPIString message = {nullptr, nullptr};
    initialized = {CMPI_RC_ERR_ACCESS_DENIED, &message};
    EXPECT_EQ(Full_Create_InstanceMI(&broker_, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(status_.msg, &message);
    EXPECT_EQ(Full_Create_InstanceMI(&broker_, nullptr, nullptr), nullptr);
}

TEST_F(CmpiStubs, Instance_functions_are_in_their_slots) {
    CMPIInstanceMI* const mi = Full_Create_InstanceMI(&broker_, nullptr, &status_);
    expectHeader(mi, "instanceFull");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::cleanup), "Cleanup");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::enumerateInstanceNames), "EnumInstanceNames");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::enumerateInstances), "EnumInstances");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::getInstance), "GetInstance");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::createInstance), "CreateInstance");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::modifyInstance), "ModifyInstance");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::deleteInstance), "DeleteInstance");
    EXPECT_EQ(reached(mi, &CMPIInstanceMIFT::execQuery), "ExecQuery");
}

TEST_F(CmpiStubs, Association_functions_are_in_their_slots) {
    CMPIAssociationMI* const mi = Full_Create_AssociationMI(&broker_, nullptr, &status_);
    expectHeader(mi, "associationFull");
    EXPECT_EQ(reached(mi, &CMPIAssociationMIFT::cleanup), "AssociationCleanup");
    EXPECT_EQ(reached(mi, &CMPIAssociationMIFT::associators), "Associators");
    EXPECT_EQ(reached(mi, &CMPIAssociationMIFT::associatorNames), "AssociatorNames");
    EXPECT_EQ(reached(mi, &CMPIAssociationMIFT::references), "References");
    EXPECT_EQ(reached(mi, &CMPIAssociationMIFT::referenceNames), "ReferenceNames");
}

TEST_F(CmpiStubs, Method_functions_are_in_their_slots) {
    CMPIMethodMI* const mi = Full_Create_MethodMI(&broker_, nullptr, &status_);
    expectHeader(mi, "methodFull");
    EXPECT_EQ(reached(mi, &CMPIMethodMIFT::cleanup), "MethodCleanup");
    EXPECT_EQ(reached(mi, &CMPIMethodMIFT::invokeMethod), "InvokeMethod");
}

TEST_F(CmpiStubs, Property_functions_are_in_their_slots) {
    CMPIPropertyMI* const mi = Full_Create_PropertyMI(&broker_, nullptr, &status_);
    expectHeader(mi, "propertyFull");
    EXPECT_EQ(reached(mi, &CMPIPropertyMIFT::cleanup), "PropertyCleanup");
    EXPECT_EQ(reached(mi, &CMPIPropertyMIFT::setProperty), "SetProperty");
    EXPECT_EQ(reached(mi, &CMPIPropertyMIFT::getProperty), "GetProperty");
    EXPECT_EQ(mi->ft->setPropertyWithOrigin, nullptr);
}

TEST_F(CmpiStubs, Indication_functions_are_in_their_slots) {
    CMPIIndicationMI* const mi = Full_Create_IndicationMI(&broker_, nullptr, &status_);
    expectHeader(mi, "IndicationFull");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::cleanup), "IndicationCleanup");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::authorizeFilter), "AuthorizeFilter");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::mustPoll), "MustPoll");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::activateFilter), "ActivateFilter");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::deActivateFilter), "DeActivateFilter");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::enableIndications), "EnableIndications");
    EXPECT_EQ(reached(mi, &CMPIIndicationMIFT::disableIndications), "DisableIndications");
}

TEST_F(CmpiStubs, The_stubs_work_in_C) {
    CMPIInstanceMI* const mi = CSample_Create_InstanceMI(&broker_, nullptr, &status_);
    expectHeader(mi, "instanceCSample");
    EXPECT_EQ(brokerOfCSample(), &broker_);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, CMPI_RC_DO_NOT_UNLOAD);
    expectHeader(CSample_Create_MethodMI(&broker_, nullptr, &status_), "methodCSample");
}

} // namespace
