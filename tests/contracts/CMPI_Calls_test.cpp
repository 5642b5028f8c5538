// Each convenience call must reach its own slot with its arguments in order. The tables here answer from one
// slot only and are zero elsewhere, so a call through another slot would crash the test.
#include "contracts/cmpi/cmpimacs.h"

#include <gtest/gtest.h>

namespace {

struct Seen
{
    const void* self;
    const void* first;
    const void* second;
    const void* third;
    int number;
};
Seen seen;

TEST(CMPI_Calls, Keys)
{
    CMPIObjectPathFT ft = {};
    ft.addKey = [](const CMPIObjectPath* op, const char* name, const CMPIValue* value, CMPIType type) {
        seen = {op, name, value, nullptr, type};
        return CMPIStatus{CMPI_RC_ERR_INVALID_DATA_TYPE, nullptr};
    };
    CMPIObjectPath path = {nullptr, &ft};
    const char* name = "Name";
    CMPIUint16 number = 5;
    EXPECT_EQ(CMPI_RC_ERR_INVALID_DATA_TYPE, CMAddKey(&path, name, &number, CMPI_uint16).rc);
    EXPECT_EQ(&path, seen.self);
    EXPECT_EQ(name, seen.first);
    EXPECT_EQ(&number, seen.second);
    EXPECT_EQ(CMPI_uint16, seen.number);
}

TEST(CMPI_Calls, IndexedAccessPassesIndexNameAndStatus)
{
    CMPIInstanceFT ft = {};
    ft.getPropertyAt = [](const CMPIInstance* inst, CMPICount index, CMPIString** name, CMPIStatus* rc) {
        seen = {inst, name, rc, nullptr, static_cast<int>(index)};
        CMPIData data = {};
        data.type = CMPI_uint64;
        data.value.uint64 = 0x1122334455667788;
        return data;
    };
    CMPIInstance inst = {nullptr, &ft};
    CMPIString* name = nullptr;
    CMPIStatus rc = {};
    CMPIData data = CMGetPropertyAt(&inst, 7, &name, &rc);
    EXPECT_EQ(0x1122334455667788u, data.value.uint64);
    EXPECT_EQ(CMPI_uint64, data.type);
    EXPECT_EQ(&inst, seen.self);
    EXPECT_EQ(&name, seen.first);
    EXPECT_EQ(&rc, seen.second);
    EXPECT_EQ(7, seen.number);
}

TEST(CMPI_Calls, BrokerCallsPassTheBrokerFirst)
{
    CMPIBrokerEncFT eft = {};
    eft.newObjectPath = [](const CMPIBroker* mb, const char* ns, const char* cn, CMPIStatus* rc) {
        seen = {mb, ns, cn, rc, 0};
        return static_cast<CMPIObjectPath*>(nullptr);
    };
    CMPIBrokerFT bft = {};
    bft.deliverIndication = [](const CMPIBroker* mb, const CMPIContext* ctx, const char* ns,
                               const CMPIInstance* inst) {
        seen = {mb, ctx, ns, inst, 0};
        return CMPIStatus{};
    };
    CMPIBroker broker = {};
    broker.bft = &bft;
    broker.eft = &eft;
    const char *ns = "root", *cn = "Class";
    CMPIStatus rc = {};
    CMNewObjectPath(&broker, ns, cn, &rc);
    EXPECT_EQ(&broker, seen.self);
    EXPECT_EQ(ns, seen.first);
    EXPECT_EQ(cn, seen.second);
    EXPECT_EQ(&rc, seen.third);
    CMPIInstance inst = {};
    CMPIContext ctx = {};
    CBDeliverIndication(&broker, &ctx, ns, &inst);
    EXPECT_EQ(&ctx, seen.first);
    EXPECT_EQ(ns, seen.second);
    EXPECT_EQ(&inst, seen.third);
}

TEST(CMPI_Calls, ReleaseAndCloneWorkOnAnyObject)
{
    CMPIArgsFT ft = {};
    ft.release = [](CMPIArgs* args) {
        seen = {args, nullptr, nullptr, nullptr, 0};
        return CMPIStatus{};
    };
    ft.clone = [](const CMPIArgs* args, CMPIStatus*) { return const_cast<CMPIArgs*>(args); };
    CMPIArgs args = {nullptr, &ft};
    EXPECT_EQ(&args, CMClone(&args, nullptr));
    EXPECT_EQ(CMPI_RC_OK, CMRelease(&args).rc);
    EXPECT_EQ(&args, seen.self);
}

TEST(CMPI_Calls, CharPointerNeedsNoStatus)
{
    CMPIStringFT ft = {};
    ft.getCharPtr = [](const CMPIString*, CMPIStatus* rc) { return rc ? "with" : "without"; };
    CMPIString text = {nullptr, &ft};
    CMPIStatus rc = {};
    EXPECT_STREQ("without", CMGetCharPtr(&text));
    EXPECT_STREQ("with", CMGetCharsPtr(&text, &rc));
}

} // namespace
