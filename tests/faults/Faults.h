// What the two drivers share: what goes wrong is told and counted.
#pragma once

#include <cstdarg>
#include <cstdio>

namespace faults {

// Names of the injector's functions, as a program looks them up.
inline constexpr char kArm[] = "talixFaultsArm";
inline constexpr char kDisarm[] = "talixFaultsDisarm";
using Arm = void(long memory, long file);
using Disarm = void(long* memory, long* file);

class Report {
 public:
  __attribute__((format(printf, 2, 3))) void fault(char const* format, ...) {
    constexpr int kShown = 20;
    if (++m_faults > kShown) return;
    va_list args;
    va_start(args, format);
    std::vprintf(format, args);
    va_end(args);
    std::printf("\n");
    std::fflush(stdout);
  }
  int exitStatus() const { return m_faults ? 1 : 0; }
  int faults() const { return m_faults; }

 private:
  int m_faults = 0;
};

}  // namespace faults
