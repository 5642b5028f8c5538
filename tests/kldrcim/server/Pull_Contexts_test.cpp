#include "kldrcim/server/Pull_Contexts.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

std::unique_ptr<Pull_Context> context()
{
    return std::make_unique<Pull_Context>(Pull_Context::PATHS, "root/toy", std::chrono::seconds(10));
}

const Pull_Contexts::Clock::time_point start;

} // namespace

TEST(Pull_Contexts, GivesAContextToOneAtATime)
{
    Pull_Contexts contexts;
    const std::string name = contexts.put(context(), start);
    EXPECT_FALSE(contexts.take(name + "0", start));
    std::unique_ptr<Pull_Context> taken = contexts.take(name, start);
    ASSERT_TRUE(taken);
    EXPECT_FALSE(contexts.take(name, start));
    contexts.put_back(name, std::move(taken), start);
    EXPECT_TRUE(contexts.take(name, start));
    EXPECT_EQ(0U, contexts.count());
}

TEST(Pull_Contexts, ForgetsWhatNobodyAsksFor)
{
    Pull_Contexts contexts;
    const std::string name = contexts.put(context(), start);
    contexts.put_back(name + "x", contexts.take(name, start + std::chrono::seconds(9)),
                      start + std::chrono::seconds(9));
    EXPECT_TRUE(contexts.take(name + "x", start + std::chrono::seconds(18)));
    const std::string other = contexts.put(context(), start);
    EXPECT_FALSE(contexts.take(other, start + std::chrono::seconds(10)));
}

TEST(Pull_Contexts, AreSweptOut)
{
    Pull_Contexts contexts;
    contexts.put(context(), start);
    contexts.put(context(), start + std::chrono::seconds(5));
    contexts.sweep(start + std::chrono::seconds(9));
    EXPECT_EQ(2U, contexts.count());
    contexts.sweep(start + std::chrono::seconds(10));
    EXPECT_EQ(1U, contexts.count());
}

TEST(Pull_Contexts, AreBounded)
{
    Pull_Contexts contexts;
    for (std::size_t i = 0; i < Pull_Contexts::MOST; ++i)
        EXPECT_NE("", contexts.put(context(), start));
    EXPECT_EQ("", contexts.put(context(), start));
    EXPECT_NE("", contexts.put(context(), start + std::chrono::seconds(10)));
}

} // namespace KPRV::kldrcim
