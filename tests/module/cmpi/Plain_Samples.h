#pragma once

#include "module/runtime/ground/Types.h"

#include <cmpidt.h>

namespace KPRV {

/// Calls `visit(type word, value)` with one telling value of each type that is copied as it is.
template <class Visit>
void for_each_plain_sample(Visit visit)
{
    visit(CMPI_boolean, boolean(true));
    visit(CMPI_uint8, uint8(255));
    visit(CMPI_sint8, sint8(-128));
    visit(CMPI_uint16, uint16(65535));
    visit(CMPI_sint16, sint16(-32768));
    visit(CMPI_uint32, uint32(0xFFFFFFFF));
    visit(CMPI_sint32, sint32(-2147483647));
    visit(CMPI_uint64, ~uint64(0));
    visit(CMPI_sint64, sint64(-5000000000));
    visit(CMPI_real32, real32(1.5));
    visit(CMPI_real64, real64(-2.25));
    visit(CMPI_char16, char16(u'\u20AC'));
}

} // namespace KPRV
