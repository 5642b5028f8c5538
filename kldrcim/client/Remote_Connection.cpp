// Verbs' operations, sent to a CIM server.
#include "kldrcim/client/Remote_Connection.h"

#include "kldrcim/client/Cim_Answer.h"
#include "kldrcim/client/Remote_Subscription.h"

namespace KPRV::kldrcim {

Remote_Connection::Remote_Connection(const Http_Settings& settings, std::string name_space)
    : _settings(settings), _name_space(std::move(name_space)), _http(_settings),
      _classes(_settings, _name_space)
{
}

Result Remote_Connection::run(Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = _name_space;
    Collected kept;
    Result result = ask_for_objects(_http, _classes, request, receiver ? *receiver : kept);
    result.instances = std::move(kept.instances);
    result.paths = std::move(kept.paths);
    return result;
}

std::unique_ptr<Open_Subscription> Remote_Connection::subscribe(const std::string& indication_class,
                                                                const std::vector<std::string>& name_spaces,
                                                                Indication_Sink sink, std::string& error)
{
    auto subscription = std::make_unique<Remote_Subscription>(_settings, std::move(sink));
    if (!subscription->begin(error))
        return nullptr;
    for (const std::string& name_space : name_spaces)
        if (!subscription->add(indication_class, name_space, error))
            return nullptr;
    return subscription;
}

} // namespace KPRV::kldrcim
