#include "AssociationShape.h"

#include <cstring>
#include <strings.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

constexpr TraceSite nameSite(int line = __builtin_LINE()) {
    return {"get_assoc_targetClass_Name", line};
}

constexpr TraceSite pathSite(int line = __builtin_LINE()) {
    return {"get_assoc_targetClass_ObjectPath", line};
}

std::string callParameters(const CMPIBroker* _broker, const CMPIObjectPath* ref,
                           const char* _RefLeftClass, const char* _RefRightClass, CMPIStatus* rc) {
    return parameters(" _broker=", _broker, " ref=", ref, " _RefLeftClass=", _RefLeftClass,
                      " _RefRightClass=", _RefRightClass, " rc=", rc);
}

// Classes of sources are compared exactly, the association class as the filter it is.
const char* otherEnd(const AssociationShape& shape, const char* source, const char* association) {
    if (association == nullptr || ::strcasecmp(association, shape.className) != 0) {
        return "";
    }
    if (std::strcmp(source, shape.nearClass) == 0) {
        return shape.farClass;
    }
    return std::strcmp(source, shape.farClass) == 0 ? shape.nearClass : "";
}

} // namespace

const char* associationTargetName(const UnitTrace& unit, const AssociationShape& shape,
                                  const CMPIBroker* _broker, const CMPIObjectPath* ref,
                                  const char* _RefLeftClass, const char* _RefRightClass,
                                  CMPIStatus* rc) {
    const CallTrace call(unit, callParameters(_broker, ref, _RefLeftClass, _RefRightClass, rc),
                         nameSite());
    const char* target = otherEnd(shape, classNameOf(ref, rc), _RefLeftClass);
    const std::string text = std::string("Target Class is ") + (*target != '\0' ? target : "empty");
    unit.message(text.c_str(), TraceLevel::detail, nameSite());
    return call.leave(target, nameSite());
}

CMPIObjectPath* associationTargetPath(const UnitTrace& unit, const AssociationShape& shape,
                                      const CMPIBroker* _broker, const CMPIObjectPath* ref,
                                      const char* _RefLeftClass, const char* _RefRightClass,
                                      CMPIStatus* rc) {
    const CallTrace call(unit, callParameters(_broker, ref, _RefLeftClass, _RefRightClass, rc),
                         pathSite());
    const char* targetName =
        associationTargetName(unit, shape, _broker, ref, _RefLeftClass, _RefRightClass, rc);
    unit.variable("targetName", targetName, pathSite());
    return call.leave(newPath(_broker, ref, targetName, nullptr, rc), pathSite());
}

bool admitsResultClass(const char* resultClass, const char* className, const char* parent) {
    if (parent == nullptr || resultClass == nullptr || *resultClass == '\0') {
        return true;
    }
    return ::strcasecmp(resultClass, className) == 0 || ::strcasecmp(resultClass, parent) == 0;
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
