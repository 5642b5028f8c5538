#pragma once

#include "broker/Local_Server.h"
#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

/// A module in this process, under the broker.
class Local_Connection final : public Connection
{
public:
    /// The host must outlive it.
    explicit Local_Connection(Local_Server& server) : _server(server) {}
    explicit Local_Connection(std::unique_ptr<Local_Server> server)
        : _owned(std::move(server)), _server(*_owned)
    {
    }

    Result run(Request request, Receiver* receiver = nullptr) override;
    const Class_Catalogue& classes() override { return _server.catalogue(); }
    std::vector<std::string> provider_kinds(const std::string& class_name) override;
    bool serves(const std::string& name_space, std::string& error) override;
    std::unique_ptr<Open_Subscription> subscribe(const std::string& indication_class,
                                                 const std::vector<std::string>& name_spaces,
                                                 Indication_Sink sink, std::string& error) override;
    std::string subject() const override { return "the module"; }
    std::string location() const override { return _server.module().path(); }
    bool is_at_work() override;
    std::vector<std::string> breaches() override { return _server.violations().list(); }
    void report_leaks(std::FILE* out) override { _server.ledger().report(out); }

    Local_Server& server() { return _server; }
    /// True of the module that this program comes with, of which more is known than its library says.
    bool is_own_module() const;

private:
    const std::unique_ptr<Local_Server> _owned;
    Local_Server& _server;
};

} // namespace KPRV::kldrcim
