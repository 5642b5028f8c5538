#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

/// The links of profiles and the server's own instances, over lists that real tables never give.
class Conformance : public Association_Fixture
{
protected:
    /// Profiles go by short names with blanks, which the script's words do not hold.
    static void add_profile(const char* label, const char* short_name, const char* registered_name = nullptr)
    {
        add("RegisteredProfile", label, short_name, registered_name ? registered_name : short_name);
    }
    static void add_subprofile(const char* label, const char* short_name)
    {
        add("RegisteredSubProfile", label, short_name, short_name);
    }

    static Lines building(std::initializer_list<const char*> profiles)
    {
        Lines lines;
        for (const char* profile : profiles)
            lines.push_back(std::string("INFO Building association instance for profile : ") + profile);
        return lines;
    }

private:
    static void add(const char* list, const char* label, const char* short_name, const char* registered_name)
    {
        Instance* instance = scripted_instance(class_named(list), label);
        set_from_text(instance, "InstanceID", short_name);
        set_from_text(instance, "RegisteredName", registered_name);
        managers_script.lists[list].push_back(instance);
    }
};

const char* const CONFORMS = "ElementConformsToProfile";
const char* const STANDARD_AND_ELEMENT = "ConformantStandard ManagedElement";
const Lines ALL_FETCHED = {"RegisteredProfile", "ComputerSystem", "ObjectManager", "RegisteredSubProfile"};

TEST_F(Conformance, ElementsThenProfilesThenSubprofiles)
{
    lists("ComputerSystem: sys; ObjectManager: om; RegisteredSubProfile: sub1, sub2");
    add_profile("std", "smi-s");
    add_profile("hba", "fc hba");
    add_profile("srv", "SERVER");
    add_profile("hdr", "Host Discovered Resources");
    add_profile("sto", "Storage HBA");
    add_profile("new", "Tape HBA");
    const Enumeration result = enumerate(CONFORMS, STANDARD_AND_ELEMENT);
    EXPECT_EQ((Lines{"hba sys", "srv om", "hdr sys", "sto sys", "std hba", "std srv", "std hdr", "std sto",
                     "std new", "std sub1", "std sub2"}),
              result.pairs);
    EXPECT_EQ(ALL_FETCHED, result.fetched);
    EXPECT_EQ(building({"smi-s", "fc hba", "SERVER", "Host Discovered Resources", "Storage HBA", "Tape HBA"}),
              result.said);
    EXPECT_EQ(0, result.status);
    EXPECT_EQ(std::vector<int>{0}, result.end_marks);
}

TEST_F(Conformance, NoProfilesFail)
{
    lists("ComputerSystem: sys; ObjectManager: om; RegisteredSubProfile: sub");
    const Enumeration result = enumerate(CONFORMS, STANDARD_AND_ELEMENT);
    EXPECT_TRUE(result.pairs.empty());
    EXPECT_EQ(Lines{"RegisteredProfile"}, result.fetched);
    EXPECT_EQ(Lines{"ERR Error: No instances of RegisteredProfile class returned."}, result.said);
    EXPECT_EQ(70, result.status);
}

// The links to the elements have gone out by then.
TEST_F(Conformance, NoStandardFailsAfterTheElements)
{
    lists("ComputerSystem: sys; ObjectManager: om; RegisteredSubProfile: sub");
    add_profile("hba", "FC HBA");
    // The short name does not make a standard.
    add_profile("not", "SMI-S", "Other");
    const Enumeration result = enumerate(CONFORMS, STANDARD_AND_ELEMENT);
    EXPECT_EQ(Lines{"hba sys"}, result.pairs);
    EXPECT_EQ((Lines{"RegisteredProfile", "ComputerSystem", "ObjectManager"}), result.fetched);
    Lines said = building({"FC HBA", "SMI-S"});
    said.push_back("ERR No instances representing SMI-S standard is returned");
    EXPECT_EQ(said, result.said);
    EXPECT_EQ(70, result.status);
    EXPECT_EQ(std::vector<int>{70}, result.end_marks);
}

TEST_F(Conformance, AMissingElementCostsItsLinkAlone)
{
    struct Row
    {
        const char* lists;
        Lines pairs;
        const char* no_system;
        const char* no_manager;
    };
    const char* no_system = "ERR Invalid number of ComputerSystem class instances";
    const char* no_manager = "ERR Invalid number of ObjectManager class instances";
    const Row rows[] = {
        {"ObjectManager: om", {"srv om", "std hba", "std srv"}, no_system, nullptr},
        {"ComputerSystem: s1, s2; ObjectManager: om", {"srv om", "std hba", "std srv"}, no_system, nullptr},
        {"ComputerSystem: sys", {"hba sys", "std hba", "std srv"}, nullptr, no_manager},
        {"ComputerSystem: sys; ObjectManager: o1, o2",
         {"hba sys", "std hba", "std srv"},
         nullptr,
         no_manager},
        {"", {"std hba", "std srv"}, no_system, no_manager},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.lists);
        lists(row.lists);
        add_profile("hba", "FC HBA");
        add_profile("srv", "Server");
        add_profile("std", "SMI-S");
        const Enumeration result = enumerate(CONFORMS, STANDARD_AND_ELEMENT);
        EXPECT_EQ(row.pairs, result.pairs);
        EXPECT_EQ(ALL_FETCHED, result.fetched);
        Lines said = building({"FC HBA"});
        if (row.no_system)
            said.push_back(row.no_system);
        said.push_back(building({"Server"})[0]);
        if (row.no_manager)
            said.push_back(row.no_manager);
        said.push_back(building({"SMI-S"})[0]);
        EXPECT_EQ(said, result.said);
        EXPECT_EQ(0, result.status);
    }
}

TEST_F(Conformance, TheFirstStandardIsTheOne)
{
    lists("RegisteredSubProfile: sub");
    add_profile("std1", "a", "SMI-S");
    add_profile("std2", "b", "smi-s");
    const Enumeration result = enumerate(CONFORMS, STANDARD_AND_ELEMENT);
    EXPECT_EQ(Lines{"std1 sub"}, result.pairs);
    EXPECT_EQ(0, result.status);
}

TEST_F(Conformance, SubprofilesByTheExactNameOfTheTable)
{
    lists("");
    add_profile("std", "SMI-S");
    add_profile("hba", "fc hba");
    add_profile("srv", "Server");
    add_profile("sto", "Storage HBA");
    add_subprofile("reg", "Profile Registration");
    add_subprofile("fcp", "FC Initiator Ports");
    add_subprofile("low", "software update");
    add_subprofile("coe", "FCoE Initiator Ports");
    const Enumeration result = enumerate("SubProfileRequiresProfile", "Antecedent Dependent");
    EXPECT_EQ((Lines{"hba fcp", "srv reg", "sto coe"}), result.pairs);
    EXPECT_EQ((Lines{"RegisteredProfile", "RegisteredSubProfile", "subprofiles of SMI-S",
                     "subprofiles of fc hba", "subprofiles of Server", "subprofiles of Storage HBA"}),
              result.fetched);
    EXPECT_EQ(Lines{BUILDING}, result.said);
    EXPECT_EQ(0, result.status);
}

TEST_F(Conformance, OneSoftwareImplementsAll)
{
    lists("ProfileSoftwareIdentity: sw; RegisteredProfile: p1, p2; RegisteredSubProfile: sub1, sub2");
    const Enumeration result = enumerate("ProfileElementSoftwareIdentity", "Antecedent Dependent");
    EXPECT_EQ((Lines{"sw p1", "sw p2", "sw sub1", "sw sub2"}), result.pairs);
    EXPECT_EQ((Lines{"ProfileSoftwareIdentity", "RegisteredProfile", "RegisteredSubProfile"}),
              result.fetched);
    EXPECT_EQ(Lines{BUILDING}, result.said);
    EXPECT_EQ(0, result.status);
}

struct Check
{
    const char* association;
    const char* lists;
    const char* fetched;
    const char* said;
};

// clang-format off
constexpr Check failures[] = {
//   association                        lists                                                            fetched until then                                                  line of the log
    {"SubProfileRequiresProfile",       "RegisteredProfile: p",                                          "RegisteredProfile, RegisteredSubProfile",                          "ERR Invalid number of instances"},
    {"SubProfileRequiresProfile",       "RegisteredSubProfile: s",                                       "RegisteredProfile, RegisteredSubProfile",                          "ERR Invalid number of instances"},
    {"ProfileElementSoftwareIdentity",  "RegisteredProfile: p; RegisteredSubProfile: s",                 "ProfileSoftwareIdentity",                                          "ERR Invalid number of ProfileSoftwareIdentity instances returned."},
    {"ProfileElementSoftwareIdentity",  "ProfileSoftwareIdentity: a, b; RegisteredProfile: p",           "ProfileSoftwareIdentity",                                          "ERR Invalid number of ProfileSoftwareIdentity instances returned."},
    {"ProfileElementSoftwareIdentity",  "ProfileSoftwareIdentity: a; RegisteredProfile: p",              "ProfileSoftwareIdentity, RegisteredProfile, RegisteredSubProfile", "ERR Invalid number of Profile instances returned."},
    {"ProfileElementSoftwareIdentity",  "ProfileSoftwareIdentity: a; RegisteredSubProfile: s",           "ProfileSoftwareIdentity, RegisteredProfile, RegisteredSubProfile", "ERR Invalid number of Profile instances returned."},
    {"NamespaceInManager",              "Namespace: n",                                                  "ObjectManager",                                                    "ERR Invalid number of ObjectManager class instances"},
    {"NamespaceInManager",              "ObjectManager: a, b; Namespace: n",                             "ObjectManager",                                                    "ERR Invalid number of ObjectManager class instances"},
    {"CommMechanismForManager",         "CIMXMLCommunicationMechanism: m",                               "ObjectManager",                                                    "ERR Invalid number of ObjectManager instances"},
    {"CommMechanismForManager",         "ObjectManager: a, b",                                           "ObjectManager",                                                    "ERR Invalid number of ObjectManager instances"},
    {"CommMechHostedAccessPoint",       "CIMXMLCommunicationMechanism: m",                               "ComputerSystem",                                                   "ERR Invalid number of ComputerSystem instances"},
    {"CommMechHostedAccessPoint",       "ComputerSystem: a, b",                                          "ComputerSystem",                                                   "ERR Invalid number of ComputerSystem instances"},
    {"ObjectManagerHostedService",      "ComputerSystem: a",                                             "ObjectManager, ComputerSystem",                                    "ERR Invalid number of reference class instances"},
    {"ObjectManagerHostedService",      "ObjectManager: a",                                              "ObjectManager, ComputerSystem",                                    "ERR Invalid number of reference class instances"},
    {"ObjectManagerHostedService",      "ObjectManager: a, b; ComputerSystem: c",                        "ObjectManager, ComputerSystem",                                    "ERR Invalid number of reference class instances"},
};

// The single left element with each right one, whatever their number.
struct Join
{
    const char* association;
    const char* lists;
    const char* fetched;
    const char* pairs;
};

constexpr Join joins[] = {
//   association                        lists                                                            fetched                                                             pairs
    {"NamespaceInManager",              "ObjectManager: om; Namespace: n1, n2",                          "ObjectManager, Namespace",                                         "om n1, om n2"},
    {"NamespaceInManager",              "ObjectManager: om",                                             "ObjectManager, Namespace",                                         ""},
    {"CommMechanismForManager",         "ObjectManager: om; CIMXMLCommunicationMechanism: m1, m2",       "ObjectManager, CIMXMLCommunicationMechanism",                      "om m1, om m2"},
    {"CommMechanismForManager",         "ObjectManager: om",                                             "ObjectManager, CIMXMLCommunicationMechanism",                      ""},
    {"CommMechHostedAccessPoint",       "ComputerSystem: s; CIMXMLCommunicationMechanism: m1, m2",       "ComputerSystem, CIMXMLCommunicationMechanism",                     "s m1, s m2"},
    {"CommMechHostedAccessPoint",       "ComputerSystem: s",                                             "ComputerSystem, CIMXMLCommunicationMechanism",                     ""},
    {"ObjectManagerHostedService",      "ObjectManager: om; ComputerSystem: s",                          "ObjectManager, ComputerSystem",                                    "s om"},
};
// clang-format on

TEST_F(Conformance, ChecksOfTheLists)
{
    for (const Check& row : failures) {
        SCOPED_TRACE(std::string(row.association) + " over " + row.lists);
        lists(row.lists);
        const Enumeration result = enumerate(row.association, "");
        EXPECT_TRUE(result.pairs.empty());
        EXPECT_EQ(pieces(row.fetched, ','), result.fetched);
        EXPECT_EQ(Lines{row.said}, result.said);
        EXPECT_EQ(70, result.status);
        EXPECT_EQ(std::vector<int>{70}, result.end_marks);
    }
}

TEST_F(Conformance, JoinsOfTheServersOwn)
{
    for (const Join& row : joins) {
        SCOPED_TRACE(std::string(row.association) + " over " + row.lists);
        lists(row.lists);
        expect(row.association, "Antecedent Dependent", row.pairs);
        lists(row.lists);
        EXPECT_EQ(pieces(row.fetched, ','), enumerate(row.association, "").fetched);
    }
}

} // namespace
} // namespace KPRV
