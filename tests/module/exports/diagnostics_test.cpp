// A program of its own, each test in a process of its own: a test run pins the module, so that it is not
// loaded anew.
#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/module/exports/Traces.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <algorithm>
#include <dlfcn.h>
#include <thread>

namespace KPRV {
namespace {

class Diagnostics : public Module_Fixture
{
protected:
    static constexpr const char* FC_PORT = "1000024b4c100000";
    static constexpr const char* ETH_PORT = "024b4c200000";
    static constexpr const char* ADAPTER = "2000024b4c100000";

    broker::Path_Value find(const std::string& class_name, const char* key, const std::string& value)
    {
        for (const broker::Path_Value& path : server->enumerate_instance_names(class_name).paths) {
            if (path.key(key)->as_text() == value)
                return path;
        }
        throw std::invalid_argument("no " + class_name + " " + value);
    }
    broker::Path_Value test(const std::string& kind, const std::string& name)
    {
        return find("KALDERA_" + kind + "DiagnosticTest", "Name", "Kaldera:" + name);
    }
    broker::Path_Value fc_port() { return find("KALDERA_FCPort", "DeviceID", FC_PORT); }
    broker::Path_Value eth_port() { return find("KALDERA_EthernetPort", "DeviceID", ETH_PORT); }
    broker::Path_Value adapter() { return find("KALDERA_PortController", "DeviceID", ADAPTER); }

    broker::Result start(const broker::Path_Value& test_path, const broker::Path_Value& element)
    {
        return server->invoke_method(test_path, "RunDiagnostic",
                                     {{"ManagedElement", broker::Plain_Value::path(element)}});
    }
    /// The return value of a start that must not fail as a method.
    std::uint64_t code(const broker::Path_Value& test_path, const broker::Path_Value& element)
    {
        const broker::Result result = start(test_path, element);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        const broker::Plain_Value* job = broker::find_value(result.out, "Job");
        EXPECT_EQ(result.return_value.as_uint() == 4096, job && !job->null);
        return result.return_value.as_uint();
    }
    /// Until the test threads have detached from the server.
    void wait()
    {
        EXPECT_TRUE(eventually([&] { return server->ledger().live() == 0; }));
    }
    Lines texts(const char* class_name, const char* property)
    {
        Lines result;
        for (const broker::Instance_Value& each : enumerate(class_name).instances)
            result.push_back(text_of(each, property));
        return result;
    }
    /// Opens the demo host in a process of the test's own.
    template <class Body>
    void on_demo_host(Body body)
    {
        in_child([&] {
            open();
            body();
        });
    }
};

TEST_F(Diagnostics, RunAsJobsThatLeaveRecords)
{
    on_demo_host([&] {
        mark();
        EXPECT_EQ(4096u, code(test("EthLoopback", "SerdesEthLoopbackTest"), eth_port()));
        wait();
        const broker::Result jobs = enumerate("KALDERA_ConcreteJob");
        ASSERT_EQ(1u, jobs.instances.size());
        EXPECT_EQ("Kaldera:SerdesEthLoopbackTest-1", text_of(jobs.instances[0], "InstanceID"));
        EXPECT_EQ(7u, jobs.instances[0].property("JobState")->as_uint());
        EXPECT_EQ(100u, jobs.instances[0].property("PercentComplete")->as_uint());
        EXPECT_EQ(
            (Lines{"Checking whether the port is disabled for running eth loopback test",
                   "Port is not disabled", "Disabling the port", "Running eth loopback test for the port",
                   "Enabling the port", "Checking for return codes for eth loopback test run"}),
            texts("KALDERA_DiagnosticServiceRecord", "RecordData"));
        EXPECT_EQ(Lines{"Eth loopback test run is successful"},
                  texts("KALDERA_DiagnosticCompletionRecord", "RecordData"));
        EXPECT_EQ(Lines(6, "eth2"), texts("KALDERA_DiagnosticServiceRecord", "ManagedElementName"));
        EXPECT_EQ(6u, enumerate("KALDERA_ServiceRecordAppliesToElement").instances.size());
        EXPECT_EQ(1u, enumerate("KALDERA_CompletionRecordAppliesToElement").instances.size());
        EXPECT_EQ(1u, enumerate("KALDERA_AffectedJobElement").instances.size());
        EXPECT_EQ(1u, enumerate("KALDERA_OwningJobElement").instances.size());
        const std::vector<Json::Value> settings = simulator.requests("setPortByWwn");
        ASSERT_EQ(2u, settings.size());
        EXPECT_FALSE(settings[0]["port"]["portStatus"].asBool());
        EXPECT_TRUE(settings[1]["port"]["portStatus"].asBool());
    });
}

TEST_F(Diagnostics, AnswerWithTheJobsKey)
{
    on_demo_host([&] {
        const broker::Result result = start(test("PCILoopback", "PCILoopbackTest"), fc_port());
        EXPECT_EQ(CMPI_uint32, result.return_value.type);
        const broker::Path_Value& job = *broker::find_value(result.out, "Job")->as_path();
        EXPECT_EQ("KALDERA_ConcreteJob", job.class_name);
        EXPECT_EQ("Kaldera:PCILoopbackTest-1", job.key("InstanceID")->as_text());
        EXPECT_EQ(1u, server->get_instance(job).instances.size());
        wait();
    });
}

TEST_F(Diagnostics, RefuseAnElementOfAnotherClass)
{
    on_demo_host([&] {
        const auto refused = [&](const broker::Path_Value& path, const broker::Path_Value& element) {
            mark();
            EXPECT_EQ(5u, code(path, element));
            EXPECT_EQ(Lines{"ERR Error: Invalid input object path!"}, said("ERR"));
        };
        refused(test("Loopback", "ExternalLoopbackTest"), eth_port());
        refused(test("EthLoopback", "SerdesEthLoopbackTest"), fc_port());
        refused(test("PCILoopback", "PCILoopbackTest"), adapter());
        refused(test("Memory", "MemoryTest"), fc_port());
        EXPECT_TRUE(enumerate("KALDERA_ConcreteJob").instances.empty());
        const broker::Result nothing =
            server->invoke_method(test("Memory", "MemoryTest"), "RunDiagnostic", {});
        EXPECT_EQ(5u, nothing.return_value.as_uint());
    });
}

TEST_F(Diagnostics, RefuseAnAddressOfTheWrongLength)
{
    on_demo_host([&] {
        broker::Path_Value port = fc_port();
        set_value(port.keys, "DeviceID", broker::Plain_Value::text("1000024b4c1000"));
        EXPECT_EQ(5u, code(test("Loopback", "ExternalLoopbackTest"), port));
        EXPECT_EQ(5u, code(test("PCILoopback", "PCILoopbackTest"), port));
    });
}

TEST_F(Diagnostics, RefuseTheInternalTestOfAnFCoEPort)
{
    on_demo_host([&] {
        const broker::Path_Value port = find("KALDERA_FCPort", "DeviceID", "1000024b4c200000");
        EXPECT_EQ(1u, code(test("Loopback", "InternalLoopbackTest"), port));
        EXPECT_TRUE(enumerate("KALDERA_ConcreteJob").instances.empty());
    });
}

TEST_F(Diagnostics, RunOneAtATime)
{
    on_demo_host([&] {
        simulator.add_fault(R"({"call": "diagMemoryTest", "do": "hold"})");
        mark();
        EXPECT_EQ(4096u, code(test("Memory", "MemoryTest"), adapter()));
        EXPECT_TRUE(simulator.wait_for_calls("diagMemoryTest", 1));
        EXPECT_EQ(4u, code(test("PCILoopback", "PCILoopbackTest"), fc_port()));
        EXPECT_EQ(4u, code(test("EthLoopback", "SerdesEthLoopbackTest"), eth_port()));
        // The adapter is out of service meanwhile, and clients can look on.
        const broker::Result jobs = enumerate("KALDERA_ConcreteJob");
        EXPECT_EQ(4u, jobs.instances.at(0).property("JobState")->as_uint());
        EXPECT_EQ(5u, enumerate("KALDERA_DiagnosticServiceRecord").instances.size());
        simulator.release();
        wait();
        simulator.clear_faults();
        EXPECT_EQ(4096u, code(test("PCILoopback", "PCILoopbackTest"), fc_port()));
        wait();
        EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest-2"}, texts("KALDERA_ConcreteJob", "InstanceID"));
        EXPECT_EQ(2u, enumerate("KALDERA_DiagnosticCompletionRecord").instances.size());
    });
}

// The record of another class's RunDiagnostic has parameters of its own.
TEST_F(Diagnostics, AreNotRunThroughAnotherClass)
{
    on_demo_host([&] {
        const broker::Path_Value path = test("PCILoopback", "PCILoopbackTest"), port = fc_port();
        mark();
        for (const char* class_name :
             {"CIM_DiagnosticService", "CIM_DiagnosticTest", "KALDERA_MemoryDiagnosticTest"}) {
            broker::Request request;
            request.operation = broker::Operation::INVOKE_METHOD;
            request.path = path;
            request.path.class_name = class_name;
            request.method = "RunDiagnostic";
            request.in = {{"ManagedElement", broker::Plain_Value::path(port)}};
            EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED,
                      server->run_at("KALDERA_PCILoopbackDiagnosticTest", request).rc)
                << class_name;
        }
        EXPECT_EQ(Lines{}, said_by("KALDERA_PCILoopbackDiagnosticTest_Provider.cpp")) << "not even entered";
        EXPECT_TRUE(enumerate("KALDERA_ConcreteJob").instances.empty());
    });
}

TEST_F(Diagnostics, TraceWhatTheyEnter)
{
    on_demo_host([&] {
        std::string text;
        const auto run = [&](const char* kind, const char* name, const broker::Path_Value& element) {
            const broker::Path_Value path = test(kind, name);
            mark();
            EXPECT_EQ(4096u, code(path, element));
            wait();
            text += std::string(name) + "\n" + as_sorted_text(traces_of(log_lines()));
        };
        run("Loopback", "ExternalLoopbackTest", fc_port());
        run("EthLoopback", "SerdesEthLoopbackTest", eth_port());
        run("PCILoopback", "PCILoopbackTest", fc_port());
        run("Memory", "MemoryTest", adapter());
        mark();
        for (const char* name :
             {"KALDERA_ConcreteJob", "KALDERA_DiagnosticServiceRecord", "KALDERA_DiagnosticCompletionRecord",
              "KALDERA_AffectedJobElement", "KALDERA_ServiceRecordAppliesToElement"})
            enumerate(name);
        text += "what they leave\n" + as_sorted_text(traces_of(log_lines()));
        expect_golden("traces_of_tests", text, ".txt");
    });
}

TEST_F(Diagnostics, OutliveTheUnloadingOfTheModule)
{
    on_demo_host([&] {
        simulator.add_fault(R"({"call": "diagEthLoopbackTest", "do": "hold"})");
        mark();
        EXPECT_EQ(4096u, code(test("EthLoopback", "SerdesEthLoopbackTest"), eth_port()));
        EXPECT_TRUE(simulator.wait_for_calls("diagEthLoopbackTest", 1));
        EXPECT_EQ(CMPI_RC_OK, server->unload(true));
        // The server's own reference goes, as at its dlclose; the broker, which the thread still knows,
        // stays.
        void* handle = dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD);
        ASSERT_NE(nullptr, handle);
        EXPECT_EQ(0, dlclose(handle));
        EXPECT_EQ(0, dlclose(handle));
        simulator.release();
        wait();
        EXPECT_EQ(2u, simulator.requests("setPortByWwn").size()) << "the port is back in service";
        EXPECT_EQ("", server->violations().text());
        // What a process does to a library that a thread may be in is not for this test to see.
        fflush(nullptr);
        _exit(testing::Test::HasFailure() ? 1 : 0);
    });
}

TEST_F(Diagnostics, DoNotPinAModuleThatHasRunNone)
{
    in_child([&] {
        open();
        enumerate("KALDERA_LoopbackDiagnosticTest");
        close();
        EXPECT_EQ(nullptr, dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD));
    });
}

} // namespace
} // namespace KPRV
