#pragma once

#include "kldrcim/client/Remote_Catalogue.h"
#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

/// A CIM server far away, or beside: CIM operations over HTTP. Not safe for several threads.
class Remote_Connection final : public Connection
{
public:
    /// Paths without a name space are in this one.
    Remote_Connection(const Http_Settings& settings, std::string name_space);

    Result run(Request request, Receiver* receiver = nullptr) override;
    const Class_Catalogue& classes() override { return _classes; }
    /// A server does not tell.
    std::vector<std::string> provider_kinds(const std::string&) override { return {}; }
    /// The server itself says no.
    bool serves(const std::string&, std::string&) override { return true; }
    std::unique_ptr<Open_Subscription> subscribe(const std::string& indication_class,
                                                 const std::vector<std::string>& name_spaces,
                                                 Indication_Sink sink, std::string& error) override;
    std::string subject() const override { return "the server"; }
    std::string location() const override { return _settings.url.text(); }
    bool is_in_process() const override { return false; }

private:
    const Http_Settings _settings;
    const std::string _name_space;
    Http_Client _http;
    Remote_Catalogue _classes;
};

} // namespace KPRV::kldrcim
