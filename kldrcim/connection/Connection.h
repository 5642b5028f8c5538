#pragma once

#include "broker/values/Cim_Operations.h"
#include "broker/values/Class_Catalogue.h"

#include <cstdio>
#include <functional>
#include <memory>
#include <stdexcept>

namespace KPRV::kldrcim {

using namespace broker;

/// What keeps a connection from asking at all, such as a server that is not there: one line for the user.
struct Connection_Error : std::runtime_error
{
    using std::runtime_error::runtime_error;
};

/// Subscribed for as long as it lives.
class Open_Subscription
{
public:
    virtual ~Open_Subscription() = default;
};

/// Gets each indication with the name space that it comes from, on the thread that delivers it.
using Indication_Sink = std::function<void(const std::string& name_space, const Instance_Value& indication)>;

/// Where verbs send CIM operations: a module in this process, or a CIM server. Paths without a name space are
/// in that of the connection. Whatever was answered is a result; an operation throws `Connection_Error` if
/// there was no answer to be had.
class Connection : public Cim_Operations
{
public:
    /// What is known of the classes of the connection's name space.
    virtual const Class_Catalogue& classes() = 0;
    /// The kinds of provider that serve a class: "instance", "association", "method", "indication".
    virtual std::vector<std::string> provider_kinds(const std::string& class_name) = 0;
    /// False, with `error` naming those that there are, for a name space that certainly nobody serves.
    virtual bool serves(const std::string& name_space, std::string& error) = 0;

    /// Subscribes to a class of indications, once for each name space. Null with a one-line `error` if that
    /// is refused.
    virtual std::unique_ptr<Open_Subscription> subscribe(const std::string& indication_class,
                                                         const std::vector<std::string>& name_spaces,
                                                         Indication_Sink sink, std::string& error) = 0;

    /// "the module" or its like, for what is said of it.
    virtual std::string subject() const = 0;
    /// Its file or address.
    virtual std::string location() const = 0;

    /// True if the module, and what it remembers, goes with this process.
    virtual bool is_in_process() const { return true; }
    /// True while a thread of the module is at work that ends with this process: whoever leaves now cuts it
    /// off.
    virtual bool is_at_work() { return false; }
    /// What the provider did against its contract, as far as it can be seen from here.
    virtual std::vector<std::string> breaches() { return {}; }
    /// Tells what the provider left behind, if that can be seen from here.
    virtual void report_leaks(std::FILE*) {}
};

} // namespace KPRV::kldrcim
