#include "module/cmpi/CMPI_Adapter.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;

/// All lines as "LEVEL text", head and line number checked.
static Texts log_lines(const Log_Capture& capture)
{
    Texts texts;
    for (const Log_Capture::Line& line : capture.lines())
        texts.push_back(line.level + " " + line.text);
    return texts;
}

TEST(CMPI_Adapter, StartsWithNothingEnabled)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    const CMPI_Adapter* const adapter = provider.adapter();
    EXPECT_EQ(adapter->broker, server.broker.cmpi());
    EXPECT_EQ(adapter->static_data, &provider.data());
    EXPECT_TRUE(adapter->unload_allowed);
    EXPECT_EQ(adapter->name_spaces.size(), 0u);
    EXPECT_EQ(adapter->model_meta_class, &Sample_Element::static_meta_class);
    EXPECT_FALSE(adapter->indications_enabled);
    provider.cleanup('I');
}

TEST(CMPI_Adapter, FindsEveryClassOfTheModule)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    CMPI_Adapter* const adapter = provider.adapter();
    for (const char* name : {"Sample_Element", "sample_port", "SAMPLE_LINK"}) {
        const Meta_Class* const meta_class = adapter->find_meta_class(name);
        EXPECT_EQ(meta_class, find_meta_class(&sample_repository, name));
        EXPECT_NE(meta_class, nullptr);
        EXPECT_EQ(adapter->find_model_meta_class(name), meta_class);
        EXPECT_EQ(CMPI_Adapter::find_meta_class_callback(name, adapter), meta_class);
    }
    for (const char* name : {"", "Unknown", "Instance"}) {
        EXPECT_EQ(adapter->find_meta_class(name), nullptr);
        EXPECT_EQ(adapter->find_model_meta_class(name), nullptr);
        EXPECT_EQ(CMPI_Adapter::find_meta_class_callback(name, adapter), nullptr);
    }
    provider.cleanup('I');
}

TEST(CMPI_Adapter, TracesItsLife)
{
    Log_Capture capture;
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    EXPECT_EQ(log_lines(capture),
              (Texts{"DBG enter: CMPI_Adapter()", "DBG return: CMPI_Adapter()",
                     "DBG enter: cimple_cmpi_adapter()", "DBG return: cimple_cmpi_adapter()"}));
    provider.factory('M');
    capture.clear();
    provider.adapter()->unload_allowed = false;
    provider.cleanup('I');
    provider.adapter()->unload_allowed = true;
    provider.cleanup('I');
    provider.cleanup('M');
    EXPECT_EQ(
        log_lines(capture),
        (Texts{"DBG enter: cleanup()", "DBG return: cleanup(): CMPI_RC_DO_NOT_UNLOAD cleanup do not unload",
               "DBG enter: cleanup()", "DBG return: cleanup(): CMPI_RC_OK cleanup decrement",
               "DBG enter: cleanup()", "DBG return: cleanup(): CMPI_RC_OK cleanup unload",
               "DBG enter: ~CMPI_Adapter()", "DBG return: ~CMPI_Adapter()"}));
}

TEST(CMPI_Adapter, IndicationAndAssociationCleanupsTraceTheirEntry)
{
    Log_Capture capture;
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('N');
    provider.factory('A');
    capture.clear();
    provider.cleanup('N');
    EXPECT_EQ(log_lines(capture), (Texts{"DBG enter: indicationCleanup()", "DBG enter: cleanup()",
                                         "DBG return: cleanup(): CMPI_RC_OK cleanup decrement"}));
    capture.clear();
    provider.cleanup('A');
    EXPECT_EQ(log_lines(capture)[0], "DBG enter: associationCleanup()");
    EXPECT_EQ(log_lines(capture)[1], "DBG enter: cleanup()");
}

TEST(CMPI_Adapter, TraceLinesAreByteExact)
{
    Temp_Folder home;
    home.write(".cimplerc", "LOG_LEVEL=DBG\n");
    const Environment_Override override("HOME", home.path());
    close_log();
    CMPI_Adapter::ent("F.cpp", 1, "f");
    CMPI_Adapter::ret("F.cpp", 2, "f");
    CMPI_Adapter::ret("F.cpp", 3, "f", CMPI_RC_ERR_NOT_FOUND);
    CMPI_Adapter::ret("F.cpp", 4, "f", CMPI_RC_ERR_METHOD_NOT_FOUND, "a text");
    CMPI_Adapter::trc("F.cpp", 5, "f", "%s=%d", "x", 6);
    close_log();
    const std::string head = "[0-9/]{10} [0-9:]{8} DBG: F\\.cpp";
    const testing::Matcher<const std::string&> lines = testing::MatchesRegex(
        head + "\\(1\\): enter: f\\(\\)\n" + head + "\\(2\\): return: f\\(\\)\n" + head +
        "\\(3\\): return: f\\(\\): CMPI_RC_ERR_NOT_FOUND\n" + head +
        "\\(4\\): return: f\\(\\): CMPI_RC_ERR_METHOD_NOT_FOUND a text\n" + head + "\\(5\\): x=6\n");
    EXPECT_TRUE(lines.Matches(home.read(".cimple/messages"))) << home.read(".cimple/messages");
}

TEST(CMPI_Adapter, NothingIsTracedBelowDebug)
{
    Log_Capture capture("INFO");
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    provider.cleanup('I');
    EXPECT_TRUE(log_lines(capture).empty());
}
