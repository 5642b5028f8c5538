// The program as users run it.
#include "kldrcim/verbs/Cli_Verbs.h"
#include "tests/broker/Toy_Server.h"
#include "tests/kldrcim/Run_Kldrcim.h"

#include <json/json.h>
#include <sstream>

namespace KPRV::kldrcim {
namespace {

TEST(Cli, EnumeratesNames)
{
    Outcome run = kldrcim("ein toy_item");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("root/toy:TOY_Item.Id=1,Name=\"one\"\n"
              "root/toy:TOY_Item.Id=2,Name=\"two \\\"quoted\\\" \\\\\"\n",
              run.out);
    EXPECT_EQ("", run.error);
}

TEST(Cli, EveryPathThatItPrintsCanBeGivenBack)
{
    Outcome run = kldrcim("gi \"$(" KLDRCIM " --module " TOY_DESCRIBED
                          " --namespace root/toy ein TOY_Item | tail -1)\"");
    EXPECT_EQ(0, run.status) << run.error;
    EXPECT_NE(std::string::npos, run.out.find("  Id      = 2\n")) << run.out;
    EXPECT_EQ(std::string::npos, run.out.find("Nothing"));
}

TEST(Cli, TablesOfChosenProperties)
{
    Outcome run = kldrcim("ei TOY_Item --properties Id,U8");
    EXPECT_EQ("Id  U8\n--  ---\n1   200\n2   200\n", run.out);
}

TEST(Cli, ManyPropertiesMakeBlocks)
{
    Outcome run = kldrcim("ei TOY_Item");
    EXPECT_EQ(0u, run.out.find("root/toy:TOY_Item.Id=1,Name=\"one\"\n")) << run.out;
    EXPECT_NE(std::string::npos, run.out.find("  Numbers = {0, 1, 2}\n")) << run.out;
}

TEST(Cli, Json)
{
    Outcome run = kldrcim("--format=json ei TOY_Item");
    Json::Value parsed;
    ASSERT_TRUE(Json::Reader().parse(run.out, parsed)) << run.out;
    EXPECT_EQ(2u, parsed.size());
    EXPECT_EQ(200, parsed[0]["properties"]["U8"].asInt());
    EXPECT_TRUE(parsed[0]["properties"]["Nothing"].isNull());
}

TEST(Cli, Mof)
{
    Outcome run = kldrcim("--format mof gi 'TOY_Item.Id=1,Name=\"one\"'");
    EXPECT_EQ(0u, run.out.find("instance of TOY_Item {\n    Id = 1;\n    Name = \"one\";\n")) << run.out;
    EXPECT_NE(std::string::npos, run.out.find("    Texts = {\"line\\nbreak\", NULL};\n")) << run.out;
}

TEST(Cli, CreateModifyDelete)
{
    EXPECT_EQ("root/toy:TOY_Item.Id=9,Name=\"n\"\n", kldrcim("ci TOY_Item Id=9 Name=n U8=1").out);
    EXPECT_EQ(0, kldrcim("mi 'TOY_Item.Id=1,Name=\"one\"' Name=new").status);
    Outcome refused = kldrcim("mi 'TOY_Item.Id=1,Name=\"one\"' U8=1");
    EXPECT_EQ(1, refused.status);
    EXPECT_EQ("kldrcim: CIM_ERR_INVALID_PARAMETER (4)\n", refused.error);
    EXPECT_EQ(0, kldrcim("di 'TOY_Item.Id=1,Name=\"one\"'").status);
}

TEST(Cli, MethodsInAllFormats)
{
    EXPECT_EQ("  return_value = 1\n  Text         = {\"a\": 1}\n",
              kldrcim("cm TOY_Item Echo 'Text={\"a\": 1}'").out);
    EXPECT_EQ("return_value = 1;\nText = \"t\";\n", kldrcim("--format mof cm TOY_Item Echo Text=t").out);
    EXPECT_EQ("{\n  \"return_value\": 1,\n  \"out\": {\n    \"Text\": \"t\"\n  }\n}\n",
              kldrcim("--format json cm TOY_Item Echo Text=t").out);
    Outcome run = kldrcim("cm TOY_Item Missing");
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("kldrcim: CIM_ERR_METHOD_NOT_FOUND (17): TOY_Item has no method Missing\n", run.error);
}

TEST(Cli, TheUserReachesTheProvider)
{
    EXPECT_EQ("  return_value = 0\n  User         = me\n",
              kldrcim("--user me cm TOY_Item User", TOY_PLAIN).out);
}

TEST(Cli, Classes)
{
    EXPECT_EQ("Class     Superclass  Provider          Keys\n"
              "--------  ----------  ----------------  --------\n"
              "TOY_Item  TOY_Base    instance, method  Id, Name\n",
              kldrcim("classes '*item'").out);
    EXPECT_EQ("[]\n", kldrcim("--format json classes X*").out);
    EXPECT_EQ("{\"class\": \"TOY_Item\", \"superclass\": \"TOY_Base\", \"provider\": [\"instance\", "
              "\"method\"], \"keys\": [\"Id\", \"Name\"]}\n",
              kldrcim("classes *item --format jsonl").out);
    Outcome run = kldrcim("classes", TOY_PLAIN);
    EXPECT_EQ(0, run.status);
    EXPECT_NE(std::string::npos, run.error.find("does not publish its classes")) << run.error;
}

TEST(Cli, SomeOfTheClasses)
{
    const std::string item = kldrcim("classes TOY_Item").out;
    EXPECT_EQ(item, kldrcim("classes --where superclass=TOY_Base --where keys=Name --where class~*item").out);
    EXPECT_EQ("1\n", kldrcim("classes TOY_Item --where provider=method --count").out);
    EXPECT_EQ("0\n", kldrcim("classes TOY_Item --where provider!=method --count").out);
    const std::string all = kldrcim("classes --format jsonl --sort class").out;
    const std::string last = kldrcim("classes --format jsonl --sort -class").out;
    EXPECT_EQ(all.substr(0, all.find('\n')),
              last.substr(last.rfind('\n', last.size() - 2) + 1, all.find('\n')));
    const Outcome run = kldrcim("classes --where Superclas=x");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ(
        "kldrcim: classes has no \"Superclas\" (did you mean \"superclass\"?); it has class, superclass, "
        "provider, keys\n",
        run.error);
    EXPECT_EQ(2, kldrcim("classes --format mof").status);
}

TEST(Cli, LeaksGoToStandardError)
{
    Outcome run = kldrcim("--leaks cm TOY_Item LostClone");
    EXPECT_EQ(0, run.status);
    EXPECT_NE(std::string::npos, run.error.find("Objects left to the server: ")) << run.error;
    EXPECT_NE(std::string::npos, run.error.find("Objects lost: 1\n")) << run.error;
}

TEST(Cli, ViolationsAreWarnings)
{
    Outcome run = kldrcim("cm TOY_Item NullText");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("kldrcim: warning: the provider broke the CMPI contract: CMNewString: null text\n", run.error);
}

struct Refusal
{
    const char* arguments;
    int status;
    const char* error;
};

TEST(Cli, OneClearLineForEachMistake)
{
    const Refusal refusals[] = {
        {"gi 'TOY_Item.Id=3,Name=\"x\"'", 1, "kldrcim: CIM_ERR_NOT_FOUND (6): no such item\n"},
        {"ei TOY_None", 1,
         "kldrcim: CIM_ERR_INVALID_CLASS (5): the module has no class TOY_None; \"kldrcim classes\" lists "
         "them\n"},
        {"gi 'TOY_Item.Id='", 2,
         "kldrcim: malformed object path at column 13: expected a quoted text, a number, true or false: "
         "TOY_Item.Id=\n"},
        {"ei TOY_Item --properties Id,Foo", 2, "kldrcim: TOY_Item has no property \"Foo\"\n"},
        {"ci TOY_Item Foo=1", 2, "kldrcim: TOY_Item has no property \"Foo\"\n"},
        {"", 2, "kldrcim: no verb; \"kldrcim --help\" lists them\n"},
        {"frobnicate", 2, "kldrcim: no verb \"frobnicate\"; \"kldrcim --help\" lists them\n"},
        {"frobnicate --help", 2, "kldrcim: no verb \"frobnicate\"; \"kldrcim --help\" lists them\n"},
        {"graf", 2, "kldrcim: no verb \"graf\" (did you mean \"graph\"?); \"kldrcim --help\" lists them\n"},
        {"prof", 2,
         "kldrcim: no verb \"prof\" (did you mean \"profiles\"?); \"kldrcim --help\" lists them\n"},
        {"ei X --propreties=A", 2,
         "kldrcim: no option \"--propreties=A\" (did you mean \"--properties\"?); \"kldrcim --help\" lists "
         "them\n"},
        {"tree --leaks=1", 2, "kldrcim: --leaks takes no value\n"},
        {"tree --color red", 2, "kldrcim: --color takes auto, always or never, not \"red\"\n"},
        {"ei", 2, "kldrcim: usage: kldrcim [options] ei CLASS\n"},
        {"ei TOY_Item --format xml", 2,
         "kldrcim: --format takes table, json, jsonl, mof, plugin, prometheus or openmetrics, not \"xml\"\n"},
        {"ei TOY_Item --nothing", 2, "kldrcim: no option \"--nothing\"; \"kldrcim --help\" lists them\n"},
        {"ei TOY_Item --user", 2, "kldrcim: --user wants a value\n"},
        {"cm TOY_Item Throws", 1,
         "kldrcim: CIM_ERR_FAILED (1): an exception left the provider: thrown by the toy\n"
         "kldrcim: warning: the provider broke the CMPI contract: MI entry: an exception left the provider: "
         "thrown by the toy\n"},
    };
    for (const Refusal& refusal : refusals) {
        Outcome run = kldrcim(refusal.arguments);
        EXPECT_EQ(refusal.status, run.status) << refusal.arguments;
        EXPECT_EQ(refusal.error, run.error) << refusal.arguments;
        EXPECT_EQ("", run.out) << refusal.arguments;
    }
}

TEST(Cli, AModuleThatCannotBeLoaded)
{
    Outcome run = kldrcim("ei X", "/nowhere/lib.so");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ(0u, run.error.find("kldrcim: cannot load the provider module: /nowhere/lib.so: ")) << run.error;
}

TEST(Cli, HelpAndVersion)
{
    Outcome run = kldrcim("--help");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ(0u, run.out.find("Usage: kldrcim [options] VERB ARGUMENT...\n"));
    EXPECT_EQ(run.out, kldrcim("-h").out);
    EXPECT_EQ(0u, kldrcim("--version").out.find("kldrcim "));
}

TEST(Cli, AnOptionMayDependOnTheVerb)
{
    // A text for rpc, none for the others, wherever it stands.
    const Outcome called = on_fabric("rpc --raw '{}'");
    EXPECT_EQ(called.error, on_fabric("--raw '{}' rpc").error);
    EXPECT_EQ(std::string::npos, called.error.find("usage")) << called.error;
    EXPECT_EQ(0, on_fabric("--raw ein KALDERA_FCPort")
                     .error.find("kldrcim: --raw makes no sense for ein; it is for ei "));
    EXPECT_EQ("kldrcim: --raw takes no value\n", on_fabric("ei KALDERA_FCPort --raw=x").error);
    EXPECT_EQ("kldrcim: --raw wants a value\n", on_fabric("rpc --raw").error);
    EXPECT_EQ(on_fabric("ei KALDERA_FCPort --raw").out, on_fabric("--raw ei KALDERA_FCPort").out);
    EXPECT_EQ(on_fabric("ei KALDERA_FCPort --raw").out,
              on_fabric("--format table --raw ei KALDERA_FCPort").out);
}

TEST(Cli, EachVerbHasHelpOfItsOwn)
{
    const std::string all = kldrcim("--help").out;
    for (const Cli_Verb& verb : cli_verbs()) {
        SCOPED_TRACE(verb.name);
        // Also where its arguments are not complete.
        const Outcome run = kldrcim(std::string(verb.name) + " --help");
        EXPECT_EQ(0, run.status);
        EXPECT_EQ("", run.error);
        EXPECT_EQ(0u, run.out.find(std::string("Usage: kldrcim [options] ") + verb.name)) << run.out;
        for (const Cli_Option& option : cli_options()) {
            // Of two options of one name, the value tells which it is.
            const std::string line =
                "\n  " + std::string(option.name) + (option.value ? " " + std::string(option.value) : "  ");
            const bool has_it = option.is_common || takes_option(verb, option);
            EXPECT_EQ(has_it, run.out.find(line) != std::string::npos) << line;
            EXPECT_NE(std::string::npos, all.find(line)) << line;
        }
        std::istringstream lines(run.out + all);
        for (std::string line; std::getline(lines, line);)
            EXPECT_GE(80u, line.size()) << line;
    }
    EXPECT_NE(std::string::npos, kldrcim("rpc --help").out.find("Parameters of rpc\n"));
    EXPECT_EQ(std::string::npos, kldrcim("ei --help").out.find("Parameters of rpc\n"));
    EXPECT_NE(std::string::npos, kldrcim("gi --help").out.find("Paths and values\n"));
}

TEST(Cli, AnOutputThatCannotBeWrittenIsAFailure)
{
    for (const char* arguments :
         {"ei TOY_Item", "ein TOY_Item", "classes", "--help", "ei --help", "--version", "rpc --list",
          "cm TOY_Item Echo Text=t", "ei TOY_Item --format json"}) {
        SCOPED_TRACE(arguments);
        const std::string command = std::string(KLDRCIM " --module " TOY_DESCRIBED " --namespace root/toy ") +
                                    arguments + " 2>cli_test.err ";
        EXPECT_EQ(1, WEXITSTATUS(std::system((command + ">/dev/full").c_str())));
        EXPECT_EQ("kldrcim: write error: No space left on device\n", read_file("cli_test.err"));
        EXPECT_EQ(1, WEXITSTATUS(std::system((command + ">&-").c_str())));
        EXPECT_EQ("kldrcim: write error: Bad file descriptor\n", read_file("cli_test.err"));
        // A reader that has had enough.
        EXPECT_EQ(0, WEXITSTATUS(std::system((command + "| true").c_str())));
        EXPECT_EQ("", read_file("cli_test.err"));
        const std::string status = "sh -c '" + command + "; echo $? >cli_test.status' | true";
        if (std::string(arguments).find('\'') == std::string::npos) {
            std::system(status.c_str());
            EXPECT_EQ("0\n", read_file("cli_test.status"));
        }
    }
}

TEST(Cli, AClosedOutputIsNotTakenByAFileThatIsOpened)
{
    // What is loaded and logged would else get the place of the output.
    const std::string command =
        KLDRCIM " --module " TOY_DESCRIBED " --namespace root/toy ein TOY_Item <&- >&- 2>cli_test.err";
    EXPECT_EQ(1, WEXITSTATUS(std::system(command.c_str())));
    EXPECT_EQ("kldrcim: write error: Bad file descriptor\n", read_file("cli_test.err"));
}

TEST(Cli, WithoutMemoryOneLineTellsIt)
{
    // What is loaded takes its place before the limit is met.
    const Outcome run = kldrcim("cm TOY_Item Echo \"Text=$(head -c 100000 /dev/zero | tr '\\0' x)\"");
    EXPECT_EQ(0, run.status);
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    const std::string command = "ulimit -v 60000; exec " KLDRCIM " --module " TOY_DESCRIBED
                                " --namespace root/toy rpc --raw - </dev/zero 2>cli_test.err";
    EXPECT_EQ(1, WEXITSTATUS(std::system(command.c_str())));
    EXPECT_EQ("kldrcim: out of memory\n", read_file("cli_test.err"));
#endif
}

TEST(Cli, ANameSpaceThatNobodyServes)
{
    const std::string own = KLDRCIM " --module " TOY_FABRIC " 2>cli_test.err >cli_test.out ";
    const auto run = [&](const std::string& arguments) {
        const int status = WEXITSTATUS(std::system((own + arguments).c_str()));
        return std::pair(status, read_file("cli_test.err"));
    };
    const std::pair unserved(2, std::string("kldrcim: no namespace \"root/x\"; there is root/kaldera\n"));
    EXPECT_EQ(unserved, run("--namespace root/x ei KALDERA_FCPort"));
    EXPECT_EQ(unserved, run("--namespace root/x tree"));
    EXPECT_EQ(unserved.first, run("ei root/x:KALDERA_FCPort").first);
    EXPECT_EQ(0, run("--namespace ROOT/Kaldera ei KALDERA_FCPort").first);
}

} // namespace
} // namespace KPRV::kldrcim
