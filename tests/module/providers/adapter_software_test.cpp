#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

class Adapter_Software : public Association_Fixture
{
protected:
    static constexpr const char* NO_TOKEN = "INFO No MAC or NWWN returned from strtok function";

    void expect_pairs(const std::string& pairs, const Lines& said = {BUILDING})
    {
        expect("AdapterElementSoftwareIdentity", "Antecedent Dependent", pairs, said);
    }
};

TEST_F(Adapter_Software, IsOfTheAdapterThatItsIdBeginsWithWhateverTheCase)
{
    lists(
        "AdapterSoftwareIdentity: b InstanceID=AB_bios, f InstanceID=cd_firmware, x InstanceID=ef_bios;"
        "PortController: a2 DeviceID=cd ControllerType=4, a1 DeviceID=ab ControllerType=4, a3 DeviceID=abc");
    expect_pairs("f a2, b a1");
    EXPECT_EQ((Lines{"AdapterSoftwareIdentity", "PortController"}),
              enumerate("AdapterElementSoftwareIdentity", "").fetched);
}

TEST_F(Adapter_Software, ThatIsADriverIsOfAllAdapters)
{
    lists("AdapterSoftwareIdentity: d InstanceID=kldrfc Classifications=2, b InstanceID=ab_bios"
          " Classifications=11, e InstanceID=other Classifications=10+2;"
          "PortController: a1 DeviceID=ab ControllerType=4, a2 DeviceID=cd ControllerType=1");
    expect_pairs("d a1, b a1, e a1, d a2, e a2");
}

TEST_F(Adapter_Software, OfTheNetworkIsNotOfPlainFCAdapters)
{
    lists("AdapterSoftwareIdentity: n InstanceID=zln Classifications=2, m InstanceID=ZLN Classifications=2,"
          " o InstanceID=zln2 Classifications=2;"
          "PortController: a1 DeviceID=ab ControllerType=4, a2 DeviceID=cd ControllerType=1,"
          " a3 DeviceID=ef ControllerType=0");
    expect_pairs("o a1, n a2, m a2, o a2, n a3, m a3, o a3");
    // The name alone decides, be it a driver or not.
    lists("AdapterSoftwareIdentity: n InstanceID=zln_bios Classifications=10;"
          "PortController: a1 DeviceID=zln ControllerType=4, a2 DeviceID=zln ControllerType=1");
    expect_pairs("n a2");
}

TEST_F(Adapter_Software, WithoutAnIdIsToldForEachAdapter)
{
    lists("AdapterSoftwareIdentity: u, v InstanceID=___ Classifications=2, w InstanceID=_ab_bios;"
          "PortController: a1 DeviceID=ab, a2 DeviceID=cd");
    expect_pairs("w a1", {BUILDING, NO_TOKEN, NO_TOKEN, NO_TOKEN, NO_TOKEN});
}

TEST_F(Adapter_Software, IsKnownByTheFirst63BytesOfItsId)
{
    const std::string whole(63, 'a');
    lists("AdapterSoftwareIdentity: i InstanceID=" + whole + "bc_bios; PortController: a1 DeviceID=" + whole +
          ", a2 DeviceID=" + whole + "b");
    expect_pairs("i a1");
}

TEST_F(Adapter_Software, MayBeThereWithoutAdaptersAndTheOtherWayRound)
{
    lists("AdapterSoftwareIdentity: u");
    expect_pairs("");
    lists("PortController: a DeviceID=ab");
    expect_pairs("");
    lists("");
    expect_pairs("");
}

} // namespace
} // namespace KPRV
