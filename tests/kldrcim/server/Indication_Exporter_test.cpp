#include "kldrcim/server/Indication_Exporter.h"

#include <atomic>
#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

/// A listener that takes what it is told to take.
class Listener
{
public:
    Delivery take(const std::string& message)
    {
        const Auto_Lock lock(_mutex);
        ++_attempts;
        _changed.notify_all();
        if (_refusals > 0) {
            --_refusals;
            return {.is_done = false, .why = "later"};
        }
        _messages.push_back(message);
        return {};
    }
    void refuse(unsigned count)
    {
        const Auto_Lock lock(_mutex);
        _refusals = count;
    }
    void wait_for_attempts(unsigned count)
    {
        const Auto_Lock lock(_mutex);
        while (_attempts < count)
            _changed.wait(_mutex);
    }
    std::vector<std::string> messages()
    {
        const Auto_Lock lock(_mutex);
        return _messages;
    }

    Delivery_Function function()
    {
        return [this](const std::string&, const std::string& message, const std::function<bool()>&) {
            return take(message);
        };
    }

private:
    Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    std::vector<std::string> _messages GUARDED_BY(_mutex);
    unsigned _attempts GUARDED_BY(_mutex) = 0;
    unsigned _refusals GUARDED_BY(_mutex) = 0;
};

constexpr Delivery_Patience short_patience{
    .quick = 3, .pause = std::chrono::milliseconds(1), .long_pause = std::chrono::milliseconds(2)};

bool has_number(const std::string& message, std::int64_t number)
{
    return message.find("NAME=\"SequenceNumber\" TYPE=\"sint64\"><VALUE>" + std::to_string(number) +
                        "</VALUE>") != std::string::npos;
}

} // namespace

TEST(Indication_Exporter, NumbersWhatItSends)
{
    Listener listener;
    Indication_Exporter exporter(
        "http://l/", "context", [](const std::string&) {}, listener.function());
    for (int i = 0; i < 3; ++i)
        exporter.put({{.class_name = "Alert"}, {}});
    listener.wait_for_attempts(3);
    while (listener.messages().size() < 3)
        std::this_thread::yield();
    for (std::int64_t i = 0; i < 3; ++i)
        EXPECT_TRUE(has_number(listener.messages()[i], i)) << listener.messages()[i];
    EXPECT_NE(std::string::npos, listener.messages()[0].find("<VALUE>context</VALUE>"));
}

TEST(Indication_Exporter, TriesAgainInOrderAndSaysSoOnce)
{
    Listener listener;
    listener.refuse(7);
    std::atomic<unsigned> lines = 0;
    Indication_Exporter exporter(
        "http://l/", "c",
        [&](const std::string& text) { lines += text == "listener http://l/: later" ? 1 : 2; },
        listener.function(), short_patience);
    exporter.put({{.class_name = "Alert"}, {}});
    exporter.put({{.class_name = "Alert"}, {}});
    listener.wait_for_attempts(9);
    while (listener.messages().size() < 2)
        std::this_thread::yield();
    EXPECT_TRUE(has_number(listener.messages()[0], 0));
    EXPECT_TRUE(has_number(listener.messages()[1], 1));
    EXPECT_EQ(1U, lines);
}

TEST(Indication_Exporter, DropsTheOldestOfTooMany)
{
    Listener listener;
    listener.refuse(~0U);
    std::atomic<unsigned> lines = 0;
    Indication_Exporter exporter(
        "http://l/", "c",
        [&](const std::string& text) { lines += text.find("dropped") != text.npos ? 1 : 0; },
        listener.function(), short_patience);
    const std::size_t count = Indication_Exporter::MOST_WAITING + 10;
    for (std::size_t i = 0; i < count; ++i)
        exporter.put({{.class_name = "Alert"}, {}});
    EXPECT_EQ(1U, lines);
    listener.refuse(0);
    while (listener.messages().size() < Indication_Exporter::MOST_WAITING)
        std::this_thread::yield();
    EXPECT_TRUE(has_number(listener.messages()[0], 0)) << "on its way when it became too many";
    EXPECT_TRUE(has_number(listener.messages()[1], 11));
    EXPECT_TRUE(has_number(listener.messages().back(), static_cast<std::int64_t>(count) - 1));
}

TEST(Indication_Exporter, EndsWithAFullQueue)
{
    Listener listener;
    listener.refuse(~0U);
    const auto begin = std::chrono::steady_clock::now();
    {
        Indication_Exporter exporter(
            "http://l/", "c", [](const std::string&) {}, listener.function());
        for (int i = 0; i < 100; ++i)
            exporter.put({{.class_name = "Alert"}, {}});
        listener.wait_for_attempts(1);
    }
    EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(1));
}

} // namespace KPRV::kldrcim
