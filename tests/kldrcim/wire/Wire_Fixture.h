#pragma once

#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Instance_Writing.h"
#include "kldrcim/wire/Xml_Reader.h"
#include "tests/kldrcim/wire/Toy_Classes.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

/// What a message is refused with that is not valid, where a status is compared.
constexpr CMPIrc NOT_VALID = CMPI_RC_ERROR;

/// Texts read with the toy classes, or without any.
class Wire_Test : public testing::Test
{
protected:
    template <class Function>
    auto read(const std::string& text, Function function, bool with_classes = true)
    {
        Xml_Reader reader;
        EXPECT_TRUE(reader.feed(text) && reader.finish()) << reader.fault_text() << "\n" << text;
        const Class_Catalogue& catalogue =
            with_classes ? static_cast<const Class_Catalogue&>(_classes) : _no_classes;
        return function(Instance_Reader(catalogue), reader.document().root());
    }
    Instance_Value instance_of(const std::string& text, bool with_classes = true)
    {
        const auto get = [](const Instance_Reader& reader, Xml_Node node) { return reader.instance(node); };
        return read(text, get, with_classes);
    }
    Path_Value path_of(const std::string& text)
    {
        return read(text, [](const Instance_Reader& reader, Xml_Node node) { return reader.path(node); });
    }

    template <class Function>
    static std::string written(Function function)
    {
        std::string out;
        Xml_Writer writer(out);
        function(writer);
        return out;
    }
    static std::string instance_text(const Instance_Value& instance, const Instance_Form& form = {})
    {
        return written([&](Xml_Writer& writer) { write_instance(writer, instance, form); });
    }

    template <class Function>
    static CMPIrc status_of(Function function)
    {
        try {
            function();
        } catch (const Wire_Error& error) {
            return error.is_not_valid() ? NOT_VALID : error.rc();
        }
        return CMPI_RC_OK;
    }

    static Path_Value ball(const char* name, std::uint64_t size)
    {
        return {.class_name = "Toy_Ball",
                .keys = {{"Name", Plain_Value::text(name)},
                         {"Size", Plain_Value::unsigned_number(CMPI_uint8, size)}}};
    }

    /// A property of each type, null ones and arrays too.
    static Instance_Value all_kinds();

    const Toy_Classes _classes;
    const No_Catalogue _no_classes;
};

inline Instance_Value Wire_Test::all_kinds()
{
    const Instance_Value inner{{.class_name = "Inner"}, {{"Text", Plain_Value::text("<&\"> \xC3\xA4\r\n")}}};
    Path_Value near = ball("n", 1), far = ball("f", 2);
    near.name_space = far.name_space = "root/toy";
    far.host = "elsewhere:5988";
    Instance_Value instance{{.class_name = "Anything"}, {}};
    const auto add = [&](const std::string& name, Plain_Value value) {
        instance.properties.push_back({name, std::move(value)});
    };
    add("B", Plain_Value::boolean(true));
    add("S", Plain_Value::text(""));
    add("C", Plain_Value::unsigned_number(CMPI_char16, 0x20AC));
    for (const CMPIType type : {CMPI_uint8, CMPI_uint16, CMPI_uint32, CMPI_uint64})
        add("U" + std::to_string(type), Plain_Value::unsigned_number(type, 200));
    for (const CMPIType type : {CMPI_sint8, CMPI_sint16, CMPI_sint32, CMPI_sint64})
        add("I" + std::to_string(type), Plain_Value::signed_number(type, -100));
    add("R4", Plain_Value::real(CMPI_real32, 0.5));
    add("R8", Plain_Value::real(CMPI_real64, 1e-7));
    add("D", Plain_Value::datetime("20261122100000.000000+060"));
    add("None", Plain_Value::null_of(CMPI_uint16));
    add("NoneArray", Plain_Value::null_of(CMPI_stringA));
    add("Empty", Plain_Value::array(CMPI_uint8, {}));
    add("Texts", Plain_Value::array(CMPI_string, {Plain_Value::text("a"), Plain_Value::null_of(CMPI_string),
                                                  Plain_Value::text(" ")}));
    add("Embedded", Plain_Value::instance(inner));
    add("EmbeddedArray", Plain_Value::array(CMPI_instance, {Plain_Value::instance(inner),
                                                            Plain_Value::instance(Instance_Value())}));
    add("Plain", Plain_Value::path(ball("x", 3)));
    add("Near", Plain_Value::path(near));
    add("Far", Plain_Value::path(far));
    add("NoRef", Plain_Value::null_of(CMPI_ref));
    return instance;
}

} // namespace KPRV::kldrcim
