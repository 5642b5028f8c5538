/* Function tables behind CMPIBroker, in slot order. */
#ifndef KLDR_CMPI_BROKER_TABLES_H
#define KLDR_CMPI_BROKER_TABLES_H

#include "contracts/cmpi/cmpidt.h"

#include <stddef.h>
#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Services of the server. Note that enumerateInstances stands after execQuery, not beside
 * enumerateInstanceNames. */
typedef struct _CMPIBrokerFT
{
    unsigned int brokerCapabilities;
    CMPIVersion brokerVersion;
    const char* brokerName;
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    CMPIStatus (*attachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    CMPIStatus (*detachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    CMPIStatus (*deliverIndication)(const CMPIBroker* mb, const CMPIContext* ctx, const char* ns,
                                    const CMPIInstance* inst);
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIInstance* (*getInstance)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                 const char** properties, CMPIStatus* rc);
    CMPIObjectPath* (*createInstance)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                      const CMPIInstance* inst, CMPIStatus* rc);
    CMPIStatus (*modifyInstance)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                 const CMPIInstance* inst, const char** properties);
    CMPIStatus (*deleteInstance)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op);
    CMPIEnumeration* (*execQuery)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                  const char* query, const char* lang, CMPIStatus* rc);
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* mb, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char** properties, CMPIStatus* rc);
    CMPIEnumeration* (*associators)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                    const char* assocClass, const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties, CMPIStatus* rc);
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const char* assocClass,
                                        const char* resultClass, const char* role, const char* resultRole,
                                        CMPIStatus* rc);
    CMPIEnumeration* (*references)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                   const char* resultClass, const char* role, const char** properties,
                                   CMPIStatus* rc);
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                       const char* resultClass, const char* role, CMPIStatus* rc);
    CMPIData (*invokeMethod)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                             const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc);
    CMPIStatus (*setProperty)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                              const char* name, const CMPIValue* value, CMPIType type);
    CMPIData (*getProperty)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                            const char* name, CMPIStatus* rc);
#if CMPI_VERSION >= 210
    CMPIEnumeration* (*enumerateInstancesFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
                                                   const CMPIObjectPath* op, const char** properties,
                                                   const char* lang, const char* query, CMPIStatus* rc);
    CMPIEnumeration* (*associatorsFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
                                            const CMPIObjectPath* op, const char* assocClass,
                                            const char* resultClass, const char* role, const char* resultRole,
                                            const char** properties, const char* lang, const char* query,
                                            CMPIStatus* rc);
    CMPIEnumeration* (*referencesFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char* resultClass,
                                           const char* role, const char** properties, const char* lang,
                                           const char* query, CMPIStatus* rc);
#endif
} CMPIBrokerFT;

/* Factories of encapsulated objects. Each result is owned by the server until the MI entry returns or the
 * thread detaches. */
typedef struct _CMPIBrokerEncFT
{
    CMPIVersion ftVersion;
    CMPIInstance* (*newInstance)(const CMPIBroker* mb, const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* mb, const char* ns, const char* cn, CMPIStatus* rc);
    CMPIArgs* (*newArgs)(const CMPIBroker* mb, CMPIStatus* rc);
    CMPIString* (*newString)(const CMPIBroker* mb, const char* text, CMPIStatus* rc);
    CMPIArray* (*newArray)(const CMPIBroker* mb, CMPICount count, CMPIType type, CMPIStatus* rc);
    CMPIDateTime* (*newDateTime)(const CMPIBroker* mb, CMPIStatus* rc);
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* mb, CMPIUint64 microseconds,
                                           CMPIBoolean interval, CMPIStatus* rc);
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* mb, const char* text, CMPIStatus* rc);
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* mb, const char* query, const char* lang,
                                   CMPIArray** projection, CMPIStatus* rc);
    CMPIBoolean (*classPathIsA)(const CMPIBroker* mb, const CMPIObjectPath* op, const char* cn,
                                CMPIStatus* rc);
    CMPIString* (*toString)(const CMPIBroker* mb, const void* object, CMPIStatus* rc);
    CMPIBoolean (*isOfType)(const CMPIBroker* mb, const void* object, const char* typeName, CMPIStatus* rc);
    CMPIString* (*getType)(const CMPIBroker* mb, const void* object, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIBroker* mb, const char* msgId, const char* defMsg, CMPIStatus* rc,
                              CMPICount count, ...);
    CMPIStatus (*logMessage)(const CMPIBroker* mb, CMPISeverity severity, const char* id, const char* text,
                             const CMPIString* str);
    CMPIStatus (*trace)(const CMPIBroker* mb, CMPILevel level, const char* component, const char* text,
                        const CMPIString* str);
#if CMPI_VERSION >= 200
    CMPIError* (*newCMPIError)(const CMPIBroker* mb, const char* owner, const char* msgId, const char* msg,
                               CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc code,
                               CMPIStatus* rc);
    CMPIStatus (*openMessageFile)(const CMPIBroker* mb, const char* file, CMPIMsgFileHandle* handle);
    CMPIStatus (*closeMessageFile)(const CMPIBroker* mb, CMPIMsgFileHandle handle);
    CMPIString* (*getMessage2)(const CMPIBroker* mb, const char* msgId, CMPIMsgFileHandle handle,
                               const char* defMsg, CMPIStatus* rc, CMPICount count, ...);
#endif
#if CMPI_VERSION >= 210
    CMPIPropertyList* (*newPropertyList)(const CMPIBroker* mb, const char** names, CMPIStatus* rc);
    CMPIString* (*newStringCP)(const CMPIBroker* mb, const char* text, CMPICodepageID codepage,
                               CMPIStatus* rc);
    CMPIEnumerationFilter* (*newEnumerationFilter)(const CMPIBroker* mb, const char* lang, const char* query,
                                                   CMPIStatus* rc);
#endif
} CMPIBrokerEncFT;

/* Operating system services. Servers leave several of them null. */
typedef struct _CMPIBrokerExtFT
{
    CMPIVersion ftVersion;
    char* (*resolveFileName)(const char* base);
    void* (*newThread)(CMPIThreadFunc start, void* parameter, int detached);
    int (*joinThread)(void* thread, void** result);
    int (*exitThread)(void* result);
    int (*cancelThread)(void* thread);
    int (*threadSleep)(CMPIUint32 milliseconds);
    int (*threadOnce)(int* once, CMPIThreadOnceFunc function);
    int (*createThreadKey)(unsigned int* key, CMPIThreadKeyCleanupFunc cleanup);
    int (*destroyThreadKey)(unsigned int key);
    void* (*getThreadSpecific)(unsigned int key);
    int (*setThreadSpecific)(unsigned int key, void* value);
    void* (*newMutex)(int option);
    void (*destroyMutex)(void* mutex);
    void (*lockMutex)(void* mutex);
    void (*unlockMutex)(void* mutex);
    void* (*newCondition)(int option);
    void (*destroyCondition)(void* condition);
    int (*condWait)(void* condition, void* mutex);
    int (*timedCondWait)(void* condition, void* mutex, struct timespec* deadline);
    int (*signalCondition)(void* condition);
#if CMPI_VERSION >= 210
    int (*destroyMutex2)(void* mutex);
    int (*lockMutex2)(void* mutex);
    int (*unlockMutex2)(void* mutex);
    int (*destroyCondition2)(void* condition);
#endif
} CMPIBrokerExtFT;

#if CMPI_VERSION >= 200
/* Memory services; the whole table is absent (broker->mft is null) in many servers. */
typedef struct _CMPIBrokerMemFT
{
    CMPIVersion ftVersion;
    CMPIGcStat* (*mark)(const CMPIBroker* mb, CMPIStatus* rc);
    CMPIStatus (*release)(const CMPIBroker* mb, const CMPIGcStat* mark);
    void* (*cmpiMalloc)(const CMPIBroker* mb, size_t size);
    void* (*cmpiCalloc)(const CMPIBroker* mb, size_t count, size_t size);
    void* (*cmpiRealloc)(const CMPIBroker* mb, void* block, size_t size);
    char* (*cmpiStrDup)(const CMPIBroker* mb, const char* text);
    void (*cmpiFree)(const CMPIBroker* mb, void* block);
    void (*freeInstance)(const CMPIBroker* mb, CMPIInstance* inst);
    void (*freeObjectPath)(const CMPIBroker* mb, CMPIObjectPath* op);
    void (*freeArgs)(const CMPIBroker* mb, CMPIArgs* args);
    void (*freeString)(const CMPIBroker* mb, CMPIString* str);
    void (*freeArray)(const CMPIBroker* mb, CMPIArray* ar);
    void (*freeDateTime)(const CMPIBroker* mb, CMPIDateTime* dt);
    void (*freeSelectExp)(const CMPIBroker* mb, CMPISelectExp* filter);
#if CMPI_VERSION >= 210
    void (*freeChars)(const CMPIBroker* mb, char* text);
#endif
} CMPIBrokerMemFT;
#endif
/* The server as a provider sees it. The member mft came with 2.0 and may be null. */
struct _CMPIBroker
{
    const void* hdl;
    const CMPIBrokerFT* bft;
    const CMPIBrokerEncFT* eft;
    const CMPIBrokerExtFT* xft;
#if CMPI_VERSION >= 200
    const CMPIBrokerMemFT* mft;
#endif
};

#ifdef __cplusplus
}
#endif

#endif
