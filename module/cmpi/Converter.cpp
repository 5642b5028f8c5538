#include "module/cmpi/Converter.h"
#include "module/cmpi/CMPI_Containers.h"
#include "module/cmpi/Made_Objects.h"
#include "module/cmpi/cmpi_text.h"
#include "module/runtime/system/log.h"

namespace KPRV {

/// Whether an end of a request frees what is made, or nobody does.
enum class Afterwards
{
    SERVER_FREES,
    GIVE_BACK,
};

static CMPIrc make_path(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                        Afterwards afterwards, CMPIObjectPath*& path, Shared_Ends* ends)
{
    const Meta_Class* const meta_class = instance->__meta_class;
    path = CMNewObjectPath(broker, name_space, meta_class->name, nullptr);
    if (!path)
        return CMPI_RC_ERR_FAILED;
    CMPIObjectPath_Container container(meta_class->meta_repository, broker, name_space, path);
    if (afterwards == Afterwards::GIVE_BACK)
        container.give_back_what_is_made();
    else
        container.share(ends);
    return container.convert(instance, FLAG_KEY) == 0 ? CMPI_RC_OK : CMPI_RC_ERR_FAILED;
}

CMPIrc make_cmpi_object_path(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                             CMPIObjectPath*& path, Shared_Ends* ends)
{
    return make_path(broker, instance, name_space, Afterwards::SERVER_FREES, path, ends);
}

CMPIrc make_cmpi_instance(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                          const CMPIObjectPath* path, const char** properties, CMPIInstance*& ci,
                          Shared_Ends* ends)
{
    ci = nullptr;
    // Without the path of a request there is no request: the caller is a thread of the module's own, so that
    // whatever is made here besides the instance is given back here.
    const Afterwards afterwards = path ? Afterwards::SERVER_FREES : Afterwards::GIVE_BACK;
    Made_Objects made;
    if (!path) {
        LOG_CONVERSION(WARN, "No ObjectPath built before call to make_CMPI_instance");
        CMPIObjectPath* built;
        const CMPIrc rc = make_path(broker, instance, name_space, afterwards, built, nullptr);
        path = made.note(built);
        if (rc != CMPI_RC_OK)
            return CMPI_RC_ERR_FAILED;
    }
    ci = CMNewInstance(broker, path, nullptr);
    if (!ci)
        return CMPI_RC_ERR_FAILED;
    if (properties) {
        // Without key names: a server that drops what the list leaves out drops keys too.
        const CMPIStatus status = CMSetPropertyFilter(ci, properties, nullptr);
        if (status.rc != CMPI_RC_OK)
            return status.rc;
    }
    CMPIInstance_Container container(instance->__meta_class->meta_repository, broker, name_space, ci);
    if (afterwards == Afterwards::GIVE_BACK)
        container.give_back_what_is_made();
    else
        container.share(ends);
    return container.convert(instance, 0) == 0 ? CMPI_RC_OK : CMPI_RC_ERR_FAILED;
}

CMPIrc make_cmpi_method(const CMPIBroker* broker, const char* name_space, const Instance* method_record,
                        const CMPIArgs* out, CMPIValue& value, CMPIType& type)
{
    // A method record has no repository, and none is needed on the way out.
    CMPIArgs_Container container(nullptr, broker, name_space, out);
    if (container.convert(method_record, FLAG_OUT) != 0)
        return CMPI_RC_ERR_FAILED;
    value = container.return_value.value;
    type = container.return_value.type;
    return CMPI_RC_OK;
}

/// The shape of the three imports: a fresh instance, filled from the container, in the path's name space.
/// `neighbour` may have that text already.
template <class Make_Container>
static CMPIrc import(const Meta_Class* meta_class, uint32 mask, const CMPIObjectPath* path,
                     Ref<Instance>& instance, const Instance* neighbour, Make_Container make_container)
{
    instance.reset();
    if (!path)
        return CMPI_RC_ERR_FAILED;
    const char* const name_space = name_space_of(path);
    Instance* imported = nullptr;
    // Either way (statement): in this direction what does not convert is left out, and that is no failure.
    if (make_container(name_space).convert(meta_class, mask, imported) != 0)
        return CMPI_RC_ERR_FAILED;
    instance = Ref<Instance>(imported);
    const bool shared = neighbour && neighbour->__name_space == name_space;
    __set_name_space_recursive(instance.ptr(), shared ? neighbour->__name_space : String(name_space), false);
    return CMPI_RC_OK;
}

CMPIrc make_cimple_instance(const CMPIBroker* broker, const Meta_Class* meta_class,
                            const CMPIObjectPath* path, const CMPIInstance* ci, Ref<Instance>& instance)
{
    return import(meta_class, 0, path, instance, nullptr, [&](const char* name_space) {
        return CMPIInstance_Container(meta_class->meta_repository, broker, name_space, ci);
    });
}

CMPIrc make_cimple_method(const CMPIBroker* broker, const Meta_Class* meta_class,
                          const Meta_Method* meta_method, const CMPIObjectPath* path, const CMPIArgs* in,
                          void*, Ref<Instance>& record, const Instance* called_on)
{
    return import(as_class(meta_method), FLAG_IN, path, record, called_on, [&](const char* name_space) {
        return CMPIArgs_Container(meta_class->meta_repository, broker, name_space, in);
    });
}

CMPIrc make_cimple_reference(const CMPIBroker* broker, const Meta_Class* meta_class,
                             const CMPIObjectPath* path, Ref<Instance>& instance)
{
    return import(meta_class, FLAG_KEY, path, instance, nullptr, [&](const char* name_space) {
        return CMPIObjectPath_Container(meta_class->meta_repository, broker, name_space, path);
    });
}

} // namespace KPRV
