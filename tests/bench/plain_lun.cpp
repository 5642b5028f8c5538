#include "tests/bench/plain_lun.h"

#include <charconv>

namespace KPRV::bench {

plain_lun_names::plain_lun_names(const plain_target& target)
    : _behind_target(_id + target.size), _end(_behind_target), _element(_behind_target)
{
    memcpy(_id, target.name, target.size + 1);
}

void plain_lun_names::add(std::string_view text)
{
    _end = static_cast<char*>(mempcpy(_end, text.data(), text.size()));
}

bool plain_lun_names::read(const Json::Value& lun)
{
    constexpr size_t VENDOR_SIZE = 8, PRODUCT_SIZE = 16;
    const Json::Value& vendor = lun["vendor"];
    const Json::Value& product = lun["productID"];
    const Json::Value& number = lun["number"];
    if (vendor.isNull() || product.isNull() || number.isNull())
        return false;
    _end = _behind_target;
    *_end++ = '_';
    add(plain_trimmed(plain_view(vendor).substr(0, VENDOR_SIZE)));
    *_end++ = '_';
    add(plain_trimmed(plain_view(product).substr(0, PRODUCT_SIZE)));
    *_end++ = '_';
    _element = _end;
    add("LUN_");
    _end = std::to_chars(_end, _id + sizeof _id - 1, static_cast<int>(number.asUInt())).ptr;
    *_end = '\0';
    return true;
}

} // namespace KPRV::bench
