#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

class SCSI_Paths : public Association_Fixture
{
protected:
    static constexpr const char* INVALID = "ERR Error: Invalid number of instances returned!";

    void expect_paths(const std::string& paths, const Lines& said)
    {
        expect("SCSIInitiatorTargetLogicalUnitPath", "Initiator Target LogicalUnit", paths, said);
    }
    static Lines counts(int initiators, int targets, int extents, int drives)
    {
        return {"DBG Number of SCSIPROTOCOLENDPOINT(Initiator and Target)= " +
                    std::to_string(initiators + targets),
                BUILDING,
                "DBG Number of SCSIPROTOCOLENDPOINT(Initiator)= " + std::to_string(initiators) +
                    "; SCSIPROTOCOLENDPOINT(Target)= " + std::to_string(targets) + "; STORAGEEXTENT= " +
                    std::to_string(extents) + "; TAPEDRIVE= " + std::to_string(drives) + " "};
    }
    Lines fetched() { return enumerate("SCSIInitiatorTargetLogicalUnitPath", "").fetched; }
};

TEST_F(SCSI_Paths, JoinPortTargetAndUnit)
{
    lists("SCSIProtocolEndpoint: t2 Role=3 ElementName=i2_t, i1 Role=2 ElementName=i1,"
          " t1 Role=3 ElementName=i1_t, u1 Role=3 ElementName=i1_u, i2 Role=2 ElementName=i2;"
          "StorageExtent: x1 DeviceID=i1_t_0, x2 DeviceID=i2_t_0, x3 DeviceID=i1_u_0, x4 DeviceID=i1_t_1_2;"
          "TapeDrive: d1 DeviceID=i1_u_5, d2 DeviceID=i1_t_5");
    // Extents before drives behind one target; targets in list order behind one initiator.
    expect_paths("i1 t1 x1, i1 t1 x4, i1 t1 d2, i1 u1 x3, i1 u1 d1, i2 t2 x2", counts(2, 3, 4, 2));
    EXPECT_EQ((Lines{"StorageExtent", "TapeDrive", "SCSIProtocolEndpoint"}), fetched());
}

TEST_F(SCSI_Paths, CompareWhateverTheCase)
{
    lists("SCSIProtocolEndpoint: i Role=2 ElementName=AB, t Role=3 ElementName=ab_CD;"
          "StorageExtent: x DeviceID=Ab_cD_0; TapeDrive: d DeviceID=aB_Cd_1");
    expect_paths("i t x, i t d", counts(1, 1, 1, 1));
}

TEST_F(SCSI_Paths, TakeEveryOtherRoleForATarget)
{
    lists(
        "SCSIProtocolEndpoint: i Role=2 ElementName=i, t0 Role=0 ElementName=i_a, t3 Role=3 ElementName=i_b,"
        " t4 Role=4 ElementName=i_c, tn ElementName=i_d;"
        "StorageExtent: xa DeviceID=i_a_0, xb DeviceID=i_b_0, xc DeviceID=i_c_0, xd DeviceID=i_d_0");
    expect_paths("i t0 xa, i t3 xb, i t4 xc, i tn xd", counts(1, 4, 4, 0));
}

TEST_F(SCSI_Paths, NeedExtentsOrDrivesNotBoth)
{
    const std::string ends = "SCSIProtocolEndpoint: i Role=2 ElementName=i, t Role=3 ElementName=i_t;";
    lists(ends + "StorageExtent: x DeviceID=i_t_0");
    expect_paths("i t x", counts(1, 1, 1, 0));
    lists(ends + "TapeDrive: d DeviceID=i_t_0");
    expect_paths("i t d", counts(1, 1, 0, 1));
    lists(ends);
    expect_paths("", {INVALID});
    EXPECT_EQ((Lines{"StorageExtent", "TapeDrive"}), fetched());
}

TEST_F(SCSI_Paths, NeedEndpoints)
{
    lists("StorageExtent: x DeviceID=i_t_0; TapeDrive: d DeviceID=i_t_1");
    expect_paths("", {INVALID});
    EXPECT_EQ((Lines{"StorageExtent", "TapeDrive", "SCSIProtocolEndpoint"}), fetched());
}

TEST_F(SCSI_Paths, LeaveOutWhatFindsNoPartner)
{
    // No initiator for the target, no target for the unit, no unit for the target.
    lists("SCSIProtocolEndpoint: i Role=2 ElementName=i, s Role=3 ElementName=j_s, t Role=3 ElementName=i_t;"
          "StorageExtent: x1 DeviceID=j_s_0, x2 DeviceID=i_u_0, x3 DeviceID=j_t_0");
    expect_paths("", counts(1, 2, 3, 0));
}

TEST_F(SCSI_Paths, LeaveOutNamesWithoutSeparators)
{
    lists("SCSIProtocolEndpoint: i Role=2 ElementName=i, t Role=3 ElementName=i, n Role=3, u Role=3 "
          "ElementName=i_u,"
          " v Role=3 ElementName=i_v_w, e Role=2;"
          "StorageExtent: x1 DeviceID=i, x2 DeviceID=i_u, x3, x4 DeviceID=i_v_w_0, x5 DeviceID=_u_0");
    expect_paths("", counts(2, 4, 5, 0));
}

TEST_F(SCSI_Paths, OfOneUnitThroughTwoPortsAreTwoOnlyIfItIsListedTwice)
{
    lists("SCSIProtocolEndpoint: i1 Role=2 ElementName=i1, t1 Role=3 ElementName=i1_t, i2 Role=2 "
          "ElementName=i2,"
          " t2 Role=3 ElementName=i2_t; StorageExtent: x DeviceID=i1_t_0");
    expect_paths("i1 t1 x", counts(2, 2, 1, 0));
    lists("SCSIProtocolEndpoint: i1 Role=2 ElementName=i1, t1 Role=3 ElementName=i1_t, i2 Role=2 "
          "ElementName=i2,"
          " t2 Role=3 ElementName=i2_t; StorageExtent: x DeviceID=i1_t_0, y DeviceID=i2_t_0");
    expect_paths("i1 t1 x, i2 t2 y", counts(2, 2, 2, 0));
}

TEST_F(SCSI_Paths, LeaveLogicalDisksAlone)
{
    lists("SCSIProtocolEndpoint: i Role=2 ElementName=i, t Role=3 ElementName=i_t;"
          "StorageExtent: x DeviceID=i_t_0; LogicalDisk: l DeviceID=i_t_0");
    expect_paths("i t x", counts(1, 1, 1, 0));
    EXPECT_EQ((Lines{"StorageExtent", "TapeDrive", "SCSIProtocolEndpoint"}), fetched());
}

} // namespace
} // namespace KPRV
