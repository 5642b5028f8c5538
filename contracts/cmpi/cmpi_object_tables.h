/* Function tables of the encapsulated objects, in slot order. Slot 1 releases and slot 2 clones, in every
 * one. */
#ifndef KLDR_CMPI_OBJECT_TABLES_H
#define KLDR_CMPI_OBJECT_TABLES_H

#include "contracts/cmpi/cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/* Invocation context: named entries such as CMPIPrincipal. A missing entry sets *rc and leaves the value
 * undefined. */
typedef struct _CMPIContextFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIContext* ctx);
    CMPIContext* (*clone)(const CMPIContext* ctx, CMPIStatus* rc);
    CMPIData (*getEntry)(const CMPIContext* ctx, const char* name, CMPIStatus* rc);
    CMPIData (*getEntryAt)(const CMPIContext* ctx, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getEntryCount)(const CMPIContext* ctx, CMPIStatus* rc);
    CMPIStatus (*addEntry)(const CMPIContext* ctx, const char* name, const CMPIValue* value, CMPIType type);
} CMPIContextFT;

/* Where an operation puts its results; each return call hands over one element, returnDone ends the stream.
 */
typedef struct _CMPIResultFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIResult* rslt);
    CMPIResult* (*clone)(const CMPIResult* rslt, CMPIStatus* rc);
    CMPIStatus (*returnData)(const CMPIResult* rslt, const CMPIValue* value, CMPIType type);
    CMPIStatus (*returnInstance)(const CMPIResult* rslt, const CMPIInstance* inst);
    CMPIStatus (*returnObjectPath)(const CMPIResult* rslt, const CMPIObjectPath* op);
    CMPIStatus (*returnDone)(const CMPIResult* rslt);
#if CMPI_VERSION >= 200
    CMPIStatus (*returnError)(const CMPIResult* rslt, const CMPIError* err);
#endif
} CMPIResultFT;

/* Text object. The characters live as long as the object. */
typedef struct _CMPIStringFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIString* str);
    CMPIString* (*clone)(const CMPIString* str, CMPIStatus* rc);
    const char* (*getCharPtr)(const CMPIString* str, CMPIStatus* rc);
#if CMPI_VERSION >= 210
    char* (*newCharsCP)(const CMPIString* str, CMPICodepageID codepage, CMPIStatus* rc);
#endif
} CMPIStringFT;

/* Fixed-size array. Elements are kept by pointer: none may be released before the array has been handed on.
 */
typedef struct _CMPIArrayFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIArray* ar);
    CMPIArray* (*clone)(const CMPIArray* ar, CMPIStatus* rc);
    CMPICount (*getSize)(const CMPIArray* ar, CMPIStatus* rc);
    CMPIType (*getSimpleType)(const CMPIArray* ar, CMPIStatus* rc);
    CMPIData (*getElementAt)(const CMPIArray* ar, CMPICount index, CMPIStatus* rc);
    CMPIStatus (*setElementAt)(const CMPIArray* ar, CMPICount index, const CMPIValue* value, CMPIType type);
} CMPIArrayFT;

/* Cursor over the elements that a broker call answered. */
typedef struct _CMPIEnumerationFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* en);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* en, CMPIStatus* rc);
    CMPIData (*getNext)(const CMPIEnumeration* en, CMPIStatus* rc);
    CMPIBoolean (*hasNext)(const CMPIEnumeration* en, CMPIStatus* rc);
    CMPIArray* (*toArray)(const CMPIEnumeration* en, CMPIStatus* rc);
} CMPIEnumerationFT;

/* CIM instance. Values set into it are copied. */
typedef struct _CMPIInstanceFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIInstance* inst);
    CMPIInstance* (*clone)(const CMPIInstance* inst, CMPIStatus* rc);
    CMPIData (*getProperty)(const CMPIInstance* inst, const char* name, CMPIStatus* rc);
    CMPIData (*getPropertyAt)(const CMPIInstance* inst, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getPropertyCount)(const CMPIInstance* inst, CMPIStatus* rc);
    CMPIStatus (*setProperty)(const CMPIInstance* inst, const char* name, const CMPIValue* value,
                              CMPIType type);
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* inst, CMPIStatus* rc);
    CMPIStatus (*setPropertyFilter)(const CMPIInstance* inst, const char** properties, const char** keys);
    CMPIStatus (*setObjectPath)(const CMPIInstance* inst, const CMPIObjectPath* op);
#if CMPI_VERSION >= 200
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance* inst, const char* name, const CMPIValue* value,
                                        CMPIType type, const char* origin);
#endif
} CMPIInstanceFT;

/* Object path: host, namespace, class and key bindings. The qualifier slots are null in many servers. */
typedef struct _CMPIObjectPathFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* op);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIStatus (*setNameSpace)(const CMPIObjectPath* op, const char* ns);
    CMPIString* (*getNameSpace)(const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIStatus (*setHostname)(const CMPIObjectPath* op, const char* host);
    CMPIString* (*getHostname)(const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIStatus (*setClassName)(const CMPIObjectPath* op, const char* cn);
    CMPIString* (*getClassName)(const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIStatus (*addKey)(const CMPIObjectPath* op, const char* name, const CMPIValue* value, CMPIType type);
    CMPIData (*getKey)(const CMPIObjectPath* op, const char* name, CMPIStatus* rc);
    CMPIData (*getKeyAt)(const CMPIObjectPath* op, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getKeyCount)(const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIStatus (*setNameSpaceFromObjectPath)(const CMPIObjectPath* op, const CMPIObjectPath* source);
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(const CMPIObjectPath* op, const CMPIObjectPath* source);
    CMPIData (*getClassQualifier)(const CMPIObjectPath* op, const char* qualifier, CMPIStatus* rc);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath* op, const char* property, const char* qualifier,
                                     CMPIStatus* rc);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath* op, const char* method, const char* qualifier,
                                   CMPIStatus* rc);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath* op, const char* method, const char* parameter,
                                      const char* qualifier, CMPIStatus* rc);
    CMPIString* (*toString)(const CMPIObjectPath* op, CMPIStatus* rc);
} CMPIObjectPathFT;

/* Named arguments of a method, in or out. */
typedef struct _CMPIArgsFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIArgs* args);
    CMPIArgs* (*clone)(const CMPIArgs* args, CMPIStatus* rc);
    CMPIStatus (*addArg)(const CMPIArgs* args, const char* name, const CMPIValue* value, CMPIType type);
    CMPIData (*getArg)(const CMPIArgs* args, const char* name, CMPIStatus* rc);
    CMPIData (*getArgAt)(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getArgCount)(const CMPIArgs* args, CMPIStatus* rc);
} CMPIArgsFT;

/* Timestamp or interval; the text form has 25 characters, the binary form counts microseconds. */
typedef struct _CMPIDateTimeFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIDateTime* dt);
    CMPIDateTime* (*clone)(const CMPIDateTime* dt, CMPIStatus* rc);
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* dt, CMPIStatus* rc);
    CMPIString* (*getStringFormat)(const CMPIDateTime* dt, CMPIStatus* rc);
    CMPIBoolean (*isInterval)(const CMPIDateTime* dt, CMPIStatus* rc);
} CMPIDateTimeFT;

/* Parsed query of an indication filter. */
typedef struct _CMPISelectExpFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISelectExp* filter);
    CMPISelectExp* (*clone)(const CMPISelectExp* filter, CMPIStatus* rc);
    CMPIBoolean (*evaluate)(const CMPISelectExp* filter, const CMPIInstance* inst, CMPIStatus* rc);
    CMPIString* (*getString)(const CMPISelectExp* filter, CMPIStatus* rc);
    CMPISelectCond* (*getDOC)(const CMPISelectExp* filter, CMPIStatus* rc);
    CMPISelectCond* (*getCOD)(const CMPISelectExp* filter, CMPIStatus* rc);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* filter, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
} CMPISelectExpFT;

/* Normalised WHERE clause of a select expression. */
typedef struct _CMPISelectCondFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISelectCond* sc);
    CMPISelectCond* (*clone)(const CMPISelectCond* sc, CMPIStatus* rc);
    CMPICount (*getCountAndType)(const CMPISelectCond* sc, int* type, CMPIStatus* rc);
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* sc, CMPICount index, CMPIStatus* rc);
} CMPISelectCondFT;

/* One conjunction or disjunction of predicates. */
typedef struct _CMPISubCondFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISubCond* sub);
    CMPISubCond* (*clone)(const CMPISubCond* sub, CMPIStatus* rc);
    CMPICount (*getCount)(const CMPISubCond* sub, CMPIStatus* rc);
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* sub, CMPICount index, CMPIStatus* rc);
    CMPIPredicate* (*getPredicate)(const CMPISubCond* sub, const char* name, CMPIStatus* rc);
} CMPISubCondFT;

/* One comparison of a WHERE clause. */
typedef struct _CMPIPredicateFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIPredicate* pred);
    CMPIPredicate* (*clone)(const CMPIPredicate* pred, CMPIStatus* rc);
    CMPIStatus (*getData)(const CMPIPredicate* pred, CMPIType* type, CMPIPredOp* op, CMPIString** lhs,
                          CMPIString** rhs);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* pred, CMPIAccessor* accessor, void* parameter,
                                         CMPIStatus* rc);
} CMPIPredicateFT;

#if CMPI_VERSION >= 200
/* CIM error: readers answer a copy of the member, setters replace it. */
typedef struct _CMPIErrorFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIError* err);
    CMPIError* (*clone)(const CMPIError* err, CMPIStatus* rc);
    CMPIErrorType (*getErrorType)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getOtherErrorType)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getOwningEntity)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getMessageID)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIError* err, CMPIStatus* rc);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError* err, CMPIStatus* rc);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getProbableCauseDescription)(const CMPIError* err, CMPIStatus* rc);
    CMPIArray* (*getRecommendedActions)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getErrorSource)(const CMPIError* err, CMPIStatus* rc);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError* err, CMPIStatus* rc);
    CMPIrc (*getCIMStatusCode)(const CMPIError* err, CMPIStatus* rc);
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError* err, CMPIStatus* rc);
    CMPIArray* (*getMessageArguments)(const CMPIError* err, CMPIStatus* rc);
    CMPIStatus (*setErrorType)(const CMPIError* err, CMPIErrorType errorType);
    CMPIStatus (*setOtherErrorType)(const CMPIError* err, const char* text);
    CMPIStatus (*setProbableCauseDescription)(const CMPIError* err, const char* text);
    CMPIStatus (*setRecommendedActions)(const CMPIError* err, const CMPIArray* ar);
    CMPIStatus (*setErrorSource)(const CMPIError* err, const char* text);
    CMPIStatus (*setErrorSourceFormat)(const CMPIError* err, CMPIErrorSrcFormat format);
    CMPIStatus (*setOtherErrorSourceFormat)(const CMPIError* err, const char* text);
    CMPIStatus (*setCIMStatusCodeDescription)(const CMPIError* err, const char* text);
    CMPIStatus (*setMessageArguments)(const CMPIError* err, const CMPIArray* ar);
} CMPIErrorFT;
#endif

#if CMPI_VERSION >= 210
/* Property list of a request. */
typedef struct _CMPIPropertyListFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIPropertyList* list);
    CMPIPropertyList* (*clone)(const CMPIPropertyList* list, CMPIStatus* rc);
    CMPIBoolean (*isPropertyInList)(const CMPIPropertyList* list, const char* name, CMPIStatus* rc);
    const char** (*getProperties)(const CMPIPropertyList* list, CMPIStatus* rc);
} CMPIPropertyListFT;
#endif

#if CMPI_VERSION >= 210
/* Filter query of an enumeration. */
typedef struct _CMPIEnumerationFilterFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIEnumerationFilter* filter);
    CMPIEnumerationFilter* (*clone)(const CMPIEnumerationFilter* filter, CMPIStatus* rc);
    CMPIBoolean (*match)(const CMPIEnumerationFilter* filter, const CMPIInstance* inst, CMPIStatus* rc);
} CMPIEnumerationFilterFT;
#endif
/* An object is two pointers, and the server keeps more behind them: never copy one by value. */
struct _CMPIContext
{
    void* hdl;
    const struct _CMPIContextFT* ft;
};

struct _CMPIResult
{
    void* hdl;
    const struct _CMPIResultFT* ft;
};

struct _CMPIString
{
    void* hdl;
    const struct _CMPIStringFT* ft;
};

struct _CMPIArray
{
    void* hdl;
    const struct _CMPIArrayFT* ft;
};

struct _CMPIEnumeration
{
    void* hdl;
    const struct _CMPIEnumerationFT* ft;
};

struct _CMPIInstance
{
    void* hdl;
    const struct _CMPIInstanceFT* ft;
};

struct _CMPIObjectPath
{
    void* hdl;
    const struct _CMPIObjectPathFT* ft;
};

struct _CMPIArgs
{
    void* hdl;
    const struct _CMPIArgsFT* ft;
};

struct _CMPIDateTime
{
    void* hdl;
    const struct _CMPIDateTimeFT* ft;
};

struct _CMPISelectExp
{
    void* hdl;
    const struct _CMPISelectExpFT* ft;
};

struct _CMPISelectCond
{
    void* hdl;
    const struct _CMPISelectCondFT* ft;
};

struct _CMPISubCond
{
    void* hdl;
    const struct _CMPISubCondFT* ft;
};

struct _CMPIPredicate
{
    void* hdl;
    const struct _CMPIPredicateFT* ft;
};

struct _CMPIError
{
    void* hdl;
    const struct _CMPIErrorFT* ft;
};

struct _CMPIPropertyList
{
    void* hdl;
    const struct _CMPIPropertyListFT* ft;
};

struct _CMPIEnumerationFilter
{
    void* hdl;
    const struct _CMPIEnumerationFilterFT* ft;
};

#ifdef __cplusplus
}
#endif

#endif
