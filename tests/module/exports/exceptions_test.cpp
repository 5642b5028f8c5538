#include "tests/module/exports/Agent_Calls.h"
#include "tests/support/Thrown_Text.h"

#include <thread>

// What leaves the entries of the module, in both forms in which it is built.

namespace KPRV {
namespace {

class Module_Exceptions : public Agent_Calls, public testing::WithParamInterface<bool>
{
protected:
    Module_Exceptions()
    {
        module = is_contained() == KLDR_CONTAINS_EXCEPTIONS ? KLDR_MODULE : KLDR_OTHER_FORM;
    }
    static bool is_contained() { return GetParam(); }

    /// The operation threw, and a client hears of it, one way or the other.
    void expect_thrown(const broker::Result& result, const std::string& entry, const std::string& what)
    {
        EXPECT_EQ(CMPI_RC_ERR_FAILED, result.rc);
        EXPECT_TRUE(result.out.empty());
        EXPECT_EQ(0u, result.done_count);
        EXPECT_EQ(is_contained() ? "none" : what, result.exception.value_or("none"));
        EXPECT_EQ(is_contained() ? entry + ": " + what : "", result.message);
        EXPECT_EQ(is_contained() ? 0u : 1u, server->violations().count());
        server->violations().clear();
    }
};

// Nothing in the provider stands between the dispatcher and the entry.
TEST_P(Module_Exceptions, OfRequestsThatAreNone)
{
    open("empty.json");
    const char* const no_object = "in Json::Value::find(begin, end): requires objectValue or nullValue";
    const char* const no_text = "Type is not convertible to string";
    const std::pair<const char*, const char*> requests[] = {
        {"[1]", no_object},
        {"[]", no_object},
        {"1", no_object},
        {"true", no_object},
        {R"("text")", no_object},
        {R"({"method": 5})", no_text},
        {R"({"method": {}})", no_text},
        {R"({"method": []})", no_text},
        {R"({"method": "discovery.getServerTime", "version": 2.0})", no_text},
        {R"({"method": "discovery.getServerTime", "version": ["1.1"]})", no_text},
    };
    for (const auto& [request, what] : requests) {
        SCOPED_TRACE(request);
        expect_thrown(execute(request), "invokeMethod(executeMethod)", what);
        EXPECT_EQ(105, reply("{}")["error"]["code"].asInt()) << "the next request is served";
    }
    // No lock is left behind for another thread either.
    std::thread([this] { EXPECT_EQ(105, reply("{}")["error"]["code"].asInt()); }).join();
}

TEST_P(Module_Exceptions, OfUnguardedCalls)
{
    open("one_cna.json");
    const auto fault = [&](const std::string& kind) {
        simulator.clear_faults();
        simulator.add_fault(
            R"({"call": "getAllAdaptersIndexString", "do": "throw", "message": "gone", "type": ")" + kind +
            R"("})");
    };
    const char* const unknown = "an exception of unknown type";
    const std::string name = "KALDERA_PortController";
    fault("std::runtime_error");
    expect_thrown(server->enumerate_instances(name), "enumerateInstances", "gone");
    expect_thrown(server->enumerate_instance_names(name), "enumerateInstanceNames", "gone");
    fault("HbaAgentError");
    expect_thrown(server->enumerate_instances(name), "enumerateInstances", is_contained() ? "gone" : unknown);
    fault("int");
    expect_thrown(server->enumerate_instances(name), "enumerateInstances", unknown);
    simulator.clear_faults();
    EXPECT_EQ(1u, enumerate(name).instances.size());
}

TEST_P(Module_Exceptions, OfAssociations)
{
    open("one_cna.json");
    const std::string name = "KALDERA_PortControllerSystemDevice";
    const broker::Path_Value host = server->enumerate_instance_names("KALDERA_ComputerSystem").paths.at(0);
    simulator.add_fault(R"({"call": "getAllAdaptersIndexString", "do": "throw", "message": "gone",
        "type": "std::runtime_error"})");
    expect_thrown(server->associators(name, host, {}), "associators", "gone");
    expect_thrown(server->associator_names(name, host, {}), "associatorNames", "gone");
    expect_thrown(server->references(name, host, {}), "references", "gone");
    expect_thrown(server->reference_names(name, host, {}), "referenceNames", "gone");
}

INSTANTIATE_TEST_SUITE_P(Form, Module_Exceptions, testing::Bool(),
                         [](const auto& form) { return form.param ? "Contained" : "Passing"; });

} // namespace
} // namespace KPRV
