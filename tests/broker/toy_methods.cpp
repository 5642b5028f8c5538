// Methods of TOY_Item that keep to the contract.
#include "tests/broker/toy.h"

#include <thread>

namespace toy {

std::string Call::text(const char* name) const
{
    CMPIStatus rc = {};
    CMPIData data = in->ft->getArg(in, name, &rc);
    return rc.rc == CMPI_RC_OK && data.type == CMPI_string && !data.state ? CMGetCharPtr(data.value.string)
                                                                          : "";
}

CMPIStatus Call::answer(CMPIUint32 number) const
{
    CMReturnData(result, &number, CMPI_uint32);
    return CMReturnDone(result);
}

namespace {

/// Hands each in argument back under its own name and type; returns their number.
CMPIStatus echo(const Call& call)
{
    CMPICount count = CMGetArgCount(call.in, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = nullptr;
        CMPIData data = CMGetArgAt(call.in, i, &name, nullptr);
        bool null = data.state & CMPI_nullValue;
        CMAddArg(call.out, CMGetCharPtr(name), null ? nullptr : &data.value, data.type);
    }
    return call.answer(count);
}

/// An embedded instance, a reference and an array of each.
CMPIStatus embed(const Call& call)
{
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/toy", "TOY_Part", nullptr);
    CMAddKey(path, "Key", "k", CMPI_chars);
    CMPIInstance* part = CMNewInstance(broker, path, nullptr);
    CMSetProperty(part, "Key", "k", CMPI_chars);
    CMAddArg(call.out, "Part", &part, CMPI_instance);
    CMAddArg(call.out, "Ref", &path, CMPI_ref);
    CMPIArray* parts = CMNewArray(broker, 1, CMPI_instance, nullptr);
    CMSetArrayElementAt(parts, 0, &part, CMPI_instance);
    CMAddArg(call.out, "Parts", &parts, CMPI_instanceA);
    CMPIArray* refs = CMNewArray(broker, 1, CMPI_ref, nullptr);
    CMSetArrayElementAt(refs, 0, &path, CMPI_ref);
    CMAddArg(call.out, "Refs", &refs, CMPI_refA);
    return call.answer(0);
}

CMPIObjectPath* other_path(const Call& call)
{
    CMPIObjectPath* path =
        CMNewObjectPath(broker, call.text("Namespace").c_str(), call.text("Class").c_str(), nullptr);
    if (!call.text("Key").empty())
        CMAddKey(path, "Key", call.text("Key").c_str(), CMPI_chars);
    return path;
}

/// The up-calls answer their own rc as return value.
CMPIStatus count_others(const Call& call)
{
    CMPIStatus rc = {};
    CMPIEnumeration* others = CBEnumInstances(broker, call.context, other_path(call), nullptr, &rc);
    CMPIUint32 count = 0;
    while (others && CMHasNext(others, nullptr) && CMGetNext(others, nullptr).type == CMPI_instance)
        ++count;
    CMAddArg(call.out, "Count", &count, CMPI_uint32);
    return call.answer(rc.rc);
}

CMPIStatus get_other(const Call& call)
{
    CMPIStatus rc = {};
    CMPIInstance* other = CBGetInstance(broker, call.context, other_path(call), nullptr, &rc);
    if (other)
        CMAddArg(call.out, "Other", &other, CMPI_instance);
    return call.answer(rc.rc);
}

CMPIStatus create_other(const Call& call)
{
    CMPIStatus rc = {};
    CMPIObjectPath* path = other_path(call);
    CMPIObjectPath* made =
        CBCreateInstance(broker, call.context, path, CMNewInstance(broker, path, nullptr), &rc);
    if (made)
        CMAddArg(call.out, "Path", &made, CMPI_ref);
    return call.answer(rc.rc);
}

CMPIStatus modify_other(const Call& call)
{
    CMPIObjectPath* path = other_path(call);
    CMPIInstance* change = CMNewInstance(broker, path, nullptr);
    CMSetProperty(change, "Value", call.text("Value").c_str(), CMPI_chars);
    return call.answer(CBModifyInstance(broker, call.context, path, change, nullptr).rc);
}

CMPIStatus delete_other(const Call& call)
{
    return call.answer(CBDeleteInstance(broker, call.context, other_path(call)).rc);
}

CMPIStatus call_other(const Call& call)
{
    CMPIStatus rc = {};
    CMPIArgs* in = CMNewArgs(broker, nullptr);
    CMAddArg(in, "Text", call.text("Value").c_str(), CMPI_chars);
    CMPIData data = CBInvokeMethod(broker, call.context, other_path(call), call.text("Method").c_str(), in,
                                   call.out, &rc);
    return call.answer(rc.rc ? CMPIUint32(rc.rc) : 1000 + data.value.uint32);
}

/// The authenticated user, by its three states: an entry with text, without text, or none.
CMPIStatus user(const Call& call)
{
    CMPIStatus rc = {};
    CMPIData data = CMGetContextEntry(call.context, CMPIPrincipal, &rc);
    if (rc.rc)
        return call.answer(rc.rc);
    if (const char* text = CMGetCharPtr(data.value.string))
        CMAddArg(call.out, "User", text, CMPI_chars);
    return call.answer(0);
}

CMPIStatus worker(const Call& call)
{
    CMPIContext* context = CBPrepareAttachThread(broker, call.context);
    std::thread([&] {
        CBAttachThread(broker, context);
        CMNewString(broker, "freed by detaching", nullptr);
        CMRelease(CMNewString(broker, "released", nullptr));
        CBDetachThread(broker, context);
    }).join();
    return call.answer(0);
}

/// A method may return nothing: a null value without a type.
CMPIStatus nothing(const Call& call)
{
    CMReturnData(call.result, nullptr, CMPI_null);
    return CMReturnDone(call.result);
}

CMPIStatus object_types(const Call& call)
{
    CMPIString* type = broker->eft->getType(broker, call.path, nullptr);
    CMAddArg(call.out, "Type", CMGetCharPtr(type), CMPI_chars);
    bool right = broker->eft->isOfType(broker, call.path, "CMPIObjectPath", nullptr) &&
                 broker->eft->classPathIsA(broker, call.path, "toy_item", nullptr);
    return call.answer(right);
}

} // namespace

const Method methods[] = {
    {"Echo", echo},
    {"Embed", embed},
    {"CountOthers", count_others},
    {"GetOther", get_other},
    {"CreateOther", create_other},
    {"ModifyOther", modify_other},
    {"DeleteOther", delete_other},
    {"CallOther", call_other},
    {"User", user},
    {"Worker", worker},
    {"Nothing", nothing},
    {"ObjectTypes", object_types},
    {nullptr, nullptr},
};

} // namespace toy
