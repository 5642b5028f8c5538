// Any body of a request: it is refused or answered, and the answer is a message that can be read.
#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Select_Query.h"
#include "kldrcim/wire/Xml_Reader.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/kldrcim/wire/Toy_Classes.h"

using namespace KPRV::kldrcim;

namespace {

/// Gives back what it gets, in each place that an answer has.
class Echo final : public Cim_Space
{
public:
    const std::string& name() const override { return _name; }
    const Class_Catalogue& classes() const override { return _classes; }
    Result run(Request request, Receiver* receiver) override
    {
        Result result;
        Instance_Value instance = request.instance;
        instance.path = request.path;
        instance.properties.insert(instance.properties.end(), request.in.begin(), request.in.end());
        result.out = request.in;
        result.return_value = Plain_Value::unsigned_number(CMPI_uint32, 0);
        if (receiver) {
            receiver->instance(std::move(instance));
            receiver->path(std::move(request.path));
        } else {
            result.instances.push_back(std::move(instance));
            result.paths.push_back(std::move(request.path));
        }
        return result;
    }

private:
    const std::string _name = "root/toy";
    const Toy_Classes _classes;
};

struct Reading_Sink final : Body_Sink
{
    bool send(std::string&& text) override { return reader.feed(text); }
    Xml_Reader reader;
};

void answer(Cim_Server& server, const Xml_Document& document)
{
    Reading_Sink sink;
    try {
        const Cim_Message message = read_message(document);
        const Cim_Server::Reply reply = server.answer(message, std::nullopt, sink);
        FUZZ_EXPECT(!reply.broken);
        FUZZ_EXPECT(sink.reader.feed(reply.body) && sink.reader.finish());
    } catch (const Http_Refusal& refusal) {
        FUZZ_EXPECT(refusal.status >= 400);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static Echo space;
    static Cim_Server server("host");
    [[maybe_unused]] static const bool added = (server.add(space.name(), space), true);
    const std::string text(reinterpret_cast<const char*>(data), size);
    Xml_Reader reader;
    if (reader.feed(text) && reader.finish())
        answer(server, reader.document());
    FUZZ_EXPECT(reader.fault() == Xml_Fault::TOO_LARGE || reader.document().size() <= 8 * size + 64);
    Query_Error error;
    if (const auto query = Select_Query::parse(text, "WQL", error))
        query->matches({{.class_name = query->class_name()}, {}}, space.classes());
    return 0;
}
