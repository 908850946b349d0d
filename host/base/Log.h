// Lines for the user, with a level, written to the sink of the thread.
#pragma once

#include <string_view>

enum class LogLevel : unsigned char { Error, Warning, Info };

char const* getLogLevelName(LogLevel level);  // "error", "warning", "info"

class LogSink {
 public:
  virtual ~LogSink() = default;
  virtual void write(LogLevel level, std::string_view text) = 0;
};

// Where this thread's lines go from now on, null for standard error ("error: TEXT"); returns the former sink.
// The caller owns it.
LogSink* setLogSink(LogSink* sink);
void writeLog(LogLevel level, std::string_view text);
