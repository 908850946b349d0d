#include "host/base/Log.h"

#include <cstdio>

#include "host/base/ThreadLocal.h"

namespace {

TALIX_THREAD_LOCAL LogSink* t_sink = nullptr;

}  // namespace

char const* getLogLevelName(LogLevel level) {
  static constexpr char const* names[] = {"error", "warning", "info"};
  return names[static_cast<int>(level)];
}

LogSink* setLogSink(LogSink* sink) {
  LogSink* former = t_sink;
  t_sink = sink;
  return former;
}

void writeLog(LogLevel level, std::string_view text) {
  if (t_sink) return t_sink->write(level, text);
  std::fprintf(stderr, "%s: %.*s\n", getLogLevelName(level), static_cast<int>(text.size()), text.data());
}
