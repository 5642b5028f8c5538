#include "tests/kldrcim/wire/Wire_Fixture.h"

namespace KPRV::kldrcim {

using Instance_Writing = Wire_Test;

TEST_F(Instance_Writing, IsReadAsItWas)
{
    const Instance_Value instance = all_kinds();
    const Instance_Value again = instance_of(instance_text(instance));
    ASSERT_EQ(instance.properties.size(), again.properties.size());
    for (std::size_t i = 0; i < instance.properties.size(); ++i)
        EXPECT_TRUE(instance.properties[i] == again.properties[i])
            << instance_text({{}, {instance.properties[i]}}) << "\n"
            << instance_text({{}, {again.properties[i]}});
    EXPECT_EQ("Anything", again.path.class_name);
}

TEST_F(Instance_Writing, IsForOldClients)
{
    const Instance_Value inner{{.class_name = "B"}, {{"t", Plain_Value::text("\"<")}}};
    const Instance_Value instance{{.class_name = "A"},
                                  {{"N", Plain_Value::null_of(CMPI_uint8)},
                                   {"E", Plain_Value::instance(inner)},
                                   {"F", Plain_Value::null_of(CMPI_ref)}}};
    EXPECT_EQ(
        "<INSTANCE CLASSNAME=\"A\"><PROPERTY NAME=\"N\" TYPE=\"uint8\"></PROPERTY>"
        "<PROPERTY NAME=\"E\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE>"
        "&lt;INSTANCE CLASSNAME=\"B\"&gt;&lt;PROPERTY NAME=\"t\" TYPE=\"string\"&gt;&lt;VALUE&gt;\"&amp;lt;"
        "&lt;/VALUE&gt;&lt;/PROPERTY&gt;&lt;/INSTANCE&gt;</VALUE></PROPERTY>"
        "<PROPERTY.REFERENCE NAME=\"F\"></PROPERTY.REFERENCE></INSTANCE>",
        instance_text(instance));
}

TEST_F(Instance_Writing, HasTheWantedPropertiesOnly)
{
    const Instance_Value instance{
        {.class_name = "Toy_Ball"},
        {{"Name", Plain_Value::text("n")}, {"Size", Plain_Value::unsigned_number(CMPI_uint8, 1)}}};
    EXPECT_EQ("<INSTANCE CLASSNAME=\"Toy_Ball\"></INSTANCE>",
              instance_text(instance, {.properties = std::vector<std::string>()}));
    EXPECT_EQ(
        "<INSTANCE CLASSNAME=\"Toy_Ball\"><PROPERTY NAME=\"Size\" TYPE=\"uint8\"><VALUE>1</VALUE></PROPERTY>"
        "</INSTANCE>",
        instance_text(instance, {.properties = {{"SIZE", "Size", "Nothing"}}}));
    EXPECT_EQ(
        "<INSTANCE CLASSNAME=\"Toy_Ball\"><PROPERTY NAME=\"Name\" TYPE=\"string\" CLASSORIGIN=\"Toy_Base\">"
        "<VALUE>n</VALUE></PROPERTY></INSTANCE>",
        instance_text(instance, {.seen_as = _classes.find("Toy_Base"), .origins = &_classes}));
}

TEST_F(Instance_Writing, KeepsPaths)
{
    Path_Value path = ball("a\"\\<&> \n\xC3\xA4", 255);
    path.name_space = "root/toy";
    EXPECT_TRUE(path ==
                path_of(written([&](Xml_Writer& writer) { write_local_instance_path(writer, path); })));
    const auto full = [&] {
        return path_of(written([&](Xml_Writer& writer) { write_instance_path(writer, path, "me"); }));
    };
    EXPECT_EQ("me", full().host);
    EXPECT_TRUE(same_object(path, full()));
    path.host = "other";
    EXPECT_EQ("other", full().host);
    const Path_Value of_class =
        path_of(written([](Xml_Writer& writer) { write_class_path(writer, "root/toy", "A", "h"); }));
    EXPECT_EQ("h root/toy A", of_class.host + " " + of_class.name_space + " " + of_class.class_name);
    const Path_Value local =
        path_of(written([](Xml_Writer& writer) { write_local_class_path(writer, "/root//toy/", "A"); }));
    EXPECT_EQ("root/toy A", local.name_space + " " + local.class_name);
}

TEST_F(Instance_Writing, KeepsParameters)
{
    for (const Named_Value& property : all_kinds().properties) {
        const std::string text = written([&](Xml_Writer& writer) { write_parameter(writer, property); });
        const Named_Value again = read(text, [](const Instance_Reader& reader, Xml_Node node) {
            return reader.parameter(node, nullptr);
        });
        // That nothing is an array of nothing, only a declaration tells.
        if (property.value.is_array() && property.value.null)
            EXPECT_TRUE(again.value.null) << text;
        else
            EXPECT_TRUE(property == again) << text;
    }
    EXPECT_EQ("<RETURNVALUE PARAMTYPE=\"uint32\"><VALUE>0</VALUE></RETURNVALUE>",
              written([](Xml_Writer& writer) {
                  write_return_value(writer, Plain_Value::unsigned_number(CMPI_uint32, 0));
              }));
}

} // namespace KPRV::kldrcim
