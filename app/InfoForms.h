// The forms in which "talix info" describes a take.
#pragma once

#include <boost/json/object.hpp>
#include <string>
#include <string_view>

#include "io/Take.h"

namespace talix {

std::string takeAsText(Take const& take, std::string const& file);
boost::json::object takeAsJson(Take const& take, std::string const& file);

// Text of a file as UTF-8 without control characters.
std::string printable(std::string_view text);

// "Tx", "Rz": a joint's channel in short.
std::string shortChannel(std::string const& channel);

}  // namespace talix
