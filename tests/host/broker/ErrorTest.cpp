// Error objects, slot by slot.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

class ErrorTest : public BrokerTest {
protected:
    CMPIError* error() {
        return mb()->eft->newCMPIError(mb(), "us", "ID1", "broken", ErrorSevHigh, Disk_Failure,
                                       CMPI_RC_ERR_NOT_FOUND, nullptr);
    }
};

TEST_F(ErrorTest, Attributes_given_at_creation_can_be_read) {
    const CMPIError* er = error();
    EXPECT_EQ(text(er->ft->getOwningEntity(er, &st)), "us");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(er->ft->getMessageID(er, nullptr)), "ID1");
    EXPECT_EQ(text(er->ft->getMessage(er, nullptr)), "broken");
    EXPECT_EQ(er->ft->getPerceivedSeverity(er, &st), ErrorSevHigh);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(er->ft->getProbableCause(er, nullptr), Disk_Failure);
    EXPECT_EQ(er->ft->getCIMStatusCode(er, nullptr), CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(ErrorTest, Attributes_not_given_are_null_with_success) {
    const CMPIError* er = error();
    using TextGetter = CMPIString* (*)(const CMPIError*, CMPIStatus*);
    for (const TextGetter get :
         {er->ft->getOtherErrorType, er->ft->getProbableCauseDescription, er->ft->getErrorSource,
          er->ft->getOtherErrorSourceFormat, er->ft->getCIMStatusCodeDescription}) {
        EXPECT_EQ(get(er, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_OK);
    }
    EXPECT_EQ(er->ft->getRecommendedActions(er, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(er->ft->getMessageArguments(er, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(er->ft->getErrorType(er, &st), UnknownErrorType);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(er->ft->getErrorSourceFormat(er, &st), CMPIErrSrcUnknown);
    EXPECT_EQ(rc(), CMPI_RC_OK);
}

TEST_F(ErrorTest, Each_attribute_can_be_set) {
    const CMPIError* er = error();
    EXPECT_EQ(er->ft->setErrorType(er, SoftwareError).rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setErrorSourceFormat(er, CIMObjectHandle).rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setOtherErrorType(er, "1").rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setProbableCauseDescription(er, "2").rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setErrorSource(er, "3").rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setOtherErrorSourceFormat(er, "4").rc, CMPI_RC_OK);
    EXPECT_EQ(er->ft->setCIMStatusCodeDescription(er, "5").rc, CMPI_RC_OK);
    CMPIArray* actions = array(1, CMPI_string);
    actions->ft->setElementAt(actions, 0, chars("6"), CMPI_chars);
    EXPECT_EQ(er->ft->setRecommendedActions(er, actions).rc, CMPI_RC_OK);
    actions->ft->setElementAt(actions, 0, chars("7"), CMPI_chars);
    EXPECT_EQ(er->ft->setMessageArguments(er, actions).rc, CMPI_RC_OK);
    CMPIError* copy = er->ft->clone(er, nullptr);
    nextCall();

    EXPECT_EQ(copy->ft->getErrorType(copy, nullptr), SoftwareError);
    EXPECT_EQ(copy->ft->getErrorSourceFormat(copy, nullptr), CIMObjectHandle);
    EXPECT_EQ(text(copy->ft->getOtherErrorType(copy, nullptr)), "1");
    EXPECT_EQ(text(copy->ft->getProbableCauseDescription(copy, nullptr)), "2");
    EXPECT_EQ(text(copy->ft->getErrorSource(copy, nullptr)), "3");
    EXPECT_EQ(text(copy->ft->getOtherErrorSourceFormat(copy, nullptr)), "4");
    EXPECT_EQ(text(copy->ft->getCIMStatusCodeDescription(copy, nullptr)), "5");
    const CMPIArray* first = copy->ft->getRecommendedActions(copy, nullptr);
    const CMPIArray* second = copy->ft->getMessageArguments(copy, nullptr);
    EXPECT_EQ(text(first->ft->getElementAt(first, 0, nullptr).value.string), "6");
    EXPECT_EQ(text(second->ft->getElementAt(second, 0, nullptr).value.string), "7");
    EXPECT_EQ(copy->ft->setErrorSource(copy, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(copy->ft->getErrorSource(copy, nullptr), nullptr);
    EXPECT_EQ(copy->ft->setMessageArguments(copy, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(copy->ft->getMessageArguments(copy, nullptr), nullptr);
    copy->ft->release(copy);
}

TEST_F(ErrorTest, Bad_arguments_are_refused) {
    CMPIError* er = error();
    EXPECT_EQ(er->ft->setRecommendedActions(er, array(1, CMPI_uint8)).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    const CMPIErrorFT* ft = er->ft;
    ft->release(er);
    EXPECT_EQ(ft->setErrorType(er, SoftwareError).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setErrorSource(er, "x").rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setMessageArguments(er, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getErrorType(er, &st), UnknownErrorType);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getMessage(er, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getRecommendedActions(er, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

} // namespace
} // namespace qelo::broker::testing
