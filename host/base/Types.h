// Whole-number types of the host interface.
#pragma once

#include <cstdint>

using int64 = std::int64_t;
using uint64 = std::uint64_t;
using uint32 = std::uint32_t;
