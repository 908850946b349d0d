// JSON values as text, with each float as the shortest text that reads back the same ("0.1", not 1E-1).
#pragma once

#include <boost/json/fwd.hpp>
#include <string>

namespace talix {

std::string jsonText(boost::json::value const& value);

}  // namespace talix
