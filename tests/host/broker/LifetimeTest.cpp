// What holds for every type of object: release, clone, and the end of a call.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

struct StringKind {
    using Cmpi = CMPIString;
    static Cmpi* make(const CMPIBroker* mb) { return mb->eft->newString(mb, "text", nullptr); }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        object->ft->getCharPtr(object, &st);
        return st.rc;
    }
};
struct ArrayKind {
    using Cmpi = CMPIArray;
    static Cmpi* make(const CMPIBroker* mb) {
        Cmpi* array = mb->eft->newArray(mb, 2, CMPI_string, nullptr);
        array->ft->setElementAt(array, 1, chars("one"), CMPI_chars);
        return array;
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIData data = object->ft->getElementAt(object, 1, &st);
        EXPECT_TRUE(st.rc != CMPI_RC_OK || text(data.value.string) == "one");
        return st.rc;
    }
};
struct ObjectPathKind {
    using Cmpi = CMPIObjectPath;
    static Cmpi* make(const CMPIBroker* mb) {
        Cmpi* path = mb->eft->newObjectPath(mb, "root/test", "TEST_Thing", nullptr);
        path->ft->setHostname(path, "host");
        path->ft->addKey(path, "Name", chars("one"), CMPI_chars);
        return path;
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIString* shown = object->ft->toString(object, &st);
        EXPECT_TRUE(st.rc != CMPI_RC_OK ||
                    text(shown) == "//host/root/test:TEST_Thing.Name=\"one\"")
            << text(shown);
        return st.rc;
    }
};
struct InstanceKind {
    using Cmpi = CMPIInstance;
    static Cmpi* make(const CMPIBroker* mb) {
        Cmpi* instance = mb->eft->newInstance(mb, ObjectPathKind::make(mb), nullptr);
        instance->ft->setProperty(instance, "Color", chars("red"), CMPI_chars);
        return instance;
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIData data = object->ft->getProperty(object, "Color", &st);
        EXPECT_TRUE(st.rc != CMPI_RC_OK || text(data.value.string) == "red");
        if (st.rc == CMPI_RC_OK) {
            EXPECT_EQ(ObjectPathKind::use(object->ft->getObjectPath(object, nullptr)), CMPI_RC_OK);
        }
        return st.rc;
    }
};
struct ArgsKind {
    using Cmpi = CMPIArgs;
    static Cmpi* make(const CMPIBroker* mb) {
        Cmpi* args = mb->eft->newArgs(mb, nullptr);
        args->ft->addArg(args, "Color", chars("red"), CMPI_chars);
        return args;
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIData data = object->ft->getArg(object, "Color", &st);
        EXPECT_TRUE(st.rc != CMPI_RC_OK || text(data.value.string) == "red");
        return st.rc;
    }
};
struct DateTimeKind {
    using Cmpi = CMPIDateTime;
    static Cmpi* make(const CMPIBroker* mb) {
        return mb->eft->newDateTimeFromBinary(mb, 1'000'000, 0, nullptr);
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIUint64 time = object->ft->getBinaryFormat(object, &st);
        EXPECT_EQ(time, st.rc == CMPI_RC_OK ? 1'000'000U : 0U);
        return st.rc;
    }
};
struct EnumerationKind {
    using Cmpi = CMPIEnumeration;
    static Cmpi* make(const CMPIBroker* mb) {
        const CMPIContext* ctx =
            &fromCim(currentArena(), OperationContext(), Ownership::Contained)->cmpi;
        return mb->bft->enumerateInstanceNames(mb, ctx, ObjectPathKind::make(mb), nullptr);
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        object->ft->hasNext(object, &st);
        return st.rc;
    }
};
struct ErrorKind {
    using Cmpi = CMPIError;
    static Cmpi* make(const CMPIBroker* mb) {
        return mb->eft->newCMPIError(mb, "us", "id", "message", ErrorSevLow, ErrorProbCauseOther,
                                     CMPI_RC_ERR_FAILED, nullptr);
    }
    static CMPIrc use(const Cmpi* object) {
        CMPIStatus st = {};
        const CMPIString* message = object->ft->getMessage(object, &st);
        EXPECT_TRUE(st.rc != CMPI_RC_OK || text(message) == "message");
        return st.rc;
    }
};

template <class Kind> class LifetimeTest : public BrokerTest {
protected:
    typename Kind::Cmpi* make() { return Kind::make(this->mb()); }
};

using Kinds = ::testing::Types<StringKind, ArrayKind, ObjectPathKind, InstanceKind, ArgsKind,
                               DateTimeKind, EnumerationKind, ErrorKind>;

// The macro wants an argument where the names of the kinds may stand.
struct KindNames {
    template <class Kind> static std::string GetName(int number) { return std::to_string(number); }
};
TYPED_TEST_SUITE(LifetimeTest, Kinds, KindNames);

TYPED_TEST(LifetimeTest, A_live_object_has_a_handle_and_a_table_of_version_200) {
    auto* object = this->make();
    EXPECT_NE(object->hdl, nullptr);
    EXPECT_EQ(object->ft->ftVersion, 200);
    EXPECT_EQ(TypeParam::use(object), CMPI_RC_OK);
}

TYPED_TEST(LifetimeTest, A_released_object_is_dead_and_can_be_released_again) {
    auto* object = this->make();
    EXPECT_EQ(object->ft->release(object).rc, CMPI_RC_OK);
    EXPECT_EQ(object->hdl, nullptr);
    EXPECT_EQ(TypeParam::use(object), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(object->ft->release(object).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(object->ft->clone(object, &this->st), nullptr);
    EXPECT_EQ(this->rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TYPED_TEST(LifetimeTest, Null_is_refused_by_release_clone_and_use) {
    auto* object = this->make();
    typename TypeParam::Cmpi none = {nullptr, object->ft};
    EXPECT_EQ(object->ft->release(nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(object->ft->clone(nullptr, &this->st), nullptr);
    EXPECT_EQ(this->rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(object->ft->clone(nullptr, nullptr), nullptr);
    EXPECT_EQ(TypeParam::use(&none), CMPI_RC_ERR_INVALID_HANDLE);
}

TYPED_TEST(LifetimeTest, An_object_of_another_broker_is_refused) {
    auto* object = this->make();
    auto otherTable = *object->ft;
    typename TypeParam::Cmpi foreign = {object->hdl, &otherTable};
    EXPECT_EQ(TypeParam::use(&foreign), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(object->ft->release(&foreign).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TYPED_TEST(LifetimeTest, A_clone_outlives_its_original_and_its_call) {
    auto* object = this->make();
    auto* copy = object->ft->clone(object, &this->st);
    EXPECT_EQ(this->rc(), CMPI_RC_OK);
    ASSERT_NE(copy, nullptr);
    EXPECT_NE(copy, object);
    object->ft->release(object);
    EXPECT_EQ(TypeParam::use(copy), CMPI_RC_OK);
    this->nextCall();
    EXPECT_EQ(TypeParam::use(copy), CMPI_RC_OK);
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
}

TYPED_TEST(LifetimeTest, A_clone_of_a_clone_is_independent) {
    auto* object = this->make();
    auto* copy = object->ft->clone(object, nullptr);
    auto* second = copy->ft->clone(copy, nullptr);
    copy->ft->release(copy);
    EXPECT_EQ(TypeParam::use(second), CMPI_RC_OK);
    second->ft->release(second);
}

TYPED_TEST(LifetimeTest, The_broker_names_the_type) {
    auto* object = this->make();
    const CMPIString* name = this->mb()->eft->getType(this->mb(), object, &this->st);
    EXPECT_EQ(this->rc(), CMPI_RC_OK);
    EXPECT_TRUE(this->mb()->eft->isOfType(this->mb(), object, text(name).c_str(), &this->st));
    EXPECT_EQ(this->rc(), CMPI_RC_OK);
    EXPECT_FALSE(this->mb()->eft->isOfType(this->mb(), object, "CMPIPredicate", &this->st));
    EXPECT_EQ(this->rc(), CMPI_RC_OK);
    EXPECT_NE(this->mb()->eft->toString(this->mb(), object, &this->st), nullptr);
    EXPECT_EQ(this->rc(), CMPI_RC_OK);
    object->ft->release(object);
    EXPECT_EQ(this->mb()->eft->getType(this->mb(), object, &this->st), nullptr);
    EXPECT_EQ(this->rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(this->mb()->eft->toString(this->mb(), object, &this->st), nullptr);
    EXPECT_EQ(this->rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

} // namespace
} // namespace qelo::broker::testing
