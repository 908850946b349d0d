// Accessors by index return nothing beyond the end: an empty value, or null for what is owned by pointer.
#pragma once

#include "host/base/Types.h"

template <class Items>
auto itemAt(Items const& items, int64 i) {
  bool const exists = i >= 0 && static_cast<uint64>(i) < items.size();
  auto const at = static_cast<uint64>(i);
  if constexpr (requires { items[at].get(); })
    return exists ? items[at].get() : nullptr;
  else
    return exists ? items[at] : typename Items::value_type();
}
