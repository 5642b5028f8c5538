#pragma once

#include "broker/values/Receiver.h"
#include "kldrcim/wire/Instance_Writing.h"

namespace KPRV::kldrcim {

/// Objects as the operations give them to clients.
struct Object_Text
{
    enum Kind
    {
        /// Instance and its name; names alone.
        NAMED,
        /// With host and name space, as associations and the older queries give them.
        OBJECTS,
        /// The same for operations that are pulled.
        PULLED,
        /// Instances alone, as queries give them that are pulled.
        BARE,
    };

    Kind kind = NAMED;
    Instance_Form form = {};
    /// Of paths that name none.
    std::string name_space = {};
    std::string host_name = {};

    void write(Xml_Writer& writer, Instance_Value&& instance) const;
    void write(Xml_Writer& writer, Path_Value&& path) const;
};

} // namespace KPRV::kldrcim
