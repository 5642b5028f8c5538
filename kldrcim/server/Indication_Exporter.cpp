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
    : url_(std::move(url)), context_(std::move(context)), log_(std::move(log)), deliver_(std::move(deliver)),
      patience_(patience), thread_([this] { run(); })
{
}

Indication_Exporter::~Indication_Exporter()
{
    {
        const Auto_Lock lock(mutex_);
        stop_ = true;
    }
    changed_.notify_all();
    thread_.join();
}

void Indication_Exporter::put(Instance_Value indication)
{
    bool first_loss = false;
    {
        const Auto_Lock lock(mutex_);
        set_value(indication.properties, "SequenceContext", Value::text(context_));
        set_value(indication.properties, "SequenceNumber", Value::signed_number(CMPI_sint64, number_));
        messages_.push_back(export_message(indication, number_));
        number_ = number_ == std::numeric_limits<std::int64_t>::max() ? 0 : number_ + 1;
        if (messages_.size() > most_waiting) {
            // The one in front is on its way.
            messages_.erase(messages_.begin() + 1);
            first_loss = !overflowed_;
            overflowed_ = true;
        }
    }
    changed_.notify_all();
    if (first_loss)
        log_("listener " + url_ + ": more than " + std::to_string(most_waiting) +
             " indications wait, the oldest are dropped");
}

bool Indication_Exporter::pause(std::chrono::milliseconds time)
{
    const auto end = std::chrono::steady_clock::now() + time;
    while (!stop_ && std::chrono::steady_clock::now() < end)
        changed_.wait_until(mutex_, end);
    return !stop_;
}

void Indication_Exporter::run()
{
    const auto stopped = [this] {
        const Auto_Lock lock(mutex_);
        return stop_;
    };
    unsigned failures = 0;
    for (;;) {
        std::string message;
        {
            const Auto_Lock lock(mutex_);
            while (messages_.empty() && !stop_)
                changed_.wait(mutex_);
            if (stop_)
                return;
            message = messages_.front();
        }
        const Delivery delivery = deliver_(url_, message, stopped);
        if (delivery == Delivery::AGAIN && ++failures == patience_.quick)
            log_("listener " + url_ + ": no answer");
        const Auto_Lock lock(mutex_);
        if (delivery == Delivery::DONE) {
            failures = 0;
            overflowed_ = false;
            messages_.pop_front();
        } else if (!pause(failures < patience_.quick ? patience_.pause : patience_.long_pause)) {
            return;
        }
    }
}

} // namespace KPRV::kldrcim
