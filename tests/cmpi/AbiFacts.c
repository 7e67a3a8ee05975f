/* The C11 view of the CMPI headers. */

#include "cmpi/Abi.h"

#include <cmpi/cmpift.h>
#include <cmpidt.h>

#include <stdalign.h>

#define HAS_TYPE(expression, ...) _Generic((expression), __VA_ARGS__ : 1ULL, default : 0ULL)

static const AbiFact facts[] = {
#define SIZE(type, size, alignment)                                                                \
    {"size of " #type, size, sizeof(type)}, {"alignment of " #type, alignment, alignof(type)},
#define MEMBER(type, offset, member, memberType)                                                   \
    {"offset of " #type "." #member, offset, offsetof(type, member)},                              \
        {"type of " #type "." #member, 1, HAS_TYPE(((type*)NULL)->member, memberType)},
#include "cmpi/AbiSizes.inc"
#define SCALAR(name, type) {"type behind " #name, 1, HAS_TYPE((name)0, type)},
#include "cmpi/AbiScalars.inc"
#define DATA(table, offset, member, memberType) MEMBER(table, offset, member, memberType)
#define SLOT(table, offset, member, result, arguments)                                             \
    MEMBER(table, offset, member, result(*) arguments)
#include "cmpi/AbiSlots.inc"
#define CONSTANT(name, value) {#name, value, (unsigned long long)(name)},
#include "cmpi/AbiConstants.inc"
};

AbiFacts abiFactsOfC(void) {
    const AbiFacts result = {facts, sizeof facts / sizeof facts[0]};
    return result;
}
