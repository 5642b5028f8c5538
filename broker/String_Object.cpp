// The function table of `CMPIString`.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

const char* get_char_ptr(const CMPIString* self, CMPIStatus* rc)
{
    Call<String_Object> call("CMGetCharsPtr", self, rc);
    return call ? call->held().data() : nullptr;
}

} // namespace

const CMPIStringFT string_table = {CMPIVersion100, release_slot<String_Object>, clone_slot<String_Object>,
                                   get_char_ptr};

} // namespace KPRV::broker
