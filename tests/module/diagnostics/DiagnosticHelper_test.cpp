#include "module/diagnostics/DiagnosticHelper.h"
#include "module/runtime/objects/Ref.h"
#include "module/schema/KALDERA_AffectedJobElement.h"
#include "module/schema/KALDERA_CompletionRecordAppliesToElement.h"
#include "module/schema/KALDERA_DiagnosticCompletionRecord.h"
#include "module/schema/KALDERA_DiagnosticServiceRecord.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_ServiceRecordAppliesToElement.h"
#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Live_Blocks.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

class Diagnostic_Helper : public testing::Test
{
protected:
    Diagnostic_Helper()
    {
        adapter("825");
        library.answers("getFcPhyPortIndicesByAdapter",
                        json("{'indexStrings': ['10:00:02:4b:4c:10:00:00']}"));
        library.answers("getPortByWwn",
                        json("{'wwn': '10:00:02:4b:4C:10:00:00', 'nodeWwn': '20:00:02:4b:4c:10:00:00'}"));
        input.class_id = FCPORT;
        input.port_wwn = "1000024b4c100000";
        input.test_id = PCI_LOOPBACK_TEST;
        input.job_id = "Kaldera:PCILoopbackTest-1";
    }
    void adapter(const char* model)
    {
        Json::Value details =
            json("{'hbaData': {'portCount': 1}, 'driver': {'storageDriverVersion': ' 3.2.1 '}}");
        details["hbaData"]["model"] = model;
        library.adapters({{"20:00:02:4b:4c:10:00:00", details}});
    }
    Lines names(classId_t id) { return taken(helper.getInstancesByClass(id), "Name"); }
    void record(bool is_service, const char* text = "text")
    {
        helper.generateDiagnosticRecord(text, is_service, &input, COMPLETION_FAILED);
    }
    DiagnosticJob add_job()
    {
        DiagnosticJob job = helper.createDiagnosticJob(&input);
        helper.addDiagnosticJob(job);
        return job;
    }
    template <class T>
    Ref<T> first(const Array<Instance*>& instances)
    {
        Ref<T> one(instances.empty() ? nullptr : cast<T>(instances[0]));
        for (uint32 i = 1; i < instances.size(); i++)
            destroy(instances[i]);
        return one;
    }

    template <class T>
    static Lines ids_of(const Array<Instance*>& records)
    {
        Lines ids;
        for (Instance* each : records) {
            ids.push_back(cast<T>(each)->InstanceID.value.c_str());
            destroy(each);
        }
        return ids;
    }

    Fixed_Host host;
    Fake_Library library;
    Log_Capture log{"INFO"};
    DiagnosticHelper helper;
    DiagnosticTestInput input;
};

const Lines NONE;

TEST_F(Diagnostic_Helper, PublishesTheTestsByClass)
{
    EXPECT_EQ(Lines{"Kaldera:MemoryTest"}, names(MEMORYDIAGNOSTICTEST));
    EXPECT_EQ(
        (Lines{"Kaldera:InternalLoopbackTest", "Kaldera:ExternalLoopbackTest", "Kaldera:SerdesLoopbackTest"}),
        names(LOOPBACKDIAGNOSTICTEST));
    EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest"}, names(PCILOOPBACKDIAGNOSTICTEST));
    EXPECT_EQ((Lines{"Kaldera:ExternalEthLoopbackTest", "Kaldera:SerdesEthLoopbackTest"}),
              names(ETHLOOPBACKDIAGNOSTICTEST));
    log.clear();
    EXPECT_EQ(NONE, names(FCPORT));
    EXPECT_EQ((Lines{"INFO Requested Class : KALDERA_FCPort", "WARN Not supported class is requested."}),
              log.said());
}

TEST_F(Diagnostic_Helper, WithholdsPlugAndEthernetTestsFromAHostWithTheSpecialModel)
{
    for (const char* model : {"Kaldera-4410", "kaldera-44", ""}) {
        adapter(model);
        EXPECT_EQ((Lines{"Kaldera:InternalLoopbackTest", "Kaldera:SerdesLoopbackTest"}),
                  names(LOOPBACKDIAGNOSTICTEST));
        EXPECT_EQ(NONE, names(ETHLOOPBACKDIAGNOSTICTEST));
        EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest"}, names(PCILOOPBACKDIAGNOSTICTEST));
        EXPECT_EQ((Lines{"Kaldera:MemoryTest", "Kaldera:InternalLoopbackTest", "Kaldera:SerdesLoopbackTest",
                         "Kaldera:PCILoopbackTest"}),
                  taken(helper.getDiagnosticServices(), "Name"));
    }
    adapter("Kaldera-44100");
    EXPECT_EQ(3u, names(LOOPBACKDIAGNOSTICTEST).size());
}

TEST_F(Diagnostic_Helper, FillsATest)
{
    const std::vector<Set_Properties> tests = taken(helper.getInstancesByClass(LOOPBACKDIAGNOSTICTEST));
    EXPECT_EQ((Set_Properties{{"Characteristics", "{2, 4, 10}"},
                              {"CreationClassName", "KALDERA_LoopbackDiagnosticTest"},
                              {"ElementName", "Loopback Diagnostic Test"},
                              {"EnabledDefault", "2"},
                              {"EnabledState", "5"},
                              {"Name", "Kaldera:ExternalLoopbackTest"},
                              {"OtherCharacteristicDescription", ""},
                              {"RequestedState", "12"},
                              {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                              {"SystemName", "10.0.0.1"},
                              {"TransitioningToState", "12"}}),
              tests.at(1));
    EXPECT_EQ("{2, 4}", tests.at(0).at("Characteristics"));
    const Set_Properties pci = taken(helper.getInstancesByClass(PCILOOPBACKDIAGNOSTICTEST)).at(0);
    EXPECT_EQ("{2}", pci.at("Characteristics"));
    EXPECT_EQ("PCI Loopback Diagnostic Test", pci.at("ElementName"));
    EXPECT_EQ("Memory Diagnostic Test",
              taken(helper.getInstancesByClass(MEMORYDIAGNOSTICTEST)).at(0).at("ElementName"));
    EXPECT_EQ("Eth Loopback Diagnostic Test",
              taken(helper.getInstancesByClass(ETHLOOPBACKDIAGNOSTICTEST)).at(1).at("ElementName"));
}

TEST_F(Diagnostic_Helper, KnowsTheCharacteristicsOfEachTest)
{
    std::map<std::string, std::string> found;
    for (const classId_t id :
         {MEMORYDIAGNOSTICTEST, LOOPBACKDIAGNOSTICTEST, PCILOOPBACKDIAGNOSTICTEST, ETHLOOPBACKDIAGNOSTICTEST})
        for (const Set_Properties& test : taken(helper.getInstancesByClass(id)))
            found[test.at("Name")] = test.at("Characteristics");
    EXPECT_EQ((std::map<std::string, std::string>{{"Kaldera:ExternalEthLoopbackTest", "{2, 4, 10}"},
                                                  {"Kaldera:ExternalLoopbackTest", "{2, 4, 10}"},
                                                  {"Kaldera:InternalLoopbackTest", "{2, 4}"},
                                                  {"Kaldera:MemoryTest", "{2, 4}"},
                                                  {"Kaldera:PCILoopbackTest", "{2}"},
                                                  {"Kaldera:SerdesEthLoopbackTest", "{2, 4}"},
                                                  {"Kaldera:SerdesLoopbackTest", "{2, 4}"}}),
              found);
}

TEST_F(Diagnostic_Helper, LosesNothingThatIsBeingMade)
{
    add_job();
    for (const bool is_service : {true, true, false, false})
        record(is_service);
    for (const classId_t id :
         {MEMORYDIAGNOSTICTEST, LOOPBACKDIAGNOSTICTEST, DIAGNOSTICSOFTWAREIDENTITY, CONCRETEJOB,
          DIAGNOSTICSERVICERECORD, DIAGNOSTICCOMPLETIONRECORD, AFFECTEDJOBELEMENT,
          SERVICERECORDAPPLIESTOELEMENT, COMPLETIONRECORDAPPLIESTOELEMENT}) {
        SCOPED_TRACE(ProviderUtil::getClassName(id));
        EXPECT_FALSE(taken(helper.getInstancesByClass(id)).empty());
        const auto enumerate = [&] {
            for (Instance* instance : helper.getInstancesByClass(id))
                destroy(instance);
        };
        const auto forget = [&] {
            log.clear();
            library.calls.clear();
        };
        EXPECT_EQ("", lost_without_a_block(enumerate, forget));
    }
}

TEST_F(Diagnostic_Helper, KnowsNoCharacteristicsOfWhatIsNoTest)
{
    for (const uint32 id : {0u, 8u, 99u}) {
        log.clear();
        EXPECT_EQ(1u, getDiagCharacteristics(diag_test_id_t(id)).size());
        EXPECT_EQ(Lines{"WARN WARNING! Control should never come here"}, log.said());
    }
}

TEST_F(Diagnostic_Helper, FillsTheSoftwareIdentity)
{
    EXPECT_EQ((Set_Properties{{"BuildNumber", "0"},
                              {"Caption", "Diagnostic Software"},
                              {"Classifications", "{7}"},
                              {"Description", "Diagnostic Software"},
                              {"ElementName", "Diagnostic Software"},
                              {"IdentityInfoType", "{SoftwareID, SoftwareStatus}"},
                              {"IdentityInfoValue", "{Diagnostic Software for Kaldera Adapter, Primary}"},
                              {"InstanceID", "Kaldera:Diagnostic"},
                              {"IsEntity", "false"},
                              {"IsLargeBuildNumber", "false"},
                              {"MajorVersion", "2"},
                              {"Manufacturer", "KLDR"},
                              {"MinorVersion", "2"},
                              {"Name", "KLDR Diagnostic Software"},
                              {"RevisionNumber", "0"},
                              {"VersionString", "3.2.1"}}),
              taken(helper.getInstancesByClass(DIAGNOSTICSOFTWAREIDENTITY)).at(0));
}

TEST_F(Diagnostic_Helper, HasNothingOnAHostWithoutAdapters)
{
    add_job();
    record(true);
    record(false);
    for (const char* list : {"{'indexStrings': []}", "{'indexStrings': null}"}) {
        library.answers("getAllAdaptersIndexString", json(list));
        for (const uint32 id : {21, 22, 23, 24, 25, 26, 27, 28, 31, 32, 33}) {
            log.clear();
            EXPECT_TRUE(helper.getInstancesByClass(classId_t(id)).empty()) << id;
            EXPECT_EQ(Lines{"WARN No adapters in the system for running diagnostics."}, log.said("WARN"));
        }
    }
    for (const char* list : {"null", "{'error': 1}", "{}", "{'indexStrings': 7}"}) {
        library.answers("getAllAdaptersIndexString", json(list));
        log.clear();
        EXPECT_TRUE(helper.getInstancesByClass(CONCRETEJOB).empty());
        EXPECT_EQ(Lines{"ERR libGetAllAdaptersIndexString returns NULL."}, log.said("ERR"));
    }
    EXPECT_EQ(7u, taken(helper.getDiagnosticServices(), "Name").size()) << "no check on adapters here";
}

TEST_F(Diagnostic_Helper, FillsAJob)
{
    add_job();
    helper.updateJobState("another");
    const Ref<KALDERA_ConcreteJob> job = first<KALDERA_ConcreteJob>(helper.getInstancesByClass(CONCRETEJOB));
    EXPECT_STREQ("Kaldera:PCILoopbackTest-1", job->InstanceID.value.c_str());
    EXPECT_STREQ("Kaldera:PCILoopbackTest-1", job->Name.value.c_str());
    EXPECT_EQ(4, job->JobState.value);
    EXPECT_EQ(0, job->PercentComplete.value);
    EXPECT_FALSE(job->PercentComplete.null);
    EXPECT_TRUE(job->StartTime.value.is_timestamp());
    EXPECT_STREQ("00000000000000.000000:000", job->ElapsedTime.value.ascii().c_str());
    EXPECT_STREQ("00000000000500.000000:000", job->TimeBeforeRemoval.value.ascii().c_str());
    helper.updateJobState("KALDERA:pciLoopbackTest-1");
    const Ref<KALDERA_ConcreteJob> over = first<KALDERA_ConcreteJob>(helper.getInstancesByClass(CONCRETEJOB));
    EXPECT_EQ(7, over->JobState.value);
    EXPECT_EQ(100, over->PercentComplete.value);
    EXPECT_EQ(job->StartTime.value, over->StartTime.value);
    EXPECT_STREQ("00000000000000.000000:000", over->ElapsedTime.value.ascii().c_str());
}

TEST_F(Diagnostic_Helper, KeepsOneJob)
{
    add_job();
    add_job();
    EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest-2"},
              ids_of<KALDERA_ConcreteJob>(helper.getDiagnosticJobInstances()));
}

TEST_F(Diagnostic_Helper, CutsAJobsNumberToSevenDigits)
{
    for (int i = 0; i < 12345678; i++)
        helper.getNextJobID();
    EXPECT_STREQ("Kaldera:PCILoopbackTest-1234567", add_job().instance_id.c_str());
}

TEST_F(Diagnostic_Helper, FillsRecordsOfBothKinds)
{
    record(true, "on the way");
    record(false, "the end");
    const auto service =
        first<KALDERA_DiagnosticServiceRecord>(helper.getInstancesByClass(DIAGNOSTICSERVICERECORD));
    EXPECT_STREQ("Kaldera:PCILoopbackTest-1:1", service->InstanceID.value.c_str());
    EXPECT_STREQ("Diagnostic Service Record", service->Caption.value.c_str());
    EXPECT_STREQ("Diagnostic Service Record", service->ElementName.value.c_str());
    EXPECT_STREQ("This represents the data generated by the diagnostic service run",
                 service->Description.value.c_str());
    EXPECT_STREQ("on the way", service->RecordData.value.c_str());
    EXPECT_STREQ("Kaldera:PCILoopbackTest", service->ServiceName.value.c_str());
    EXPECT_STREQ("2000024b4c100000:1000024b4C100000", service->ManagedElementName.value.c_str());
    EXPECT_EQ(4, service->RecordType.value);
    EXPECT_FALSE(service->RecordFormat.null);
    EXPECT_TRUE(service->RecordFormat.value.empty());
    EXPECT_TRUE(service->CreationTimeStamp.value.is_timestamp());
    const auto completion =
        first<KALDERA_DiagnosticCompletionRecord>(helper.getInstancesByClass(DIAGNOSTICCOMPLETIONRECORD));
    EXPECT_STREQ("Kaldera:PCILoopbackTest-1:2", completion->InstanceID.value.c_str());
    EXPECT_STREQ("Diagnostic Completion Record", completion->Caption.value.c_str());
    EXPECT_STREQ("This represents the results generated by the diagnostic service run",
                 completion->Description.value.c_str());
    EXPECT_EQ(6, completion->RecordType.value);
    EXPECT_EQ(5, completion->CompletionState.value);
}

TEST_F(Diagnostic_Helper, KeepsTheLastHundredRecordsOfAKind)
{
    input.class_id = NO_CLASS;
    const auto ids = [&] {
        return ids_of<KALDERA_DiagnosticServiceRecord>(helper.getDiagnosticServiceRecordInstances());
    };
    for (int i = 1; i <= 101; i++)
        record(true);
    EXPECT_EQ(100u, ids().size());
    EXPECT_EQ("Kaldera:PCILoopbackTest-1:2", ids().front());
    for (int i = 102; i <= 150; i++)
        record(true);
    EXPECT_EQ(100u, ids().size());
    EXPECT_EQ("Kaldera:PCILoopbackTest-1:51", ids().front());
    EXPECT_EQ("Kaldera:PCILoopbackTest-1:150", ids().back());
    // One counter serves both kinds, and the limit counts each by itself.
    record(false);
    EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest-1:151"},
              ids_of<KALDERA_DiagnosticCompletionRecord>(helper.getDiagnosticCompletionRecordInstances()));
    record(true);
    EXPECT_EQ("Kaldera:PCILoopbackTest-1:152", ids().back());
    EXPECT_EQ("Kaldera:PCILoopbackTest-1:52", ids().front());
}

TEST_F(Diagnostic_Helper, CutsARecordsIdToItsBuffer)
{
    input.job_id = std::string(60, 'x').c_str();
    record(true);
    EXPECT_EQ(Lines{std::string(49, 'x')},
              ids_of<KALDERA_DiagnosticServiceRecord>(helper.getDiagnosticServiceRecordInstances()));
}

TEST_F(Diagnostic_Helper, PairsRecordsAndJobsWithTheirElement)
{
    record(true);
    record(false);
    add_job();
    const auto service = first<KALDERA_ServiceRecordAppliesToElement>(
        helper.getInstancesByClass(SERVICERECORDAPPLIESTOELEMENT));
    EXPECT_NE(nullptr, service->Antecedent);
    ASSERT_NE(nullptr, service->Dependent);
    EXPECT_STREQ(
        "1000024b4C100000",
        cast<KALDERA_FCPort>(reinterpret_cast<Instance*>(service->Dependent))->DeviceID.value.c_str());
    const auto completion = first<KALDERA_CompletionRecordAppliesToElement>(
        helper.getInstancesByClass(COMPLETIONRECORDAPPLIESTOELEMENT));
    EXPECT_NE(nullptr, completion->Antecedent);
    EXPECT_NE(nullptr, completion->Dependent);
    const auto job = first<KALDERA_AffectedJobElement>(helper.getInstancesByClass(AFFECTEDJOBELEMENT));
    EXPECT_NE(nullptr, job->AffectedElement);
    EXPECT_NE(nullptr, job->AffectingElement);
}

TEST_F(Diagnostic_Helper, ForgetsTheElementThatHasGone)
{
    record(true);
    add_job();
    library.answers("getFcPhyPortIndicesByAdapter", json("{'indexStrings': []}"));
    const auto record_instance =
        first<KALDERA_DiagnosticServiceRecord>(helper.getInstancesByClass(DIAGNOSTICSERVICERECORD));
    EXPECT_TRUE(record_instance->ManagedElementName.value.empty());
    EXPECT_FALSE(record_instance->ManagedElementName.null);
    const auto pair = first<KALDERA_ServiceRecordAppliesToElement>(
        helper.getInstancesByClass(SERVICERECORDAPPLIESTOELEMENT));
    EXPECT_NE(nullptr, pair->Antecedent);
    EXPECT_EQ(nullptr, pair->Dependent);
    const auto job = first<KALDERA_AffectedJobElement>(helper.getInstancesByClass(AFFECTEDJOBELEMENT));
    ASSERT_TRUE(job);
    EXPECT_EQ(nullptr, job->AffectedElement);
    EXPECT_EQ(nullptr, job->AffectingElement);
}

TEST_F(Diagnostic_Helper, IsOneForTheModule)
{
    EXPECT_EQ(DiagnosticHelper::getDiagnosticHelperObject(), DiagnosticHelper::getDiagnosticHelperObject());
}

} // namespace
} // namespace KPRV
