#include "ExitStatus.h"

namespace qelo::cli {

int exitStatusOf(unsigned int cimStatus) {
    return cimStatus >= 1 && cimStatus < ExitUsage ? static_cast<int>(cimStatus) : 1;
}

const char* cimStatusName(unsigned int cimStatus) {
    switch (cimStatus) {
    case 2:
        return "CIM_ERR_ACCESS_DENIED";
    case 3:
        return "CIM_ERR_INVALID_NAMESPACE";
    case 4:
        return "CIM_ERR_INVALID_PARAMETER";
    case 5:
        return "CIM_ERR_INVALID_CLASS";
    case 6:
        return "CIM_ERR_NOT_FOUND";
    case 7:
        return "CIM_ERR_NOT_SUPPORTED";
    case 8:
        return "CIM_ERR_CLASS_HAS_CHILDREN";
    case 9:
        return "CIM_ERR_CLASS_HAS_INSTANCES";
    case 10:
        return "CIM_ERR_INVALID_SUPERCLASS";
    case 11:
        return "CIM_ERR_ALREADY_EXISTS";
    case 12:
        return "CIM_ERR_NO_SUCH_PROPERTY";
    case 13:
        return "CIM_ERR_TYPE_MISMATCH";
    case 14:
        return "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED";
    case 15:
        return "CIM_ERR_INVALID_QUERY";
    case 16:
        return "CIM_ERR_METHOD_NOT_AVAILABLE";
    case 17:
        return "CIM_ERR_METHOD_NOT_FOUND";
    case 27:
        return "CIM_ERR_SERVER_LIMITS_EXCEEDED";
    case 28:
        return "CIM_ERR_SERVER_IS_SHUTTING_DOWN";
    case 29:
        return "CIM_ERR_QUERY_FEATURE_NOT_SUPPORTED";
    default:
        return "CIM_ERR_FAILED";
    }
}

} // namespace qelo::cli
