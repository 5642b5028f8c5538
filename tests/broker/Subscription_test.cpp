#include "broker/Subscription.h"

#include "tests/broker/Toy_Server.h"

#include <atomic>

namespace KPRV::broker {
namespace {

class Subscription_Test : public Toy_Test
{
protected:
    Subscription_Test()
    {
        server->set_sink([this](const std::string&, const Instance_Value&) {
            ++enabled;
            return CMPI_RC_OK;
        });
    }
    /// The toy delivers once each time that it is enabled.
    std::atomic<int> enabled = 0;
};

TEST_F(Subscription_Test, EnablesWithTheFirstFilterOfAll)
{
    Subscription subscription(*server, "TOY_Alert");
    EXPECT_EQ(CMPI_RC_OK, subscription.add("root/one"));
    EXPECT_EQ(CMPI_RC_OK, subscription.add("root/one"));
    EXPECT_EQ(CMPI_RC_OK, subscription.add("root/two"));
    EXPECT_EQ(1, enabled);
    EXPECT_EQ(2u, subscription.count("root/one"));
    EXPECT_EQ(1u, subscription.count("root/two"));
    EXPECT_EQ(0u, subscription.count("root/three"));
    for (const char* name_space : {"root/one", "root/two", "root/one"})
        EXPECT_EQ(CMPI_RC_OK, subscription.remove(name_space));
    EXPECT_EQ(0u, subscription.count("root/one"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, subscription.remove("root/one"));
    EXPECT_EQ(CMPI_RC_OK, subscription.add("root/one"));
    EXPECT_EQ(2, enabled);
}

TEST_F(Subscription_Test, HandsOnWhatTheProviderRefuses)
{
    Subscription silent(*server, "TOY_Silent");
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, silent.add("root/toy"));
    Subscription alert(*server, "TOY_Alert");
    EXPECT_EQ(CMPI_RC_ERR_INVALID_NAMESPACE, alert.add(""));
    EXPECT_EQ(0u, alert.count(""));
    EXPECT_EQ(0, enabled);
}

} // namespace
} // namespace KPRV::broker
