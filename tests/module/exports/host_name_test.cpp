#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Module_Picture.h"

#include <algorithm>
#include <atomic>

#include <dlfcn.h>
#include <netdb.h>

namespace {

std::atomic<int> look_ups = 0;

} // namespace

/// In this program the module asks its resolver here.
extern "C" [[gnu::visibility("default")]] int gethostbyname_r(const char* name, hostent* entry, char* room,
                                                              size_t size, hostent** found, int* error)
{
    static auto* const ask =
        reinterpret_cast<decltype(gethostbyname_r)*>(dlsym(RTLD_NEXT, "gethostbyname_r"));
    look_ups++;
    return ask(name, entry, room, size, found, error);
}

namespace KPRV {
namespace {

class Host_Look_Ups : public Module_Fixture
{
protected:
    template <class Request>
    static int of(Request request)
    {
        look_ups = 0;
        EXPECT_EQ(CMPI_RC_OK, request().rc);
        return look_ups;
    }
    int of_enumeration(const std::string& name)
    {
        return of([&] { return server->enumerate_instances(name); });
    }
};

TEST_F(Host_Look_Ups, AreOneAnEnumerationAtMost)
{
    open("rich.json");
    std::vector<std::string> looked_up;
    for (const std::string& name : enumerable_classes(*server)) {
        const int count = of_enumeration(name);
        EXPECT_LE(count, 1) << name;
        if (count == 1)
            looked_up.push_back(name);
    }
    // Whatever belongs to the host bears its name.
    for (const char* name :
         {"KALDERA_ComputerSystem", "KALDERA_ControlledBy", "KALDERA_FCPort", "KALDERA_FCPortSystemDevice",
          "KALDERA_LogicalDisk", "KALDERA_PortController", "KALDERA_PortControllerSystemDevice",
          "KALDERA_SCSIInitiatorTargetLogicalUnitPath", "KALDERA_SCSIProtocolEndpoint",
          "KALDERA_StorageExtent", "KALDERA_StorageResourcesSystemDevice"})
        EXPECT_EQ(1, std::ranges::count(looked_up, name)) << name;
}

TEST_F(Host_Look_Ups, AreOneForEachRequestAnew)
{
    open("rich.json");
    for (int i = 0; i < 3; i++)
        EXPECT_EQ(1, of_enumeration("KALDERA_FCPort"));
}

/// The server asks the module for each far end, on the thread of the request.
TEST_F(Host_Look_Ups, AreOneForAnEndWithAllThatItIsAssociatedWith)
{
    open("rich.json");
    const broker::Path_Value host = enumerate("KALDERA_ComputerSystem").instances.at(0).path;
    const broker::Path_Value port = enumerate("KALDERA_FCPort").instances.at(0).path;
    EXPECT_EQ(1, of([&] { return server->get_instance(port); }));
    for (const char* name : {"KALDERA_FCPortSystemDevice", "KALDERA_PortControllerSystemDevice",
                             "KALDERA_StorageResourcesSystemDevice"}) {
        EXPECT_EQ(1, of([&] { return server->associators(name, host, {}); })) << name;
        EXPECT_EQ(1, of([&] { return server->associator_names(name, host, {}); })) << name;
        EXPECT_EQ(1, of([&] { return server->references(name, host, {}); })) << name;
        EXPECT_EQ(1, of([&] { return server->reference_names(name, host, {}); })) << name;
    }
}

} // namespace
} // namespace KPRV
