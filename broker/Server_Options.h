#pragma once

#include "contracts/cmpi/cmpidt.h"

#include <optional>
#include <string>

namespace KPRV::broker {

/// Servers differ in what they do to a provider; each difference that matters is a switch.
struct Server_Options
{
    /// How integer keys of a client's path arrive.
    enum class Key_Style
    {
        /// uint64, or sint64 below zero; state 0.
        BY_SIGN,
        /// Always sint64, and all keys have the state bit `CMPI_keyValue`.
        SINT64,
    };

    /// What `CMSetPropertyFilter` does.
    enum class Filter_Style
    {
        /// Accepts the list; the server filters the result. Keys stay in the path.
        LATE,
        /// Drops other properties at once, ignores later sets of other names, and loses the keys of the path
        /// that the list leaves out.
        EARLY,
    };

    /// How an in parameter without value arrives.
    enum class Argument_Style
    {
        LEFT_OUT,
        /// Present, of type boolean whatever the class says, null.
        NULL_BOOLEAN,
    };

    Key_Style key_style = Key_Style::BY_SIGN;
    Filter_Style filter_style = Filter_Style::LATE;
    Argument_Style argument_style = Argument_Style::LEFT_OUT;

    /// A null string property holds a string object without text instead of a null pointer.
    bool null_string_objects = false;
    /// Good elements of an enumeration carry the null bit, as one server has it: only rc and type may be
    /// judged.
    bool null_bit_on_elements = false;
    /// Text of `CMPIPrincipal`; no entry without it.
    std::optional<std::string> user = {};
    /// `CMPIPrincipal` is present but its string has no text.
    bool user_without_text = false;
    /// Up-calls for a class that nobody serves, and for a name space that nobody has.
    CMPIrc unknown_class_rc = CMPI_RC_ERR_INVALID_CLASS;
    CMPIrc unknown_name_space_rc = CMPI_RC_ERR_INVALID_NAMESPACE;
    /// Name space of the module's classes.
    std::string name_space = "root/kaldera";
    /// How many released objects are remembered, so that a later use of one is seen. Enough for every object
    /// of one large operation.
    std::size_t most_shells = 1 << 18;
    /// Bytes of objects that lie in memory; what a provider leaves behind beyond that lies in a file without
    /// a name, see `Block_Memory`. 0 for all.
    std::size_t most_object_memory = 0;

    /// The two public servers whose behaviour was measured.
    static Server_Options sfcb_like();
    static Server_Options pegasus_like();
};

inline Server_Options Server_Options::sfcb_like()
{
    Server_Options options;
    options.filter_style = Filter_Style::EARLY;
    options.null_string_objects = true;
    options.user_without_text = true;
    return options;
}

inline Server_Options Server_Options::pegasus_like()
{
    Server_Options options;
    options.key_style = Key_Style::SINT64;
    options.argument_style = Argument_Style::NULL_BOOLEAN;
    options.null_bit_on_elements = true;
    options.user = "";
    return options;
}

} // namespace KPRV::broker
