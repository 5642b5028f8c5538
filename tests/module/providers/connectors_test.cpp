#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

class Connectors : public Association_Fixture
{
protected:
    /// Two adapters with the serial numbers "S1" and "S2".
    Connectors()
    {
        library.adapters(
            {{"20:00:00:00:00:00:00:01",
              json("{'hbaData': {'serialNumber': 'S1'}, 'driver': {'storageDriverName': 'd'}}")},
             {"20:00:00:00:00:00:00:02",
              json("{'hbaData': {'serialNumber': 'S2'}, 'driver': {'storageDriverName': 'd'}}")}});
    }
    void expect_contained(const std::string& pairs)
    {
        expect("PhysicalConnectorContainer", "GroupComponent PartComponent", pairs);
    }
    void expect_realized(const std::string& pairs)
    {
        expect("EthernetPortRealizes", "Antecedent Dependent", pairs);
    }
};

TEST_F(Connectors, AreInThePackageOfTheAdapterThatTheirTagNames)
{
    lists("PhysicalConnector: c1 Tag=x_1_0, c2 Tag=x_2_0, c3 Tag=x_1_1, c4 Tag=x_3_0, c5 Tag=x;"
          "PhysicalPackage: k2 SerialNumber=S2, k1 SerialNumber=S1, k3 SerialNumber=S3");
    expect_contained("k2 c2, k1 c1, k1 c3");
}

TEST_F(Connectors, MindTheCaseOfASerialNumber)
{
    lists("PhysicalConnector: c1 Tag=x_1_0; PhysicalPackage: k1 SerialNumber=s1");
    expect_contained("");
}

TEST_F(Connectors, AskTheLibraryAnewForEachPair)
{
    lists("PhysicalConnector: c1 Tag=x_1_0, c2 Tag=x_2_0; PhysicalPackage: k1 SerialNumber=S1, k2");
    expect_contained("k1 c1");
    std::vector<Fake_Library::Call> expected;
    for (int package = 0; package < 2; package++) {
        for (const char* address : {"20:00:00:00:00:00:00:01", "20:00:00:00:00:00:00:02"}) {
            expected.push_back({"getAllAdaptersIndexString", Json::Value()});
            expected.push_back({"getHbaByWwn", json(std::string("{'wwn': '") + address + "'}")});
        }
    }
    EXPECT_EQ(expected, library_calls);
    EXPECT_EQ((Lines{"PhysicalConnector", "PhysicalPackage"}),
              enumerate("PhysicalConnectorContainer", "").fetched);
}

TEST_F(Connectors, OfAnAdapterThatCannotBeReadAreInNone)
{
    library.answers("getHbaByWwn", Json::Value());
    lists("PhysicalConnector: c1 Tag=x_1_0; PhysicalPackage: k1 SerialNumber=S1");
    expect_contained("");
}

TEST_F(Connectors, RealizeTheEthernetPortOfTheSameNumber)
{
    lists("PhysicalConnector: c1 Tag=x_1_1, c2 Tag=x_2_0, c3 Tag=x_1_0, c4 Tag=x_1_2;"
          "Ethernet ports of adapter 1: e1 PortNumber=0, e2 PortNumber=1, e3 PortNumber=1;"
          "Ethernet ports of adapter 2: f1 PortNumber=0");
    expect_realized("c1 e2, c2 f1, c3 e1");
    EXPECT_EQ((Lines{"PhysicalConnector", "Ethernet ports of adapter 1", "Ethernet ports of adapter 2",
                     "Ethernet ports of adapter 1", "Ethernet ports of adapter 1"}),
              enumerate("EthernetPortRealizes", "").fetched);
}

TEST_F(Connectors, OfPlainFCAdaptersArePassedOverInSilence)
{
    lists("PhysicalConnector: c1 Tag=x_1_0, c2 Tag=x_2_0; Ethernet ports of adapter 2: f1 PortNumber=0");
    expect_realized("c2 f1");
    lists("PhysicalConnector: c1 Tag=x_1_0, c2 Tag=x_2_0");
    expect_realized("");
}

TEST_F(Connectors, WithATagWithoutNumbersAreOfNoAdapter)
{
    lists("PhysicalConnector: c1 Tag=x, c2; Ethernet ports of adapter 1: e PortNumber=0");
    expect_realized("");
    EXPECT_EQ((Lines{"PhysicalConnector", "Ethernet ports of adapter 0", "Ethernet ports of adapter 0"}),
              enumerate("EthernetPortRealizes", "").fetched);
}

// A number beyond 32 bits is clamped to one that no adapter and no port has, whatever the word size.
TEST_F(Connectors, WithNumbersBeyondThirtyTwoBitsAreOfNoAdapter)
{
    const char* const beyond[] = {
        "4294967297",         "4294967298", "-4294967295", "18446744073709551617", "-18446744073709551615",
        "9223372036854775808"};
    for (const char* number : beyond) {
        SCOPED_TRACE(number);
        const std::string id = number;
        lists("PhysicalConnector: c1 Tag=x_" + id + "_0; PhysicalPackage: k1 SerialNumber=S1");
        expect_contained("");
        const std::string clamped = id[0] == '-' ? "-2147483648" : "2147483647";
        lists("PhysicalConnector: c1 Tag=x_" + id +
              "_0;"
              "Ethernet ports of adapter 1: e1 PortNumber=0;"
              "Ethernet ports of adapter " +
              clamped + ": f1 PortNumber=0");
        expect_realized("c1 f1");
    }
    // Port numbers have 16 bits: none is as large as what a number beyond is clamped to.
    lists("PhysicalConnector: c1 Tag=x_1_4294967296, c2 Tag=x_1_4294967297, c3 Tag=x_1_-4294967295;"
          "Ethernet ports of adapter 1: e1 PortNumber=0, e2 PortNumber=1");
    expect_realized("");
}

} // namespace
} // namespace KPRV
