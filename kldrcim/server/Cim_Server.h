#pragma once

#include "kldrcim/server/Answer.h"
#include "kldrcim/server/Cim_Space.h"
#include "kldrcim/server/Pull_Contexts.h"

#include <memory>
#include <span>

namespace KPRV::kldrcim {

/// A CIM server without its connections: takes a message and makes the one that answers it. Safe for any
/// number of threads.
class Cim_Server
{
public:
    /// `host_name` stands in full paths.
    explicit Cim_Server(std::string host_name);

    /// The first space of a name answers. Before the first message.
    void add(std::string name, Cim_Space& space) { _spaces.emplace_back(std::move(name), &space); }

    struct Reply
    {
        /// All that has not gone through the sink.
        std::string body;
        /// The answer failed when a part of it had been sent.
        bool broken = false;
    };

    /// `user` is the authenticated one, if there is any. Throws `Http_Refusal`, but not for a later one of
    /// several requests: what those before it have done is told.
    Reply answer(const Cim_Message& message, const std::optional<std::string>& user, Body_Sink& sink);

    /// True if the answer may be long.
    static bool may_be_long(const Cim_Message& message);

    const std::string& host_name() const { return _host_name; }
    Pull_Contexts& pull_contexts() { return _pull_contexts; }

private:
    Cim_Space* find_space(const std::string& name) const;
    /// True if the answer is broken.
    bool answer_call(const Cim_Call& call, const std::optional<std::string>& user, Answer& answer);

    std::string _host_name;
    std::vector<std::pair<std::string, Cim_Space*>> _spaces;
    Pull_Contexts _pull_contexts;
};

/// What the bodies of operations work with.
struct Operation_Call
{
    Cim_Server& server;
    Cim_Space& space;
    const Cim_Call& call;
    const Parameters& parameters;
    const std::optional<std::string>& user;
    Answer& answer;

    /// A request of that operation by this client.
    Request request(Operation operation, Path_Value path) const;
    /// INSTANCENAME of a parameter, in this name space.
    Path_Value path(std::string_view parameter) const;
};

/// Writes the answer, but for its end. What fails is the result.
using Operation_Body = Result (*)(const Operation_Call& call);

struct Operation_Row
{
    const char* name;
    /// With blanks between them.
    const char* parameters;
    bool may_be_long;
    Operation_Body body;
};

// The families of operations.
std::span<const Operation_Row> instance_operations();
std::span<const Operation_Row> association_operations();
std::span<const Operation_Row> class_operations();
std::span<const Operation_Row> pull_operations();
std::span<const Operation_Row> query_operations();

/// A method of a class.
Result call_method(const Operation_Call& call);

} // namespace KPRV::kldrcim
