#include <boost/json.hpp>
#include <cmath>

#include "app/InfoForms.h"
#include "io/TakeGaps.h"

namespace talix {

namespace {

namespace json = boost::json;

// Whole numbers without an exponent.
json::value jsonNumber(double value) {
  constexpr double kExact = 9007199254740992.0;
  if (value == std::floor(value) && std::abs(value) < kExact) return static_cast<int64>(value);
  return value;
}

template <class T, class Form>
json::array listOf(std::vector<T> const& items, Form form) {
  json::array list;
  list.reserve(items.size());
  for (T const& item : items) list.emplace_back(form(item));
  return list;
}

json::object marker(Take const& take, TakePoint const& point) {
  TakeGaps const gaps = gapsOf(take, point.positions);
  return {{"subject", printable(point.subject)},
          {"label", printable(point.label)},
          {"description", printable(point.description)},
          {"missingFrames", gaps.missing},
          {"gaps", gaps.count},
          {"longestGap", gaps.longest}};
}

json::object joint(TakeJoint const& joint) {
  constexpr char const* kOrders[] = {"XYZ", "XZY", "YXZ", "YZX", "ZXY", "ZYX"};
  return {{"name", printable(joint.name)},
          {"parent", joint.parent},
          {"endSite", joint.endSite},
          {"offset", {jsonNumber(joint.offset.x), jsonNumber(joint.offset.y), jsonNumber(joint.offset.z)}},
          {"rotationOrder", kOrders[joint.rotationOrder]},
          {"channels", listOf(joint.channels, shortChannel)}};
}

}  // namespace

json::object takeAsJson(Take const& take, std::string const& file) {
  json::object info;
  info["file"] = printable(file);
  info["format"] = take.format;
  info["variant"] = printable(take.variant);
  info["rate"] = jsonNumber(take.rate);
  info["frames"] = take.frameCount;
  info["firstFrame"] = take.firstFrame;
  info["seconds"] = jsonNumber(static_cast<double>(take.frameCount) / take.rate);
  info["unit"] = printable(take.fileUnit);
  info["unitInMillimetres"] = jsonNumber(take.unitInMillimetres);
  info["unitAssumed"] = take.unitAssumed;
  info["upAxis"] = std::string(1, "xyz"[static_cast<int>(take.up)]);
  info["upAxisAssumed"] = take.upAssumed;
  info["markers"] = listOf(take.points, [&](TakePoint const& point) { return marker(take, point); });
  info["outputs"] = listOf(take.outputs, [](ModelOutput const& output) -> json::object {
    return {
        {"name", printable(output.name)}, {"kind", printable(output.kind)}, {"unit", printable(output.unit)}};
  });
  info["analogRate"] = jsonNumber(take.analogRate);
  info["analog"] = listOf(take.analog, [](TakeAnalogChannel const& channel) -> json::object {
    return {{"name", printable(channel.name)},
            {"unit", printable(channel.unit)},
            {"description", printable(channel.description)},
            {"scale", jsonNumber(channel.scale)},
            {"offset", jsonNumber(channel.offset)}};
  });
  info["joints"] = listOf(take.joints, joint);
  info["events"] = listOf(take.events, [](TakeEvent const& event) -> json::object {
    return {{"seconds", jsonNumber(event.seconds)},
            {"label", printable(event.label)},
            {"context", printable(event.context)},
            {"subject", printable(event.subject)},
            {"description", printable(event.description)}};
  });
  info["notes"] = listOf(take.notes, [](TakeNote const& note) -> json::object {
    return {{"level", note.level == TakeNote::Level::Warning ? "warning" : "info"},
            {"text", printable(note.text)}};
  });
  return info;
}

}  // namespace talix
