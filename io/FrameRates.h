// Frame rates as files give them.
#pragma once

namespace talix {

// Frames a second that we take from a file; the error text when a rate is none.
bool isFrameRate(double rate);
inline constexpr char const* kFrameRateExpected = "a frame rate from 0.001 to 1000000 a second";

// The rate that a printed frame time means: the usual rate whose frame time is within `precision` seconds of
// it, else 1 / frameTime. Whole rates go before broken ones, since a short text may stand for either.
double rateFromFrameTime(double frameTime, double precision);

}  // namespace talix
