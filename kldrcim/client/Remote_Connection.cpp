// Verbs' operations, sent to a CIM server.
#include "kldrcim/client/Remote_Connection.h"

#include "kldrcim/client/Cim_Answer.h"
#include "kldrcim/client/Remote_Subscription.h"

namespace KPRV::kldrcim {

Remote_Connection::Remote_Connection(const Http_Settings& settings, std::string name_space)
    : settings_(settings), name_space_(std::move(name_space)), http_(settings_),
      classes_(settings_, name_space_)
{
}

Result Remote_Connection::run(Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = name_space_;
    Collected kept;
    Result result = ask_for_objects(http_, classes_, request, receiver ? *receiver : kept);
    result.instances = std::move(kept.instances);
    result.paths = std::move(kept.paths);
    return result;
}

std::unique_ptr<Open_Subscription> Remote_Connection::subscribe(const std::string& indication_class,
                                                                const std::vector<std::string>& name_spaces,
                                                                Indication_Sink sink, std::string& error)
{
    auto subscription = std::make_unique<Remote_Subscription>(settings_, std::move(sink));
    if (!subscription->begin(error))
        return nullptr;
    for (const std::string& name_space : name_spaces)
        if (!subscription->add(indication_class, name_space, error))
            return nullptr;
    return subscription;
}

} // namespace KPRV::kldrcim
