#include "kldrcim/server/Object_Answers.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

} // namespace

void Object_Answers::place(Path_Value& path) const
{
    if (path.name_space.empty())
        path.name_space = _call.space.name();
}

bool Object_Answers::instance(Instance_Value&& instance)
{
    Xml_Writer& writer = _call.answer.object();
    if (_kind == BARE) {
        write_instance(writer, instance, _form);
        return _call.answer.object_done();
    }
    const Tag tag = _kind == NAMED    ? Tag::VALUE_NAMEDINSTANCE
                    : _kind == PULLED ? Tag::VALUE_INSTANCEWITHPATH
                                      : Tag::VALUE_OBJECTWITHPATH;
    place(instance.path);
    writer.open(tag);
    if (_kind == NAMED)
        write_instance_name(writer, instance.path);
    else
        write_instance_path(writer, instance.path, _call.server.host_name());
    write_instance(writer, instance, _form);
    writer.close(tag);
    return _call.answer.object_done();
}

bool Object_Answers::path(Path_Value&& path)
{
    Xml_Writer& writer = _call.answer.object();
    place(path);
    if (_kind == NAMED) {
        write_instance_name(writer, path);
    } else {
        if (_kind == OBJECTS)
            writer.open(Tag::OBJECTPATH);
        write_instance_path(writer, path, _call.server.host_name());
        if (_kind == OBJECTS)
            writer.close(Tag::OBJECTPATH);
    }
    return _call.answer.object_done();
}

} // namespace KPRV::kldrcim
