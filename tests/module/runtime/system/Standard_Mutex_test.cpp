#include "module/runtime/system/Standard_Mutex.h"

#include <future>
#include <gtest/gtest.h>
#include <optional>
#include <shared_mutex>

using namespace KPRV;

namespace {

/// How far another thread has come that wants to write.
template <class Kind>
class Writer
{
public:
    explicit Writer(Standard_Mutex<Kind>& mutex)
        : _done(std::async(std::launch::async, [&mutex] { const Auto_Lock lock(mutex); }))
    {
    }

    bool waits() const
    {
        return _done.wait_for(std::chrono::milliseconds(50)) == std::future_status::timeout;
    }
    void finish() { _done.get(); }

private:
    std::future<void> _done;
};

} // namespace

TEST(Standard_Mutex, KeepsOthersOutForAScope)
{
    Standard_Mutex<> mutex;
    std::optional<Writer<std::mutex>> other;
    {
        const Auto_Lock lock(mutex);
        other.emplace(mutex);
        EXPECT_TRUE(other->waits());
    }
    other->finish();
}

TEST(Standard_Mutex, RecursiveOneIsTakenAgainByItsOwner)
{
    Standard_Mutex<std::recursive_mutex> mutex;
    std::optional<Writer<std::recursive_mutex>> other;
    {
        const Auto_Lock lock(mutex);
        {
            const Auto_Lock again(mutex);
        }
        other.emplace(mutex);
        EXPECT_TRUE(other->waits());
    }
    other->finish();
}

TEST(Standard_Mutex, ReadersShareItAndKeepWritersOut)
{
    Standard_Mutex<std::shared_mutex> mutex;
    std::optional<Writer<std::shared_mutex>> writer;
    {
        const Auto_Shared_Lock lock(mutex);
        std::async(std::launch::async, [&] { const Auto_Shared_Lock beside(mutex); }).get();
        writer.emplace(mutex);
        EXPECT_TRUE(writer->waits());
    }
    writer->finish();
}
