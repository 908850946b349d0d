// The settings that the engine knows: their places, units, defaults and least values. docs/profile.md lists
// them for users.
#pragma once

struct ProfileInt {
  char const *section, *entry;
  int byDefault, least;
};

struct ProfileDouble {
  char const *section, *entry;
  double byDefault, least;
};

namespace profile {

// How much memory undo may hold, in MiB.
inline constexpr ProfileInt kUndoMemory{"Undo", "MemoryMB", 1024, 0};

// How far a reduced curve may deviate from the original one.
inline constexpr ProfileDouble kReductionLength{"Reduction", "LengthMM", 0.1, 0};         // millimetres
inline constexpr ProfileDouble kReductionAngle{"Reduction", "AngleDegrees", 0.1, 0};      // degrees
inline constexpr ProfileDouble kReductionPercent{"Reduction", "PercentOfRange", 0.1, 0};  // % of max - min

inline constexpr ProfileInt kInts[] = {kUndoMemory};
inline constexpr ProfileDouble kDoubles[] = {kReductionLength, kReductionAngle, kReductionPercent};

}  // namespace profile
