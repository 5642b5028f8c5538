// Every way of breaking the contract is seen, named, and survived.
#include "tests/broker/Toy_Server.h"

namespace KPRV::broker {
namespace {

struct Misdeed
{
    const char* method;
    const char* violation;
};

class Contract_Test : public testing::TestWithParam<Misdeed>
{
};

TEST_P(Contract_Test, IsReported)
{
    auto server = open_toy(TOY_PLAIN);
    server->store().add("root/other", {.path = {.class_name = "TOY_Other"}});
    call(*server, GetParam().method);
    std::vector<std::string> violations = server->violations().list();
    ASSERT_EQ(1u, violations.size()) << server->violations().text();
    EXPECT_EQ(GetParam().violation, violations[0]);
    // The host goes on as if nothing had been.
    EXPECT_EQ(2u, server->enumerate_instances("TOY_Item").instances.size());
}

constexpr Misdeed misdeeds[] = {
    {"ReleaseTwice", "CMRelease: a string made by CMNewString is used after its end"},
    {"UseAfterRelease", "CMGetCharsPtr: a string made by CMNewString is used after its end"},
    {"ReleaseArgument", "CMRelease: the provider does not own this args made by the call"},
    {"UnknownType", "CMAddArg: unknown type word 17"},
    {"WrongObject", "CMAddArg: an object path where a string is wanted"},
    {"NullObject", "CMAddArg: null string"},
    {"NullName", "CMAddArg: null argument name"},
    {"NullText", "CMNewString: null text"},
    {"BadDatetime", "CMNewDateTimeFromChars: not a datetime: \"yesterday\""},
    {"BadIndex", "CMGetArgAt: index 99 of 0"},
    {"WrongElement", "CMSetArrayElementAt: uint32 into an array of uint16"},
    {"ReleasedElement", "CMAddArg: element 0 was released before its array was used"},
    {"WrongArray", "CMAddArg: an array of string passed as uint16[]"},
    {"NullKey", "CMAddKey: null key Key"},
    {"PastTheEnd", "CMGetNext: past the end"},
    {"Unattached", "CMNewString: makes a string on a thread that is neither in a call nor attached"},
    {"OtherThread", "CMRelease: released on another thread than its own: string made by CMNewString"},
    {"AttachTwice", "CBAttachThread: this thread is in a call or attached already"},
    {"StayAttached", "CBDetachThread: a thread ended while it was attached"},
    {"NoReturn", "TOY_Item: a method returns one value, not 0"},
    {"ReturnInstance", "CMReturnInstance: this operation returns no instances"},
    {"Throws", "MI entry: an exception left the provider: thrown by the toy"},
    {"NullBroker", "CMNewArgs: this is not a broker of this server"},
    {"CloneContext", "CMClone: servers do not clone contexts"},
};

INSTANTIATE_TEST_SUITE_P(Misdeeds, Contract_Test, testing::ValuesIn(misdeeds),
                         [](const auto& test) { return test.param.method; });

TEST(Contract, ForeignObjectsAreSeenAsSelfAndAsArgument)
{
    auto server = open_toy(TOY_PLAIN);
    call(*server, "ForeignObject");
    EXPECT_EQ("CMGetCharsPtr: this is not a string of this server\n"
              "CMAddArg: this is not a string of this server\n",
              server->violations().text());
}

TEST(Contract, ObjectsEndWithTheirCall)
{
    auto server = open_toy(TOY_PLAIN);
    call(*server, "Keep");
    EXPECT_EQ("", server->violations().text());
    call(*server, "UseKept");
    EXPECT_EQ("CMGetCharsPtr: a string made by CMNewString is used after its end\n",
              server->violations().text());
}

TEST(Contract, NothingMayFollowTheEnd)
{
    auto server = open_toy(TOY_PLAIN);
    Result result = call(*server, "AfterDone");
    EXPECT_EQ("CMReturnData: after CMReturnDone\nCMReturnDone: a second time\n", server->violations().text());
    EXPECT_EQ(2u, result.done_count);
    EXPECT_EQ(0u, result.return_value.as_uint());
}

TEST(Contract, ACloneThatIsNotReleasedIsLost)
{
    auto server = open_toy(TOY_PLAIN);
    call(*server, "LostClone");
    EXPECT_EQ(1u, server->ledger().live());
    EXPECT_EQ(1u, server->ledger().live(Object_Kind::STRING));
    char* text = nullptr;
    std::size_t size = 0;
    std::FILE* out = open_memstream(&text, &size);
    server->ledger().report(out);
    std::fclose(out);
    std::string report(text, size);
    free(text);
    EXPECT_NE(std::string::npos, report.find("Objects lost: 1\n         1  string       from CMClone\n"))
        << report;
}

TEST(Contract, AnExceptionBecomesAFailedResult)
{
    auto server = open_toy(TOY_PLAIN);
    Result result = call(*server, "Throws");
    EXPECT_EQ(CMPI_RC_ERR_FAILED, result.rc);
    EXPECT_EQ("thrown by the toy", result.exception);
    EXPECT_EQ(0u, server->ledger().live());
}

TEST(Contract, OutParametersMustBeThoseOfTheMethod)
{
    auto server = open_toy(TOY_DESCRIBED);
    call(*server, "Echo", {{"Text", Plain_Value::boolean(true)}, {"More", Plain_Value::boolean(true)}});
    EXPECT_EQ("TOY_Item: Echo.Text is string, not boolean\nTOY_Item: Echo has no out parameter More\n",
              server->violations().text());
}

} // namespace
} // namespace KPRV::broker
