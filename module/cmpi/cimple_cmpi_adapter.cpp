#include "module/cmpi/cimple_cmpi_adapter.h"
#include "module/cmpi/CMPI_Adapter.h"

using namespace KPRV;

/// Joins the MI to its table and hands it out.
template <class MI, class Table>
static void hand_out(MI& mi, const Table& ft, CMPI_Static_Data* data, void** mi_out)
{
    mi.hdl = data;
    mi.ft = &ft;
    *mi_out = &mi;
}

extern "C" int cimple_cmpi_adapter(char, void* static_data, const Registration* registration,
                                   const CMPIBroker* broker, const CMPIContext* context,
                                   const char* provider_name, char mi_kind, void** mi_out)
{
    constexpr const char* function = "cimple_cmpi_adapter";
    auto* const data = static_cast<CMPI_Static_Data*>(static_data);

    if (data->adapter)
        data->adapter->load_count++;
    else
        new CMPI_Adapter(broker, context, provider_name, registration, data); // the block holds it from now

    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, function);
    switch (mi_kind) {
    case 'I':
        hand_out(data->instance_mi, data->instance_ft, data, mi_out);
        break;
    case 'M':
        hand_out(data->method_mi, data->method_ft, data, mi_out);
        break;
    case 'A':
        hand_out(data->association_mi, data->association_ft, data, mi_out);
        break;
    case 'N':
        hand_out(data->indication_mi, data->indication_ft, data, mi_out);
        break;
    default:
        break;
    }
    CMPI_Adapter::ret(__FILE_NAME__, __LINE__, function);
    return 0;
}
