#include "tests/io/c3d/C3DTestFiles.h"

#include "host/time/Ticks.h"
#include "io/c3d/C3DParameterWriter.h"

namespace talix {

bool hasNote(std::vector<TakeNote> const& notes, TakeNote::Level level, std::string const& part) {
  for (TakeNote const& note : notes)
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

void SmallC3D::set(std::string const& group, C3DParameter const& parameter) {
  for (C3DGroup& candidate : parameters.groups) {
    if (candidate.name != group) continue;
    std::erase_if(candidate.parameters, [&](C3DParameter const& old) { return old.name == parameter.name; });
    candidate.parameters.push_back(parameter);
    return;
  }
  parameters.groups.push_back({group, "", {parameter}});
}

std::string SmallC3D::bytes() const {
  std::string const section = c3dParameterSection(parameters);
  size_t const dataBlock = 2 + section.size() / kC3DBlock;
  std::string all = "\x02\x50";
  for (int const word : {2, channels * samplesPerFrame, headerFirst, headerLast, 0})
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

C3DParameter integers(std::string const& name, std::vector<double> const& values) {
  return {name, C3DParameter::Type::Integer, {static_cast<int>(values.size())}, {}, values};
}

C3DParameter reals(std::string const& name, std::vector<double> const& values) {
  return {name, C3DParameter::Type::Real, {static_cast<int>(values.size())}, {}, values};
}

C3DParameter text(std::string const& name, std::string const& value) {
  return {name, C3DParameter::Type::Text, {static_cast<int>(value.size())}, value, {}};
}

Take movingPoints(int points, int64 frames, std::function<bool(int, int64)> const& seen) {
  Take take;
  take.rate = 100;
  take.firstFrame = 1;
  take.frameCount = frames;
  for (int p = 0; p < points; ++p) {
    TakePoint point;
    point.label = "M" + std::to_string(p);
    for (int64 f = 0; f < frames; ++f) {
      if (!seen(p, f)) continue;
      double const x = static_cast<double>(f % 1000), y = p;
      point.positions.set((f + take.firstFrame) * ticksPerFrameAt(take.rate), {x, y, 0.25 * x + 1});
    }
    take.points.push_back(std::move(point));
  }
  return take;
}

}  // namespace talix
