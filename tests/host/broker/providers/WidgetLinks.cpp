// Associations between widgets. TEST_Pair joins "one" (role First) with "two" (role Second).
// TEST_Chain does not support references and ignores every filter.
#include "Widgets.h"

namespace {

using namespace widgets;

std::string nameSpaceOf(const CMPIObjectPath* op) { return textOf(CMGetNameSpace(op, nullptr)); }

// The widget at the other end, or "".
std::string partnerOf(const CMPIObjectPath* op) {
    const std::string name = textOf(CMGetKey(op, "Name", nullptr));
    return name == "one" ? "two" : name == "two" ? "one" : "";
}

bool isPair(const char* assocClass) { return assocClass && std::string(assocClass) == "TEST_Pair"; }

CMPIInstance* makePair(const CMPIObjectPath* op, const char** properties) {
    const std::string nameSpace = nameSpaceOf(op);
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace.c_str(), "TEST_Pair", nullptr);
    CMPIInstance* pair = CMNewInstance(broker, path, nullptr);
    CMSetPropertyFilter(pair, properties, nullptr);
    CMPIValue first = {};
    first.ref = makePath(nameSpace, "TEST_Widget", "one");
    CMPIValue second = {};
    second.ref = makePath(nameSpace, "TEST_Widget", "two");
    CMSetProperty(pair, "First", &first, CMPI_ref);
    CMSetProperty(pair, "Second", &second, CMPI_ref);
    CMSetProperty(pair, "Note", "a pair", CMPI_chars);
    return pair;
}

CMPIStatus cleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) { CMReturn(CMPI_RC_OK); }

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* rslt,
                       const CMPIObjectPath* op, const char* assocClass, const char*, const char*,
                       const char*, const char** properties) {
    const std::string partner = partnerOf(op);
    if (isPair(assocClass) && !partner.empty()) {
        CMReturnInstance(
            rslt, makeInstance(nameSpaceOf(op), "TEST_Widget", partner, {"linked", 1}, properties));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* rslt,
                           const CMPIObjectPath* op, const char* assocClass, const char*,
                           const char*, const char*) {
    const std::string partner = partnerOf(op);
    if (isPair(assocClass) && !partner.empty()) {
        CMReturnObjectPath(rslt, makePath(nameSpaceOf(op), "TEST_Widget", partner));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* rslt,
                      const CMPIObjectPath* op, const char* resultClass, const char*,
                      const char** properties) {
    if (isPair(resultClass) && !partnerOf(op).empty()) {
        CMReturnInstance(rslt, makePair(op, properties));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* rslt,
                          const CMPIObjectPath* op, const char* resultClass, const char*) {
    if (isPair(resultClass) && !partnerOf(op).empty()) {
        CMReturnObjectPath(rslt, CMGetObjectPath(makePair(op, nullptr), nullptr));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

const CMPIAssociationMIFT pairTable = {
    CMPIVersion200, 1, "Pair", cleanup, associators, associatorNames, references, referenceNames};

CMPIStatus chainAssociators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* rslt,
                            const CMPIObjectPath* op, const char*, const char*, const char*,
                            const char*, const char** properties) {
    CMReturnInstance(
        rslt, makeInstance(nameSpaceOf(op), "TEST_Gadget", "gadget", {"chained", 1}, properties));
    CMReturn(CMPI_RC_OK);
}

const CMPIAssociationMIFT chainTable = {CMPIVersion200,   1,       "Chain", cleanup,
                                        chainAssociators, nullptr, nullptr, nullptr};

} // namespace

CMPI_EXTERN_C CMPIAssociationMI* Pair_Create_AssociationMI(const CMPIBroker* mb, const CMPIContext*,
                                                           CMPIStatus*) {
    static CMPIAssociationMI mi = {nullptr, &pairTable};
    broker = mb;
    return &mi;
}

CMPI_EXTERN_C CMPIAssociationMI* Chain_Create_AssociationMI(const CMPIBroker* mb,
                                                            const CMPIContext*, CMPIStatus*) {
    static CMPIAssociationMI mi = {nullptr, &chainTable};
    broker = mb;
    return &mi;
}
