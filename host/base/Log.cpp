#include "host/base/Log.h"

#include <cstdio>

namespace {

LogSink* s_sink = nullptr;

}  // namespace

char const* getLogLevelName(LogLevel level) {
  static constexpr char const* names[] = {"error", "warning", "info"};
  return names[static_cast<int>(level)];
}

LogSink* setLogSink(LogSink* sink) {
  LogSink* former = s_sink;
  s_sink = sink;
  return former;
}

void writeLog(LogLevel level, std::string_view text) {
  if (s_sink) return s_sink->write(level, text);
  std::fprintf(stderr, "%s: %.*s\n", getLogLevelName(level), static_cast<int>(text.size()), text.data());
}
