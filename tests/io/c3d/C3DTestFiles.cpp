#include "tests/io/c3d/C3DTestFiles.h"

#include "host/time/Ticks.h"
#include "io/c3d/C3DParameterWriter.h"

namespace talix {

bool hasNote(const std::vector<TakeNote>& notes, TakeNote::Level level, const std::string& part) {
  for (const TakeNote& note : notes)
    if (note.level == level && note.text.find(part) != std::string::npos) return true;
  return false;
}

SmallC3D::SmallC3D() {
  parameters.groups = {{"POINT", "", {}}, {"ANALOG", "", {}}};
  set("POINT", integers("USED", {2}));
  set("POINT", reals("SCALE", {scale}));
  set("POINT", reals("RATE", {100}));
  set("POINT", integers("FRAMES", {4}));
  set("POINT", text("UNITS", "mm"));
}

void SmallC3D::set(const std::string& group, const C3DParameter& parameter) {
  for (C3DGroup& candidate : parameters.groups) {
    if (candidate.name != group) continue;
    std::erase_if(candidate.parameters, [&](const C3DParameter& old) { return old.name == parameter.name; });
    candidate.parameters.push_back(parameter);
    return;
  }
  parameters.groups.push_back({group, "", {parameter}});
}

std::string SmallC3D::bytes() const {
  const std::string section = c3dParameterSection(parameters);
  const size_t dataBlock = 2 + section.size() / kC3DBlock;
  std::string all = "\x02\x50";
  for (const int word : {2, channels * samplesPerFrame, headerFirst, headerLast, 0})
    appendC3DWord(all, static_cast<unsigned>(word));
  appendC3DReal(all, scale);
  appendC3DWord(all,
                headerDataBlock ? static_cast<unsigned>(headerDataBlock) : static_cast<unsigned>(dataBlock));
  appendC3DWord(all, static_cast<unsigned>(samplesPerFrame));
  appendC3DReal(all, 100);
  all.resize(kC3DBlock, '\0');
  all += section;
  std::string values = data;
  if (values.empty())
    for (int i = 0; i < frames * (8 + channels * samplesPerFrame); ++i)
      appendC3DWord(values, static_cast<unsigned>(i));
  values.resize((values.size() + kC3DBlock - 1) / kC3DBlock * kC3DBlock, '\0');
  return all + values;
}

C3DParameter integers(const std::string& name, const std::vector<double>& values) {
  return {name, C3DParameter::Type::Integer, {static_cast<int>(values.size())}, {}, values};
}

C3DParameter reals(const std::string& name, const std::vector<double>& values) {
  return {name, C3DParameter::Type::Real, {static_cast<int>(values.size())}, {}, values};
}

C3DParameter text(const std::string& name, const std::string& value) {
  return {name, C3DParameter::Type::Text, {static_cast<int>(value.size())}, value, {}};
}

Take movingPoints(int points, int64 frames, const std::function<bool(int, int64)>& seen) {
  Take take;
  take.rate = 100;
  take.firstFrame = 1;
  take.frameCount = frames;
  for (int p = 0; p < points; ++p) {
    TakePoint point;
    point.label = "M" + std::to_string(p);
    for (int64 f = 0; f < frames; ++f) {
      if (!seen(p, f)) continue;
      const double x = static_cast<double>(f % 1000), y = p;
      point.positions.set((f + take.firstFrame) * ticksPerFrameAt(take.rate), {x, y, 0.25 * x + 1});
    }
    take.points.push_back(std::move(point));
  }
  return take;
}

}  // namespace talix
