// Methods of TOY_Item that break the contract, each in one way.
#include "tests/broker/toy.h"

#include <stdexcept>
#include <thread>

namespace toy {

namespace {

CMPIString* kept;

CMPIString* text()
{
    return CMNewString(broker, "text", nullptr);
}

CMPIStatus release_twice(const Call& call)
{
    CMPIString* string = text();
    CMRelease(string);
    CMRelease(string);
    return call.answer(0);
}

CMPIStatus use_after_release(const Call& call)
{
    CMPIString* string = text();
    CMRelease(string);
    return call.answer(CMGetCharPtr(string) != nullptr);
}

CMPIStatus keep(const Call& call)
{
    kept = text();
    return call.answer(0);
}

CMPIStatus use_kept(const Call& call)
{
    return call.answer(CMGetCharPtr(kept) != nullptr);
}

CMPIStatus release_argument(const Call& call)
{
    return call.answer(CMRelease(const_cast<CMPIArgs*>(call.in)).rc);
}

CMPIStatus unknown_type(const Call& call)
{
    CMPIUint32 number = 1;
    return call.answer(CMAddArg(call.out, "Name", &number, 17).rc);
}

CMPIStatus wrong_object(const Call& call)
{
    CMPIObjectPath* path = CMNewObjectPath(broker, "root", "C", nullptr);
    return call.answer(CMAddArg(call.out, "Name", &path, CMPI_string).rc);
}

CMPIStatus null_object(const Call& call)
{
    CMPIString* none = nullptr;
    return call.answer(CMAddArg(call.out, "Name", &none, CMPI_string).rc);
}

CMPIStatus foreign_object(const Call& call)
{
    CMPIString own = {nullptr, text()->ft};
    CMPIString* address = &own;
    CMGetCharPtr(address);
    return call.answer(CMAddArg(call.out, "Name", &address, CMPI_string).rc);
}

CMPIStatus null_name(const Call& call)
{
    CMPIUint32 number = 1;
    return call.answer(CMAddArg(call.out, nullptr, &number, CMPI_uint32).rc);
}

CMPIStatus null_text(const Call& call)
{
    return call.answer(CMNewString(broker, nullptr, nullptr) != nullptr);
}

CMPIStatus bad_datetime(const Call& call)
{
    return call.answer(CMNewDateTimeFromChars(broker, "yesterday", nullptr) != nullptr);
}

CMPIStatus bad_index(const Call& call)
{
    CMPIStatus rc = {};
    CMGetArgAt(call.in, 99, nullptr, &rc);
    return call.answer(rc.rc);
}

CMPIStatus wrong_element(const Call& call)
{
    CMPIUint32 number = 1;
    CMPIArray* array = CMNewArray(broker, 1, CMPI_uint16, nullptr);
    return call.answer(CMSetArrayElementAt(array, 0, &number, CMPI_uint32).rc);
}

CMPIStatus released_element(const Call& call)
{
    CMPIArray* array = CMNewArray(broker, 1, CMPI_string, nullptr);
    CMPIString* string = text();
    CMSetArrayElementAt(array, 0, &string, CMPI_string);
    CMRelease(string);
    return call.answer(CMAddArg(call.out, "Name", &array, CMPI_stringA).rc);
}

CMPIStatus wrong_array(const Call& call)
{
    CMPIArray* array = CMNewArray(broker, 1, CMPI_string, nullptr);
    return call.answer(CMAddArg(call.out, "Name", &array, CMPI_uint16A).rc);
}

CMPIStatus null_key(const Call& call)
{
    CMPIObjectPath* path = CMNewObjectPath(broker, "root", "C", nullptr);
    return call.answer(CMAddKey(path, "Key", nullptr, CMPI_string).rc);
}

CMPIStatus past_the_end(const Call& call)
{
    CMPIStatus rc = {};
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/other", "TOY_Other", nullptr);
    CMPIEnumeration* others = CBEnumInstances(broker, call.context, path, nullptr, &rc);
    while (others && CMHasNext(others, nullptr))
        CMGetNext(others, nullptr);
    if (others)
        CMGetNext(others, &rc);
    return call.answer(rc.rc);
}

CMPIStatus unattached(const Call& call)
{
    std::thread([] { text(); }).join();
    return call.answer(0);
}

CMPIStatus other_thread(const Call& call)
{
    CMPIString* string = text();
    CMPIStatus rc = {};
    std::thread([&] { rc = CMRelease(string); }).join();
    return call.answer(rc.rc);
}

CMPIStatus attach_twice(const Call& call)
{
    return call.answer(CBAttachThread(broker, call.context).rc);
}

CMPIStatus stay_attached(const Call& call)
{
    CMPIContext* context = CBPrepareAttachThread(broker, call.context);
    std::thread([&] { CBAttachThread(broker, context); }).join();
    return call.answer(0);
}

CMPIStatus lost_clone(const Call& call)
{
    CMClone(text(), nullptr);
    return call.answer(0);
}

CMPIStatus no_return(const Call&)
{
    return ok;
}

CMPIStatus return_instance(const Call& call)
{
    CMReturnInstance(call.result, CMNewInstance(broker, call.path, nullptr));
    return call.answer(0);
}

CMPIStatus after_done(const Call& call)
{
    call.answer(0);
    return call.answer(1);
}

CMPIStatus throws(const Call&)
{
    throw std::runtime_error("thrown by the toy");
}

CMPIStatus null_broker(const Call& call)
{
    return call.answer(broker->eft->newArgs(nullptr, nullptr) != nullptr);
}

CMPIStatus clone_context(const Call& call)
{
    return call.answer(CMClone(call.context, nullptr) != nullptr);
}

} // namespace

const Method misdeeds[] = {
    {"ReleaseTwice", release_twice},
    {"UseAfterRelease", use_after_release},
    {"Keep", keep},
    {"UseKept", use_kept},
    {"ReleaseArgument", release_argument},
    {"UnknownType", unknown_type},
    {"WrongObject", wrong_object},
    {"NullObject", null_object},
    {"ForeignObject", foreign_object},
    {"NullName", null_name},
    {"NullText", null_text},
    {"BadDatetime", bad_datetime},
    {"BadIndex", bad_index},
    {"WrongElement", wrong_element},
    {"ReleasedElement", released_element},
    {"WrongArray", wrong_array},
    {"NullKey", null_key},
    {"PastTheEnd", past_the_end},
    {"Unattached", unattached},
    {"OtherThread", other_thread},
    {"AttachTwice", attach_twice},
    {"StayAttached", stay_attached},
    {"LostClone", lost_clone},
    {"NoReturn", no_return},
    {"ReturnInstance", return_instance},
    {"AfterDone", after_done},
    {"Throws", throws},
    {"NullBroker", null_broker},
    {"CloneContext", clone_context},
    {nullptr, nullptr},
};

} // namespace toy
