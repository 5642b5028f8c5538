// Of `ProviderUtil`, the names of classes, records and tests, as tables by their ids.
#include "module/adapter/Class_Names.h"
#include "module/adapter/ProviderUtil.h"
#include "module/adapter/ProviderUtil_Log.h"

#include <iterator>

namespace KPRV {

namespace {

constexpr const char* class_names[] = {
    "--",
#define CLASS_ID(id, enumerator, name) #name,
#include "module/adapter/Class_Ids.def"
#undef CLASS_ID
};

constexpr const char* record_texts[] = {
    /*  0 */ "--",
    /*  1 */ "Checking whether the adapter is disabled for running memory test",
    /*  2 */ "Adapter is not disabled",
    /*  3 */ "Disabling the adapter for running memory test",
    /*  4 */ "Enabling the adapter after running memory test",
    /*  5 */ "Running memory test on the adapter",
    /*  6 */ "Checking for return codes for memory test run",
    /*  7 */ "Memory test run is successful",
    /*  8 */ "Memory test failed",
    /*  9 */ "Running PCI Loopback test for the port",
    /* 10 */ "Checking for return codes for PCI Loopback test run",
    /* 11 */ "PCI Loopback test run is successful",
    /* 12 */ "PCI Loopback test failed",
    /* 13 */ "Checking whether the port is disabled for running loopback test",
    /* 14 */ "Port is already disabled",
    /* 15 */ "Port is not disabled",
    /* 16 */ "Disabling the port for running loopback test",
    /* 17 */ "Enabling the port after running loopback test",
    /* 18 */ "Running loopback test for the port",
    /* 19 */ "Checking for return codes for loopback test run",
    /* 20 */ "Loopback test run is successful",
    /* 21 */ "Loopback test failed",
    /* 22 */ "Checking whether the port is disabled for running eth loopback test",
    /* 23 */ "Disabling the port for running eth loopback test",
    /* 24 */ "Enabling the port after running eth loopback test",
    /* 25 */ "Running eth loopback test for the port",
    /* 26 */ "Checking for return codes for eth loopback test run",
    /* 27 */ "Eth loopback test run is successful",
    /* 28 */ "Eth loopback test failed",
    /* 29 */ "Disabling the port",
    /* 30 */ "Enabling the port",
    /* 31 */ "Failed to disable the port",
    /* 32 */ "Running memory test may take a few moments",
    /* 33 */ "Adapter is already disabled",
    /* 34 */ "Eth loopback test aborted",
    /* 35 */ "Unknown failure",
};

#define TEST_NAME(name) "Kaldera:" name
constexpr const char* test_names[] = {
    TEST_NAME("--"),
    TEST_NAME("MemoryTest"),
    TEST_NAME("InternalLoopbackTest"),
    TEST_NAME("ExternalLoopbackTest"),
    TEST_NAME("SerdesLoopbackTest"),
    TEST_NAME("PCILoopbackTest"),
    TEST_NAME("ExternalEthLoopbackTest"),
    TEST_NAME("SerdesEthLoopbackTest"),
};
#undef TEST_NAME

static_assert(std::size(class_names) == MAXCLASSID);
static_assert(std::size(record_texts) == REC_MAX_ID);
static_assert(std::size(test_names) == DIAG_NAME_INVALID);

} // namespace

const char* ProviderUtil::getClassName(classId_t id)
{
    if (id < MAXCLASSID)
        return class_names[id];
    UTIL_LOG(INFO, "ClassId is greater than MAXCLASSID");
    return "INVALID CLASS";
}

const String& class_name_text(classId_t id)
{
    struct Texts
    {
        String text[MAXCLASSID];
        Texts()
        {
            for (unsigned i = 0; i < MAXCLASSID; i++)
                text[i] = class_names[i];
        }
    };
    static const Texts texts;
    if (id < MAXCLASSID)
        return texts.text[id];
    static const String invalid(ProviderUtil::getClassName(id));
    return invalid;
}

const char* ProviderUtil::getRecordData(diag_record_msg_t id)
{
    if (id < REC_MAX_ID)
        return record_texts[id];
    UTIL_LOG(ERR, "Record ID is greater than REC_MAX_ID");
    return "INVALID RECORD ID";
}

const char* ProviderUtil::getDiagTestName(diag_test_id_t id)
{
    if (id < DIAG_NAME_INVALID)
        return test_names[id];
    UTIL_LOG(INFO, "Diag Test Id is greater than DIAG_NAME_INVALID");
    return "INVALID DIAGNOSTIC ID";
}

} // namespace KPRV
