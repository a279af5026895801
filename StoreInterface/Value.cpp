#include "StoreInterface/Value.h"

#include <array>

namespace NMX
{

std::string_view TypeName(EValueType type)
{
  static constexpr std::array<std::string_view, std::variant_size_v<Value>> names{
      "nothing",  "a truth value", "a whole number", "a whole number", "a whole number",
      "a number", "a text",        "a text",         "a colour",       "a subject",
      "subjects", "positions",     "smart clusters", "slots",          "a choice of options",
      "an action"};
  return names[static_cast<std::size_t>(type)];
}

}
