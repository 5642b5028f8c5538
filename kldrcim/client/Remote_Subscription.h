#pragma once

#include "kldrcim/client/Http_Client.h"
#include "kldrcim/client/Indication_Listener.h"

namespace KPRV::kldrcim {

/// Subscriptions in a server's interop name space, and the listener that they lead to. All that was made
/// there is taken back at the end. What other ends have left, such as that of a machine, goes at the
/// beginning.
class Remote_Subscription final : public Open_Subscription
{
public:
    Remote_Subscription(const Http_Settings& settings, Indication_Sink sink);
    ~Remote_Subscription() override;

    /// Finds the interop name space and listens; false with a one-line `error`.
    bool begin(std::string& error);
    /// Filter, destination and subscription.
    bool add(const std::string& indication_class, const std::string& name_space, std::string& error);

private:
    Result run(const Request& request, Receiver& receiver);
    bool find_interop(std::string& error);
    std::string system_name();
    void take_back_orphans();
    /// The path of what was made; nothing with `error`.
    std::optional<Path_Value> create(const std::string& class_name, std::vector<Named_Value> properties,
                                     std::string& error);
    std::vector<Named_Value> named(const char* class_name) const;
    bool remove(const Path_Value& path);

    Http_Client _http;
    Indication_Sink _sink;
    std::string _interop;
    std::string _system_name;
    std::string _name;
    std::unique_ptr<Indication_Listener> _listener;
    /// In the order in which they were made.
    std::vector<Path_Value> _made;
};

} // namespace KPRV::kldrcim
