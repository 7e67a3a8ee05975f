// The convenience layer: every CM... and CB... reaches its slot with the arguments it was
// given, and passes the slot's result on.

#include <cmpi/cmpimacs.h>

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstring>
#include <string>
#include <tuple>
#include <type_traits>
#include <vector>

namespace {

// Everything that a call carried, in a form that can be compared.
using Words = std::vector<std::uint64_t>;

template <typename T> void append(Words& words, T value) {
    if constexpr (std::is_pointer_v<T>) {
        words.push_back(reinterpret_cast<std::uintptr_t>(value));
    } else if constexpr (std::is_same_v<T, CMPIStatus>) {
        words.insert(words.end(),
                     {std::uint64_t{value.rc}, reinterpret_cast<std::uintptr_t>(value.msg)});
    } else if constexpr (std::is_same_v<T, CMPIData>) {
        words.insert(words.end(), {value.type, value.state, value.value.uint64});
    } else {
        words.push_back(static_cast<std::uint64_t>(value));
    }
}

// A value that no other call of sample() returns, within the range of T.
std::uintptr_t nextSample = 1;
template <typename T> T sample() {
    ++nextSample;
    if constexpr (std::is_pointer_v<T>) {
        static std::array<char, 4096> addresses;
        return reinterpret_cast<T>(addresses.data() + nextSample % addresses.size());
    } else if constexpr (std::is_same_v<T, CMPIStatus>) {
        return {CMPI_RC_ERR_NOT_FOUND, sample<CMPIString*>()};
    } else if constexpr (std::is_same_v<T, CMPIData>) {
        CMPIData data = {CMPI_uint64, CMPI_keyValue, {0}};
        data.value.uint64 = nextSample;
        return data;
    } else if constexpr (std::is_enum_v<T>) {
        // The smallest enumeration has values of up to 3.
        return static_cast<T>(1 + nextSample % 3);
    } else {
        return static_cast<T>(nextSample % 200 + 1);
    }
}

Words received;
Words answered;

// Stands in for a slot: keeps its arguments and returns something recognisable.
template <typename Slot> struct Fake;
template <typename Result, typename... Args> struct Fake<Result (*)(Args...)> {
    static Result slot(Args... args) {
        received.clear();
        (append(received, args), ...);
        const Result result = sample<Result>();
        answered.clear();
        append(answered, result);
        return result;
    }
};

// An object, or a broker, whose table has only that slot.
template <auto Slot> struct Target;
template <typename Table, typename Member, Member Table::*Slot> struct Target<Slot> {
    using Function = Member;
    Target() {
        table.*Slot = Fake<Member>::slot;
        broker.bft = reinterpret_cast<const CMPIBrokerFT*>(&table);
        broker.eft = reinterpret_cast<const CMPIBrokerEncFT*>(&table);
    }
    template <typename Object> const Object* as() {
        if constexpr (std::is_same_v<Object, CMPIBroker>) {
            return &broker;
        } else {
            static Object object;
            object.hdl = &table;
            object.ft = &table;
            return &object;
        }
    }
    Table table = {};
    CMPIBroker broker = {};
};

// Calls wrapper on such an object with distinct arguments; the slot must have got them.
template <auto Slot, typename Result, typename Object, typename... Args>
void expectForwarding(const char* name, Result (*wrapper)(const Object*, Args...)) {
    Target<Slot> target;
    const Object* const object = target.template as<Object>();
    const std::tuple<Args...> arguments = {sample<Args>()...};
    Words given;
    append(given, object);
    std::apply([&](auto... args) { (append(given, args), ...); }, arguments);

    received.clear();
    const Result result =
        std::apply([&](auto... args) { return wrapper(object, args...); }, arguments);
    Words returned;
    append(returned, result);
    EXPECT_EQ(received, given) << name;
    EXPECT_EQ(returned, answered) << name;
}

#define FORWARDS(type, slot, wrapper) expectForwarding<&CMPI##type##FT::slot>(#wrapper, wrapper);

TEST(CmpiForwarding, Each_call_on_an_object_reaches_its_slot){
#define SECTION_OBJECTS
#include "cmpi/Wrappers.inc"
#undef SECTION_OBJECTS
}

TEST(CmpiForwarding, Each_call_on_the_broker_reaches_its_slot){
#define SECTION_BROKER
#include "cmpi/Wrappers.inc"
#undef SECTION_BROKER
}

TEST(CmpiForwarding, CMGetCharPtr_goes_through_the_slot_without_a_status) {
    Target<&CMPIStringFT::getCharPtr> target;
    const CMPIString* const string = target.as<CMPIString>();
    const char* const text = CMGetCharPtr(string);
    EXPECT_EQ(received, (Words{reinterpret_cast<std::uintptr_t>(string), 0}));
    EXPECT_EQ(answered, (Words{reinterpret_cast<std::uintptr_t>(text)}));
}

TEST(CmpiForwarding, CMRelease_and_CMClone_work_on_any_object) {
    Target<&CMPIInstanceFT::clone> cloning;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIInstance* const instance = cloning.as<CMPIInstance>();
    const CMPIInstance* const clone = CMClone(instance, &status);
    EXPECT_EQ(received, (Words{reinterpret_cast<std::uintptr_t>(instance),
                               reinterpret_cast<std::uintptr_t>(&status)}));
    EXPECT_EQ(answered, (Words{reinterpret_cast<std::uintptr_t>(clone)}));

    Target<&CMPIArgsFT::release> releasing;
    CMPIArgs args = *releasing.as<CMPIArgs>();
    EXPECT_EQ(CMRelease(&args).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(received, (Words{reinterpret_cast<std::uintptr_t>(&args)}));
}

TEST(CmpiForwarding, Arguments_are_evaluated_once) {
    Target<&CMPIObjectPathFT::setNameSpace> target;
    int evaluations = 0;
    const auto path = [&] {
        ++evaluations;
        return target.as<CMPIObjectPath>();
    };
    CMSetNameSpace(path(), "root/cimv2");
    EXPECT_EQ(evaluations, 1);
}

TEST(CmpiForwarding, The_brokers_data_members_are_read) {
    CMPIBrokerFT table = {};
    table.brokerCapabilities = CMPI_MB_BasicRead | CMPI_MB_OSEncapsulationSupport;
    table.brokerVersion = 200;
    table.brokerName = "name";
    CMPIBroker broker = {};
    broker.bft = &table;
    EXPECT_EQ(CBGetCapabilities(&broker), 0x101u);
    EXPECT_EQ(CBGetBrokerCapabilities(&broker), 0x101u);
    EXPECT_EQ(CBBrokerVersion(&broker), 200);
    EXPECT_STREQ(CBBrokerName(&broker), "name");
}

// What a call with a value passed on.
struct Passed {
    std::string text;
    CMPIUint32 number = 0;
    CMPIType type = 0;
} passed;

CMPIStatus takeValue(const CMPIInstance*, const char*, const CMPIValue* value, CMPIType type) {
    passed = Passed();
    passed.type = type;
    if (type == CMPI_chars) {
        passed.text = reinterpret_cast<const char*>(value);
    } else {
        std::memcpy(&passed.number, static_cast<const void*>(value), sizeof passed.number);
    }
    return {CMPI_RC_OK, nullptr};
}

TEST(CmpiForwarding, Values_go_in_without_a_cast) {
    CMPIInstanceFT table = {};
    table.setProperty = takeValue;
    CMPIInstance instance = {&table, &table};
    const std::string text = "text";
    const CMPIUint32 number = 5;
    CMPIValue value = {7};

    CMSetProperty(&instance, "A", "literal", CMPI_chars);
    EXPECT_EQ(passed.text, "literal");
    CMSetProperty(&instance, "A", text.c_str(), CMPI_chars);
    EXPECT_EQ(passed.text, "text");
    CMSetProperty(&instance, "A", &number, CMPI_uint32);
    EXPECT_EQ(passed.number, 5u);
    CMSetProperty(&instance, "A", &value, CMPI_uint32);
    EXPECT_EQ(passed.number, 7u);
    CMSetProperty(&instance, "A", (CMPIValue*)"cast", CMPI_chars);
    EXPECT_EQ(passed.text, "cast");
}

} // namespace
