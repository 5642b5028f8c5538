// TOY_Many: as many instances as the environment variable TOY_MANY says, none of which exists before it is
// returned. With TOY_MANY_FAILS the enumeration fails behind the last; in the middle it waits for a writer of
// the FIFO that TOY_MANY_WAITS names. The 2000th is wider than others, and of the 3000th on there is more to
// tell. With TOY_MANY_LEAVES nothing is released, and some of what is left is looked at before the end.
// Before the first leaves, the time of the monotonic clock is written into the file that TOY_MANY_NOTES
// names.
#include "tests/broker/toy.h"

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <vector>

namespace toy {

namespace {

CMPIUint32 wanted()
{
    const char* number = std::getenv("TOY_MANY");
    return number ? static_cast<CMPIUint32>(std::strtoul(number, nullptr, 10)) : 0;
}

CMPIObjectPath* many_path(CMPIUint32 id)
{
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/toy", "TOY_Many", nullptr);
    CMAddKey(path, "Id", &id, CMPI_uint32);
    return path;
}

void wait_in_the_middle(CMPIUint32 id)
{
    const char* fifo = std::getenv("TOY_MANY_WAITS");
    if (!fifo || id != wanted() / 2)
        return;
    if (std::FILE* file = std::fopen(fifo, "r"))
        std::fclose(file);
}

/// In seconds.
void note_the_first(CMPIUint32 id)
{
    const char* notes = std::getenv("TOY_MANY_NOTES");
    if (!notes || id != 1)
        return;
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC, &now);
    if (std::FILE* file = std::fopen(notes, "w")) {
        std::fprintf(file, "%lld.%09ld\n", static_cast<long long>(now.tv_sec), now.tv_nsec);
        std::fclose(file);
    }
}

/// What an instance is made of, if it is left to the server.
struct Left
{
    CMPIUint32 id;
    CMPIObjectPath* path;
    CMPIInstance* instance;
    CMPIString* text;
    CMPIDateTime* moment;
    CMPIArray* numbers;
};

std::string text_of(CMPIUint32 id)
{
    return "a text that stands for " + std::to_string(id);
}

Left leave(CMPIUint32 id, CMPIObjectPath* path, CMPIInstance* instance)
{
    Left left = {id,
                 path,
                 instance,
                 CMNewString(broker, text_of(id).c_str(), nullptr),
                 broker->eft->newDateTimeFromBinary(broker, id, 0, nullptr),
                 CMNewArray(broker, 2, CMPI_uint32, nullptr)};
    CMSetArrayElementAt(left.numbers, 1, &id, CMPI_uint32);
    CMSetProperty(instance, "Text", &left.text, CMPI_string);
    return left;
}

/// True if all reads as it did when it was made.
bool is_whole(const Left& left)
{
    const CMPIData key = left.path->ft->getKey(left.path, "Id", nullptr);
    const CMPIData id = left.instance->ft->getProperty(left.instance, "Id", nullptr);
    const CMPIData text = left.instance->ft->getProperty(left.instance, "Text", nullptr);
    return key.value.uint32 == left.id && id.value.uint32 == left.id &&
           text_of(left.id) == CMGetCharPtr(text.value.string) &&
           text_of(left.id) == CMGetCharPtr(left.text) &&
           left.moment->ft->getBinaryFormat(left.moment, nullptr) == left.id &&
           CMGetArrayElementAt(left.numbers, 0, nullptr).state == CMPI_nullValue &&
           CMGetArrayElementAt(left.numbers, 1, nullptr).value.uint32 == left.id;
}

CMPIStatus finish(const CMPIResult* result)
{
    return std::getenv("TOY_MANY_FAILS")
               ? CMPIStatus{CMPI_RC_ERR_FAILED, CMNewString(broker, "no more of them", nullptr)}
               : CMReturnDone(result);
}

CMPIStatus return_paths(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath*)
{
    for (CMPIUint32 id = 1; id <= wanted(); ++id) {
        CMPIObjectPath* path = many_path(id);
        note_the_first(id);
        CMReturnObjectPath(result, path);
        wait_in_the_middle(id);
        if (!std::getenv("TOY_MANY_LEAVES"))
            CMRelease(path);
    }
    return finish(result);
}

CMPIStatus return_instances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath*, const char**)
{
    const bool leaves = std::getenv("TOY_MANY_LEAVES");
    std::vector<Left> seldom;
    for (CMPIUint32 id = 1; id <= wanted(); ++id) {
        CMPIObjectPath* path = many_path(id);
        CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
        CMSetProperty(instance, "Id", &id, CMPI_uint32);
        CMSetProperty(instance, "Text", id == 2000 ? "wider than all before" : "as all", CMPI_chars);
        if (id >= 3000)
            CMSetProperty(instance, "Late", "now", CMPI_chars);
        if (leaves)
            if (const Left left = leave(id, path, instance); id % 1000 == 1)
                seldom.push_back(left);
        note_the_first(id);
        const CMPIStatus status = CMReturnInstance(result, instance);
        if (!leaves) {
            CMRelease(instance);
            CMRelease(path);
        }
        wait_in_the_middle(id);
        if (status.rc != CMPI_RC_OK)
            return status;
    }
    for (const Left& left : seldom)
        if (!is_whole(left))
            return {CMPI_RC_ERR_FAILED, CMNewString(broker, "what was left is not what it was", nullptr)};
    return finish(result);
}

CMPIStatus many_cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

CMPIInstanceMIFT many_table = {100,     100,     nullptr, many_cleanup, return_paths, return_instances,
                               nullptr, nullptr, nullptr, nullptr,      nullptr};
CMPIInstanceMI many_mi = {nullptr, &many_table};

} // namespace
} // namespace toy

TOY_EXPORT CMPIInstanceMI* TOY_Many_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*)
{
    toy::broker = mb;
    return &toy::many_mi;
}
