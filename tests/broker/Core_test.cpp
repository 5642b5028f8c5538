#include "broker/Call_Frame.h"
#include "broker/Objects.h"

#include "tests/support/Live_Blocks.h"

#include <gtest/gtest.h>
#include <vector>

namespace KPRV::broker {

TEST(Core, AnObjectThatEndsWithoutMemoryGoesWithItsShell)
{
    constexpr std::size_t MANY = 2000;
    Core core((Server_Options()));
    std::vector<String_Object*> objects;
    for (std::size_t i = 0; i < MANY; ++i)
        objects.push_back(make_argument<String_Object>(core, "text"));
    std::size_t gone = 0;
    for (String_Object* object : objects) {
        const void* const address = object->cmpi();
        refuse_block(1);
        core.retire(*object);
        grant_blocks();
        gone += !Object_Blocks::find(address);
    }
    EXPECT_LT(0u, gone);
    EXPECT_LT(gone, MANY) << "the others kept theirs";
}

} // namespace KPRV::broker
