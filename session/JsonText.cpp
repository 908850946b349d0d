#include "session/JsonText.h"

#include <boost/json.hpp>

#include "session/ScriptText.h"

namespace talix {

namespace {

void append(boost::json::value const& value, std::string& out) {
  auto const appendAll = [&out](auto const& items, char open, char close, auto appendItem) {
    out += open;
    bool first = true;
    for (auto const& item : items) {
      if (!first) out += ',';
      first = false;
      appendItem(item);
    }
    out += close;
  };
  switch (value.kind()) {
    case boost::json::kind::double_: {
      Variable number;
      number.setValue(value.get_double(), -1);
      appendText(number, out);
      break;
    }
    case boost::json::kind::array:
      appendAll(value.get_array(), '[', ']', [&](auto const& item) { append(item, out); });
      break;
    case boost::json::kind::object:
      appendAll(value.get_object(), '{', '}', [&](auto const& item) {
        out += boost::json::serialize(item.key());
        out += ':';
        append(item.value(), out);
      });
      break;
    default:
      out += boost::json::serialize(value);
  }
}

}  // namespace

std::string jsonText(boost::json::value const& value) {
  std::string out;
  append(value, out);
  return out;
}

}  // namespace talix
