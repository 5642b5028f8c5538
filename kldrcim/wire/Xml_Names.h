#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace KPRV::kldrcim {

// clang-format off
/// The elements of CIM in XML, and what may stand in each, in any order and number: what must be there exactly once is for the
/// readers to miss. "#" is text.
#define KLDR_XML_TAGS(X) \
    X(CIM,                       "CIM",                       "MESSAGE") \
    X(MESSAGE,                   "MESSAGE",                   "SIMPLEREQ MULTIREQ SIMPLERSP MULTIRSP SIMPLEEXPREQ MULTIEXPREQ SIMPLEEXPRSP MULTIEXPRSP") \
    X(SIMPLEREQ,                 "SIMPLEREQ",                 "CORRELATOR IMETHODCALL METHODCALL") \
    X(MULTIREQ,                  "MULTIREQ",                  "SIMPLEREQ") \
    X(SIMPLERSP,                 "SIMPLERSP",                 "METHODRESPONSE IMETHODRESPONSE") \
    X(MULTIRSP,                  "MULTIRSP",                  "SIMPLERSP") \
    X(SIMPLEEXPREQ,              "SIMPLEEXPREQ",              "CORRELATOR EXPMETHODCALL") \
    X(MULTIEXPREQ,               "MULTIEXPREQ",               "SIMPLEEXPREQ") \
    X(SIMPLEEXPRSP,              "SIMPLEEXPRSP",              "EXPMETHODRESPONSE") \
    X(MULTIEXPRSP,               "MULTIEXPRSP",               "SIMPLEEXPRSP") \
    X(CORRELATOR,                "CORRELATOR",                "VALUE") \
    X(IMETHODCALL,               "IMETHODCALL",               "LOCALNAMESPACEPATH IPARAMVALUE") \
    X(IPARAMVALUE,               "IPARAMVALUE",               "VALUE VALUE.ARRAY VALUE.REFERENCE INSTANCENAME CLASSNAME QUALIFIER.DECLARATION CLASS INSTANCE VALUE.NAMEDINSTANCE") \
    X(METHODCALL,                "METHODCALL",                "LOCALINSTANCEPATH LOCALCLASSPATH PARAMVALUE") \
    X(PARAMVALUE,                "PARAMVALUE",                "VALUE VALUE.REFERENCE VALUE.ARRAY VALUE.REFARRAY CLASSNAME INSTANCENAME CLASS INSTANCE VALUE.NAMEDINSTANCE") \
    X(IMETHODRESPONSE,           "IMETHODRESPONSE",           "ERROR IRETURNVALUE PARAMVALUE") \
    X(METHODRESPONSE,            "METHODRESPONSE",            "ERROR RETURNVALUE PARAMVALUE") \
    X(IRETURNVALUE,              "IRETURNVALUE",              "CLASSNAME INSTANCENAME VALUE VALUE.OBJECTWITHPATH VALUE.OBJECTWITHLOCALPATH VALUE.OBJECT OBJECTPATH QUALIFIER.DECLARATION VALUE.ARRAY VALUE.REFERENCE CLASS INSTANCE INSTANCEPATH VALUE.NAMEDINSTANCE VALUE.INSTANCEWITHPATH") \
    X(RETURNVALUE,               "RETURNVALUE",               "VALUE VALUE.REFERENCE") \
    X(ERROR,                     "ERROR",                     "INSTANCE") \
    X(EXPMETHODCALL,             "EXPMETHODCALL",             "EXPPARAMVALUE") \
    X(EXPPARAMVALUE,             "EXPPARAMVALUE",             "INSTANCE VALUE") \
    X(EXPMETHODRESPONSE,         "EXPMETHODRESPONSE",         "ERROR IRETURNVALUE") \
    X(NAMESPACEPATH,             "NAMESPACEPATH",             "HOST LOCALNAMESPACEPATH") \
    X(LOCALNAMESPACEPATH,        "LOCALNAMESPACEPATH",        "NAMESPACE") \
    X(NAMESPACE,                 "NAMESPACE",                 "") \
    X(HOST,                      "HOST",                      "#") \
    X(CLASSNAME,                 "CLASSNAME",                 "") \
    X(INSTANCENAME,              "INSTANCENAME",              "KEYBINDING KEYVALUE VALUE.REFERENCE") \
    X(KEYBINDING,                "KEYBINDING",                "KEYVALUE VALUE.REFERENCE") \
    X(KEYVALUE,                  "KEYVALUE",                  "#") \
    X(CLASSPATH,                 "CLASSPATH",                 "NAMESPACEPATH CLASSNAME") \
    X(INSTANCEPATH,              "INSTANCEPATH",              "NAMESPACEPATH INSTANCENAME") \
    X(LOCALCLASSPATH,            "LOCALCLASSPATH",            "LOCALNAMESPACEPATH CLASSNAME") \
    X(LOCALINSTANCEPATH,         "LOCALINSTANCEPATH",         "LOCALNAMESPACEPATH INSTANCENAME") \
    X(OBJECTPATH,                "OBJECTPATH",                "INSTANCEPATH CLASSPATH") \
    X(VALUE,                     "VALUE",                     "#") \
    X(VALUE_NULL,                "VALUE.NULL",                "") \
    X(VALUE_ARRAY,               "VALUE.ARRAY",               "VALUE VALUE.NULL") \
    X(VALUE_REFERENCE,           "VALUE.REFERENCE",           "CLASSPATH LOCALCLASSPATH CLASSNAME INSTANCEPATH LOCALINSTANCEPATH INSTANCENAME") \
    X(VALUE_REFARRAY,            "VALUE.REFARRAY",            "VALUE.REFERENCE VALUE.NULL") \
    X(VALUE_NAMEDINSTANCE,       "VALUE.NAMEDINSTANCE",       "INSTANCENAME INSTANCE") \
    X(VALUE_INSTANCEWITHPATH,    "VALUE.INSTANCEWITHPATH",    "INSTANCEPATH INSTANCE") \
    X(VALUE_OBJECTWITHPATH,      "VALUE.OBJECTWITHPATH",      "INSTANCEPATH INSTANCE CLASSPATH CLASS") \
    X(VALUE_OBJECTWITHLOCALPATH, "VALUE.OBJECTWITHLOCALPATH", "LOCALINSTANCEPATH INSTANCE LOCALCLASSPATH CLASS") \
    X(VALUE_OBJECT,              "VALUE.OBJECT",              "CLASS INSTANCE") \
    X(INSTANCE,                  "INSTANCE",                  "QUALIFIER PROPERTY PROPERTY.ARRAY PROPERTY.REFERENCE") \
    X(PROPERTY,                  "PROPERTY",                  "QUALIFIER VALUE") \
    X(PROPERTY_ARRAY,            "PROPERTY.ARRAY",            "QUALIFIER VALUE.ARRAY") \
    X(PROPERTY_REFERENCE,        "PROPERTY.REFERENCE",        "QUALIFIER VALUE.REFERENCE") \
    X(CLASS,                     "CLASS",                     "QUALIFIER PROPERTY PROPERTY.ARRAY PROPERTY.REFERENCE METHOD") \
    X(METHOD,                    "METHOD",                    "QUALIFIER PARAMETER PARAMETER.REFERENCE PARAMETER.ARRAY PARAMETER.REFARRAY") \
    X(PARAMETER,                 "PARAMETER",                 "QUALIFIER") \
    X(PARAMETER_ARRAY,           "PARAMETER.ARRAY",           "QUALIFIER") \
    X(PARAMETER_REFERENCE,       "PARAMETER.REFERENCE",       "QUALIFIER") \
    X(PARAMETER_REFARRAY,        "PARAMETER.REFARRAY",        "QUALIFIER") \
    X(QUALIFIER,                 "QUALIFIER",                 "VALUE VALUE.ARRAY") \
    X(QUALIFIER_DECLARATION,     "QUALIFIER.DECLARATION",     "SCOPE VALUE VALUE.ARRAY") \
    X(SCOPE,                     "SCOPE",                     "")

/// The attributes that are read or written; others are passed over.
#define KLDR_XML_ATTRIBUTES(X) \
    X(CIMVERSION) X(DTDVERSION) X(ID) X(PROTOCOLVERSION) X(NAME) X(CODE) X(DESCRIPTION) X(CLASSNAME) X(SUPERCLASS) X(TYPE) \
    X(VALUETYPE) X(PARAMTYPE) X(REFERENCECLASS) X(CLASSORIGIN) X(PROPAGATED) X(ARRAYSIZE) X(EmbeddedObject) X(EMBEDDEDOBJECT) \
    X(ISARRAY) X(OVERRIDABLE) X(TOSUBCLASS) X(TOINSTANCE) X(TRANSLATABLE) X(CLASS) X(ASSOCIATION) X(REFERENCE) X(PROPERTY) \
    X(METHOD) X(PARAMETER) X(INDICATION)
// clang-format on

enum class Xml_Tag : std::uint8_t
{
#define X(tag, name, content) tag,
    KLDR_XML_TAGS(X)
#undef X
};

enum class Xml_Attribute : std::uint8_t
{
#define X(name) name,
    KLDR_XML_ATTRIBUTES(X)
#undef X
};

/// As the text has it: "VALUE.ARRAY".
std::string_view name_of(Xml_Tag tag);
std::string_view name_of(Xml_Attribute attribute);

/// As they are written: "<VALUE.ARRAY", "</VALUE.ARRAY>" and " NAME=\"".
std::string_view opening_of(Xml_Tag tag);
std::string_view closing_of(Xml_Tag tag);
std::string_view opening_of(Xml_Attribute attribute);

/// Nothing for a word that is none. The case counts.
std::optional<Xml_Tag> tag_of(std::string_view name);
std::optional<Xml_Attribute> attribute_of(std::string_view name);

/// True if the one may stand directly in the other.
bool may_hold(Xml_Tag parent, Xml_Tag child);
/// True for those that hold text, and no elements.
bool holds_text(Xml_Tag tag);

} // namespace KPRV::kldrcim
