#include "broker/values/Value_Text.h"

#include "broker/values/Control_Text.h"
#include "broker/values/Type_Words.h"

#include <charconv>

namespace KPRV::broker {

namespace {

std::string number_text(double value)
{
    char buffer[64];
    auto end = std::to_chars(buffer, buffer + sizeof buffer, value).ptr;
    std::string text(buffer, end);
    // A real must not read back as an integer.
    if (text.find_first_of(".en") == std::string::npos)
        text += ".0";
    return text;
}

std::string list_text(const Plain_Value& value, std::string (*one)(const Plain_Value&))
{
    std::string text = "{";
    for (const Plain_Value& element : value.elements())
        text += (text.size() > 1 ? ", " : "") + one(element);
    return text + "}";
}

std::string indented(const std::string& text)
{
    std::string result;
    for (char c : text) {
        result += c;
        if (c == '\n')
            result += "    ";
    }
    return result;
}

std::string scalar_text(const Plain_Value& value)
{
    if (value.type == CMPI_boolean)
        return value.as_bool() ? "true" : "false";
    if (is_signed(value.type))
        return std::to_string(value.as_sint());
    if (is_real(value.type))
        return number_text(value.as_real());
    return std::to_string(value.as_uint());
}

std::string embedded_mof(const Instance_Value& instance)
{
    std::string text = mof_instance(instance);
    return indented(text.substr(0, text.size() - 2)); // without ";\n"
}

} // namespace

std::string quoted(std::string_view text)
{
    static const char digits[] = "0123456789ABCDEF";
    std::string result = "\"";
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        switch (c) {
        case '"':
        case '\\':
            result += '\\';
            result += c;
            break;
        case '\n':
            result += "\\n";
            break;
        case '\t':
            result += "\\t";
            break;
        case '\r':
            result += "\\r";
            break;
        case '\b':
            result += "\\b";
            break;
        case '\f':
            result += "\\f";
            break;
        default:
            const std::size_t control = control_size(text.substr(i));
            if (control == 0) {
                result += c;
                break;
            }
            i += control - 1;
            const auto code = static_cast<unsigned char>(text[i]);
            result += {'\\', 'x', '0', '0', digits[code >> 4], digits[code & 15]};
        }
    }
    return result + '"';
}

std::string plain_text(const Plain_Value& value)
{
    if (value.null)
        return "null";
    if (value.is_array())
        return list_text(value, mof_text);
    if (value.type == CMPI_string || value.type == CMPI_dateTime)
        return value.as_text();
    if (const Path_Value* path = value.as_path())
        return path_text(*path);
    if (const Instance_Value* instance = value.as_instance())
        return embedded_mof(*instance);
    return scalar_text(value);
}

std::string mof_text(const Plain_Value& value)
{
    if (value.null)
        return "NULL";
    if (value.is_array())
        return list_text(value, mof_text);
    if (value.type == CMPI_string || value.type == CMPI_dateTime)
        return quoted(value.as_text());
    if (const Path_Value* path = value.as_path())
        return quoted(path_text(*path));
    if (const Instance_Value* instance = value.as_instance())
        return embedded_mof(*instance);
    return scalar_text(value);
}

std::string mof_instance(const Instance_Value& instance)
{
    std::string text = "instance of " + instance.path.class_name + " {\n";
    for (const Named_Value& property : instance.properties)
        if (!property.value.null)
            text += "    " + property.name + " = " + mof_text(property.value) + ";\n";
    return text + "};\n";
}

std::string path_text(const Path_Value& path)
{
    std::string text = path.name_space.empty() ? "" : path.name_space + ":";
    text += path.class_name;
    char separator = '.';
    for (const Named_Value& key : path.keys) {
        text += separator + key.name + "=" + mof_text(key.value);
        separator = ',';
    }
    return text;
}

} // namespace KPRV::broker
