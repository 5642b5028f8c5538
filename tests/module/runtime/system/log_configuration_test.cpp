#include "module/runtime/system/log_configuration.h"
#include "tests/support/Temp_Folder.h"

#include <cstring>
#include <gtest/gtest.h>
#include <optional>

using namespace KPRV;

/// The level that an rc file asks for; nothing if it asks for none.
static std::optional<Log_Level> level_of(const std::string& rc_text)
{
    Temp_Folder home;
    home.write(".cimplerc", rc_text);
    const Environment_Override override("HOME", home.path());
    Log_Configuration configuration;
    if (!read_log_configuration(configuration))
        return std::nullopt;
    return configuration.level;
}

TEST(log_configuration, RulesOfTheRcFile)
{
    using enum Log_Level;
    const std::string long_line(5000, 'x');
    const struct
    {
        std::string text;
        std::optional<Log_Level> level;
    } rows[] = {
        {"LOG_LEVEL=FATAL\n", FATAL},
        {"LOG_LEVEL=ERR\n", ERR},
        {"LOG_LEVEL=WARN\n", WARN},
        {"LOG_LEVEL=INFO\n", INFO},
        {"LOG_LEVEL=DBG\n", DBG},
        {"LOG_LEVEL=dbg\n", DBG},
        {"LOG_LEVEL=dBg", DBG},
        {"LOG_LEVEL = DBG\n", DBG},
        {"LOG_LEVEL\t=\t Info \t\r\n", INFO},
        {"# LOG_LEVEL=DBG\n\n   \nLOG_LEVEL=ERR\n", ERR},
        {"OTHER=1\nLOG_LEVEL=WARN\n", WARN},
        {"LOG_LEVEL=ERR\nLOG_LEVEL=DBG\n", ERR},
        // The key must stand at the start, in capitals, and be all of the word.
        {" LOG_LEVEL=DBG\n", std::nullopt},
        {"log_level=DBG\n", std::nullopt},
        {"LOG_LEVELS=DBG\n", std::nullopt},
        {"LOG_LEVELS=DBG\nLOG_LEVEL=WARN\n", WARN},
        {"LOG_LEVEL DBG\n", std::nullopt},
        {"LOG_LEVE=DBG\n", std::nullopt},
        {"LOG_LEVEL\n", std::nullopt},
        // An unknown value ends the search.
        {"LOG_LEVEL=LOUD\nLOG_LEVEL=DBG\n", std::nullopt},
        {"LOG_LEVEL=\nLOG_LEVEL=DBG\n", std::nullopt},
        {"LOG_LEVEL==DBG\n", std::nullopt},
        {"LOG_LEVEL=DBG DBG\n", std::nullopt},
        {"LOG_LEVEL=4\n", std::nullopt},
        {"", std::nullopt},
        {"\n", std::nullopt},
        {long_line + "\nLOG_LEVEL=INFO\n", INFO},
        // A line that is too long counts as several, also where it begins as a comment.
        {std::string(1022, 'x') + "LOG_LEVEL=INFO\n", std::nullopt},
        {std::string(1023, 'x') + "LOG_LEVEL=INFO\n", INFO},
        {std::string(1024, 'x') + "LOG_LEVEL=INFO\n", std::nullopt},
        {'#' + std::string(1022, 'x') + "LOG_LEVEL=INFO\n", INFO},
        {long_line, std::nullopt},
    };
    for (const auto& row : rows)
        EXPECT_EQ(level_of(row.text), row.level) << row.text.substr(0, 80);
}

TEST(log_configuration, NamesTheFilesBelowHome)
{
    Temp_Folder home;
    home.write(".cimplerc", "LOG_LEVEL=DBG\n");
    std::string folder = home.path("");
    folder.pop_back(); // the slash
    const Environment_Override override("HOME", folder);
    Log_Configuration configuration;
    ASSERT_TRUE(read_log_configuration(configuration));
    EXPECT_EQ(configuration.directory, folder + "/.cimple");
    EXPECT_EQ(configuration.messages, folder + "/.cimple/messages");
    EXPECT_EQ(configuration.lock, folder + "/.cimple/messages.lock");
}

TEST(log_configuration, NothingWithoutHomeOrFile)
{
    Temp_Folder home;
    const Environment_Override override("HOME", home.path());
    Log_Configuration configuration;
    EXPECT_FALSE(read_log_configuration(configuration));
    unsetenv("HOME");
    EXPECT_FALSE(read_log_configuration(configuration));
}

/// The folder by another name, of the given size.
static std::string lengthened(std::string folder, size_t size)
{
    if ((size - folder.size()) % 2)
        folder += '/';
    while (folder.size() < size)
        folder += "/.";
    return folder;
}

TEST(log_configuration, APathThatDoesNotFitIsNotShortened)
{
    Temp_Folder home;
    home.write(".cimplerc", "LOG_LEVEL=DBG\n");
    // The lock file's is the longest; with its end it fills its room exactly.
    const size_t longest = 1023 - strlen("/.cimple/messages.lock");
    const std::string folder = home.path();
    Log_Configuration configuration;
    for (const size_t size : {longest - 1, longest}) {
        const Environment_Override override("HOME", lengthened(folder, size));
        ASSERT_TRUE(read_log_configuration(configuration));
        EXPECT_EQ(configuration.lock, lengthened(folder, size) + "/.cimple/messages.lock");
    }
    // The rc file's fits also in the next ones, for as long as it is no longer than the lock file's may be.
    for (const size_t size :
         {longest + 1, longest + 2, 1023 - strlen("/.cimplerc"), 1024 - strlen("/.cimplerc"), size_t(3000)}) {
        const Environment_Override override("HOME", lengthened(folder, size));
        EXPECT_FALSE(read_log_configuration(configuration)) << size;
    }
}
