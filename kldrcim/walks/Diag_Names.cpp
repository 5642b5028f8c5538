#include "kldrcim/walks/Diag_Names.h"

#include "kldrcim/input/Address_Words.h"
#include "kldrcim/input/Typed_Input.h"

namespace KPRV::kldrcim {

namespace {

// clang-format off
constexpr Element_Kind kinds[] = {
    {"KALDERA_FCPort",         "FC port",       " KALDERA_LoopbackDiagnosticTest KALDERA_PCILoopbackDiagnosticTest "},
    {"KALDERA_EthernetPort",   "Ethernet port", " KALDERA_EthLoopbackDiagnosticTest KALDERA_PCILoopbackDiagnosticTest "},
    {"KALDERA_PortController", "adapter",       " KALDERA_MemoryDiagnosticTest "},
};
// clang-format on

constexpr const char* name_prefix = "kaldera:";

bool takes(const Element_Kind& kind, const std::string& test_class_name)
{
    return std::string(kind.test_classes).find(" " + test_class_name + " ") != std::string::npos;
}

bool find_address(Connection& connection, const Element_Kind& kind, const std::string& flat, Path_Value& path)
{
    for (const Path_Value& each : connection.enumerate_instance_names(kind.class_name).paths) {
        const Plain_Value* const id = each.key("DeviceID");
        if (!id || address_digits(id->as_text()) != flat)
            continue;
        path = each;
        return true;
    }
    return false;
}

} // namespace

std::span<const Element_Kind> element_kinds()
{
    return kinds;
}

std::string element_words(const std::string& test_class_name)
{
    std::string words;
    for (const Element_Kind& kind : kinds)
        if (takes(kind, test_class_name))
            words += (words.empty() ? "" : ", ") + std::string(kind.words);
    return words;
}

bool find_test(Connection& connection, const std::string& name, Path_Value& path, std::string& error)
{
    const std::string wanted = lower_name(name);
    for (const Path_Value& each : connection.enumerate_instance_names(test_class).paths) {
        const Plain_Value* const key = each.key("Name");
        const std::string known = key ? lower_name(key->as_text()) : "";
        if (known != wanted && known != name_prefix + wanted)
            continue;
        path = each;
        return true;
    }
    error = "no test " + name + "; \"kldrcim diag list\" lists them";
    return false;
}

bool find_element(Connection& connection, const std::string& test_class_name, const std::string& text,
                  Path_Value& path, std::string& error)
{
    if (text.find('=') != std::string::npos)
        return typed_path(connection.classes(), text, path, error);
    const std::string flat = address_digits(text);
    for (const bool right_kind : {true, false})
        for (const Element_Kind& kind : kinds)
            if (takes(kind, test_class_name) == right_kind && find_address(connection, kind, flat, path))
                return true;
    error = "no port or adapter " + text + "; \"kldrcim diag list\" lists them";
    return false;
}

} // namespace KPRV::kldrcim
