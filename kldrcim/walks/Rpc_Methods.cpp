#include "kldrcim/walks/Rpc_Methods.h"

#include <algorithm>
#include <iterator>
#include <sstream>

namespace KPRV::kldrcim {

namespace {

struct Type_Row
{
    char letter;
    const char* name;
};

// In the order of the enumeration.
constexpr Type_Row types[] = {
    {'S', "string"}, {'I', "integer"}, {'B', "boolean"}, {'A', "array"}, {'O', "object"}};

struct Table_Row
{
    const char* name;
    /// A letter and a key for each position, separated by blanks.
    const char* parameters;
};

// clang-format off
constexpr Table_Row table[] = {
// What takes no position is left out.
#define METHOD(name, handler, shape, entry_point, members) {name, "" members},
#define HANDLER(handler, shape, entry_point, members)
#define NONE
#define S(key)       "S" #key " "
#define I(key)       "I" #key " "
#define B(key)       "B" #key " "
#define A(key)       "A" #key " "
#define O(key)       "O" #key " "
#define ADDRESS(key) "S" #key " "
#define OWN_S(name)  "S" #name " "
#define OWN_A(name)  "A" #name " "
#define OWN_O(name)  "O" #name " "
#define UNREAD(name) "S" #name " "
#define ZERO(key)
#define FUNCTION(text)
#include "contracts/agent/Methods.def"
};
// clang-format on

Rpc_Type type_of(char letter)
{
    const auto found = std::find_if(std::begin(types), std::end(types),
                                    [&](const Type_Row& row) { return row.letter == letter; });
    return static_cast<Rpc_Type>(found - std::begin(types));
}

std::vector<Rpc_Method> read_table()
{
    std::vector<Rpc_Method> methods;
    for (const Table_Row& row : table) {
        Rpc_Method& method = methods.emplace_back(Rpc_Method{row.name, {}});
        std::istringstream parameters(row.parameters);
        for (std::string each; parameters >> each;)
            method.parameters.push_back({each.substr(1), type_of(each.front())});
    }
    return methods;
}

} // namespace

const char* rpc_type_name(Rpc_Type type)
{
    return types[static_cast<std::size_t>(type)].name;
}

const std::vector<Rpc_Method>& rpc_methods()
{
    static const std::vector<Rpc_Method> methods = read_table();
    return methods;
}

const Rpc_Method* find_rpc_method(const std::string& name)
{
    const std::vector<Rpc_Method>& methods = rpc_methods();
    const auto found = std::find_if(methods.begin(), methods.end(),
                                    [&](const Rpc_Method& method) { return method.name == name; });
    return found == methods.end() ? nullptr : &*found;
}

} // namespace KPRV::kldrcim
