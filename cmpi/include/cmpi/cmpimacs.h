/*
 * CMPI 2.0: convenience layer.
 *
 * CM... and CB... read as plain calls and go to the slot of the same name: arguments in
 * the slot's order, its result and status passed through. An object must be alive; ask
 * CMIsNullObject first where it may not be.
 *
 * All are inline functions, so each argument is evaluated once, except where a comment
 * says macro. A value goes in as const void*: a text, the address of a variable or of a
 * CMPIValue all fit without a cast.
 */
#ifndef _CMPIMACS_H_
#define _CMPIMACS_H_

#include "cmpift.h"

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Any object ------------------------------------------------------------------------ */

/* Ends a clone. Macro: obj is evaluated twice. */
#define CMRelease(obj) ((obj)->ft->release((obj)))

/* An independent copy, which the caller must release. Macro: obj is evaluated twice. */
#define CMClone(obj, st) ((obj)->ft->clone((obj), (st)))

/* Whether obj is NULL or without a handle, as a failed factory may leave it. */
static inline CMPIBoolean CMIsNullObject(const void* obj) {
    return (CMPIBoolean)(obj == NULL || *(const void* const*)obj == NULL);
}

/* Tests of a CMPIData. */
static inline CMPIBoolean CMIsNullValue(const CMPIData data) {
    return (CMPIBoolean)((data.state & CMPI_nullValue) != 0);
}
static inline CMPIBoolean CMIsKeyValue(const CMPIData data) {
    return (CMPIBoolean)((data.state & CMPI_keyValue) != 0);
}
static inline CMPIBoolean CMIsArray(const CMPIData data) {
    return (CMPIBoolean)((data.type & CMPI_ARRAY) != 0);
}

/* ---- Status ------------------------------------------------------------------------------
   A NULL status pointer, broker or text is accepted everywhere here; without a broker or a
   text there is no message. */

/* What the macros below are made of; not for use elsewhere. */
static inline CMPIStatus cmpiStatusWithString_(CMPIrc rc, CMPIString* string) {
    CMPIStatus status;
    status.rc = rc;
    status.msg = string;
    return status;
}
static inline CMPIStatus cmpiStatusWithChars_(const CMPIBroker* mb, CMPIrc rc, const char* text) {
    return cmpiStatusWithString_(rc, mb != NULL && text != NULL ? mb->eft->newString(mb, text, NULL)
                                                                : NULL);
}

/* Macros: leave the enclosing function with that status. */
#define CMReturn(rc) return cmpiStatusWithString_((rc), NULL)
#define CMReturnWithString(rc, string) return cmpiStatusWithString_((rc), (string))
#define CMReturnWithChars(mb, rc, text) return cmpiStatusWithChars_((mb), (rc), (text))

static inline void CMSetStatusWithString(CMPIStatus* st, CMPIrc rc, CMPIString* string) {
    if (st != NULL)
        *st = cmpiStatusWithString_(rc, string);
}
static inline void CMSetStatus(CMPIStatus* st, CMPIrc rc) { CMSetStatusWithString(st, rc, NULL); }
static inline void CMSetStatusWithChars(const CMPIBroker* mb, CMPIStatus* st, CMPIrc rc,
                                        const char* text) {
    if (st != NULL)
        *st = cmpiStatusWithChars_(mb, rc, text);
}

/* ---- Context ---------------------------------------------------------------------------- */

static inline CMPIData CMGetContextEntry(const CMPIContext* ctx, const char* name, CMPIStatus* st) {
    return ctx->ft->getEntry(ctx, name, st);
}
static inline CMPIData CMGetContextEntryAt(const CMPIContext* ctx, CMPICount index,
                                           CMPIString** name, CMPIStatus* st) {
    return ctx->ft->getEntryAt(ctx, index, name, st);
}
static inline CMPICount CMGetContextEntryCount(const CMPIContext* ctx, CMPIStatus* st) {
    return ctx->ft->getEntryCount(ctx, st);
}
static inline CMPIStatus CMAddContextEntry(const CMPIContext* ctx, const char* name,
                                           const void* value, CMPIType type) {
    return ctx->ft->addEntry(ctx, name, (const CMPIValue*)value, type);
}

/* ---- Result ----------------------------------------------------------------------------- */

static inline CMPIStatus CMReturnData(const CMPIResult* rslt, const void* value, CMPIType type) {
    return rslt->ft->returnData(rslt, (const CMPIValue*)value, type);
}
static inline CMPIStatus CMReturnInstance(const CMPIResult* rslt, const CMPIInstance* inst) {
    return rslt->ft->returnInstance(rslt, inst);
}
static inline CMPIStatus CMReturnObjectPath(const CMPIResult* rslt, const CMPIObjectPath* op) {
    return rslt->ft->returnObjectPath(rslt, op);
}
static inline CMPIStatus CMReturnDone(const CMPIResult* rslt) { return rslt->ft->returnDone(rslt); }
static inline CMPIStatus CMReturnError(const CMPIResult* rslt, const CMPIError* error) {
    return rslt->ft->returnError(rslt, error);
}

/* ---- String ----------------------------------------------------------------------------- */

static inline const char* CMGetCharsPtr(const CMPIString* string, CMPIStatus* st) {
    return string->ft->getCharPtr(string, st);
}

/* As CMGetCharsPtr, for callers that want no status. */
static inline const char* CMGetCharPtr(const CMPIString* string) {
    return string->ft->getCharPtr(string, NULL);
}

/* ---- Array ------------------------------------------------------------------------------ */

static inline CMPICount CMGetArrayCount(const CMPIArray* array, CMPIStatus* st) {
    return array->ft->getSize(array, st);
}
static inline CMPIType CMGetArrayType(const CMPIArray* array, CMPIStatus* st) {
    return array->ft->getSimpleType(array, st);
}
static inline CMPIData CMGetArrayElementAt(const CMPIArray* array, CMPICount index,
                                           CMPIStatus* st) {
    return array->ft->getElementAt(array, index, st);
}
static inline CMPIStatus CMSetArrayElementAt(const CMPIArray* array, CMPICount index,
                                             const void* value, CMPIType type) {
    return array->ft->setElementAt(array, index, (const CMPIValue*)value, type);
}

/* ---- Enumeration ------------------------------------------------------------------------ */

static inline CMPIData CMGetNext(const CMPIEnumeration* en, CMPIStatus* st) {
    return en->ft->getNext(en, st);
}
static inline CMPIBoolean CMHasNext(const CMPIEnumeration* en, CMPIStatus* st) {
    return en->ft->hasNext(en, st);
}
static inline CMPIArray* CMToArray(const CMPIEnumeration* en, CMPIStatus* st) {
    return en->ft->toArray(en, st);
}

/* ---- Instance --------------------------------------------------------------------------- */

static inline CMPIData CMGetProperty(const CMPIInstance* inst, const char* name, CMPIStatus* st) {
    return inst->ft->getProperty(inst, name, st);
}
static inline CMPIData CMGetPropertyAt(const CMPIInstance* inst, CMPICount index, CMPIString** name,
                                       CMPIStatus* st) {
    return inst->ft->getPropertyAt(inst, index, name, st);
}
static inline CMPICount CMGetPropertyCount(const CMPIInstance* inst, CMPIStatus* st) {
    return inst->ft->getPropertyCount(inst, st);
}
static inline CMPIStatus CMSetProperty(const CMPIInstance* inst, const char* name,
                                       const void* value, CMPIType type) {
    return inst->ft->setProperty(inst, name, (const CMPIValue*)value, type);
}
static inline CMPIObjectPath* CMGetObjectPath(const CMPIInstance* inst, CMPIStatus* st) {
    return inst->ft->getObjectPath(inst, st);
}
static inline CMPIStatus CMSetPropertyFilter(const CMPIInstance* inst, const char** properties,
                                             const char** keys) {
    return inst->ft->setPropertyFilter(inst, properties, keys);
}
static inline CMPIStatus CMSetObjectPath(const CMPIInstance* inst, const CMPIObjectPath* op) {
    return inst->ft->setObjectPath(inst, op);
}
static inline CMPIStatus CMSetPropertyWithOrigin(const CMPIInstance* inst, const char* name,
                                                 const void* value, CMPIType type,
                                                 const char* origin) {
    return inst->ft->setPropertyWithOrigin(inst, name, (const CMPIValue*)value, type, origin);
}

/* ---- Object path ------------------------------------------------------------------------ */

static inline CMPIStatus CMSetNameSpace(const CMPIObjectPath* op, const char* ns) {
    return op->ft->setNameSpace(op, ns);
}
static inline CMPIString* CMGetNameSpace(const CMPIObjectPath* op, CMPIStatus* st) {
    return op->ft->getNameSpace(op, st);
}
static inline CMPIStatus CMSetHostname(const CMPIObjectPath* op, const char* hostname) {
    return op->ft->setHostname(op, hostname);
}
static inline CMPIString* CMGetHostname(const CMPIObjectPath* op, CMPIStatus* st) {
    return op->ft->getHostname(op, st);
}
static inline CMPIStatus CMSetClassName(const CMPIObjectPath* op, const char* className) {
    return op->ft->setClassName(op, className);
}
static inline CMPIString* CMGetClassName(const CMPIObjectPath* op, CMPIStatus* st) {
    return op->ft->getClassName(op, st);
}
static inline CMPIStatus CMAddKey(const CMPIObjectPath* op, const char* name, const void* value,
                                  CMPIType type) {
    return op->ft->addKey(op, name, (const CMPIValue*)value, type);
}
static inline CMPIData CMGetKey(const CMPIObjectPath* op, const char* name, CMPIStatus* st) {
    return op->ft->getKey(op, name, st);
}
static inline CMPIData CMGetKeyAt(const CMPIObjectPath* op, CMPICount index, CMPIString** name,
                                  CMPIStatus* st) {
    return op->ft->getKeyAt(op, index, name, st);
}
static inline CMPICount CMGetKeyCount(const CMPIObjectPath* op, CMPIStatus* st) {
    return op->ft->getKeyCount(op, st);
}
static inline CMPIStatus CMSetNameSpaceFromObjectPath(const CMPIObjectPath* op,
                                                      const CMPIObjectPath* src) {
    return op->ft->setNameSpaceFromObjectPath(op, src);
}
static inline CMPIStatus CMSetHostAndNameSpaceFromObjectPath(const CMPIObjectPath* op,
                                                             const CMPIObjectPath* src) {
    return op->ft->setHostAndNameSpaceFromObjectPath(op, src);
}
static inline CMPIData CMGetClassQualifier(const CMPIObjectPath* op, const char* qualifier,
                                           CMPIStatus* st) {
    return op->ft->getClassQualifier(op, qualifier, st);
}
static inline CMPIData CMGetPropertyQualifier(const CMPIObjectPath* op, const char* property,
                                              const char* qualifier, CMPIStatus* st) {
    return op->ft->getPropertyQualifier(op, property, qualifier, st);
}
static inline CMPIData CMGetMethodQualifier(const CMPIObjectPath* op, const char* method,
                                            const char* qualifier, CMPIStatus* st) {
    return op->ft->getMethodQualifier(op, method, qualifier, st);
}
static inline CMPIData CMGetParameterQualifier(const CMPIObjectPath* op, const char* method,
                                               const char* parameter, const char* qualifier,
                                               CMPIStatus* st) {
    return op->ft->getParameterQualifier(op, method, parameter, qualifier, st);
}
static inline CMPIString* CMObjectPathToString(const CMPIObjectPath* op, CMPIStatus* st) {
    return op->ft->toString(op, st);
}

/* ---- Arguments -------------------------------------------------------------------------- */

static inline CMPIStatus CMAddArg(const CMPIArgs* args, const char* name, const void* value,
                                  CMPIType type) {
    return args->ft->addArg(args, name, (const CMPIValue*)value, type);
}
static inline CMPIData CMGetArg(const CMPIArgs* args, const char* name, CMPIStatus* st) {
    return args->ft->getArg(args, name, st);
}
static inline CMPIData CMGetArgAt(const CMPIArgs* args, CMPICount index, CMPIString** name,
                                  CMPIStatus* st) {
    return args->ft->getArgAt(args, index, name, st);
}
static inline CMPICount CMGetArgCount(const CMPIArgs* args, CMPIStatus* st) {
    return args->ft->getArgCount(args, st);
}

/* ---- Date and time ---------------------------------------------------------------------- */

static inline CMPIUint64 CMGetBinaryFormat(const CMPIDateTime* dt, CMPIStatus* st) {
    return dt->ft->getBinaryFormat(dt, st);
}
static inline CMPIString* CMGetStringFormat(const CMPIDateTime* dt, CMPIStatus* st) {
    return dt->ft->getStringFormat(dt, st);
}
static inline CMPIBoolean CMIsInterval(const CMPIDateTime* dt, CMPIStatus* st) {
    return dt->ft->isInterval(dt, st);
}

/* ---- Queries ---------------------------------------------------------------------------- */

static inline CMPIBoolean CMEvaluateSelExp(const CMPISelectExp* se, const CMPIInstance* inst,
                                           CMPIStatus* st) {
    return se->ft->evaluate(se, inst, st);
}
static inline CMPIString* CMGetSelExpString(const CMPISelectExp* se, CMPIStatus* st) {
    return se->ft->getString(se, st);
}
static inline CMPISelectCond* CMGetDoc(const CMPISelectExp* se, CMPIStatus* st) {
    return se->ft->getDOC(se, st);
}
static inline CMPISelectCond* CMGetCod(const CMPISelectExp* se, CMPIStatus* st) {
    return se->ft->getCOD(se, st);
}
static inline CMPIBoolean CMEvaluateSelExpUsingAccessor(const CMPISelectExp* se,
                                                        CMPIAccessor* accessor, void* parm,
                                                        CMPIStatus* st) {
    return se->ft->evaluateUsingAccessor(se, accessor, parm, st);
}
static inline CMPICount CMGetSubCondCountAndType(const CMPISelectCond* sc, int* type,
                                                 CMPIStatus* st) {
    return sc->ft->getCountAndType(sc, type, st);
}
static inline CMPISubCond* CMGetSubCondAt(const CMPISelectCond* sc, CMPICount index,
                                          CMPIStatus* st) {
    return sc->ft->getSubCondAt(sc, index, st);
}
static inline CMPICount CMGetPredicateCount(const CMPISubCond* sc, CMPIStatus* st) {
    return sc->ft->getCount(sc, st);
}
static inline CMPIPredicate* CMGetPredicateAt(const CMPISubCond* sc, CMPICount index,
                                              CMPIStatus* st) {
    return sc->ft->getPredicateAt(sc, index, st);
}
static inline CMPIPredicate* CMGetPredicate(const CMPISubCond* sc, const char* name,
                                            CMPIStatus* st) {
    return sc->ft->getPredicate(sc, name, st);
}
static inline CMPIStatus CMGetPredicateData(const CMPIPredicate* pr, CMPIType* type, CMPIPredOp* op,
                                            CMPIString** lhs, CMPIString** rhs) {
    return pr->ft->getData(pr, type, op, lhs, rhs);
}
static inline CMPIBoolean CMEvaluatePredicateUsingAccessor(const CMPIPredicate* pr,
                                                           CMPIAccessor* accessor, void* parm,
                                                           CMPIStatus* st) {
    return pr->ft->evaluateUsingAccessor(pr, accessor, parm, st);
}

/* ---- Error ------------------------------------------------------------------------------ */

static inline CMPIErrorType CMGetErrorType(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getErrorType(er, st);
}
static inline CMPIString* CMGetOtherErrorType(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getOtherErrorType(er, st);
}
static inline CMPIString* CMGetOwningEntity(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getOwningEntity(er, st);
}
static inline CMPIString* CMGetMessageID(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getMessageID(er, st);
}
static inline CMPIErrorSeverity CMGetPerceivedSeverity(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getPerceivedSeverity(er, st);
}
static inline CMPIErrorProbableCause CMGetProbableCause(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getProbableCause(er, st);
}
static inline CMPIString* CMGetProbableCauseDescription(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getProbableCauseDescription(er, st);
}
static inline CMPIArray* CMGetRecommendedActions(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getRecommendedActions(er, st);
}
static inline CMPIString* CMGetErrorSource(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getErrorSource(er, st);
}
static inline CMPIErrorSrcFormat CMGetErrorSourceFormat(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getErrorSourceFormat(er, st);
}
static inline CMPIString* CMGetOtherErrorSourceFormat(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getOtherErrorSourceFormat(er, st);
}
static inline CMPIrc CMGetCIMStatusCode(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getCIMStatusCode(er, st);
}
static inline CMPIString* CMGetCIMStatusCodeDescription(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getCIMStatusCodeDescription(er, st);
}
static inline CMPIArray* CMGetMessageArguments(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getMessageArguments(er, st);
}
static inline CMPIString* CMGetErrorMessage(const CMPIError* er, CMPIStatus* st) {
    return er->ft->getMessage(er, st);
}
static inline CMPIStatus CMSetErrorType(const CMPIError* er, const CMPIErrorType type) {
    return er->ft->setErrorType(er, type);
}
static inline CMPIStatus CMSetOtherErrorType(const CMPIError* er, const char* text) {
    return er->ft->setOtherErrorType(er, text);
}
static inline CMPIStatus CMSetProbableCauseDescription(const CMPIError* er, const char* text) {
    return er->ft->setProbableCauseDescription(er, text);
}
static inline CMPIStatus CMSetRecommendedActions(const CMPIError* er, const CMPIArray* actions) {
    return er->ft->setRecommendedActions(er, actions);
}
static inline CMPIStatus CMSetErrorSource(const CMPIError* er, const char* text) {
    return er->ft->setErrorSource(er, text);
}
static inline CMPIStatus CMSetErrorSourceFormat(const CMPIError* er,
                                                const CMPIErrorSrcFormat format) {
    return er->ft->setErrorSourceFormat(er, format);
}
static inline CMPIStatus CMSetOtherErrorSourceFormat(const CMPIError* er, const char* text) {
    return er->ft->setOtherErrorSourceFormat(er, text);
}
static inline CMPIStatus CMSetCIMStatusCodeDescription(const CMPIError* er, const char* text) {
    return er->ft->setCIMStatusCodeDescription(er, text);
}
static inline CMPIStatus CMSetMessageArguments(const CMPIError* er, const CMPIArray* arguments) {
    return er->ft->setMessageArguments(er, arguments);
}

/* ---- Broker: services of the object manager --------------------------------------------- */

static inline unsigned int CBGetCapabilities(const CMPIBroker* mb) {
    return mb->bft->brokerCapabilities;
}
static inline unsigned int CBGetBrokerCapabilities(const CMPIBroker* mb) {
    return mb->bft->brokerCapabilities;
}
static inline int CBBrokerVersion(const CMPIBroker* mb) { return mb->bft->brokerVersion; }
static inline const char* CBBrokerName(const CMPIBroker* mb) { return mb->bft->brokerName; }
static inline CMPIContext* CBPrepareAttachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return mb->bft->prepareAttachThread(mb, ctx);
}
static inline CMPIStatus CBAttachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return mb->bft->attachThread(mb, ctx);
}
static inline CMPIStatus CBDetachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return mb->bft->detachThread(mb, ctx);
}
static inline CMPIStatus CBDeliverIndication(const CMPIBroker* mb, const CMPIContext* ctx,
                                             const char* ns, const CMPIInstance* indication) {
    return mb->bft->deliverIndication(mb, ctx, ns, indication);
}
static inline CMPIEnumeration* CBEnumInstanceNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                                   const CMPIObjectPath* op, CMPIStatus* st) {
    return mb->bft->enumerateInstanceNames(mb, ctx, op, st);
}
static inline CMPIEnumeration* CBEnumInstances(const CMPIBroker* mb, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, const char** properties,
                                               CMPIStatus* st) {
    return mb->bft->enumerateInstances(mb, ctx, op, properties, st);
}
static inline CMPIInstance* CBGetInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                          const CMPIObjectPath* op, const char** properties,
                                          CMPIStatus* st) {
    return mb->bft->getInstance(mb, ctx, op, properties, st);
}
static inline CMPIObjectPath* CBCreateInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, const CMPIInstance* inst,
                                               CMPIStatus* st) {
    return mb->bft->createInstance(mb, ctx, op, inst, st);
}
static inline CMPIStatus CBModifyInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                          const CMPIObjectPath* op, const CMPIInstance* inst,
                                          const char** properties) {
    return mb->bft->modifyInstance(mb, ctx, op, inst, properties);
}
static inline CMPIStatus CBDeleteInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                          const CMPIObjectPath* op) {
    return mb->bft->deleteInstance(mb, ctx, op);
}
static inline CMPIEnumeration* CBExecQuery(const CMPIBroker* mb, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char* query,
                                           const char* lang, CMPIStatus* st) {
    return mb->bft->execQuery(mb, ctx, op, query, lang, st);
}
static inline CMPIEnumeration* CBAssociators(const CMPIBroker* mb, const CMPIContext* ctx,
                                             const CMPIObjectPath* op, const char* assocClass,
                                             const char* resultClass, const char* role,
                                             const char* resultRole, const char** properties,
                                             CMPIStatus* st) {
    return mb->bft->associators(mb, ctx, op, assocClass, resultClass, role, resultRole, properties,
                                st);
}
static inline CMPIEnumeration* CBAssociatorNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                                 const CMPIObjectPath* op, const char* assocClass,
                                                 const char* resultClass, const char* role,
                                                 const char* resultRole, CMPIStatus* st) {
    return mb->bft->associatorNames(mb, ctx, op, assocClass, resultClass, role, resultRole, st);
}
static inline CMPIEnumeration* CBReferences(const CMPIBroker* mb, const CMPIContext* ctx,
                                            const CMPIObjectPath* op, const char* resultClass,
                                            const char* role, const char** properties,
                                            CMPIStatus* st) {
    return mb->bft->references(mb, ctx, op, resultClass, role, properties, st);
}
static inline CMPIEnumeration* CBReferenceNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                                const CMPIObjectPath* op, const char* resultClass,
                                                const char* role, CMPIStatus* st) {
    return mb->bft->referenceNames(mb, ctx, op, resultClass, role, st);
}
static inline CMPIData CBInvokeMethod(const CMPIBroker* mb, const CMPIContext* ctx,
                                      const CMPIObjectPath* op, const char* method,
                                      const CMPIArgs* in, CMPIArgs* out, CMPIStatus* st) {
    return mb->bft->invokeMethod(mb, ctx, op, method, in, out, st);
}
static inline CMPIStatus CBSetProperty(const CMPIBroker* mb, const CMPIContext* ctx,
                                       const CMPIObjectPath* op, const char* name,
                                       const void* value, CMPIType type) {
    return mb->bft->setProperty(mb, ctx, op, name, (const CMPIValue*)value, type);
}
static inline CMPIData CBGetProperty(const CMPIBroker* mb, const CMPIContext* ctx,
                                     const CMPIObjectPath* op, const char* name, CMPIStatus* st) {
    return mb->bft->getProperty(mb, ctx, op, name, st);
}

/* ---- Broker: factories and services around objects -------------------------------------- */

static inline CMPIInstance* CMNewInstance(const CMPIBroker* mb, const CMPIObjectPath* op,
                                          CMPIStatus* st) {
    return mb->eft->newInstance(mb, op, st);
}
static inline CMPIObjectPath* CMNewObjectPath(const CMPIBroker* mb, const char* ns,
                                              const char* className, CMPIStatus* st) {
    return mb->eft->newObjectPath(mb, ns, className, st);
}
static inline CMPIArgs* CMNewArgs(const CMPIBroker* mb, CMPIStatus* st) {
    return mb->eft->newArgs(mb, st);
}
static inline CMPIString* CMNewString(const CMPIBroker* mb, const char* text, CMPIStatus* st) {
    return mb->eft->newString(mb, text, st);
}
static inline CMPIArray* CMNewArray(const CMPIBroker* mb, CMPICount size, CMPIType type,
                                    CMPIStatus* st) {
    return mb->eft->newArray(mb, size, type, st);
}
static inline CMPIDateTime* CMNewDateTime(const CMPIBroker* mb, CMPIStatus* st) {
    return mb->eft->newDateTime(mb, st);
}
static inline CMPIDateTime* CMNewDateTimeFromBinary(const CMPIBroker* mb, CMPIUint64 time,
                                                    CMPIBoolean interval, CMPIStatus* st) {
    return mb->eft->newDateTimeFromBinary(mb, time, interval, st);
}
static inline CMPIDateTime* CMNewDateTimeFromChars(const CMPIBroker* mb, const char* text,
                                                   CMPIStatus* st) {
    return mb->eft->newDateTimeFromChars(mb, text, st);
}
static inline CMPISelectExp* CMNewSelectExp(const CMPIBroker* mb, const char* query,
                                            const char* lang, CMPIArray** projection,
                                            CMPIStatus* st) {
    return mb->eft->newSelectExp(mb, query, lang, projection, st);
}
static inline CMPIError* CMNewCMPIError(const CMPIBroker* mb, const char* owner, const char* msgID,
                                        const char* msg, const CMPIErrorSeverity severity,
                                        const CMPIErrorProbableCause cause,
                                        const CMPIrc cimStatusCode, CMPIStatus* st) {
    return mb->eft->newCMPIError(mb, owner, msgID, msg, severity, cause, cimStatusCode, st);
}
static inline CMPIBoolean CMClassPathIsA(const CMPIBroker* mb, const CMPIObjectPath* op,
                                         const char* className, CMPIStatus* st) {
    return mb->eft->classPathIsA(mb, op, className, st);
}
static inline CMPIString* CDToString(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    return mb->eft->toString(mb, object, st);
}
static inline CMPIBoolean CDIsOfType(const CMPIBroker* mb, const void* object, const char* type,
                                     CMPIStatus* st) {
    return mb->eft->isOfType(mb, object, type, st);
}
static inline CMPIString* CDGetType(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    return mb->eft->getType(mb, object, st);
}
static inline CMPIStatus CMLogMessage(const CMPIBroker* mb, CMPISeverity severity, const char* id,
                                      const char* text, const CMPIString* string) {
    return mb->eft->logMessage(mb, severity, id, text, string);
}
static inline CMPIStatus CMTraceMessage(const CMPIBroker* mb, CMPILevel level,
                                        const char* component, const char* text,
                                        const CMPIString* string) {
    return mb->eft->trace(mb, level, component, text, string);
}
static inline CMPIStatus CMOpenMessageFile(const CMPIBroker* mb, const char* file,
                                           CMPIMsgFileHandle* handle) {
    return mb->eft->openMessageFile(mb, file, handle);
}
static inline CMPIStatus CMCloseMessageFile(const CMPIBroker* mb, const CMPIMsgFileHandle handle) {
    return mb->eft->closeMessageFile(mb, handle);
}

/* ---- Messages --------------------------------------------------------------------------
   Macros. The arguments of a message come from CMFmtArgs0 to CMFmtArgs10, each of them from
   one of the CMFmt macros:
      CMGetMessage(mb, "ID1", "$0 of $1 users", &st,
                   CMFmtArgs2(CMFmtUint(n), CMFmtChars(host))) */

#define CMGetMessage(mb, msgId, defMsg, st, ...)                                                   \
    ((mb)->eft->getMessage((mb), (msgId), (defMsg), (st), __VA_ARGS__))
#define CMGetMessage2(mb, msgId, handle, defMsg, st, ...)                                          \
    ((mb)->eft->getMessage2((mb), (msgId), (handle), (defMsg), (st), __VA_ARGS__))

#define CMFmtSint(v) CMPI_sint32, ((long)(v))
#define CMFmtUint(v) CMPI_uint32, ((unsigned long)(v))
#define CMFmtSint64(v) CMPI_sint64, ((long long)(v))
#define CMFmtUint64(v) CMPI_uint64, ((unsigned long long)(v))
#define CMFmtReal(v) CMPI_real64, ((double)(v))
#define CMFmtBoolean(v) CMPI_boolean, ((int)(v))
#define CMFmtChars(v) CMPI_chars, ((const char*)(v))
#define CMFmtString(v) CMPI_string, ((const CMPIString*)(v))

#define CMFmtArgs0() 0
#define CMFmtArgs1(v1) 1, v1
#define CMFmtArgs2(v1, v2) 2, v1, v2
#define CMFmtArgs3(v1, v2, v3) 3, v1, v2, v3
#define CMFmtArgs4(v1, v2, v3, v4) 4, v1, v2, v3, v4
#define CMFmtArgs5(v1, v2, v3, v4, v5) 5, v1, v2, v3, v4, v5
#define CMFmtArgs6(v1, v2, v3, v4, v5, v6) 6, v1, v2, v3, v4, v5, v6
#define CMFmtArgs7(v1, v2, v3, v4, v5, v6, v7) 7, v1, v2, v3, v4, v5, v6, v7
#define CMFmtArgs8(v1, v2, v3, v4, v5, v6, v7, v8) 8, v1, v2, v3, v4, v5, v6, v7, v8
#define CMFmtArgs9(v1, v2, v3, v4, v5, v6, v7, v8, v9) 9, v1, v2, v3, v4, v5, v6, v7, v8, v9
#define CMFmtArgs10(v1, v2, v3, v4, v5, v6, v7, v8, v9, v10)                                       \
    10, v1, v2, v3, v4, v5, v6, v7, v8, v9, v10

#ifdef __cplusplus
}
#endif

/* ---- Stubs of management interfaces ------------------------------------------------------
   CM<Type>MIStub(pfx, name, brokerVar, hook), once per type in a source file, defines a
   table of the functions whose names begin with pfx, and the factory
   name_Create_<Type>MI. The factory stores the broker in brokerVar, runs hook and returns a
   static interface. Within hook the factory's own mi, ctx and rc can be used. */

/* Hooks: nothing, or a call of CMPIStatus pfx<Type>Initialize(CMPI<Type>MI*, const
   CMPIContext*), whose failure becomes the factory's. */
#define CMNoHook
#define CMInitHook(pfx, type)                                                                      \
    do {                                                                                           \
        const CMPIStatus hookStatus_ = pfx##type##Initialize(&mi, ctx);                            \
        if (hookStatus_.rc != CMPI_RC_OK) {                                                        \
            CMSetStatusWithString(rc, hookStatus_.rc, hookStatus_.msg);                            \
            return NULL;                                                                           \
        }                                                                                          \
    } while (0)

/* The factory that all stubs share. */
#define CMPI_MI_FACTORY_(type, name, table, brokerVar, hook)                                       \
    CMPI_EXTERN_C CMPI##type##MI* name##_Create_##type##MI(                                        \
        const CMPIBroker* brkr, const CMPIContext* ctx, CMPIStatus* rc) {                          \
        static CMPI##type##MI mi = {NULL, &table};                                                 \
        (void)ctx;                                                                                 \
        CMSetStatus(rc, CMPI_RC_OK);                                                               \
        brokerVar = brkr;                                                                          \
        hook;                                                                                      \
        return &mi;                                                                                \
    }

#define CMInstanceMIStub(pfx, name, brokerVar, hook)                                               \
    static const CMPIInstanceMIFT instMIFT__ = {                                                   \
        CMPICurrentVersion,     CMPICurrentVersion,  "instance" #name, pfx##Cleanup,               \
        pfx##EnumInstanceNames, pfx##EnumInstances,  pfx##GetInstance, pfx##CreateInstance,        \
        pfx##ModifyInstance,    pfx##DeleteInstance, pfx##ExecQuery};                              \
    CMPI_MI_FACTORY_(Instance, name, instMIFT__, brokerVar, hook)

#define CMAssociationMIStub(pfx, name, brokerVar, hook)                                            \
    static const CMPIAssociationMIFT assocMIFT__ = {                                               \
        CMPICurrentVersion, CMPICurrentVersion,   "association" #name, pfx##AssociationCleanup,    \
        pfx##Associators,   pfx##AssociatorNames, pfx##References,     pfx##ReferenceNames};       \
    CMPI_MI_FACTORY_(Association, name, assocMIFT__, brokerVar, hook)

#define CMMethodMIStub(pfx, name, brokerVar, hook)                                                 \
    static const CMPIMethodMIFT methMIFT__ = {CMPICurrentVersion, CMPICurrentVersion,              \
                                              "method" #name, pfx##MethodCleanup,                  \
                                              pfx##InvokeMethod};                                  \
    CMPI_MI_FACTORY_(Method, name, methMIFT__, brokerVar, hook)

/* Without a setPropertyWithOrigin: that slot is NULL. */
#define CMPropertyMIStub(pfx, name, brokerVar, hook)                                               \
    static const CMPIPropertyMIFT propMIFT__ = {CMPICurrentVersion,                                \
                                                CMPICurrentVersion,                                \
                                                "property" #name,                                  \
                                                pfx##PropertyCleanup,                              \
                                                pfx##SetProperty,                                  \
                                                pfx##GetProperty,                                  \
                                                NULL};                                             \
    CMPI_MI_FACTORY_(Property, name, propMIFT__, brokerVar, hook)

/* The capital I of the text is the standard's. */
#define CMIndicationMIStub(pfx, name, brokerVar, hook)                                             \
    static const CMPIIndicationMIFT indMIFT__ = {CMPICurrentVersion,     CMPICurrentVersion,       \
                                                 "Indication" #name,     pfx##IndicationCleanup,   \
                                                 pfx##AuthorizeFilter,   pfx##MustPoll,            \
                                                 pfx##ActivateFilter,    pfx##DeActivateFilter,    \
                                                 pfx##EnableIndications, pfx##DisableIndications}; \
    CMPI_MI_FACTORY_(Indication, name, indMIFT__, brokerVar, hook)

#endif /* _CMPIMACS_H_ */
