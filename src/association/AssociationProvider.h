// The operations of an association provider under the names of its class.
#pragma once

#include "AssociationTraversal.h"

#include "../frame/ProviderTables.h"

// `Prefix` is the prefix of the operations, `Association` the description. The including unit
// defines a file-static `broker` and its trace `unit`.
#define QELO_ASSOCIATION_OPERATIONS(Prefix, Association)                                           \
    CMPIStatus Prefix##_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* ctx,                 \
                                          const CMPIResult* rslt, const CMPIObjectPath* ref) {     \
        return enumAssociationNames<Association>(MarkerLines(unit),                                \
                                                 {broker, ctx, rslt, ref, nullptr});               \
    }                                                                                              \
    CMPIStatus Prefix##_EnumInstances(CMPIInstanceMI*, const CMPIContext* ctx,                     \
                                      const CMPIResult* rslt, const CMPIObjectPath* ref,           \
                                      const char** properties) {                                   \
        return enumAssociations<Association>(MarkerLines(unit),                                    \
                                             {broker, ctx, rslt, ref, properties});                \
    }                                                                                              \
    CMPIStatus Prefix##_GetInstance(CMPIInstanceMI*, const CMPIContext* ctx,                       \
                                    const CMPIResult* rslt, const CMPIObjectPath* cop,             \
                                    const char** properties) {                                     \
        return getAssociation<Association>(MarkerLines(unit),                                      \
                                           {broker, ctx, rslt, cop, properties});                  \
    }                                                                                              \
    CMPIStatus Prefix##_Associators(CMPIAssociationMI*, const CMPIContext* ctx,                    \
                                    const CMPIResult* rslt, const CMPIObjectPath* op,              \
                                    const char* assocClass, const char* resultClass, const char*,  \
                                    const char*, const char** properties) {                        \
        return associators<Association>(MarkerLines(unit), {broker, ctx, rslt, op, properties},    \
                                        assocClass, resultClass);                                  \
    }                                                                                              \
    CMPIStatus Prefix##_AssociatorNames(CMPIAssociationMI*, const CMPIContext* ctx,                \
                                        const CMPIResult* rslt, const CMPIObjectPath* op,          \
                                        const char* assocClass, const char* resultClass,           \
                                        const char*, const char*) {                                \
        return associatorNames<Association>(MarkerLines(unit), {broker, ctx, rslt, op, nullptr},   \
                                            assocClass, resultClass);                              \
    }                                                                                              \
    CMPIStatus Prefix##_References(                                                                \
        CMPIAssociationMI*, const CMPIContext* ctx, const CMPIResult* rslt,                        \
        const CMPIObjectPath* op, const char* resultClass, const char*, const char** properties) { \
        return references<Association>(MarkerLines(unit), {broker, ctx, rslt, op, properties},     \
                                       resultClass);                                               \
    }                                                                                              \
    CMPIStatus Prefix##_ReferenceNames(CMPIAssociationMI*, const CMPIContext* ctx,                 \
                                       const CMPIResult* rslt, const CMPIObjectPath* op,           \
                                       const char* resultClass, const char*) {                     \
        return referenceNames<Association>(MarkerLines(unit), {broker, ctx, rslt, op, nullptr},    \
                                           resultClass);                                           \
    }                                                                                              \
    QELO_READ_ONLY_OPERATIONS(Prefix)                                                              \
    QELO_ASSOCIATION_CLEANUP(Prefix)
