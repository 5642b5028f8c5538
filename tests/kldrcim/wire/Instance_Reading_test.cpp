#include "tests/kldrcim/wire/Wire_Fixture.h"

namespace KPRV::kldrcim {

class Instance_Reading : public Wire_Test
{
protected:
    Named_Value parameter_of(const std::string& text, const Feature_Info* declared = nullptr)
    {
        return read(text, [&](const Instance_Reader& reader, Xml_Node node) {
            return reader.parameter(node, declared);
        });
    }
    Plain_Value key(const std::string& class_name, const std::string& attributes, const std::string& text)
    {
        return path_of("<INSTANCENAME CLASSNAME='" + class_name + "'><KEYBINDING NAME='Size'><KEYVALUE " +
                       attributes + ">" + text + "</KEYVALUE></KEYBINDING></INSTANCENAME>")
            .keys.at(0)
            .value;
    }
};

TEST_F(Instance_Reading, TakesTypesFromTheClass)
{
    const Instance_Value ball = instance_of(
        "<INSTANCE CLASSNAME='toy_ball'><PROPERTY NAME='SIZE' TYPE='string'><VALUE>0x10</VALUE>"
        "</PROPERTY><PROPERTY NAME='Parts' TYPE='string'><VALUE>&lt;INSTANCE CLASSNAME='Toy_Base'/"
        "&gt;</VALUE></PROPERTY></INSTANCE>");
    EXPECT_EQ(CMPI_uint8, ball.properties[0].value.type);
    EXPECT_EQ(16U, ball.properties[0].value.as_uint());
    ASSERT_EQ(1U, ball.properties[1].value.elements().size()) << "one element without its array";
    EXPECT_EQ("Toy_Base", ball.properties[1].value.elements()[0].as_instance()->path.class_name);
    const char* too_large = "<INSTANCE CLASSNAME='Toy_Ball'><PROPERTY NAME='Size' TYPE='uint16'>"
                            "<VALUE>256</VALUE></PROPERTY></INSTANCE>";
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, status_of([&] { instance_of(too_large); }));
    EXPECT_EQ(CMPI_RC_OK, status_of([&] { instance_of(too_large, false); }));
}

TEST_F(Instance_Reading, TakesBothSpellingsOfEmbeddedObject)
{
    for (const std::string mark : {"EmbeddedObject='instance'", "EMBEDDEDOBJECT='object'",
                                   "EmbeddedObject='object' EMBEDDEDOBJECT='object'"}) {
        const Instance_Value outer =
            instance_of("<INSTANCE CLASSNAME='A'><PROPERTY NAME='E' TYPE='string' " + mark +
                        "><VALUE>&lt;INSTANCE CLASSNAME=&quot;B&quot;/&gt;</VALUE></PROPERTY></INSTANCE>");
        ASSERT_TRUE(outer.properties[0].value.as_instance()) << mark;
        EXPECT_EQ("B", outer.properties[0].value.as_instance()->path.class_name);
    }
}

TEST_F(Instance_Reading, BoundsInstancesInInstances)
{
    Instance_Value instance{{.class_name = "A"}, {}};
    const auto wrap = [&] { instance = {{.class_name = "A"}, {{"E", Plain_Value::instance(instance)}}}; };
    const auto read_again = [&] { instance_of(instance_text(instance)); };
    // Each level escapes the text once more, so that it doubles.
    for (int i = 0; i < 16; ++i)
        wrap();
    EXPECT_EQ(CMPI_RC_OK, status_of(read_again));
    wrap();
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, status_of(read_again));
    const auto embed = [&](const std::string& text) {
        instance_of(
            "<INSTANCE CLASSNAME='A'><PROPERTY NAME='E' TYPE='string' EmbeddedObject='instance'><VALUE>" +
            text + "</VALUE></PROPERTY></INSTANCE>");
    };
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, status_of([&] { embed("&lt;INSTANCE"); }));
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, status_of([&] { embed("&lt;VALUE/&gt;"); }));
}

TEST_F(Instance_Reading, TypesKeysByClassThenByNameThenByKind)
{
    EXPECT_EQ(CMPI_uint8, key("Toy_Ball", "VALUETYPE='numeric'", "3").type);
    EXPECT_EQ(CMPI_uint8, key("Toy_Ball", "VALUETYPE='string' TYPE='string'", "3").type);
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, status_of([&] { key("Toy_Ball", "", "x"); }));
    EXPECT_EQ(CMPI_sint16, key("Other", "TYPE='sint16'", "3").type);
    EXPECT_EQ(CMPI_string, key("Other", "", "3").type);
    EXPECT_EQ(CMPI_uint64, key("Other", "VALUETYPE='numeric'", "3").type);
    EXPECT_EQ(14U, key("Other", "VALUETYPE='numeric'", "0xE").as_uint());
    EXPECT_EQ(CMPI_sint64, key("Other", "VALUETYPE='numeric'", "-3").type);
    EXPECT_EQ(CMPI_real64, key("Other", "VALUETYPE='numeric'", "1.5").type);
    EXPECT_EQ(CMPI_boolean, key("Other", "VALUETYPE='boolean'", "TRUE").type);
}

TEST_F(Instance_Reading, FindsTheNameOfAnOnlyKey)
{
    const std::string key = "><KEYVALUE>x</KEYVALUE></INSTANCENAME>";
    EXPECT_EQ("Name", path_of("<INSTANCENAME CLASSNAME='Toy_Base'" + key).keys.at(0).name);
    EXPECT_EQ("", path_of("<INSTANCENAME CLASSNAME='Toy_Ball'" + key).keys.at(0).name);
    EXPECT_TRUE(path_of("<INSTANCENAME CLASSNAME='Toy_Ball'/>").keys.empty());
}

TEST_F(Instance_Reading, TakesReferencesAsKeysInEachForm)
{
    const Path_Value end = ball("b", 7);
    const std::string name = written([&](Xml_Writer& writer) { write_instance_name(writer, end); });
    const std::string place = "<LOCALNAMESPACEPATH><NAMESPACE NAME='root/toy'/></LOCALNAMESPACEPATH>";
    const auto link = [&](const std::string& form) {
        return path_of("<INSTANCENAME CLASSNAME='Toy_Link'><KEYBINDING NAME='From'>" + form +
                       "</KEYBINDING></INSTANCENAME>");
    };
    for (const std::string& form :
         {"<VALUE.REFERENCE>" + name + "</VALUE.REFERENCE>",
          "<VALUE.REFERENCE><LOCALINSTANCEPATH>" + place + name + "</LOCALINSTANCEPATH></VALUE.REFERENCE>",
          "<VALUE.REFERENCE><INSTANCEPATH><NAMESPACEPATH><HOST>h</HOST>" + place + "</NAMESPACEPATH>" + name +
              "</INSTANCEPATH></VALUE.REFERENCE>",
          std::string("<KEYVALUE VALUETYPE='string'>Toy_Ball.Name=\"b\",Size=7</KEYVALUE>")}) {
        const Path_Value path = link(form);
        ASSERT_TRUE(path.keys.at(0).value.as_path()) << form;
        EXPECT_TRUE(same_object(end, *path.keys[0].value.as_path())) << form;
    }
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, status_of([&] { link("<KEYVALUE>=</KEYVALUE>"); }));
}

TEST_F(Instance_Reading, RefusesWhatLacksAPart)
{
    for (const char* text :
         {"<INSTANCENAME/>", "<CLASSNAME/>", "<VALUE.REFERENCE/>", "<LOCALINSTANCEPATH/>", "<INSTANCEPATH/>",
          "<VALUE/>", "<OBJECTPATH/>", "<INSTANCENAME CLASSNAME='A'><KEYBINDING NAME='k'/></INSTANCENAME>",
          "<INSTANCENAME CLASSNAME='A'><KEYBINDING><KEYVALUE/></KEYBINDING></INSTANCENAME>",
          "<LOCALCLASSPATH><LOCALNAMESPACEPATH/><CLASSNAME NAME='A'/></LOCALCLASSPATH>"})
        EXPECT_EQ(NOT_VALID, status_of([&] { path_of(text); })) << text;
    for (const char* text : {"<INSTANCE/>", "<INSTANCE CLASSNAME='A'><PROPERTY NAME='x'/></INSTANCE>",
                             "<INSTANCE CLASSNAME='A'><PROPERTY NAME='x' TYPE='y'/></INSTANCE>"})
        EXPECT_EQ(NOT_VALID, status_of([&] { instance_of(text); })) << text;
}

TEST_F(Instance_Reading, TypesParametersByTheirMethod)
{
    const Method_Info& grow = *_classes.find("Toy_Ball")->method("Grow");
    const auto by = [&](const std::string& text) { return parameter_of(text, grow.parameter("By")).value; };
    EXPECT_EQ(CMPI_sint16, by("<PARAMVALUE NAME='by'><VALUE>-5</VALUE></PARAMVALUE>").type);
    EXPECT_EQ(-5, by("<PARAMVALUE NAME='By' PARAMTYPE='uint8'><VALUE>-5</VALUE></PARAMVALUE>").as_sint());
    EXPECT_TRUE(by("<PARAMVALUE NAME='By'/>").null);
    const std::string one = "<PARAMVALUE NAME='Names'><VALUE>a</VALUE></PARAMVALUE>";
    ASSERT_EQ(1U, parameter_of(one, grow.parameter("Names")).value.elements().size());
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH,
              status_of([&] { by("<PARAMVALUE NAME='By'><VALUE.ARRAY/></PARAMVALUE>"); }));
    EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, status_of([&] { parameter_of(one, grow.parameter("Into")); }));
}

TEST_F(Instance_Reading, TypesParametersByThemselvesWhereNobodyDeclaresThem)
{
    const auto type = [&](const std::string& rest) {
        return parameter_of("<PARAMVALUE NAME='x'" + rest + "</PARAMVALUE>").value.type;
    };
    EXPECT_EQ(CMPI_uint32, type(" PARAMTYPE='uint32'><VALUE>1</VALUE>"));
    EXPECT_EQ(CMPI_string, type("><VALUE>1</VALUE>"));
    EXPECT_EQ(CMPI_stringA, type("><VALUE.ARRAY/>"));
    EXPECT_EQ(CMPI_ref, type("><VALUE.REFERENCE><CLASSNAME NAME='A'/></VALUE.REFERENCE>"));
    EXPECT_EQ(CMPI_instance, type("><INSTANCE CLASSNAME='A'/>"));
    EXPECT_EQ(CMPI_ref, type("><INSTANCENAME CLASSNAME='A'/>"));
}

} // namespace KPRV::kldrcim
