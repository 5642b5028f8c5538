// Any body of an answer: a server far away is no friend, and what is made of its words goes to a terminal.
#include "broker/values/Control_Text.h"
#include "broker/values/Value_Text.h"
#include "kldrcim/client/Cim_Answer.h"
#include "kldrcim/connection/Connection.h"
#include "kldrcim/wire/Class_Xml.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/kldrcim/wire/Toy_Classes.h"

using namespace KPRV::kldrcim;

namespace {

/// Answers whatever is asked.
class Canned final : public Http_Sender
{
public:
    explicit Canned(std::string_view text) : _text(text) {}

    Http_Head post(const Http_Message&, const Body& body, std::chrono::seconds) override
    {
        Http_Head head = {.status = 200};
        const std::size_t half = _text.size() / 2;
        if (body(head, _text.substr(0, half)))
            body(head, _text.substr(half));
        return head;
    }
    const Http_Settings& settings() const override { return _settings; }

private:
    const std::string_view _text;
    const Http_Settings _settings = {.url = {.host = "host", .port = 1}};
};

bool is_printable(std::string_view text)
{
    for (; !text.empty(); text.remove_prefix(1))
        if (control_size(text) != 0)
            return false;
    return true;
}

/// What has been read can be written again.
struct Reading final : Receiver
{
    bool instance(Instance_Value&& instance) override
    {
        for (const Named_Value& property : instance.properties)
            size += plain_text(property.value).size();
        return path(std::move(instance.path));
    }
    bool path(Path_Value&& path) override
    {
        FUZZ_EXPECT(is_printable(path_text(path)));
        return ++count != 100;
    }

    std::size_t size = 0;
    unsigned count = 0;
};

template <class Ask>
void ask(const Ask& ask)
{
    try {
        FUZZ_EXPECT(is_printable(ask().message));
    } catch (const Connection_Error& error) {
        FUZZ_EXPECT(is_printable(error.what()));
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static const Toy_Classes classes;
    Canned server({reinterpret_cast<const char*>(data), size});
    const Path_Value ball = {.name_space = "root/toy", .class_name = "Toy_Ball"};
    Reading reading;
    for (const Operation operation :
         {Operation::ENUMERATE_INSTANCES, Operation::GET_INSTANCE, Operation::INVOKE_METHOD})
        ask([&] {
            Request request = {.operation = operation, .path = ball, .method = "Grow"};
            request.properties = std::vector<std::string>{"Size", "Parts"};
            return ask_for_objects(server, classes, request, reading);
        });
    ask([&] {
        Cim_Answer answer(server, [](Xml_Node node) { return !read_class(node).name.empty(); });
        return answer.ask({}, No_Catalogue());
    });
    return 0;
}
