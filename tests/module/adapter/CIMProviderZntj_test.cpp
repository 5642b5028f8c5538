#include "module/adapter/CIMProviderZntj.h"

#include "module/adapter/ProviderUtil.h"
#include "tests/support/In_Child.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <dlfcn.h>

using namespace KPRV;

namespace {

/// Opens a library under its path first, so that opening it by its bare name finds it.
void* preload(const char* path)
{
    void* handle = dlopen(path, RTLD_NOW);
    EXPECT_NE(handle, nullptr) << dlerror();
    return handle;
}

template <class Signature>
void expect_holds(Signature variable, const char* symbol, void* library)
{
    EXPECT_EQ(reinterpret_cast<void*>(variable), dlsym(library, symbol)) << symbol;
}

void expect_stubs()
{
#define ENTRY_POINT(symbol, variable, signature) EXPECT_EQ(variable, &default_##signature) << #symbol;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
}

void expect_symbols(void* library)
{
#define ENTRY_POINT(symbol, variable, signature) expect_holds(variable, #symbol, library);
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
}

} // namespace

TEST(CIMProviderZntj, WithoutALibraryEveryVariableHoldsItsStub)
{
    in_child([] {
        Log_Capture log;
        setupDLLEntryPoints();
        EXPECT_EQ(libHandle, nullptr);
        EXPECT_FALSE(gZntjLibLoaded);
        expect_stubs();
        const Lines said = log.said();
        ASSERT_EQ(said.size(), 2u);
        EXPECT_EQ(said[0], "DBG inside setupDLLEntryPoints");
        EXPECT_TRUE(said[1].starts_with("DBG Error in loading library: libdzntj.so: cannot open")) << said[1];
        EXPECT_EQ(log.traces(), Lines{"DBG Returning: setupDLLEntryPoints"});
        EXPECT_EQ(log.lines().front().file, "CIMProviderZntj.cpp");
    });
}

TEST(CIMProviderZntj, TheStubsAnswerAsAFailure)
{
    EXPECT_TRUE(default_JsonReqFP(Json::Value(5)).isNull());
    default_JsonReqVoidFP(Json::Value());
    EXPECT_EQ(default_voidRetStrFP(), nullptr);
    EXPECT_EQ(default_voidRetUIntFP(), 65535u);
    EXPECT_EQ(default_voidRetIntFP(), -1);
    default_evtProcessCBRetVoidFP(nullptr);
    default_log4cxxMsgRetVoidFP(nullptr);
    EXPECT_FALSE(ProviderUtil::isValidJsonResponse(default_JsonReqFP(Json::Value())));
}

TEST(CIMProviderZntj, ThereAre117EntryPoints)
{
    int count = 0, json = 0;
#define ENTRY_POINT(symbol, variable, signature)                                                             \
    count++;                                                                                                 \
    json += std::is_same_v<signature, JsonReqFP>;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    EXPECT_EQ(count, 117);
    EXPECT_EQ(json, 111);
}

TEST(CIMProviderZntj, ALibraryIsFoundByItsBareNameAndFillsEveryVariable)
{
    in_child([] {
        void* library = preload(WHOLE_LIBRARY);
        Log_Capture log;
        setupDLLEntryPoints();
        EXPECT_EQ(libHandle, library);
        EXPECT_TRUE(gZntjLibLoaded);
        expect_symbols(library);
        EXPECT_EQ(libGetAdapterIdByPort(Json::Value()), "getAdapterIdByPort");
        EXPECT_EQ(libUnRegisterForEvents(Json::Value()), "unregister_for_events");
        EXPECT_EQ(libGetNumOfAdapters(), 2u);
        EXPECT_EQ(log.said(), Lines{"DBG inside setupDLLEntryPoints"});
    });
}

TEST(CIMProviderZntj, AMissingSymbolLeavesItsVariableNull)
{
    in_child([] {
        preload(LACKING_LIBRARY);
        Log_Capture log("ERR");
        setupDLLEntryPoints();
        EXPECT_TRUE(gZntjLibLoaded);
        EXPECT_EQ(libGetLldp, nullptr);
        EXPECT_NE(libGetCee, nullptr);
        const Lines said = log.said();
        ASSERT_EQ(said.size(), 1u);
        EXPECT_TRUE(said[0].starts_with("ERR getLldp not found. ")) << said[0];
        EXPECT_TRUE(said[0].ends_with(" undefined symbol: getLldp ")) << said[0];
    });
}
