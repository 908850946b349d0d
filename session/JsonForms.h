// Values, results and commands as JSON. Text that is no UTF-8 is mended, so that the JSON is valid whatever
// the scene holds; numbers that are not finite are null.
#pragma once

#include <boost/json/fwd.hpp>
#include <string_view>

#include "session/CommandRegistry.h"
#include "session/Session.h"

namespace talix {

// Vectors and arrays are arrays, an empty value is null.
boost::json::value toJson(Variable const& value);
// "command", "ok", "result" and "log".
boost::json::object toJson(LineResult const& result);
boost::json::object toJson(CommandRegistry::Entry const& entry);
boost::json::array toJson(CommandRegistry const& commands);

// As JSON text wants it: each byte that is no part of a UTF-8 character becomes U+FFFD.
std::string mendedUtf8(std::string_view text);

}  // namespace talix
