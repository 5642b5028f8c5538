#include "kldrcim/server/Object_Text.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

void place(Path_Value& path, const std::string& name_space)
{
    if (path.name_space.empty())
        path.name_space = name_space;
}

} // namespace

void Object_Text::write(Xml_Writer& writer, Instance_Value&& instance) const
{
    if (kind == BARE)
        return write_instance(writer, instance, form);
    const Tag tag = kind == NAMED    ? Tag::VALUE_NAMEDINSTANCE
                    : kind == PULLED ? Tag::VALUE_INSTANCEWITHPATH
                                     : Tag::VALUE_OBJECTWITHPATH;
    place(instance.path, name_space);
    writer.open(tag);
    if (kind == NAMED)
        write_instance_name(writer, instance.path);
    else
        write_instance_path(writer, instance.path, host_name);
    write_instance(writer, instance, form);
    writer.close(tag);
}

void Object_Text::write(Xml_Writer& writer, Path_Value&& path) const
{
    place(path, name_space);
    if (kind == NAMED)
        return write_instance_name(writer, path);
    if (kind == OBJECTS)
        writer.open(Tag::OBJECTPATH);
    write_instance_path(writer, path, host_name);
    if (kind == OBJECTS)
        writer.close(Tag::OBJECTPATH);
}

} // namespace KPRV::kldrcim
