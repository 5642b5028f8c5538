// Whatever a server presents as instance or path, with any property, type and value, as an instance of the
// product's classes.
#include "broker/Mi_Call.h"
#include "broker/Objects.h"
#include "module/cmpi/to_cimple_instance.h"
#include "module/runtime/objects/Ref.h"
#include "tests/fuzz/Bytes.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/fuzz/Product_Classes.h"

using namespace KPRV;

namespace {

/// A server without classes of its own.
class Bare_Server : broker::Up_Calls
{
public:
    Bare_Server() : core(std::make_shared<broker::Core>(broker::Server_Options())), broker(core, *this)
    {
        core->catalogue = &_catalogue;
    }
    broker::Result up_call(const broker::Request&) override { return {.rc = CMPI_RC_ERR_INVALID_CLASS}; }
    CMPIrc deliver(const std::string&, const broker::Instance_Value&) override { return CMPI_RC_OK; }

    std::shared_ptr<broker::Core> core;

private:
    broker::No_Catalogue _catalogue;

public:
    broker::Broker broker;
};

const Meta_Class& any_class(Bytes& bytes)
{
    const Meta_Repository& classes = *product_classes();
    return *classes.meta_classes[bytes.number<std::uint16_t>() % classes.num_meta_classes];
}

/// The name of a feature of the class, or any other.
std::string any_name(Bytes& bytes, const Meta_Class& meta_class)
{
    const unsigned choice = bytes.byte();
    if (choice >= 250 || meta_class.num_meta_features == 0)
        return bytes.text();
    return meta_class.meta_features[choice % meta_class.num_meta_features]->name;
}

broker::Path_Value any_path(Bytes& bytes, unsigned depth);
broker::Instance_Value any_instance(Bytes& bytes, unsigned depth);

broker::Plain_Value any_scalar(Bytes& bytes, unsigned depth)
{
    switch (bytes.below(depth ? 8 : 6)) {
    case 0:
        return broker::Plain_Value::boolean(bytes.byte() & 1);
    case 1: {
        constexpr CMPIType types[] = {CMPI_uint8, CMPI_uint16, CMPI_uint32, CMPI_uint64, CMPI_char16};
        return broker::Plain_Value::unsigned_number(types[bytes.below(5)], bytes.number<std::uint64_t>());
    }
    case 2: {
        constexpr CMPIType types[] = {CMPI_sint8, CMPI_sint16, CMPI_sint32, CMPI_sint64};
        return broker::Plain_Value::signed_number(types[bytes.below(4)], bytes.number<std::int64_t>());
    }
    case 3:
        return broker::Plain_Value::real(bytes.byte() & 1 ? CMPI_real32 : CMPI_real64, bytes.number<float>());
    case 4:
        return broker::Plain_Value::datetime(bytes.byte() & 1 ? "20260101120000.000000+000" : bytes.text());
    case 5:
        return broker::Plain_Value::text(bytes.text());
    case 6:
        return broker::Plain_Value::path(any_path(bytes, depth - 1));
    default:
        return broker::Plain_Value::instance(any_instance(bytes, depth - 1));
    }
}

broker::Plain_Value any_value(Bytes& bytes, unsigned depth)
{
    const unsigned shape = bytes.below(8);
    if (shape == 0) {
        broker::Plain_Value value = any_scalar(bytes, depth);
        return broker::Plain_Value::null_of(value.type);
    }
    if (shape > 2)
        return any_scalar(bytes, depth);
    std::vector<broker::Plain_Value> elements{any_scalar(bytes, depth)};
    const CMPIType type = elements[0].type;
    for (unsigned n = bytes.below(4); n > 0; --n)
        if (broker::Plain_Value more = any_scalar(bytes, depth); more.type == type)
            elements.push_back(more);
    return broker::Plain_Value::array(type, elements);
}

std::vector<broker::Named_Value> any_values(Bytes& bytes, const Meta_Class& meta_class, unsigned depth)
{
    std::vector<broker::Named_Value> values;
    for (unsigned n = bytes.below(8); n > 0 && !bytes.empty(); --n) {
        std::string name = any_name(bytes, meta_class);
        values.push_back({std::move(name), any_value(bytes, depth)});
    }
    return values;
}

broker::Path_Value any_path(Bytes& bytes, unsigned depth)
{
    const Meta_Class& meta_class = any_class(bytes);
    broker::Path_Value path;
    path.name_space = "root/kaldera";
    path.class_name = bytes.below(16) ? meta_class.name : bytes.text();
    path.keys = any_values(bytes, meta_class, depth);
    return path;
}

broker::Instance_Value any_instance(Bytes& bytes, unsigned depth)
{
    const Meta_Class& meta_class = any_class(bytes);
    broker::Instance_Value instance;
    instance.path = {.name_space = "root/kaldera", .class_name = meta_class.name};
    instance.properties = any_values(bytes, meta_class, depth);
    return instance;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    Bytes bytes(data, size);
    Bare_Server server;
    broker::Mi_Frame frame(server.broker, {});
    constexpr unsigned DEPTH = 3;
    if (bytes.byte() & 1) {
        const auto* object =
            broker::make_object<broker::Path_Object>(*server.core, "fuzz", any_path(bytes, DEPTH))->cmpi();
        const Ref<Instance> result(
            _to_cimple_instance(product_classes(), server.broker.cmpi(), "root/kaldera", object));
    } else {
        const auto* object =
            broker::make_object<broker::Instance_Object>(*server.core, "fuzz", any_instance(bytes, DEPTH))
                ->cmpi();
        const Ref<Instance> result(
            _to_cimple_instance(product_classes(), server.broker.cmpi(), "root/kaldera", object));
        if (result)
            const Ref<Instance> copy(clone(result.ptr()));
    }
    FUZZ_EXPECT(server.core->violations.empty());
    return 0;
}
