#include "tests/faults/Failing_Allocator.h"
#include "tests/faults/Fault_Fixture.h"

#include <dlfcn.h>

namespace KPRV {
namespace {

class Allocation_Failures : public Fault_Fixture
{
protected:
    void SetUp() override
    {
        // Kept in memory, so that a report of what was lost can name its places.
        ASSERT_TRUE(dlopen(module_under_test(), RTLD_NOW | RTLD_NODELETE));
        open_host();
    }
    virtual void open_host() { open("one_cna.json"); }

    /// Where the module guards a call of the adapter library, the failure costs no more than the element at
    /// hand.
    static bool is_less(const broker::Result& result, const broker::Result& whole)
    {
        return result.instances.size() < whole.instances.size() ||
               !(result.return_value == whole.return_value) || !(texts(result.out) == texts(whole.out));
    }
    static std::vector<std::string> texts(const std::vector<broker::Named_Value>& values)
    {
        std::vector<std::string> all;
        for (const broker::Named_Value& each : values)
            all.push_back(each.name + (each.value.null ? "" : " " + each.value.as_text()));
        return all;
    }

    /// The operation with allocations failing in three ways: the module's own, from the n-th on; with those
    /// that the C++ and the JSON library make for it, from the n-th on; and the n-th of those alone. A
    /// failure leaves the provider as an exception, which takes all that was half made with it.
    template <class Operation>
    void starve(const std::string& what, Operation&& operation)
    {
        starve(what, operation, {});
        starve(what + " and its helpers", operation, {.helpers_too = true});
        starve(what + " and its helpers, once", operation, {.helpers_too = true, .once = true});
    }

    struct Sweep
    {
        bool helpers_too = false;
        bool once = false;
        /// What it costs is not looked at, only what is left behind.
        bool any_cost = false;
    };

    /// Each allocation in turn up to a bound, and from there a spread of them.
    static unsigned long next(unsigned long nth, unsigned long count)
    {
        constexpr unsigned long EACH = 300;
        constexpr unsigned long SPREAD = 200;
        return nth + (nth < EACH ? 1 : 1 + count / SPREAD);
    }

    /// The enumerations of all classes, or of some where each of them writes a thousand lines, or is slow.
    void starve_every_class(const Sweep& sweep)
    {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
        const size_t step = 4;
#else
        const size_t step = logs() ? 8 : 1;
#endif
        for (size_t i = 0; i < classes.size(); i += step)
            starve(
                classes[i], [&] { return server->enumerate_instances(classes[i]); }, sweep);
    }

    template <class Operation>
    void starve(const std::string& what, Operation&& operation, const Sweep& sweep)
    {
        operation(); // makes what is kept from one call to the next
        watch_library("libkldrprovider_Module", sweep.helpers_too);
        fail_allocation(~0ul);
        const broker::Result whole = operation();
        const unsigned long count = mend_memory();
        ASSERT_TRUE(whole.ok()) << what;
        // A list of none may take no memory but what is kept.
        const bool is_empty = whole.instances.empty() && whole.return_value.null;
        ASSERT_TRUE(is_empty || count > 0) << what;
        for (unsigned long nth = 1; nth <= count; nth = next(nth, count)) {
            SCOPED_TRACE(what + ": allocation " + std::to_string(nth) + " of " + std::to_string(count));
            fail_allocation(nth, sweep.once);
            const broker::Result result = operation();
            const unsigned long asked = mend_memory();
            EXPECT_LE(nth, asked);
            // A value that a helper has no room for costs that value alone, and a line that the log has no
            // room for costs nothing.
            EXPECT_TRUE(sweep.any_cost || sweep.helpers_too || logs() || !result.ok() ||
                        is_less(result, whole));
            EXPECT_TRUE(sweep.any_cost || result.ok() == !thrown_text(result))
                << "no other failure than that exception: " << result.rc;
            expect_nothing_left();
        }
        const broker::Result after = operation();
        EXPECT_TRUE(after.ok()) << what << ": " << after.rc << " " << thrown_text(after).value_or("");
        EXPECT_FALSE(is_less(after, whole)) << what;
    }
};

TEST_F(Allocation_Failures, OfEnumerations)
{
    for (const char* name :
         {"KALDERA_ComputerSystem", "KALDERA_PortController", "KALDERA_FCPort", "KALDERA_EthernetPort",
          "KALDERA_FCPortSystemDevice", "KALDERA_ControlledBy", "KALDERA_RegisteredProfile"})
        starve(name, [&] { return server->enumerate_instances(name); });
}

// Whoever makes an instance must not lose it, nor the list that it was to stand in. What a guarded call costs
// may be told as a failure: some associations want lists of one length.
TEST_F(Allocation_Failures, OfEveryClass)
{
    starve_every_class({.helpers_too = true, .once = true, .any_cost = true});
}

/// What an instance holds is cut from pieces, so that only a piece can fail: of many instances, one that ends
/// in the middle of another.
class Allocation_Failures_Of_Many : public Allocation_Failures
{
protected:
    void open_host() override
    {
        constexpr unsigned ADAPTERS = 12;
        std::string adapters;
        for (unsigned i = 0; i < ADAPTERS; i++) {
            std::string number = std::to_string(i + 10);
            adapters += (i ? ", " : "") + std::string(R"({"hbaData": {"wwn": "20:00:02:4b:4c:)") + number +
                        R"(:00:00", "hbaMAC": "02:4b:4c:)" + number + R"(:00:00", "serialNumber": "KLDR)" +
                        number + R"("}, "fcPorts": [{"wwn": "10:00:02:4b:4c:)" + number + R"(:00:00",
                            "optics": {"serialNo": "KO)" +
                        number +
                        R"("}, "remotePorts": ["50:24:b4:c0:22:65:00:00", "50:24:b4:c0:22:65:00:01"]}],
                            "ethPorts": [{"mac": "02:4b:4c:)" +
                        number + R"(:00:00"}]})";
        }
        open_text(R"({"remotePorts": [
            {"remotePortWwn": "50:24:b4:c0:22:65:00:00", "deviceData": {"type": "Disk"}, "lunList": [
                {"number": 0, "vendor": "KLDR", "productID": "ARRAY"}, {"number": 1, "vendor": "KLDR", "productID": "ARRAY"}]},
            {"remotePortWwn": "50:24:b4:c0:22:65:00:01", "deviceData": {"type": "Tape"}, "lunList": [
                {"number": 0, "vendor": "KLDR", "productID": "TAPE"}]}], "adapters": [)" +
                  adapters + "]}");
    }
};

TEST_F(Allocation_Failures_Of_Many, OfEveryClass)
{
    EXPECT_EQ(12u, server->enumerate_instances("KALDERA_TapeDrive").instances.size());
    starve_every_class({.once = true, .any_cost = true});
}

TEST_F(Allocation_Failures, OfAMethod)
{
    const broker::Path_Value alarm = server->enumerate_instances("KALDERA_AlarmDevice").instances.at(0).path;
    // The library agrees, and stays as it is.
    simulator.add_fault(R"({"call": "setPortByWwn", "do": "answer", "answer": {"status": 0}})");
    constexpr unsigned ON = 3;
    starve("SetAlarmState", [&] {
        return server->invoke_method(
            alarm, "SetAlarmState",
            {{"RequestedAlarmState", broker::Plain_Value::unsigned_number(CMPI_uint16, ON)}});
    });
}

TEST_F(Allocation_Failures, OfTheAgent)
{
    const broker::Path_Value service =
        server->enumerate_instances("KALDERA_AgentService").instances.at(0).path;
    const std::string list = R"({"method": "discovery.getAllHbasByHost", "params": []})";
    // For a long one nothing is kept.
    for (const std::string& request :
         {list, list + std::string(5000, ' '),
          std::string(R"({"method": "discovery.getPortByWwn", "params": ["10:00:02:4b:4c:20:00:00"]})")})
        starve(request, [&] {
            return server->invoke_method(service, "executeMethod",
                                         {{"request", broker::Plain_Value::text(request)}});
        });
}

TEST_F(Allocation_Failures, OfAFirmwareUpdate)
{
    const auto first = [this](const char* name) {
        return server->enumerate_instance_names(name).paths.at(0);
    };
    const broker::Path_Value service = first("KALDERA_HBASoftwareInstallationService");
    const broker::Path_Value controller = first("KALDERA_PortController");
    // The library agrees, and stays as it is.
    simulator.add_fault(R"({"call": "adapterUpdateFlash", "do": "answer",
                            "answer": {"status": 0, "message": "done"}})");
    const broker::Plain_Value update = broker::Plain_Value::unsigned_number(CMPI_uint16, 5);
    const auto install = [&] {
        return server->invoke_method(service, "InstallFromURI",
                                     {{"URI", broker::Plain_Value::text("file:///firmware/image")},
                                      {"Target", broker::Plain_Value::path(controller)},
                                      {"InstallOptions", broker::Plain_Value::array(CMPI_uint16, {update})}});
    };
    // The last text is for the log alone, so that its loss changes no answer.
    for (const bool once : {false, true})
        starve("InstallFromURI", install, {.helpers_too = true, .once = once});
}

TEST_F(Allocation_Failures, OfAssociations)
{
    const broker::Path_Value port = server->enumerate_instances("KALDERA_FCPort").instances.at(0).path;
    starve("associators", [&] { return server->associators("KALDERA_FCPortSystemDevice", port, {}); });
}

} // namespace
} // namespace KPRV
