#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Receiver.h"
#include "broker/values/Request.h"

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
/// in that of the connection.
class Connection
{
public:
    virtual ~Connection() = default;

    /// One operation. With a receiver, instances and paths go there as they come, and are not in the result.
    /// Whatever was answered is a result; throws `Connection_Error` if there was no answer to be had.
    virtual Result run(Request request, Receiver* receiver = nullptr) = 0;

    Result enumerate_instance_names(const std::string& class_name);
    Result enumerate_instances(const std::string& class_name, const Property_List& properties = {});
    Result get_instance(const Path_Value& path, const Property_List& properties = {});
    Result invoke_method(const Path_Value& path, const std::string& method,
                         const std::vector<Named_Value>& in);

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

    /// True while a thread of the module is at work that ends with this process: whoever leaves now cuts it
    /// off.
    virtual bool is_at_work() { return false; }
    /// What the provider did against its contract, as far as it can be seen from here.
    virtual std::vector<std::string> breaches() { return {}; }
    /// Tells what the provider left behind, if that can be seen from here.
    virtual void report_leaks(std::FILE*) {}
};

} // namespace KPRV::kldrcim
