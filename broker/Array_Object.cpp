// The function table of `CMPIArray`: of fixed size and one type, as it was made.
#include "broker/Convert.h"
#include "broker/values/Type_Words.h"
#include "broker/values/Value_Bytes.h"

#include <bit>

namespace KPRV::broker {

Array_Object::Array_Object(Core& owner_core, CMPIType type, std::size_t size)
    : Object_Of(owner_core, array_table), element_type(type), elements(size)
{
    for (Element& element : elements)
        element.value = Plain_Value::null_of(type);
}

Array_Object::Array_Object(Core& owner_core, const Plain_Value& value)
    : Object_Of(owner_core, array_table), element_type(value.element_type())
{
    for (const Plain_Value& element : value.elements())
        elements.push_back({element, nullptr});
}

bool Array_Object::pack()
{
    Byte_Writer writer;
    writer.number(elements.size());
    for (const Element& element : elements) {
        writer.number(reinterpret_cast<std::uintptr_t>(element.object));
        writer.value(element.value);
    }
    hold(writer.bytes());
    free_all(elements);
    return true;
}

void Array_Object::unpack()
{
    Byte_Reader reader(held());
    std::vector<Element> read(reader.number());
    for (Element& element : read) {
        element.object = std::bit_cast<const void*>(static_cast<std::uintptr_t>(reader.number()));
        element.value = reader.value();
    }
    elements = std::move(read);
    let_go();
}

namespace {

CMPICount get_size(const CMPIArray* self, CMPIStatus* rc)
{
    Call<Array_Object> call("CMGetArrayCount", self, rc);
    return call ? static_cast<CMPICount>(call->elements.size()) : 0;
}

CMPIType get_simple_type(const CMPIArray* self, CMPIStatus* rc)
{
    Call<Array_Object> call("CMGetArrayType", self, rc);
    return call ? call->element_type : CMPIType(CMPI_null);
}

bool in_range(Call<Array_Object>& call, CMPICount index)
{
    if (index < call->elements.size())
        return true;
    call.violation(call.core(), CMPI_RC_ERR_NO_SUCH_PROPERTY,
                   "index " + std::to_string(index) + " of " + std::to_string(call->elements.size()));
    return false;
}

CMPIData get_element_at(const CMPIArray* self, CMPICount index, CMPIStatus* rc)
{
    Call<Array_Object> call("CMGetArrayElementAt", self, rc);
    if (!call || !in_range(call, index))
        return no_data(CMPI_nullValue);
    return make_data(call.core(), call.name(), call->elements[index].value);
}

CMPIStatus set_element_at(const CMPIArray* self, CMPICount index, const CMPIValue* value, CMPIType type)
{
    Call<Array_Object> call("CMSetArrayElementAt", self, nullptr);
    if (!call || !in_range(call, index))
        return call.status();
    Array_Object::Element element;
    if (read_value(call, call.core(), value, type, element.value))
        return call.status();
    if (element.value.type != call->element_type)
        call.violation(call.core(), CMPI_RC_ERR_TYPE_MISMATCH,
                       type_word_name(element.value.type) + " into an array of " +
                           type_word_name(call->element_type));
    if (!call)
        return call.status();
    if (value && (type & CMPI_ENC) && type != CMPI_chars && type != CMPI_charsptr)
        element.object = value->string;
    call->elements[index] = std::move(element);
    return call.status();
}

} // namespace

const CMPIArrayFT array_table = {CMPIVersion100,
                                 release_slot<Array_Object>,
                                 clone_slot<Array_Object>,
                                 get_size,
                                 get_simple_type,
                                 get_element_at,
                                 set_element_at};

} // namespace KPRV::broker
