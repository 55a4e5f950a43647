#ifndef QV_CORBEL_ITEMNAME_H
#define QV_CORBEL_ITEMNAME_H

#include <string_view>

namespace corbel {

// The expert names each clock port after its port identity: the eight octets of the clock
// identity in hexadecimal joined by "-", then ":" and the port number.
inline constexpr const char* kItemNameExample = "02-11-22-FF-FE-33-44-55:1";

// Whether `text` has the form of an item name (either case of the hexadecimal digits), so
// that a command can tell item names from tag names among its words.
bool isItemName(std::string_view text);

}  // namespace corbel

#endif
