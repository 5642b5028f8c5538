#include "kldrcim/server/Pull_Context.h"

#include <future>
#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

using namespace std::chrono_literals;

Path_Value path(int number)
{
    Path_Value path{.class_name = "TOY_Item"};
    path.keys.push_back({"Name", Plain_Value::text(std::to_string(number))});
    return path;
}

Result failure()
{
    Result result;
    result.rc = CMPI_RC_ERR_FAILED;
    result.message = "no more of them";
    return result;
}

const Object_Text names{Object_Text::NAMED};

/// Hands paths over, then gives a result.
Pull_Context::Make paths(int count, const Result& result = {})
{
    return [count, result](Receiver& receiver) {
        for (int i = 0; i < count; ++i)
            if (!receiver.path(path(i)))
                return Result();
        return result;
    };
}

struct Pulled : testing::Test
{
    std::string taken()
    {
        const auto object = context.take();
        return object ? *object : "none";
    }

    Pull_Context context{Pull_Context::PATHS, "root/toy", 30s};
};

} // namespace

TEST_F(Pulled, GivesWhatItIsAskedForAndSaysWhenThatIsAll)
{
    context.start(names, paths(3));
    EXPECT_EQ(Pull_Context::MORE, context.wait(0));
    EXPECT_EQ(Pull_Context::MORE, context.wait(2));
    EXPECT_NE(std::string::npos, taken().find(">0<"));
    EXPECT_NE(std::string::npos, taken().find(">1<"));
    EXPECT_EQ(Pull_Context::END, context.wait(1));
    EXPECT_NE(std::string::npos, taken().find("<INSTANCENAME CLASSNAME=\"TOY_Item\">"));
    EXPECT_EQ("none", taken());
}

TEST_F(Pulled, GivesTheFirstWhileTheProviderWorksOnTheOthers)
{
    std::promise<void> more;
    context.start(names, [go_on = more.get_future().share()](Receiver& receiver) {
        receiver.path(path(0));
        receiver.path(path(1));
        go_on.wait();
        receiver.path(path(2));
        return Result();
    });
    EXPECT_EQ(Pull_Context::MORE, context.wait(1));
    EXPECT_NE("none", taken());
    more.set_value();
    EXPECT_EQ(Pull_Context::END, context.wait(5));
}

TEST_F(Pulled, FailsWhereTheProviderDid)
{
    context.start(names, paths(3, failure()));
    EXPECT_EQ(Pull_Context::MORE, context.wait(2));
    EXPECT_EQ(Pull_Context::FAILED, context.wait(3));
    EXPECT_EQ("no more of them", context.failure().message);
}

TEST_F(Pulled, FailsByAnException)
{
    context.start(names, [](Receiver&) -> Result { throw std::runtime_error("thrown"); });
    EXPECT_EQ(Pull_Context::FAILED, context.wait(0));
    EXPECT_EQ("thrown", context.failure().message);
}

TEST(Pull_Context, TellsTheProviderWhenNobodyPullsAnyMore)
{
    std::promise<void> told;
    {
        Pull_Context context(Pull_Context::PATHS, "root/toy", 30s);
        context.start(names, [&told](Receiver& receiver) {
            for (int i = 0; receiver.path(path(i)); ++i)
                std::this_thread::sleep_for(1ms);
            told.set_value();
            return Result();
        });
        EXPECT_EQ(Pull_Context::MORE, context.wait(2));
    }
    EXPECT_EQ(std::future_status::ready, told.get_future().wait_for(0s));
}

} // namespace KPRV::kldrcim
