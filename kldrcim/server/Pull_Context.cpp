#include "kldrcim/server/Pull_Context.h"

namespace KPRV::kldrcim {

/// Writes what a provider hands over.
class Pull_Context::Spooling final : public Receiver
{
public:
    Spooling(Pull_Context& context, const Object_Text& text) : _context(context), _text(text) {}

    bool instance(Instance_Value&& instance) override { return write(std::move(instance)); }
    bool path(Path_Value&& path) override { return write(std::move(path)); }

private:
    template <class Object>
    bool write(Object&& object)
    {
        std::string text;
        Xml_Writer writer(text);
        _text.write(writer, std::forward<Object>(object));
        return _context.put(std::move(text));
    }

    Pull_Context& _context;
    const Object_Text& _text;
};

Pull_Context::~Pull_Context()
{
    {
        const Auto_Lock lock(_mutex);
        _closed = true;
    }
    if (_maker.joinable())
        _maker.join();
}

void Pull_Context::start(Object_Text text, Make make)
{
    _maker = std::thread([this, text = std::move(text), make = std::move(make)] { run(text, make); });
}

void Pull_Context::run(const Object_Text& text, const Make& make)
{
    Result result;
    try {
        Spooling receiver(*this, text);
        result = make(receiver);
    } catch (const std::exception& error) {
        result.rc = CMPI_RC_ERR_FAILED;
        result.message = error.what();
    }
    const Auto_Lock lock(_mutex);
    _result = std::move(result);
    _finished = true;
    _changed.notify_all();
}

bool Pull_Context::put(std::string&& object)
{
    const Auto_Lock lock(_mutex);
    if (_closed)
        return false;
    _objects.put(std::move(object));
    _changed.notify_all();
    return true;
}

Pull_Context::State Pull_Context::wait(std::uint64_t count)
{
    const Auto_Lock lock(_mutex);
    while (!_finished && _objects.size() <= count)
        _changed.wait(_mutex);
    if (_objects.size() > count)
        return MORE;
    return _result.ok() ? END : FAILED;
}

std::optional<std::string> Pull_Context::take()
{
    const Auto_Lock lock(_mutex);
    if (_objects.size() == 0)
        return std::nullopt;
    return _objects.take();
}

Result Pull_Context::failure() const
{
    const Auto_Lock lock(_mutex);
    return _result;
}

} // namespace KPRV::kldrcim
