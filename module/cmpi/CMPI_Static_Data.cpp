#include "module/cmpi/CMPI_Static_Data.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/exception_containment.h"
#include "module/runtime/ground/strutil.h"

namespace KPRV {

static constexpr int TABLE_VERSION = 100;

template <class Table>
static void set_versions(Table& ft)
{
    ft.ftVersion = TABLE_VERSION;
    ft.miVersion = TABLE_VERSION;
}

template <size_t N>
static const char* set_name(char (&name)[N], const char* kind, const char* provider_name)
{
    strlcpy(name, kind, N);
    strlcat(name, provider_name, N);
    return name;
}

void fill(CMPI_Static_Data* data, CMPI_Adapter* adapter, const char* provider_name)
{
    data->magic = STATIC_DATA_MAGIC;
    data->adapter = adapter;

    // All four names go into the instance table's slot, one after the other, so that it ends up with the
    // association's name and the other tables have none. Servers never read them; they stay as they are.
    const char*& name_slot = data->instance_ft.miName;

    set_versions(data->instance_ft);
    fill_instance_operations(data->instance_ft);
    name_slot = set_name(data->instance_name, "instance", provider_name);

    set_versions(data->method_ft);
    fill_method_operations(data->method_ft);
    name_slot = set_name(data->method_name, "method", provider_name);

    set_versions(data->indication_ft);
    fill_indication_operations(data->indication_ft);
    name_slot = set_name(data->indication_name, "indication", provider_name);

    set_versions(data->association_ft);
    fill_association_operations(data->association_ft);
    name_slot = set_name(data->association_name, "association", provider_name);

    fill_cleanup_operations(*data);
    contain_exceptions(*data);
}

} // namespace KPRV
