// Degrees, which users read and type; inside, angles are radians.
#pragma once

inline constexpr double kDegreesPerRadian = 57.29577951308232;
