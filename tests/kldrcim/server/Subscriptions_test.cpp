#include "kldrcim/server/Subscriptions.h"

#include "kldrcim/server/Interop_Classes.h"
#include "tests/broker/Toy_Server.h"
#include "tests/kldrcim/wire/Toy_Classes.h"

namespace KPRV::kldrcim {

namespace {

constexpr std::uint64_t ENABLED_STATE = 2, DISABLED_STATE = 4;

/// Two classes of the toy's indications, one of which takes no filter.
class Toy_Indications final : public Toy_Classes
{
public:
    Toy_Indications()
    {
        Feature_Info text;
        text.name = "Text";
        text.type = CMPI_string;
        for (const char* name : {"TOY_Alert", "TOY_Silent"}) {
            add(name, "", {text}, {});
            _classes.back().is_indication = true;
        }
    }
};

/// Notes whom alerts reach.
class Listeners
{
public:
    Delivery take(const std::string& url)
    {
        const Auto_Lock lock(_mutex);
        _urls.push_back(url);
        _arrived.notify_all();
        return {};
    }
    std::string next()
    {
        const Auto_Lock lock(_mutex);
        while (_urls.empty())
            _arrived.wait(_mutex);
        std::string url = _urls.front();
        _urls.erase(_urls.begin());
        return url;
    }

private:
    Standard_Mutex<> _mutex;
    std::condition_variable_any _arrived;
    std::vector<std::string> _urls GUARDED_BY(_mutex);
};

Instance_Value object(const char* class_name, const std::string& name)
{
    Instance_Value made{.path = {.class_name = class_name}};
    set_value(made.properties, "Name", Plain_Value::text(name));
    return made;
}

class Subscriptions_Test : public Toy_Test
{
protected:
    Path_Value create(Instance_Value instance)
    {
        const Result made = subscriptions.create(std::move(instance));
        EXPECT_EQ(CMPI_RC_OK, made.rc) << made.message;
        return made.paths.empty() ? Path_Value() : made.paths.front();
    }

    Path_Value create_filter(const std::string& query)
    {
        Instance_Value filter = object("CIM_IndicationFilter", "filter");
        set_value(filter.properties, "Query", Plain_Value::text(query));
        set_value(filter.properties, "QueryLanguage", Plain_Value::text("WQL"));
        return create(std::move(filter));
    }

    /// To a listener of its own.
    Path_Value subscribe(const Path_Value& filter, const std::string& name, std::uint64_t state)
    {
        Instance_Value listener = object("CIM_ListenerDestinationCIMXML", name);
        set_value(listener.properties, "Destination", Plain_Value::text("http://" + name));
        Instance_Value subscription{.path = {.class_name = "CIM_IndicationSubscription"}};
        set_value(subscription.properties, "Filter", Plain_Value::path(filter));
        set_value(subscription.properties, "Handler", Plain_Value::path(create(std::move(listener))));
        set_value(subscription.properties, "SubscriptionState",
                  Plain_Value::unsigned_number(CMPI_uint16, state));
        return create(std::move(subscription));
    }

    Result change_query(const Path_Value& filter, const std::string& query)
    {
        Instance_Value changes{.path = filter};
        set_value(changes.properties, "Query", Plain_Value::text(query));
        return subscriptions.modify(changes, std::nullopt);
    }

    std::string query()
    {
        for (const Instance_Value& each : subscriptions.instances())
            if (const Plain_Value* text = each.property("Query"))
                return text->as_text();
        return {};
    }

    /// Whom the module's next alert reaches.
    std::string heard()
    {
        EXPECT_EQ(CMPI_RC_OK, server->enable_indications("TOY_Alert"));
        return listeners.next();
    }

    Listeners listeners;
    Toy_Indications toy;
    Interop_Classes classes{toy};
    Subscriptions subscriptions{
        *server,
        classes,
        {.system_name = "host",
         .interop_names = {"interop"},
         .deliver = [this](const std::string& url, auto&&...) { return listeners.take(url); }}};
};

} // namespace

TEST_F(Subscriptions_Test, WhatOneOfSeveralRefusesChangesNone)
{
    const Path_Value filter = create_filter("SELECT * FROM TOY_Alert");
    // A disabled one asks nobody and refuses nothing; the one behind it does.
    subscribe(filter, "off", DISABLED_STATE);
    subscribe(filter, "on", ENABLED_STATE);
    const Result refused = change_query(filter, "SELECT * FROM TOY_Silent");
    EXPECT_EQ("TOY_Silent takes no subscription", refused.message);
    EXPECT_EQ("SELECT * FROM TOY_Alert", query());
    EXPECT_EQ("http://on", heard());
    EXPECT_EQ(CMPI_RC_OK, change_query(filter, "SELECT Text FROM TOY_Alert").rc);
    EXPECT_EQ("SELECT Text FROM TOY_Alert", query());
    EXPECT_EQ("http://on", heard());
}

} // namespace KPRV::kldrcim
