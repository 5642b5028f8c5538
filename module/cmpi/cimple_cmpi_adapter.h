#pragma once

#include "module/runtime/dispatch/Registration.h"

#include <cmpidt.h>

/// What every exported factory comes to. The first call for a provider creates its adapter and loads it,
/// later ones only count. `static_data` is the provider's zeroed static area of 2048 bytes; `mi_kind` is 'I'
/// instance, 'M' method, 'A' association or 'N' indication, and `mi_out` takes the address of that MI (it is
/// left alone for any other kind). `kind_tag` is not read. Always 0; a provider's exceptions pass through.
extern "C" __attribute__((visibility("default"))) int
cimple_cmpi_adapter(char kind_tag, void* static_data, const KPRV::Registration* registration,
                    const CMPIBroker* broker, const CMPIContext* context, const char* provider_name,
                    char mi_kind, void** mi_out);
