#include "platform/TeskCommon.h"

#include "common/CmpiRead.h"
#include "common/KeyValue.h"

#include <algorithm>

namespace Tesk {
namespace {

using namespace qelo::platform;

// Keys of associations refer to paths that seldom refer further. The limit ends the
// comparison of paths that refer to themselves.
constexpr int kDeepestReference = 8;

char lowered(char character) {
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a')
                                                : character;
}

bool equalIgnoringCase(std::string_view left, std::string_view right) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char l, char r) { return lowered(l) == lowered(r); });
}

bool sameClass(const CMPIObjectPath* wanted, const CMPIObjectPath* path) {
    const auto wantedClass = classNameOf(wanted);
    const auto pathClass = classNameOf(path);
    return wantedClass && pathClass && equalIgnoringCase(*wantedClass, *pathClass);
}

bool samePaths(const CMPIObjectPath* wanted, const CMPIObjectPath* path, bool strict, int depth);

bool sameKey(const Key& wanted, const CMPIObjectPath* path, bool strict, int depth) {
    const auto found = keyNamed(path, wanted.name);
    if (!found) {
        return false;
    }
    const auto plain = equalPlainValues(wanted.data, *found);
    return plain ? *plain : samePaths(wanted.data.value.ref, found->value.ref, strict, depth + 1);
}

bool sameKeys(const CMPIObjectPath* wanted, CMPICount count, const CMPIObjectPath* path,
              bool strict, int depth) {
    for (CMPICount position = 0; position < count; ++position) {
        const auto key = keyAt(wanted, position);
        if (!key || !sameKey(*key, path, strict, depth)) {
            return false;
        }
    }
    return true;
}

bool samePaths(const CMPIObjectPath* wanted, const CMPIObjectPath* path, bool strict, int depth) {
    if (depth > kDeepestReference || !sameClass(wanted, path)) {
        return false;
    }
    const auto count = keyCountOf(wanted);
    if (!count || (strict && keyCountOf(path) != count)) {
        return false;
    }
    return sameKeys(wanted, *count, path, strict, depth);
}

} // namespace

bool isObjPathsEqual(const CMPIObjectPath* wanted, const CMPIObjectPath* path, bool strict) {
    return samePaths(wanted, path, strict, 0);
}

} // namespace Tesk
