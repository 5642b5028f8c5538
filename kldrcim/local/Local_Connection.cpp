#include "kldrcim/local/Local_Connection.h"

#include "broker/Subscription.h"
#include "broker/values/Type_Words.h"

namespace KPRV::kldrcim {

namespace {

/// The host's indications go to the sink while this lives.
class Local_Subscription final : public Open_Subscription
{
public:
    Local_Subscription(Local_Server& server, const std::string& indication_class, Indication_Sink sink)
        : _server(server), _subscription(std::in_place, server, indication_class)
    {
        _server.set_sink([sink = std::move(sink)](const auto& name_space, const Instance_Value& indication) {
            sink(name_space, indication);
            return CMPI_RC_OK;
        });
    }
    ~Local_Subscription() override
    {
        _subscription.reset();
        _server.set_sink({});
    }

    CMPIrc add(const std::string& name_space) { return _subscription->add(name_space); }

private:
    Local_Server& _server;
    std::optional<Subscription> _subscription;
};

} // namespace

Result Local_Connection::run(Request request, Receiver* receiver)
{
    return _server.run(std::move(request), receiver);
}

std::vector<std::string> Local_Connection::provider_kinds(const std::string& class_name)
{
    std::vector<std::string> kinds;
    for (const Mi_Kind kind : mi_kinds)
        if (_server.module().factory(class_name, kind))
            kinds.push_back(lower_name(mi_kind_name(kind)));
    return kinds;
}

bool Local_Connection::is_own_module() const
{
    return _server.catalogue().module_name() == "kldrprovider_Module";
}

bool Local_Connection::serves(const std::string& name_space, std::string& error)
{
    // What another module serves cannot be known, and is believed.
    if (!is_own_module())
        return true;
    // What --server-instances brings is for the module, and no client reaches it.
    static constexpr const char* served = "root/kaldera";
    if (same_name(name_space, served))
        return true;
    error = "no namespace \"" + name_space + "\"; there is " + served;
    return false;
}

std::unique_ptr<Open_Subscription> Local_Connection::subscribe(const std::string& indication_class,
                                                               const std::vector<std::string>& name_spaces,
                                                               Indication_Sink sink, std::string& error)
{
    auto subscription = std::make_unique<Local_Subscription>(_server, indication_class, std::move(sink));
    for (const std::string& name_space : name_spaces)
        if (const CMPIrc rc = subscription->add(name_space); rc != CMPI_RC_OK) {
            error = code_text(rc) + ": " + indication_class + " takes no subscription for " + name_space;
            return nullptr;
        }
    return subscription;
}

bool Local_Connection::is_at_work()
{
    // The thread of a test stays attached to its server until it ends.
    return _server.ledger().live(Object_Kind::CONTEXT) != 0;
}

} // namespace KPRV::kldrcim
