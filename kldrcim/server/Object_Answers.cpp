#include "kldrcim/server/Object_Answers.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

} // namespace

void Object_Answers::place(Path_Value& path) const
{
    if (path.name_space.empty())
        path.name_space = call_.space.name();
}

bool Object_Answers::instance(Instance_Value&& instance)
{
    Xml_Writer& writer = call_.answer.object();
    if (kind_ == BARE) {
        write_instance(writer, instance, form_);
        return call_.answer.object_done();
    }
    const Tag tag = kind_ == NAMED    ? Tag::VALUE_NAMEDINSTANCE
                    : kind_ == PULLED ? Tag::VALUE_INSTANCEWITHPATH
                                      : Tag::VALUE_OBJECTWITHPATH;
    place(instance.path);
    writer.open(tag);
    if (kind_ == NAMED)
        write_instance_name(writer, instance.path);
    else
        write_instance_path(writer, instance.path, call_.server.host_name());
    write_instance(writer, instance, form_);
    writer.close(tag);
    return call_.answer.object_done();
}

bool Object_Answers::path(Path_Value&& path)
{
    Xml_Writer& writer = call_.answer.object();
    place(path);
    if (kind_ == NAMED) {
        write_instance_name(writer, path);
    } else {
        if (kind_ == OBJECTS)
            writer.open(Tag::OBJECTPATH);
        write_instance_path(writer, path, call_.server.host_name());
        if (kind_ == OBJECTS)
            writer.close(Tag::OBJECTPATH);
    }
    return call_.answer.object_done();
}

} // namespace KPRV::kldrcim
