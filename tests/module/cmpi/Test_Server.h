#pragma once

#include "broker/Mi_Call.h"
#include "broker/Registration_Catalogue.h"
#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/cmpi/cimple_cmpi_adapter.h"
#include "tests/module/cmpi/thing_classes.h"

#include <gtest/gtest.h>

namespace KPRV {

inline constexpr const char* NAME_SPACE = "root/sample";

/// A server in the test's own process, around one scripted provider. Up-calls go to the test.
class Test_Server : public broker::Up_Calls
{
public:
    explicit Test_Server(broker::Server_Options options = {})
        : core(std::make_shared<broker::Core>(std::move(options))), catalogue(thing_registration),
          broker(core, *this)
    {
        core->catalogue = &catalogue;
        script = Script();
    }
    ~Test_Server() override
    {
        script = Script();
        EXPECT_TRUE(core->violations.empty()) << core->violations.text();
        EXPECT_EQ(core->ledger.live(), 0u);
    }

    broker::Result up_call(const broker::Request& request) override
    {
        return on_up_call ? on_up_call(request) : broker::Result{.rc = CMPI_RC_ERR_INVALID_CLASS};
    }
    CMPIrc deliver(const std::string& name_space, const broker::Instance_Value& indication) override
    {
        delivered.emplace_back(name_space, indication);
        if (on_deliver)
            on_deliver();
        return deliver_rc;
    }

    /// The calls recorded so far, without the reading of texts, and the record begun anew.
    std::vector<std::string> calls()
    {
        std::vector<std::string> list = core->calls.calls();
        core->calls.clear();
        std::erase(list, "CMGetCharsPtr");
        return list;
    }

    std::shared_ptr<broker::Core> core;
    broker::Registration_Catalogue catalogue;
    broker::Broker broker;
    std::function<broker::Result(const broker::Request&)> on_up_call;
    std::vector<std::pair<std::string, broker::Instance_Value>> delivered;
    std::function<void()> on_deliver;
    CMPIrc deliver_rc = CMPI_RC_OK;
    /// Entries of the context of each call.
    std::vector<broker::Named_Value> context_entries;
    /// Only where exceptions are contained does a status have a message.
    bool tells_failures = false;
};

/// A provider behind its static area, reached as a server reaches it: by the tables of its MIs.
class Served_Provider
{
public:
    Served_Provider(Test_Server& server, const Registration* registration)
        : _server(server), _registration(registration)
    {
    }

    /// What a factory does. Null for an unknown kind.
    void* factory(char kind)
    {
        void* mi = nullptr;
        broker::Mi_Frame frame(_server.broker, _server.context_entries);
        EXPECT_EQ(cimple_cmpi_adapter('C', _area, _registration, _server.broker.cmpi(), frame.context(),
                                      _registration->provider_name, kind, &mi),
                  0);
        return mi;
    }

    CMPI_Static_Data& data() { return *reinterpret_cast<CMPI_Static_Data*>(_area); }
    CMPI_Adapter* adapter() { return data().adapter; }

    /// Cleanup through the table of a kind.
    CMPIrc cleanup(char kind, bool terminating = false)
    {
        const auto run = [&](auto& mi) {
            broker::Mi_Frame frame(_server.broker, _server.context_entries);
            return mi.ft->cleanup(&mi, frame.context(), terminating).rc;
        };
        switch (kind) {
        case 'I':
            return run(data().instance_mi);
        case 'M':
            return run(data().method_mi);
        case 'A':
            return run(data().association_mi);
        default:
            return run(data().indication_mi);
        }
    }

    /// Calls `entry(context, result, path)` as one operation and reads what it returned.
    template <class Entry>
    broker::Result operate(const broker::Path_Value& path, Entry entry)
    {
        broker::Result result;
        broker::Mi_Frame frame(_server.broker, _server.context_entries);
        const broker::Argument<broker::Path_Object> cop(*_server.core, path, true);
        broker::Collected kept;
        const broker::Argument<broker::Result_Object> results(
            *_server.core,
            broker::Result_Object::INSTANCES | broker::Result_Object::PATHS | broker::Result_Object::DATA,
            static_cast<broker::Receiver&>(kept));
        frame.run(result, [&] {
            const CMPIStatus status = entry(frame.context(), results.cmpi(), cop.cmpi());
            EXPECT_TRUE(!status.msg || _server.tells_failures);
            return status;
        });
        result.instances = std::move(kept.instances);
        result.paths = std::move(kept.paths);
        if (!results->data.empty())
            result.return_value = results->data[0];
        result.done_count = results->done_count;
        result.done = result.done_count != 0;
        return result;
    }

private:
    Test_Server& _server;
    const Registration* _registration;
    alignas(16) unsigned char _area[STATIC_DATA_AREA] = {};
};

/// A property list as a server passes it.
class Property_List
{
public:
    Property_List(std::initializer_list<const char*> names) : _names(names) { _names.push_back(nullptr); }
    operator const char**() { return _names.data(); }

private:
    std::vector<const char*> _names;
};

/// The path of an element, port or group by name.
inline broker::Path_Value path_of(const char* class_name, const char* name)
{
    return {"", NAME_SPACE, class_name, {{"Name", broker::Plain_Value::text(name)}}};
}

inline broker::Path_Value class_path(const char* class_name)
{
    return {"", NAME_SPACE, class_name, {}};
}

/// "Name=value" for text comparisons of keys and properties.
inline std::string text_of_key(const broker::Path_Value& path, const char* name)
{
    const broker::Plain_Value* const value = path.key(name);
    return value ? value->as_text() : "(none)";
}

using Texts = std::vector<std::string>;

} // namespace KPRV
