#include "kldrcim/server/Select_Query.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

class Select_Query_Test : public testing::Test
{
protected:
    static Instance_Value alert()
    {
        Instance_Value port{{.class_name = "Port"},
                            {{"OperationalStatus", Plain_Value::unsigned_number(CMPI_uint16, 2)}}};
        return {{.class_name = "Alert"},
                {{"MessageID", Plain_Value::text("FC'1")},
                 {"Severity", Plain_Value::unsigned_number(CMPI_uint16, 5)},
                 {"Change", Plain_Value::signed_number(CMPI_sint32, -3)},
                 {"Part", Plain_Value::real(CMPI_real64, 0.5)},
                 {"Large", Plain_Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0))},
                 {"Good", Plain_Value::boolean(true)},
                 {"Nothing", Plain_Value::null_of(CMPI_string)},
                 {"SequenceNumber", Plain_Value::signed_number(CMPI_sint64, 1)},
                 {"SourceInstance", Plain_Value::instance(port)}}};
    }

    bool matches(const std::string& condition)
    {
        const auto query = Select_Query::parse("SELECT * FROM Alert WHERE " + condition, "WQL", _error);
        EXPECT_TRUE(query) << condition << ": " << _error.text;
        return query && query->matches(alert(), _classes);
    }
    std::string refusal(const std::string& text, const std::string& language = "WQL")
    {
        _error = {};
        EXPECT_FALSE(Select_Query::parse(text, language, _error)) << text;
        return std::to_string(_error.rc) + " " + _error.text;
    }

    const No_Catalogue _classes;
    Query_Error _error;
};

TEST_F(Select_Query_Test, NamesWhatTheClassHasNot)
{
    Class_Info info;
    for (const char* name : {"MessageID", "SourceInstance"})
        info.properties.emplace_back().name = name;
    const auto unknown = [&](const char* text) {
        const auto query = Select_Query::parse(text, "WQL", _error);
        return query ? query->unknown_property(info) : _error.text;
    };
    EXPECT_EQ("", unknown("SELECT * FROM Alert"));
    EXPECT_EQ("",
              unknown("SELECT messageid FROM Alert WHERE Alert.MessageID = 'x' OR SourceInstance.Any = 1"));
    EXPECT_EQ("Other", unknown("SELECT MessageID, Other FROM Alert"));
    EXPECT_EQ("Other", unknown("SELECT * FROM Alert WHERE MessageID = 'x' AND NOT Other IS NULL"));
}

TEST_F(Select_Query_Test, ComparesPropertiesWithLiterals)
{
    for (const char* condition : {"MessageID = 'FC''1'",
                                  "MessageID = 'FC\\'1'",
                                  "messageid = \"FC'1\"",
                                  "MessageID LIKE 'F%1'",
                                  "MessageID LIKE '____'",
                                  "MessageID < 'G'",
                                  "Severity = 5",
                                  "Severity <> 4",
                                  "Severity != -1",
                                  "Severity >= 5",
                                  "Severity > -7",
                                  "Severity < 5.5",
                                  "Change = -3",
                                  "Change < 0",
                                  "Change > -4",
                                  "Part = 0.5",
                                  "Part < 1",
                                  "Large > -1",
                                  "Large = 18446744073709551615",
                                  "Good = TRUE",
                                  "Good <> false",
                                  "Nothing IS NULL",
                                  "Missing IS NULL",
                                  "Good IS NOT NULL",
                                  "Alert.Severity = 5",
                                  "SourceInstance ISA Port",
                                  "SourceInstance ISA 'Port'",
                                  "SourceInstance.OperationalStatus = 2",
                                  "SourceInstance.Port::OperationalStatus = 2"})
        EXPECT_TRUE(matches(condition)) << condition;
    for (const char* condition : {"MessageID = 'fc''1'", "MessageID LIKE 'F%2'", "MessageID LIKE '___'",
                                  "Severity < 5", "Severity = 'five'", "Good = 1", "SourceInstance ISA Other",
                                  "Severity ISA Port", "Change > 18446744073709551615"})
        EXPECT_FALSE(matches(condition)) << condition;
}

TEST_F(Select_Query_Test, KnowsWhatIsUnknown)
{
    EXPECT_FALSE(matches("Nothing = 'x'"));
    EXPECT_FALSE(matches("NOT Nothing = 'x'"));
    EXPECT_FALSE(matches("Severity = NULL"));
    EXPECT_TRUE(matches("Nothing = 'x' OR Severity = 5"));
    EXPECT_FALSE(matches("Nothing = 'x' AND Severity = 5"));
    EXPECT_TRUE(matches("NOT (Nothing = 'x' AND Severity = 4)"));
    EXPECT_FALSE(matches("Missing.Part = 1"));
}

TEST_F(Select_Query_Test, BindsAsSqlDoes)
{
    EXPECT_TRUE(matches("Severity = 5 OR Severity = 4 AND Good = FALSE"));
    EXPECT_FALSE(matches("(Severity = 5 OR Severity = 4) AND Good = FALSE"));
    EXPECT_FALSE(matches("NOT Severity = 5 OR Good = FALSE"));
    EXPECT_TRUE(matches("not not Severity=5"));
}

TEST_F(Select_Query_Test, SaysWhereAQueryGoesWrong)
{
    EXPECT_EQ("15 at character 1: SELECT is expected", refusal(""));
    EXPECT_EQ("15 at character 10: a name is expected", refusal("SELECT a,"));
    EXPECT_EQ("15 at character 16: AND, OR or the end is expected", refusal("SELECT * FROM A, B"));
    EXPECT_EQ("15 at character 22: a name is expected", refusal("SELECT * FROM A WHERE"));
    EXPECT_EQ("15 at character 25: a comparison is expected", refusal("SELECT * FROM A WHERE a b"));
    EXPECT_EQ("15 at character 27: a text, a number, TRUE, FALSE or NULL is expected",
              refusal("SELECT * FROM A WHERE a = 'b"));
    EXPECT_EQ("15 at character 27: a number is expected", refusal("SELECT * FROM A WHERE a = 1x"));
    EXPECT_EQ("15 at character 29: \")\" is expected", refusal("SELECT * FROM A WHERE (a = 1"));
    EXPECT_EQ("14 WQL and DMTF:CQL are understood", refusal("SELECT * FROM A", "DMTF:FQL"));
}

TEST_F(Select_Query_Test, IsBounded)
{
    std::string nested, chained = "a = 1";
    for (int i = 0; i < 100; ++i)
        nested += "NOT (";
    for (int i = 0; i < 300; ++i)
        chained += " AND a = 1";
    EXPECT_NE(std::string::npos, refusal("SELECT * FROM A WHERE " + nested).find("less nesting"));
    EXPECT_NE(std::string::npos, refusal("SELECT * FROM A WHERE " + chained).find("fewer comparisons"));
}

TEST_F(Select_Query_Test, ProjectsButKeepsTheSequence)
{
    const auto query = Select_Query::parse("select messageid, Good from Alert", "CIM:CQL", _error);
    ASSERT_TRUE(query);
    Instance_Value instance = alert();
    query->project(instance);
    ASSERT_EQ(3U, instance.properties.size());
    EXPECT_TRUE(instance.property("SequenceNumber"));
    instance.path.class_name = "Other";
    EXPECT_FALSE(query->matches(instance, _classes));
}

} // namespace KPRV::kldrcim
