#include "io/FrameRates.h"

#include <algorithm>
#include <cmath>

namespace talix {

namespace {

constexpr double kWholeRates[] = {24,  25,  30,  48,  50,  60,  72,  75,  90,  96,  100, 120,
                                  144, 150, 180, 200, 240, 250, 300, 360, 400, 480, 500, 1000};
// As people write them, then as they are.
constexpr double kBrokenRates[] = {23.976, 29.97, 47.952, 59.94, 119.88, 239.76};
constexpr double kExactBrokenRates[] = {24000 / 1001.0, 30000 / 1001.0,  48000 / 1001.0,
                                        60000 / 1001.0, 120000 / 1001.0, 240000 / 1001.0};

// Beyond this a text is too short to mean the usual rate rather than its own.
constexpr double kLargestCorrection = 0.05;

template <int N>
double nearestUsual(double const (&rates)[N], double frameTime, double tolerance) {
  double best = 0, bestDistance = tolerance;
  for (double const rate : rates) {
    double const distance = std::abs(1 / rate - frameTime);
    if (distance <= bestDistance) best = rate, bestDistance = distance;
  }
  return best;
}

}  // namespace

bool isFrameRate(double rate) { return rate >= 0.001 && rate <= 1e6; }

double rateFromFrameTime(double frameTime, double precision) {
  double const rate = 1 / frameTime;
  if (std::abs(rate - std::round(rate)) <= 1e-9 * rate) return std::round(rate);
  // Frame times of full double precision differ in their last bits.
  double const tolerance = std::min(precision + 1e-13 * frameTime, kLargestCorrection * frameTime);
  if (double const whole = nearestUsual(kWholeRates, frameTime, tolerance)) return whole;
  if (double const broken = nearestUsual(kBrokenRates, frameTime, tolerance)) return broken;
  if (double const exact = nearestUsual(kExactBrokenRates, frameTime, tolerance)) return exact;
  return rate;
}

}  // namespace talix
