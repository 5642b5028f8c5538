#include "module/model/Record_Filling.h"

namespace KPRV {

// Not inline: where the compiler knows the room it copies by its own instructions, which take several times
// as long for texts as short as these.
size_t copy_cut(char* to, size_t room, std::string_view text)
{
    return text.copy(to, room);
}

} // namespace KPRV
