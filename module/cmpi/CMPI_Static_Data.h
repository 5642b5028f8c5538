#pragma once

#include "module/runtime/ground/Types.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

class CMPI_Adapter;

/// The block of one provider that lives as long as the library: what the server holds pointers into. It lies
/// in a zeroed static area of 2048 bytes and is never constructed, only assigned to.
struct CMPI_Static_Data
{
    uint32 magic;
    /// Null while no adapter is alive.
    CMPI_Adapter* adapter;
    CMPIInstanceMIFT instance_ft;
    CMPIMethodMIFT method_ft;
    CMPIIndicationMIFT indication_ft;
    CMPIAssociationMIFT association_ft;
    CMPIInstanceMI instance_mi;
    CMPIMethodMI method_mi;
    CMPIAssociationMI association_mi;
    CMPIIndicationMI indication_mi;
    char instance_name[256];
    char method_name[256];
    char indication_name[256];
    char association_name[256];
};

inline constexpr uint32 STATIC_DATA_MAGIC = 0x5DE2B131;
inline constexpr uint32 STATIC_DATA_DEAD = 0xDDDDDDDD;
inline constexpr size_t STATIC_DATA_AREA = 2048;

static_assert(sizeof(CMPI_Static_Data) <= STATIC_DATA_AREA);
#if defined(KLDR_CMPI_INTERFACE) && CMPI_VERSION == 100
static_assert(sizeof(CMPI_Static_Data) == (sizeof(void*) == 4 ? 1200 : 1344));
#endif

/// Fills magic, adapter, the four tables and the names, but not the MI objects: those belong to the factory
/// that hands them out.
void fill(CMPI_Static_Data* data, CMPI_Adapter* adapter, const char* provider_name);

/// The adapter behind any MI: its `hdl` is the static block.
template <class T>
CMPI_Adapter* _adapter(const T* mi)
{
    return static_cast<const CMPI_Static_Data*>(mi->hdl)->adapter;
}

} // namespace KPRV
