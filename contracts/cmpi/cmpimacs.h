/* CMPI convenience calls. Each is one call through one table slot.
 *
 * An rc argument is an out status and may be null. A value argument points at a CMPIValue or at a variable of
 * the type named by the type word; for CMPI_chars it is the text itself, and for a null value it is null.
 */
#ifndef KLDR_CMPIMACS_H
#define KLDR_CMPIMACS_H

#include "contracts/cmpi/cmpidt.h"
#include "contracts/cmpi/cmpift.h"

#ifdef __cplusplus
#define CMPI_INLINE inline
#define CMPI_NO_STATUS nullptr
#define CMPI_VALUE_POINTER(value) static_cast<const CMPIValue*>(value)
#else
#define CMPI_INLINE static inline
#define CMPI_NO_STATUS ((CMPIStatus*)0)
#define CMPI_VALUE_POINTER(value) ((const CMPIValue*)(value))
#endif

CMPI_INLINE CMPIString* CMGetClassName(const CMPIObjectPath* op, CMPIStatus* rc)
{
    return op->ft->getClassName(op, rc);
}

CMPI_INLINE CMPIString* CMGetNameSpace(const CMPIObjectPath* op, CMPIStatus* rc)
{
    return op->ft->getNameSpace(op, rc);
}

CMPI_INLINE CMPIStatus CMAddKey(const CMPIObjectPath* op, const char* name, const void* value, CMPIType type)
{
    return op->ft->addKey(op, name, CMPI_VALUE_POINTER(value), type);
}

CMPI_INLINE CMPIData CMGetKeyAt(const CMPIObjectPath* op, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return op->ft->getKeyAt(op, index, name, rc);
}

CMPI_INLINE CMPICount CMGetKeyCount(const CMPIObjectPath* op, CMPIStatus* rc)
{
    return op->ft->getKeyCount(op, rc);
}

CMPI_INLINE CMPIStatus CMSetPropertyFilter(const CMPIInstance* inst, const char** names, const char** keys)
{
    return inst->ft->setPropertyFilter(inst, names, keys);
}

CMPI_INLINE CMPIStatus CMSetProperty(const CMPIInstance* inst, const char* name, const void* value,
                                     CMPIType type)
{
    return inst->ft->setProperty(inst, name, CMPI_VALUE_POINTER(value), type);
}

CMPI_INLINE CMPIData CMGetPropertyAt(const CMPIInstance* inst, CMPICount index, CMPIString** name,
                                     CMPIStatus* rc)
{
    return inst->ft->getPropertyAt(inst, index, name, rc);
}

CMPI_INLINE CMPICount CMGetPropertyCount(const CMPIInstance* inst, CMPIStatus* rc)
{
    return inst->ft->getPropertyCount(inst, rc);
}

CMPI_INLINE CMPIObjectPath* CMGetObjectPath(const CMPIInstance* inst, CMPIStatus* rc)
{
    return inst->ft->getObjectPath(inst, rc);
}

CMPI_INLINE CMPIStatus CMAddArg(const CMPIArgs* args, const char* name, const void* value, CMPIType type)
{
    return args->ft->addArg(args, name, CMPI_VALUE_POINTER(value), type);
}

CMPI_INLINE CMPIData CMGetArgAt(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return args->ft->getArgAt(args, index, name, rc);
}

CMPI_INLINE CMPICount CMGetArgCount(const CMPIArgs* args, CMPIStatus* rc)
{
    return args->ft->getArgCount(args, rc);
}

CMPI_INLINE CMPICount CMGetArrayCount(const CMPIArray* ar, CMPIStatus* rc)
{
    return ar->ft->getSize(ar, rc);
}

CMPI_INLINE CMPIData CMGetArrayElementAt(const CMPIArray* ar, CMPICount index, CMPIStatus* rc)
{
    return ar->ft->getElementAt(ar, index, rc);
}

CMPI_INLINE CMPIStatus CMSetArrayElementAt(const CMPIArray* ar, CMPICount index, const void* value,
                                           CMPIType type)
{
    return ar->ft->setElementAt(ar, index, CMPI_VALUE_POINTER(value), type);
}

CMPI_INLINE CMPIString* CMGetStringFormat(const CMPIDateTime* dt, CMPIStatus* rc)
{
    return dt->ft->getStringFormat(dt, rc);
}

CMPI_INLINE const char* CMGetCharPtr(const CMPIString* str)
{
    return str->ft->getCharPtr(str, CMPI_NO_STATUS);
}

CMPI_INLINE const char* CMGetCharsPtr(const CMPIString* str, CMPIStatus* rc)
{
    return str->ft->getCharPtr(str, rc);
}

CMPI_INLINE CMPIBoolean CMHasNext(const CMPIEnumeration* en, CMPIStatus* rc)
{
    return en->ft->hasNext(en, rc);
}

CMPI_INLINE CMPIData CMGetNext(const CMPIEnumeration* en, CMPIStatus* rc)
{
    return en->ft->getNext(en, rc);
}

CMPI_INLINE CMPIData CMGetContextEntry(const CMPIContext* ctx, const char* name, CMPIStatus* rc)
{
    return ctx->ft->getEntry(ctx, name, rc);
}

CMPI_INLINE CMPIStatus CMReturnData(const CMPIResult* rslt, const void* value, CMPIType type)
{
    return rslt->ft->returnData(rslt, CMPI_VALUE_POINTER(value), type);
}

CMPI_INLINE CMPIStatus CMReturnInstance(const CMPIResult* rslt, const CMPIInstance* inst)
{
    return rslt->ft->returnInstance(rslt, inst);
}

CMPI_INLINE CMPIStatus CMReturnObjectPath(const CMPIResult* rslt, const CMPIObjectPath* op)
{
    return rslt->ft->returnObjectPath(rslt, op);
}

CMPI_INLINE CMPIStatus CMReturnDone(const CMPIResult* rslt)
{
    return rslt->ft->returnDone(rslt);
}

CMPI_INLINE CMPIInstance* CMNewInstance(const CMPIBroker* mb, const CMPIObjectPath* op, CMPIStatus* rc)
{
    return mb->eft->newInstance(mb, op, rc);
}

CMPI_INLINE CMPIObjectPath* CMNewObjectPath(const CMPIBroker* mb, const char* ns, const char* cn,
                                            CMPIStatus* rc)
{
    return mb->eft->newObjectPath(mb, ns, cn, rc);
}

CMPI_INLINE CMPIArgs* CMNewArgs(const CMPIBroker* mb, CMPIStatus* rc)
{
    return mb->eft->newArgs(mb, rc);
}

CMPI_INLINE CMPIString* CMNewString(const CMPIBroker* mb, const char* text, CMPIStatus* rc)
{
    return mb->eft->newString(mb, text, rc);
}

CMPI_INLINE CMPIArray* CMNewArray(const CMPIBroker* mb, CMPICount count, CMPIType type, CMPIStatus* rc)
{
    return mb->eft->newArray(mb, count, type, rc);
}

CMPI_INLINE CMPIDateTime* CMNewDateTimeFromChars(const CMPIBroker* mb, const char* text, CMPIStatus* rc)
{
    return mb->eft->newDateTimeFromChars(mb, text, rc);
}

CMPI_INLINE CMPIInstance* CBGetInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const char** names, CMPIStatus* rc)
{
    return mb->bft->getInstance(mb, ctx, op, names, rc);
}

CMPI_INLINE CMPIEnumeration* CBEnumInstances(const CMPIBroker* mb, const CMPIContext* ctx,
                                             const CMPIObjectPath* op, const char** names, CMPIStatus* rc)
{
    return mb->bft->enumerateInstances(mb, ctx, op, names, rc);
}

CMPI_INLINE CMPIObjectPath* CBCreateInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                             const CMPIObjectPath* op, const CMPIInstance* inst,
                                             CMPIStatus* rc)
{
    return mb->bft->createInstance(mb, ctx, op, inst, rc);
}

CMPI_INLINE CMPIStatus CBModifyInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const CMPIInstance* inst,
                                        const char** names)
{
    return mb->bft->modifyInstance(mb, ctx, op, inst, names);
}

CMPI_INLINE CMPIStatus CBDeleteInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op)
{
    return mb->bft->deleteInstance(mb, ctx, op);
}

CMPI_INLINE CMPIData CBInvokeMethod(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                                    const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc)
{
    return mb->bft->invokeMethod(mb, ctx, op, method, in, out, rc);
}

CMPI_INLINE CMPIStatus CBDeliverIndication(const CMPIBroker* mb, const CMPIContext* ctx, const char* ns,
                                           const CMPIInstance* inst)
{
    return mb->bft->deliverIndication(mb, ctx, ns, inst);
}

CMPI_INLINE CMPIContext* CBPrepareAttachThread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    return mb->bft->prepareAttachThread(mb, ctx);
}

CMPI_INLINE CMPIStatus CBAttachThread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    return mb->bft->attachThread(mb, ctx);
}

CMPI_INLINE CMPIStatus CBDetachThread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    return mb->bft->detachThread(mb, ctx);
}

/* Any object: hdl, ft and these two slots lie alike in all of them. */
#ifdef __cplusplus
template <class Object>
inline CMPIStatus CMRelease(Object* object)
{
    return object->ft->release(object);
}

template <class Object>
inline Object* CMClone(const Object* object, CMPIStatus* rc)
{
    return object->ft->clone(object, rc);
}
#else
#define CMRelease(object) ((object)->ft->release((object)))
#define CMClone(object, rc) ((object)->ft->clone((object), (rc)))
#endif

#endif
