#include "kldrcim/server/Indication_Exporter.h"

#include "kldrcim/wire/Instance_Writing.h"

#include <limits>

namespace KPRV::kldrcim {

namespace {

std::string export_message(const Instance_Value& indication, std::int64_t id)
{
    using Tag = Xml_Tag;
    using At = Xml_Attribute;
    std::string text = xml_declaration;
    Xml_Writer writer(text);
    writer.open(Tag::CIM).attribute(At::CIMVERSION, "2.0").attribute(At::DTDVERSION, "2.0");
    writer.open(Tag::MESSAGE).attribute(At::ID, std::to_string(id)).attribute(At::PROTOCOLVERSION, "1.0");
    writer.open(Tag::SIMPLEEXPREQ).open(Tag::EXPMETHODCALL).attribute(At::NAME, "ExportIndication");
    writer.open(Tag::EXPPARAMVALUE).attribute(At::NAME, "NewIndication");
    write_instance(writer, indication);
    writer.close(Tag::EXPPARAMVALUE).close(Tag::EXPMETHODCALL).close(Tag::SIMPLEEXPREQ);
    writer.close(Tag::MESSAGE).close(Tag::CIM);
    text += '\n';
    return text;
}

} // namespace

Indication_Exporter::Indication_Exporter(std::string url, std::string context, Log log,
                                         Delivery_Function deliver, Delivery_Patience patience)
    : _url(std::move(url)), _context(std::move(context)), _log(std::move(log)), _deliver(std::move(deliver)),
      _patience(patience), _thread([this] { run(); })
{
}

Indication_Exporter::~Indication_Exporter()
{
    {
        const Auto_Lock lock(_mutex);
        _stop = true;
    }
    _changed.notify_all();
    _thread.join();
}

void Indication_Exporter::put(Instance_Value indication)
{
    bool first_loss = false;
    {
        const Auto_Lock lock(_mutex);
        set_value(indication.properties, "SequenceContext", Plain_Value::text(_context));
        set_value(indication.properties, "SequenceNumber", Plain_Value::signed_number(CMPI_sint64, _number));
        _messages.push_back(export_message(indication, _number));
        _number = _number == std::numeric_limits<std::int64_t>::max() ? 0 : _number + 1;
        if (_messages.size() > MOST_WAITING) {
            // The one in front is on its way.
            _messages.erase(_messages.begin() + 1);
            first_loss = !_overflowed;
            _overflowed = true;
        }
    }
    _changed.notify_all();
    if (first_loss)
        _log("listener " + _url + ": more than " + std::to_string(MOST_WAITING) +
             " indications wait, the oldest are dropped");
}

bool Indication_Exporter::pause(std::chrono::milliseconds time)
{
    const auto end = std::chrono::steady_clock::now() + time;
    while (!_stop && std::chrono::steady_clock::now() < end)
        _changed.wait_until(_mutex, end);
    return !_stop;
}

void Indication_Exporter::run()
{
    const auto stopped = [this] {
        const Auto_Lock lock(_mutex);
        return _stop;
    };
    unsigned failures = 0;
    for (;;) {
        std::string message;
        {
            const Auto_Lock lock(_mutex);
            while (_messages.empty() && !_stop)
                _changed.wait(_mutex);
            if (_stop)
                return;
            message = _messages.front();
        }
        const Delivery delivery = _deliver(_url, message, stopped);
        if (!delivery.is_done && ++failures == _patience.quick)
            _log("listener " + _url + ": " + delivery.why);
        const Auto_Lock lock(_mutex);
        if (delivery.is_done) {
            failures = 0;
            _overflowed = false;
            _messages.pop_front();
        } else if (!pause(failures < _patience.quick ? _patience.pause : _patience.long_pause)) {
            return;
        }
    }
}

} // namespace KPRV::kldrcim
