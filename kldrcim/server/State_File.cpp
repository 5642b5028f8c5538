#include "kldrcim/server/State_File.h"

#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Instance_Writing.h"
#include "kldrcim/wire/Xml_Reader.h"

#include <cerrno>
#include <fcntl.h>
#include <fstream>
#include <iterator>
#include <system_error>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

bool write_all(int file, std::string_view text)
{
    while (!text.empty()) {
        const ssize_t written = ::write(file, text.data(), text.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0)
            return false;
        text.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

std::string state_text(const std::vector<Instance_Value>& instances)
{
    std::string text = xml_declaration;
    Xml_Writer writer(text);
    writer.open(Tag::IRETURNVALUE).text("\n");
    for (const Instance_Value& each : instances) {
        writer.open(Tag::VALUE_NAMEDINSTANCE);
        write_instance_name(writer, each.path);
        write_instance(writer, each);
        writer.close(Tag::VALUE_NAMEDINSTANCE).text("\n");
    }
    writer.close(Tag::IRETURNVALUE).text("\n");
    return text;
}

} // namespace

bool read_state(const std::string& file, const Class_Catalogue& classes,
                std::vector<Instance_Value>& instances, std::string& error)
{
    errno = 0;
    std::ifstream in(file, std::ios::binary);
    if (!in && errno == ENOENT)
        return true;
    const std::string text(std::istreambuf_iterator<char>(in), {});
    if (!in && !in.eof()) {
        error = file + ": " + std::generic_category().message(errno);
        return false;
    }
    try {
        Xml_Reader reader;
        if (!reader.feed(text) || !reader.finish())
            throw Wire_Error::not_valid(reader.fault_text());
        for (const Xml_Node each : reader.document().root().children())
            instances.push_back(Instance_Reader(classes).instance_with_path(each));
    } catch (const Wire_Error& failure) {
        error = file + ": " + failure.what();
        return false;
    }
    return true;
}

bool write_state(const std::string& file, const std::vector<Instance_Value>& instances, std::string& error)
{
    const std::string fresh = file + ".new";
    const int out = ::open(fresh.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOFOLLOW, 0600);
    bool done = out >= 0 && write_all(out, state_text(instances)) && fsync(out) == 0;
    int failure = errno;
    if (out >= 0 && ::close(out) != 0 && done) {
        done = false;
        failure = errno;
    }
    if (done && rename(fresh.c_str(), file.c_str()) != 0) {
        done = false;
        failure = errno;
    }
    if (!done)
        error = file + ": " + std::generic_category().message(failure);
    return done;
}

} // namespace KPRV::kldrcim
