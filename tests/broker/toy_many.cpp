// TOY_Many: as many instances as the environment variable TOY_MANY says, none of which exists before it is
// returned. With TOY_MANY_FAILS the enumeration fails behind the last; in the middle it waits for a writer of
// the FIFO that TOY_MANY_WAITS names. The 2000th is wider than others, and of the 3000th on there is more to
// tell.
#include "tests/broker/toy.h"

#include <cstdio>
#include <cstdlib>

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
        CMReturnObjectPath(result, path);
        wait_in_the_middle(id);
        CMRelease(path);
    }
    return finish(result);
}

CMPIStatus return_instances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath*, const char**)
{
    for (CMPIUint32 id = 1; id <= wanted(); ++id) {
        CMPIObjectPath* path = many_path(id);
        CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
        CMSetProperty(instance, "Id", &id, CMPI_uint32);
        CMSetProperty(instance, "Text", id == 2000 ? "wider than all before" : "as all", CMPI_chars);
        if (id >= 3000)
            CMSetProperty(instance, "Late", "now", CMPI_chars);
        const CMPIStatus status = CMReturnInstance(result, instance);
        CMRelease(instance);
        CMRelease(path);
        wait_in_the_middle(id);
        if (status.rc != CMPI_RC_OK)
            return status;
    }
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
