#include "module/runtime/dispatch/Registration.h"
#include "tests/module/exports/Module_Fixture.h"

#include <dlfcn.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <iterator>
#include <set>

#include <pthread.h>

namespace KPRV {
namespace {

std::string output_of(const std::string& command)
{
    std::string text;
    FILE* pipe = popen(command.c_str(), "r");
    if (!pipe)
        return text;
    std::array<char, 4096> part;
    while (size_t n = fread(part.data(), 1, part.size(), pipe))
        text.append(part.data(), n);
    pclose(pipe);
    return text;
}

bool is_mapped()
{
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.ends_with(KLDR_MODULE))
            return true;
    }
    return false;
}

std::vector<const char*> kinds_of(const Meta_Class* meta_class)
{
    if (meta_class->flags & FLAG_INDICATION)
        return {"Indication", "Method"};
    if (meta_class->flags & FLAG_ASSOCIATION)
        return {"Association", "Instance", "Method"};
    return {"Instance", "Method"};
}

class Surface : public Module_Fixture
{
};

TEST_F(Surface, ExportsTheFactoriesOfTheClassListAndFourNamesMore)
{
    open("empty.json");
    std::set<std::string> expected = {"cimple_module", "cimple_cmpi_adapter", "_ZTIN4KPRV13HbaAgentErrorE",
                                      "_ZTSN4KPRV13HbaAgentErrorE"};
    size_t providers = 0;
    for (const Registration* each = server->module().registrations(); each; each = each->next, providers++) {
        for (const char* kind : kinds_of(each->meta_class)) {
            expected.insert(std::string(each->provider_name) + "_Create_" + kind + "MI");
            expected.insert(std::string(each->meta_class->name) + "_Create_" + kind + "MI");
        }
    }
    EXPECT_EQ(76u, providers);

    std::set<std::string> exported;
    std::istringstream lines(output_of("nm -D --defined-only '" KLDR_MODULE "'"));
    for (std::string line; std::getline(lines, line);)
        exported.insert(line.substr(line.rfind(' ') + 1));
    EXPECT_EQ(expected, exported);
}

TEST_F(Surface, FindsTheAdapterLibraryBehindTheSearchPathOfTheServer)
{
    const std::string dynamic = output_of("readelf -d '" KLDR_MODULE "'");
    // RUNPATH comes behind LD_LIBRARY_PATH; RPATH would come before it.
    EXPECT_NE(std::string::npos, dynamic.find("(RUNPATH)")) << dynamic;
    EXPECT_NE(std::string::npos, dynamic.find("[/usr/lib/cim]")) << dynamic;
    EXPECT_EQ(std::string::npos, dynamic.find("(RPATH)")) << dynamic;
    EXPECT_EQ(std::string::npos, dynamic.find("libdzntj")) << "the adapter library is opened, never linked";
    EXPECT_NE(std::string::npos, dynamic.find("libjsoncpp")) << "its values cross into the adapter library";
}

TEST_F(Surface, LastCloseUnmapsTheModule)
{
    open();
    EXPECT_TRUE(server->enumerate_instances("KALDERA_PortController").ok());
    EXPECT_TRUE(is_mapped());
    close();
    EXPECT_FALSE(is_mapped());
    open();
    EXPECT_TRUE(server->enumerate_instances("KALDERA_PortController").ok());
}

TEST_F(Surface, GivesItsThreadKeyAndItsDescriptorsBack)
{
    const auto descriptors = [] {
        return std::distance(std::filesystem::directory_iterator("/proc/self/fd"),
                             std::filesystem::directory_iterator());
    };
    open("one_hba.json");
    close();
    const auto before = descriptors();

    // All keys of the process but a few are taken: one lost at each load would show.
    std::vector<pthread_key_t> taken;
    for (pthread_key_t key; pthread_key_create(&key, nullptr) == 0;)
        taken.push_back(key);
    for (int spare = 0; spare < 3 && !taken.empty(); spare++) {
        pthread_key_delete(taken.back());
        taken.pop_back();
    }
    for (int load = 0; load < 10; load++) {
        open("one_hba.json");
        EXPECT_EQ(1u, server->enumerate_instances("KALDERA_Product").instances.size());
        close();
    }
    pthread_key_t still_free;
    EXPECT_EQ(0, pthread_key_create(&still_free, nullptr));
    pthread_key_delete(still_free);
    for (const pthread_key_t key : taken)
        pthread_key_delete(key);
    EXPECT_EQ(before, descriptors());
}

TEST_F(Surface, LoadsWithEverySymbolResolvedAtOnce)
{
    void* handle = dlopen(KLDR_MODULE, RTLD_NOW | RTLD_GLOBAL);
    ASSERT_TRUE(handle) << dlerror();
    EXPECT_EQ(0, dlclose(handle));
}

TEST_F(Surface, GreetsAndLeavesTheAdapterLibraryOnce)
{
    open("one_hba.json");
    EXPECT_EQ((std::vector<std::string>{"get_agt_version", "registerLogMsgCb", "init_hba_lib",
                                        "getNumberOfAdapters"}),
              simulator.call_names());
    EXPECT_EQ(2, simulator.requests("init_hba_lib").at(0)["appId"].asInt());
    mark();
    close();
    EXPECT_EQ(std::vector<std::string>{"free_hba_lib"}, simulator.call_names());
    EXPECT_EQ((Lines{"DBG Inside ProviderInit Destructor."}), said_by("ProviderInit.cpp"));
}

} // namespace
} // namespace KPRV
