/*
 * CMPI 2.0: function tables.
 *
 * A broker hands a provider objects made of a handle and a table; a provider hands the
 * broker management interfaces of the same shape. The order and the types of the members
 * are fixed by the standard and must never change.
 *
 * What holds for every slot unless it says otherwise:
 *  - A CMPIStatus* takes the outcome and may be NULL; when given it is always written.
 *    Codes below are short for CMPI_RC_ERR_ plus the name.
 *  - On failure a pointer result is NULL, a boolean false, a count 0.
 *  - INVALID_HANDLE for an object that is NULL or no longer alive.
 *  - What is returned belongs to the broker or to the object asked. It lives until the
 *    provider function that is running returns, an attached thread detaches, or the
 *    enclosing mark is released. Only the result of clone belongs to the caller.
 *  - Names of classes, properties, keys and arguments compare ignoring case; texts are
 *    UTF-8; positions count from 0; a missing name or position is NO_SUCH_PROPERTY.
 *  - A value and its type: a NULL value pointer is CIM NULL; for CMPI_chars the pointer is
 *    the text itself. Values and texts are copied during the call.
 *
 * Every object table begins with
 *    ftVersion  the version of the table (200)
 *    release    ends a clone together with what it contains
 *    clone      an independent deep copy, which the caller must release
 */
#ifndef _CMPIFT_H_
#define _CMPIFT_H_

#include "cmpidt.h"

#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

/* ---- The broker ----------------------------------------------------------------------
   Valid as long as the provider is loaded. No slot is NULL: a service that a broker lacks
   is a function that answers NOT_SUPPORTED. mft is NULL when brokerCapabilities lacks
   CMPI_MB_Supports_MemEnhancements. */

struct _CMPIBroker {
    const void* hdl;
    const CMPIBrokerFT* bft;
    const CMPIBrokerEncFT* eft;
    const CMPIBrokerExtFT* xft;
    const CMPIBrokerMemFT* mft;
};

/* Services of the object manager. ctx must carry the caller's principal, role and language
   entries. The host of a path is ignored, and its keys where a class path is wanted. All
   of them may give ACCESS_DENIED, INVALID_NAMESPACE, INVALID_CLASS and FAILED. What is
   returned must not be passed to mft->free*. */
struct _CMPIBrokerFT {
    /* CMPI_MB_ bits */
    unsigned int brokerCapabilities;
    /* the CMPI version of this table, not the product's */
    int brokerVersion;
    /* the product's name, for people */
    const char* brokerName;

    /* Called in the old thread: a context for a new thread, or NULL. */
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    /* Called in the new thread with that context, before any other broker call. */
    CMPIStatus (*attachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    /* The new thread is done; its context is freed. */
    CMPIStatus (*detachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    /* Success also when nobody subscribed. NOT_SUPPORTED, INVALID_PARAMETER. */
    CMPIStatus (*deliverIndication)(const CMPIBroker* mb, const CMPIContext* ctx, const char* ns,
                                    const CMPIInstance* indication);

    /* Paths of the class and its subclasses; none is success. */
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, CMPIStatus* st);
    /* NOT_FOUND if there is no such instance. properties NULL: all. */
    CMPIInstance* (*getInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const char** properties, CMPIStatus* st);
    /* The path of the new instance. ALREADY_EXISTS. */
    CMPIObjectPath* (*createInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                      const CMPIObjectPath* op, const CMPIInstance* inst,
                                      CMPIStatus* st);
    /* properties NULL: all; the others stay as they are. NOT_FOUND. */
    CMPIStatus (*modifyInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const CMPIInstance* inst,
                                 const char** properties);
    /* NOT_FOUND if there is no such instance. */
    CMPIStatus (*deleteInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op);
    /* Instances that the query selects. QUERY_LANGUAGE_NOT_SUPPORTED, INVALID_QUERY. */
    CMPIEnumeration* (*execQuery)(const CMPIBroker* mb, const CMPIContext* ctx,
                                  const CMPIObjectPath* op, const char* query, const char* lang,
                                  CMPIStatus* st);
    /* Instances of the class and its subclasses; none is success. properties NULL: all. */
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* mb, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char** properties,
                                           CMPIStatus* st);

    /* Instances associated with op. A filter that is NULL does not filter; class filters
       include subclasses. A missing source instance gives no results and success. */
    CMPIEnumeration* (*associators)(const CMPIBroker* mb, const CMPIContext* ctx,
                                    const CMPIObjectPath* op, const char* assocClass,
                                    const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties,
                                    CMPIStatus* st);
    /* As associators, with paths for instances. */
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const char* assocClass,
                                        const char* resultClass, const char* role,
                                        const char* resultRole, CMPIStatus* st);
    /* As associators, with the association instances themselves. */
    CMPIEnumeration* (*references)(const CMPIBroker* mb, const CMPIContext* ctx,
                                   const CMPIObjectPath* op, const char* resultClass,
                                   const char* role, const char** properties, CMPIStatus* st);
    /* As references, with paths for instances. */
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                       const CMPIObjectPath* op, const char* resultClass,
                                       const char* role, CMPIStatus* st);

    /* The method's return value; out, empty at first, is filled on success.
       METHOD_NOT_AVAILABLE, METHOD_NOT_FOUND, NOT_FOUND, NOT_SUPPORTED. */
    CMPIData (*invokeMethod)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                             const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* st);
    /* value NULL: the property becomes NULL. NOT_FOUND, NO_SUCH_PROPERTY, TYPE_MISMATCH. */
    CMPIStatus (*setProperty)(const CMPIBroker* mb, const CMPIContext* ctx,
                              const CMPIObjectPath* op, const char* name, const CMPIValue* value,
                              CMPIType type);
    /* NOT_FOUND, NO_SUCH_PROPERTY. */
    CMPIData (*getProperty)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                            const char* name, CMPIStatus* st);
};

/* Factories and services around encapsulated objects.

   Messages (getMessage, getMessage2): the default text may hold $0 to $9. count, at most
   10, says how many pairs follow: an int with the CMPIType, then the value: long for
   sint32, unsigned long for uint32, long long and unsigned long long for the 64-bit types,
   double for real64, int for boolean, char* for chars, CMPIString* for string. On failure
   the text comes back unexpanded, never NULL. */
struct _CMPIBrokerEncFT {
    int ftVersion;
    /* An instance without properties. The path gives namespace, class and keys.
       INVALID_NAMESPACE; NOT_FOUND for an unknown class. */
    CMPIInstance* (*newInstance)(const CMPIBroker* mb, const CMPIObjectPath* op, CMPIStatus* st);
    /* A path without keys. */
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* mb, const char* ns, const char* className,
                                     CMPIStatus* st);
    /* An empty list of arguments. */
    CMPIArgs* (*newArgs)(const CMPIBroker* mb, CMPIStatus* st);
    /* A copy of text, which must not be NULL. */
    CMPIString* (*newString)(const CMPIBroker* mb, const char* text, CMPIStatus* st);
    /* An array of fixed size, possibly 0, all elements NULL. type is without
       CMPI_ARRAY. INVALID_DATA_TYPE. */
    CMPIArray* (*newArray)(const CMPIBroker* mb, CMPICount size, CMPIType type, CMPIStatus* st);
    /* The current time. */
    CMPIDateTime* (*newDateTime)(const CMPIBroker* mb, CMPIStatus* st);
    /* Microseconds since 1970-01-01 UTC, or the length of an interval. */
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* mb, CMPIUint64 time,
                                           CMPIBoolean interval, CMPIStatus* st);
    /* From the 25 characters of a CIM datetime; INVALID_PARAMETER for anything else. */
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* mb, const char* text, CMPIStatus* st);
    /* A parsed query. *projection, unless projection is NULL, takes the selected names as
       a string array, or NULL for all. QUERY_LANGUAGE_NOT_SUPPORTED, INVALID_QUERY. */
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* mb, const char* query, const char* lang,
                                   CMPIArray** projection, CMPIStatus* st);
    /* Whether the class of op is className or derived from it. */
    CMPIBoolean (*classPathIsA)(const CMPIBroker* mb, const CMPIObjectPath* op,
                                const char* className, CMPIStatus* st);
    /* Any object as text for people. */
    CMPIString* (*toString)(const CMPIBroker* mb, const void* object, CMPIStatus* st);
    /* Whether object is of that type, for example "CMPIInstance". INVALID_PARAMETER. */
    CMPIBoolean (*isOfType)(const CMPIBroker* mb, const void* object, const char* type,
                            CMPIStatus* st);
    /* The name of object's type. */
    CMPIString* (*getType)(const CMPIBroker* mb, const void* object, CMPIStatus* st);
    /* A translated message with its arguments put in. */
    CMPIString* (*getMessage)(const CMPIBroker* mb, const char* msgId, const char* defMsg,
                              CMPIStatus* st, CMPICount count, ...);
    /* id may be NULL; so may text or string, text wins. NOT_SUPPORTED. */
    CMPIStatus (*logMessage)(const CMPIBroker* mb, CMPISeverity severity, const char* id,
                             const char* text, const CMPIString* string);
    /* As logMessage; component may be NULL. */
    CMPIStatus (*trace)(const CMPIBroker* mb, CMPILevel level, const char* component,
                        const char* text, const CMPIString* string);
    /* An error object; attributes that are not passed are NULL. */
    CMPIError* (*newCMPIError)(const CMPIBroker* mb, const char* owner, const char* msgID,
                               const char* msg, const CMPIErrorSeverity severity,
                               const CMPIErrorProbableCause cause, const CMPIrc cimStatusCode,
                               CMPIStatus* st);
    /* Writes *handle; NULL and NOT_FOUND when there are no translations. */
    CMPIStatus (*openMessageFile)(const CMPIBroker* mb, const char* file,
                                  CMPIMsgFileHandle* handle);
    /* A NULL handle is fine. */
    CMPIStatus (*closeMessageFile)(const CMPIBroker* mb, const CMPIMsgFileHandle handle);
    /* As getMessage, from an opened file; a NULL handle gives the default text. */
    CMPIString* (*getMessage2)(const CMPIBroker* mb, const char* msgId,
                               const CMPIMsgFileHandle handle, const char* defMsg, CMPIStatus* st,
                               CMPICount count, ...);
};

/* Services of the operating system, with the meaning of their POSIX namesakes: an int is 0
   or an errno value, a pointer is NULL on failure. */
struct _CMPIBrokerExtFT {
    int ftVersion;
    /* "X" to "libX.so", without a directory. Never free the result. */
    char* (*resolveFileName)(const char* name);
    /* Runs start(parm), detached if detached is not 0. Does not attach it to the broker. */
    CMPI_THREAD_TYPE(*newThread)
    (CMPI_THREAD_RETURN(CMPI_THREAD_CDECL* start)(void*), void* parm, int detached);
    int (*joinThread)(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* code);
    /* Does not return. */
    int (*exitThread)(CMPI_THREAD_RETURN code);
    int (*cancelThread)(CMPI_THREAD_TYPE thread);
    int (*threadSleep)(CMPIUint32 milliseconds);
    /* Runs init once per once; *once starts as 0. */
    int (*threadOnce)(int* once, void (*init)(void));
    int (*createThreadKey)(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*));
    int (*destroyThreadKey)(CMPI_THREAD_KEY_TYPE key);
    void* (*getThreadSpecific)(CMPI_THREAD_KEY_TYPE key);
    int (*setThreadSpecific)(CMPI_THREAD_KEY_TYPE key, void* value);
    /* opt is 0. */
    CMPI_MUTEX_TYPE (*newMutex)(int opt);
    void (*destroyMutex)(CMPI_MUTEX_TYPE mutex);
    void (*lockMutex)(CMPI_MUTEX_TYPE mutex);
    void (*unlockMutex)(CMPI_MUTEX_TYPE mutex);
    /* opt is 0. */
    CMPI_COND_TYPE (*newCondition)(int opt);
    void (*destroyCondition)(CMPI_COND_TYPE condition);
    /* mutex must be held. */
    int (*condWait)(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex);
    /* wait is a point in time, not a length. */
    int (*timedCondWait)(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, struct timespec* wait);
    int (*signalCondition)(CMPI_COND_TYPE condition);
};

/* Memory. The free functions end an object of the matching factory early; they must not
   be given a clone or the result of an up-call. */
struct _CMPIBrokerMemFT {
    int ftVersion;
    /* Opens a nested lifetime for the objects made from now on. FAILED. */
    CMPIGcStat* (*mark)(const CMPIBroker* mb, CMPIStatus* st);
    /* Frees all but the clones made since that mark; marks nest strictly. */
    CMPIStatus (*release)(const CMPIBroker* mb, const CMPIGcStat* gc);
    /* As the functions of the C library; freed at the latest after the cleanup. */
    void* (*cmpiMalloc)(const CMPIBroker* mb, size_t size);
    void* (*cmpiCalloc)(const CMPIBroker* mb, size_t count, size_t size);
    void* (*cmpiRealloc)(const CMPIBroker* mb, void* ptr, size_t size);
    char* (*cmpiStrDup)(const CMPIBroker* mb, const char* text);
    void (*cmpiFree)(const CMPIBroker* mb, void* ptr);
    void (*freeInstance)(const CMPIBroker* mb, CMPIInstance* inst);
    void (*freeObjectPath)(const CMPIBroker* mb, CMPIObjectPath* op);
    void (*freeArgs)(const CMPIBroker* mb, CMPIArgs* args);
    void (*freeString)(const CMPIBroker* mb, CMPIString* string);
    void (*freeArray)(const CMPIBroker* mb, CMPIArray* array);
    void (*freeDateTime)(const CMPIBroker* mb, CMPIDateTime* dateTime);
    void (*freeSelectExp)(const CMPIBroker* mb, CMPISelectExp* se);
};

/* ---- Context: what the broker says about a request ----------------------------------- */

struct _CMPIContext {
    const void* hdl;
    const CMPIContextFT* ft;
};

struct _CMPIContextFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIContext* ctx);
    CMPIContext* (*clone)(const CMPIContext* ctx, CMPIStatus* st);
    /* The entry of that name. */
    CMPIData (*getEntry)(const CMPIContext* ctx, const char* name, CMPIStatus* st);
    /* The entry at that position; *name, unless name is NULL, takes its name. */
    CMPIData (*getEntryAt)(const CMPIContext* ctx, CMPICount index, CMPIString** name,
                           CMPIStatus* st);
    CMPICount (*getEntryCount)(const CMPIContext* ctx, CMPIStatus* st);
    /* Adds or replaces. INVALID_DATA_TYPE. */
    CMPIStatus (*addEntry)(const CMPIContext* ctx, const char* name, const CMPIValue* value,
                           CMPIType type);
};

/* ---- Result: where a provider puts its answer ------------------------------------------
   Everything is taken before the call returns. INVALID_HANDLE also says that the broker
   has given up the request. */

struct _CMPIResult {
    const void* hdl;
    const CMPIResultFT* ft;
};

struct _CMPIResultFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIResult* rslt);
    CMPIResult* (*clone)(const CMPIResult* rslt, CMPIStatus* st);
    /* A value of the type that the running operation answers. INVALID_DATA_TYPE. */
    CMPIStatus (*returnData)(const CMPIResult* rslt, const CMPIValue* value, CMPIType type);
    CMPIStatus (*returnInstance)(const CMPIResult* rslt, const CMPIInstance* inst);
    CMPIStatus (*returnObjectPath)(const CMPIResult* rslt, const CMPIObjectPath* op);
    /* Nothing more follows; call it once. */
    CMPIStatus (*returnDone)(const CMPIResult* rslt);
    /* Its status code must be the one that the provider function returns. */
    CMPIStatus (*returnError)(const CMPIResult* rslt, const CMPIError* error);
};

/* ---- String --------------------------------------------------------------------------
   hdl points at the text itself: some providers read it there. */

struct _CMPIString {
    const void* hdl;
    const CMPIStringFT* ft;
};

struct _CMPIStringFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIString* string);
    CMPIString* (*clone)(const CMPIString* string, CMPIStatus* st);
    /* The zero-terminated text; belongs to the string. */
    const char* (*getCharPtr)(const CMPIString* string, CMPIStatus* st);
};

/* ---- Array ----------------------------------------------------------------------------- */

struct _CMPIArray {
    const void* hdl;
    const CMPIArrayFT* ft;
};

struct _CMPIArrayFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArray* array);
    CMPIArray* (*clone)(const CMPIArray* array, CMPIStatus* st);
    CMPICount (*getSize)(const CMPIArray* array, CMPIStatus* st);
    /* The type of the elements, without CMPI_ARRAY; CMPI_null on failure. */
    CMPIType (*getSimpleType)(const CMPIArray* array, CMPIStatus* st);
    CMPIData (*getElementAt)(const CMPIArray* array, CMPICount index, CMPIStatus* st);
    /* type is that of the elements, else TYPE_MISMATCH. The array never grows. */
    CMPIStatus (*setElementAt)(const CMPIArray* array, CMPICount index, const CMPIValue* value,
                               CMPIType type);
};

/* ---- Enumeration ----------------------------------------------------------------------- */

struct _CMPIEnumeration {
    const void* hdl;
    const CMPIEnumerationFT* ft;
};

struct _CMPIEnumerationFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* en);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* en, CMPIStatus* st);
    /* CMPI_RC_NO_MORE_ELEMENTS past the end. */
    CMPIData (*getNext)(const CMPIEnumeration* en, CMPIStatus* st);
    CMPIBoolean (*hasNext)(const CMPIEnumeration* en, CMPIStatus* st);
    /* All elements; belongs to the enumeration. */
    CMPIArray* (*toArray)(const CMPIEnumeration* en, CMPIStatus* st);
};

/* ---- Instance -------------------------------------------------------------------------- */

struct _CMPIInstance {
    const void* hdl;
    const CMPIInstanceFT* ft;
};

struct _CMPIInstanceFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIInstance* inst);
    CMPIInstance* (*clone)(const CMPIInstance* inst, CMPIStatus* st);
    CMPIData (*getProperty)(const CMPIInstance* inst, const char* name, CMPIStatus* st);
    /* The property at that position; *name, unless name is NULL, takes its name. */
    CMPIData (*getPropertyAt)(const CMPIInstance* inst, CMPICount index, CMPIString** name,
                              CMPIStatus* st);
    CMPICount (*getPropertyCount)(const CMPIInstance* inst, CMPIStatus* st);
    /* Adds or replaces; does nothing, with success, for a name that the filter leaves
       out. May or may not touch the key of that name. TYPE_MISMATCH. */
    CMPIStatus (*setProperty)(const CMPIInstance* inst, const char* name, const CMPIValue* value,
                              CMPIType type);
    /* Belongs to the instance. */
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* inst, CMPIStatus* st);
    /* Which properties are kept: NULL all, an empty list none. Replaces an earlier filter.
       keys has no meaning any more. NOT_SUPPORTED. */
    CMPIStatus (*setPropertyFilter)(const CMPIInstance* inst, const char** properties,
                                    const char** keys);
    /* Replaces host, namespace, class and keys. */
    CMPIStatus (*setObjectPath)(const CMPIInstance* inst, const CMPIObjectPath* op);
    /* As setProperty, with the class that the property comes from, or NULL. */
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance* inst, const char* name,
                                        const CMPIValue* value, CMPIType type, const char* origin);
};

/* ---- Object path ----------------------------------------------------------------------- */

struct _CMPIObjectPath {
    const void* hdl;
    const CMPIObjectPathFT* ft;
};

struct _CMPIObjectPathFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* op);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setNameSpace)(const CMPIObjectPath* op, const char* ns);
    CMPIString* (*getNameSpace)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setHostname)(const CMPIObjectPath* op, const char* hostname);
    CMPIString* (*getHostname)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setClassName)(const CMPIObjectPath* op, const char* className);
    CMPIString* (*getClassName)(const CMPIObjectPath* op, CMPIStatus* st);
    /* Adds or replaces; a key is never NULL: INVALID_PARAMETER. */
    CMPIStatus (*addKey)(const CMPIObjectPath* op, const char* name, const CMPIValue* value,
                         CMPIType type);
    /* The state of a key has CMPI_keyValue; its type may be one of the CMPI_key types. */
    CMPIData (*getKey)(const CMPIObjectPath* op, const char* name, CMPIStatus* st);
    /* The key at that position; *name, unless name is NULL, takes its name. */
    CMPIData (*getKeyAt)(const CMPIObjectPath* op, CMPICount index, CMPIString** name,
                         CMPIStatus* st);
    /* 0 with success for the path of a class. */
    CMPICount (*getKeyCount)(const CMPIObjectPath* op, CMPIStatus* st);
    /* Copies namespace and class. */
    CMPIStatus (*setNameSpaceFromObjectPath)(const CMPIObjectPath* op, const CMPIObjectPath* src);
    /* Copies host, namespace and class. */
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(const CMPIObjectPath* op,
                                                    const CMPIObjectPath* src);
    /* Qualifiers of the class and its parts: NOT_SUPPORTED where a broker has none,
       NOT_FOUND for an unknown one. */
    CMPIData (*getClassQualifier)(const CMPIObjectPath* op, const char* qualifier, CMPIStatus* st);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath* op, const char* property,
                                     const char* qualifier, CMPIStatus* st);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath* op, const char* method,
                                   const char* qualifier, CMPIStatus* st);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath* op, const char* method,
                                      const char* parameter, const char* qualifier, CMPIStatus* st);
    /* The path as text; its form is the broker's own. */
    CMPIString* (*toString)(const CMPIObjectPath* op, CMPIStatus* st);
};

/* ---- Arguments of a method ------------------------------------------------------------- */

struct _CMPIArgs {
    const void* hdl;
    const CMPIArgsFT* ft;
};

struct _CMPIArgsFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArgs* args);
    CMPIArgs* (*clone)(const CMPIArgs* args, CMPIStatus* st);
    /* Adds or replaces. INVALID_DATA_TYPE. */
    CMPIStatus (*addArg)(const CMPIArgs* args, const char* name, const CMPIValue* value,
                         CMPIType type);
    CMPIData (*getArg)(const CMPIArgs* args, const char* name, CMPIStatus* st);
    /* The argument at that position; *name, unless name is NULL, takes its name. */
    CMPIData (*getArgAt)(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* st);
    CMPICount (*getArgCount)(const CMPIArgs* args, CMPIStatus* st);
};

/* ---- Date and time --------------------------------------------------------------------- */

struct _CMPIDateTime {
    const void* hdl;
    const CMPIDateTimeFT* ft;
};

struct _CMPIDateTimeFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIDateTime* dt);
    CMPIDateTime* (*clone)(const CMPIDateTime* dt, CMPIStatus* st);
    /* Microseconds since 1970-01-01 UTC, or the length of an interval. */
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* dt, CMPIStatus* st);
    /* yyyymmddhhmmss.mmmmmm+uuu, or ddddddddhhmmss.mmmmmm:000 for an interval. */
    CMPIString* (*getStringFormat)(const CMPIDateTime* dt, CMPIStatus* st);
    CMPIBoolean (*isInterval)(const CMPIDateTime* dt, CMPIStatus* st);
};

/* ---- Queries: only with CMPI_MB_QueryNormalization ---------------------------------------- */

struct _CMPISelectExp {
    const void* hdl;
    const CMPISelectExpFT* ft;
};

struct _CMPISelectExpFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectExp* se);
    CMPISelectExp* (*clone)(const CMPISelectExp* se, CMPIStatus* st);
    /* Whether the condition holds for the instance. */
    CMPIBoolean (*evaluate)(const CMPISelectExp* se, const CMPIInstance* inst, CMPIStatus* st);
    /* The text of the query. */
    CMPIString* (*getString)(const CMPISelectExp* se, CMPIStatus* st);
    /* The condition as an OR of ANDs. NOT_SUPPORTED. */
    CMPISelectCond* (*getDOC)(const CMPISelectExp* se, CMPIStatus* st);
    /* The condition as an AND of ORs. NOT_SUPPORTED. */
    CMPISelectCond* (*getCOD)(const CMPISelectExp* se, CMPIStatus* st);
    /* As evaluate, with values that accessor answers; parm goes to it. */
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* se, CMPIAccessor* accessor,
                                         void* parm, CMPIStatus* st);
};

struct _CMPISelectCond {
    const void* hdl;
    const CMPISelectCondFT* ft;
};

struct _CMPISelectCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectCond* sc);
    CMPISelectCond* (*clone)(const CMPISelectCond* sc, CMPIStatus* st);
    /* How many parts; *type, unless type is NULL, takes a CMPISelectCondType. */
    CMPICount (*getCountAndType)(const CMPISelectCond* sc, int* type, CMPIStatus* st);
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* sc, CMPICount index, CMPIStatus* st);
};

struct _CMPISubCond {
    const void* hdl;
    const CMPISubCondFT* ft;
};

struct _CMPISubCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISubCond* sc);
    CMPISubCond* (*clone)(const CMPISubCond* sc, CMPIStatus* st);
    CMPICount (*getCount)(const CMPISubCond* sc, CMPIStatus* st);
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* sc, CMPICount index, CMPIStatus* st);
    /* The predicate whose left side is name. */
    CMPIPredicate* (*getPredicate)(const CMPISubCond* sc, const char* name, CMPIStatus* st);
};

struct _CMPIPredicate {
    const void* hdl;
    const CMPIPredicateFT* ft;
};

struct _CMPIPredicateFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIPredicate* pr);
    CMPIPredicate* (*clone)(const CMPIPredicate* pr, CMPIStatus* st);
    /* Each of the four places may be NULL; on failure the two sides become NULL. */
    CMPIStatus (*getData)(const CMPIPredicate* pr, CMPIType* type, CMPIPredOp* op, CMPIString** lhs,
                          CMPIString** rhs);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* pr, CMPIAccessor* accessor,
                                         void* parm, CMPIStatus* st);
};

/* ---- Error -----------------------------------------------------------------------------
   An attribute that is not set reads as NULL with success. A text of NULL unsets it. */

struct _CMPIError {
    const void* hdl;
    const CMPIErrorFT* ft;
};

struct _CMPIErrorFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIError* er);
    CMPIError* (*clone)(const CMPIError* er, CMPIStatus* st);
    CMPIErrorType (*getErrorType)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getOtherErrorType)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getOwningEntity)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getMessageID)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getMessage)(const CMPIError* er, CMPIStatus* st);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError* er, CMPIStatus* st);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getProbableCauseDescription)(const CMPIError* er, CMPIStatus* st);
    /* an array of strings */
    CMPIArray* (*getRecommendedActions)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getErrorSource)(const CMPIError* er, CMPIStatus* st);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError* er, CMPIStatus* st);
    CMPIrc (*getCIMStatusCode)(const CMPIError* er, CMPIStatus* st);
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError* er, CMPIStatus* st);
    /* an array of strings */
    CMPIArray* (*getMessageArguments)(const CMPIError* er, CMPIStatus* st);
    CMPIStatus (*setErrorType)(const CMPIError* er, const CMPIErrorType type);
    CMPIStatus (*setOtherErrorType)(const CMPIError* er, const char* text);
    CMPIStatus (*setProbableCauseDescription)(const CMPIError* er, const char* text);
    CMPIStatus (*setRecommendedActions)(const CMPIError* er, const CMPIArray* actions);
    CMPIStatus (*setErrorSource)(const CMPIError* er, const char* text);
    CMPIStatus (*setErrorSourceFormat)(const CMPIError* er, const CMPIErrorSrcFormat format);
    CMPIStatus (*setOtherErrorSourceFormat)(const CMPIError* er, const char* text);
    CMPIStatus (*setCIMStatusCodeDescription)(const CMPIError* er, const char* text);
    CMPIStatus (*setMessageArguments)(const CMPIError* er, const CMPIArray* arguments);
};

/* ---- Management interfaces: the provider's side -----------------------------------------
   Made by the provider's factories and valid until cleanup; hdl is the provider's own.
   All arguments are valid during the call only. Every slot returns the outcome of the
   operation; what it found goes into rslt.

   Every table begins with
      ftVersion   the version of the table
      miVersion   the version of the provider's interface, for people
      miName      the name of the provider, for people
      cleanup     the provider is to be unloaded. If terminating is false it may answer
                  CMPI_RC_DO_NOT_UNLOAD or CMPI_RC_NEVER_UNLOAD.

   The factories are exported under these names, with C linkage:
      CMPI<Type>MI* <Name>_Create_<Type>MI(const CMPIBroker*, const CMPIContext*,
                                           CMPIStatus*)
      CMPI<Type>MI* _Generic_Create_<Type>MI(const CMPIBroker*, const CMPIContext*,
                                             const char* miName, CMPIStatus*)
   with Type one of Instance, Association, Method, Property, Indication. NULL: failed. */

struct _CMPIInstanceMI {
    const void* hdl;
    const CMPIInstanceMIFT* ft;
};

struct _CMPIInstanceMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    /* Paths of all instances. */
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* rslt, const CMPIObjectPath* op);
    /* All instances. properties NULL: with all properties. */
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* op,
                                     const char** properties);
    /* One instance. NOT_FOUND. */
    CMPIStatus (*getInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char** properties);
    /* The path of the new instance goes into rslt. ALREADY_EXISTS. */
    CMPIStatus (*createInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const CMPIInstance* inst);
    /* properties NULL: all that inst has. NOT_FOUND. */
    CMPIStatus (*modifyInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const CMPIInstance* inst,
                                 const char** properties);
    /* NOT_FOUND. */
    CMPIStatus (*deleteInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op);
    /* Instances. QUERY_LANGUAGE_NOT_SUPPORTED, INVALID_QUERY. */
    CMPIStatus (*execQuery)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                            const CMPIObjectPath* op, const char* query, const char* lang);
};

struct _CMPIAssociationMI {
    const void* hdl;
    const CMPIAssociationMIFT* ft;
};

/* The filters assocClass, resultClass, role and resultRole may be NULL; the broker need
   not have applied them. */
struct _CMPIAssociationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    /* Associated instances. */
    CMPIStatus (*associators)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* assocClass,
                              const char* resultClass, const char* role, const char* resultRole,
                              const char** properties);
    /* Their paths. */
    CMPIStatus (*associatorNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                  const CMPIResult* rslt, const CMPIObjectPath* op,
                                  const char* assocClass, const char* resultClass, const char* role,
                                  const char* resultRole);
    /* Association instances that refer to op. */
    CMPIStatus (*references)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                             const CMPIObjectPath* op, const char* resultClass, const char* role,
                             const char** properties);
    /* Their paths. */
    CMPIStatus (*referenceNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* rslt, const CMPIObjectPath* op,
                                 const char* resultClass, const char* role);
};

struct _CMPIMethodMI {
    const void* hdl;
    const CMPIMethodMIFT* ft;
};

struct _CMPIMethodMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    /* The method's return value goes into rslt, its output arguments into out.
       METHOD_NOT_AVAILABLE, NOT_FOUND. */
    CMPIStatus (*invokeMethod)(CMPIMethodMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                               const CMPIObjectPath* op, const char* method, const CMPIArgs* in,
                               CMPIArgs* out);
};

struct _CMPIPropertyMI {
    const void* hdl;
    const CMPIPropertyMIFT* ft;
};

struct _CMPIPropertyMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIPropertyMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*setProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* name, const CMPIData data);
    /* The value goes into rslt. NOT_FOUND, NO_SUCH_PROPERTY. */
    CMPIStatus (*getProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* name);
    /* origin may be NULL. Not every provider's table is long enough to have this slot. */
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* rslt, CMPIObjectPath* op,
                                        const char* name, const CMPIData data, const char* origin);
};

struct _CMPIIndicationMI {
    const void* hdl;
    const CMPIIndicationMIFT* ft;
};

struct _CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    /* OK: the filter can be served. */
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                  const CMPISelectExp* se, const char* className,
                                  const CMPIObjectPath* op, const char* owner);
    /* Brokers had best not call it: generations of providers differ in its arguments. */
    CMPIStatus (*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* ctx, const CMPISelectExp* se,
                           const char* className, const CMPIObjectPath* op);
    /* first: the first filter after a time without any. */
    CMPIStatus (*activateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                 const CMPISelectExp* se, const char* className,
                                 const CMPIObjectPath* op, CMPIBoolean first);
    /* last: no filter is left. */
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                   const CMPISelectExp* se, const char* className,
                                   const CMPIObjectPath* op, CMPIBoolean last);
    /* The broker takes indications from now on, and no longer. */
    CMPIStatus (*enableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
    CMPIStatus (*disableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
};

#ifdef __cplusplus
}
#endif

/* Sources that include only this header expect the convenience layer with it. */
#include "cmpimacs.h"

#endif /* _CMPIFT_H_ */
