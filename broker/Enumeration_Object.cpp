// The function table of `CMPIEnumeration`: what an up-call found, read once from front to back.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

CMPIData get_next(const CMPIEnumeration* self, CMPIStatus* rc)
{
    Call<Enumeration_Object> call("CMGetNext", self, rc);
    if (!call)
        return no_data(CMPI_nullValue);
    if (call->next >= call->elements.size()) {
        call.violation(call.core(), CMPI_RC_NO_MORE_ELEMENTS, "past the end");
        return no_data(CMPI_nullValue);
    }
    CMPIData data = make_data(call.core(), call.name(), call->elements[call->next++]);
    if (call.core().options.null_bit_on_elements)
        data.state |= CMPI_nullValue;
    return data;
}

CMPIBoolean has_next(const CMPIEnumeration* self, CMPIStatus* rc)
{
    Call<Enumeration_Object> call("CMHasNext", self, rc);
    return call && call->next < call->elements.size();
}

CMPIArray* to_array(const CMPIEnumeration* self, CMPIStatus* rc)
{
    Call<Enumeration_Object> call("CMToArray", self, rc);
    if (!call)
        return nullptr;
    CMPIType type = call->elements.empty() ? CMPIType(CMPI_instance) : call->elements.front().type;
    return make_object<Array_Object>(call.core(), call.name(), Plain_Value::array(type, call->elements))
        ->cmpi();
}

} // namespace

const CMPIEnumerationFT enumeration_table = {
    CMPIVersion100, release_slot<Enumeration_Object>, clone_slot<Enumeration_Object>, get_next, has_next,
    to_array};

} // namespace KPRV::broker
