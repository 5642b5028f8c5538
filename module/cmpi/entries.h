#pragma once

#include <cmpidt.h>
#include <cmpift.h>

// The functions behind the four tables of a provider, by the operation that each serves. They have the
// signatures of their slots and throw whatever a provider throws.

namespace KPRV {

struct CMPI_Static_Data;

/// Each sets the slots of its table; version words and names are set by `fill`.
void fill_instance_operations(CMPIInstanceMIFT& ft);
void fill_method_operations(CMPIMethodMIFT& ft);
void fill_association_operations(CMPIAssociationMIFT& ft);
void fill_indication_operations(CMPIIndicationMIFT& ft);
void fill_cleanup_operations(CMPI_Static_Data& data);

} // namespace KPRV
