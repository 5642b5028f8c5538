#pragma once

#include "broker/Host.h"
#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

/// A module in this process, under the broker.
class Local_Connection final : public Connection
{
public:
    /// The host must outlive it.
    explicit Local_Connection(Host& host) : host_(host) {}
    explicit Local_Connection(std::unique_ptr<Host> host) : owned_(std::move(host)), host_(*owned_) {}

    Result run(Request request, Receiver* receiver = nullptr) override;
    const Class_Catalogue& classes() override { return host_.catalogue(); }
    std::vector<std::string> provider_kinds(const std::string& class_name) override;
    bool serves(const std::string& name_space, std::string& error) override;
    std::unique_ptr<Open_Subscription> subscribe(const std::string& indication_class,
                                                 const std::vector<std::string>& name_spaces,
                                                 Indication_Sink sink, std::string& error) override;
    std::string subject() const override { return "the module"; }
    std::string location() const override { return host_.module().path(); }
    bool is_at_work() override;
    std::vector<std::string> breaches() override { return host_.violations().list(); }
    void report_leaks(std::FILE* out) override { host_.ledger().report(out); }

    Host& host() { return host_; }
    /// True of the module that this program comes with, of which more is known than its library says.
    bool is_own_module() const;

private:
    const std::unique_ptr<Host> owned_;
    Host& host_;
};

} // namespace KPRV::kldrcim
