#include "tests/io/c3d/C3DTestFiles.h"

#include <algorithm>
#include <cmath>
#include <gtest/gtest.h>

#include "host/time/Ticks.h"
#include "io/c3d/C3DParameterWriter.h"

namespace talix {

bool hasNote(const std::vector<TakeNote>& notes, TakeNote::Level level, const std::string& part) {
  for (const TakeNote& note : notes)
    if (note.level == level && note.text.find(part) != std::string::npos) return true;
  return false;
}

void expectSameTrack(const KeyTrack& a, const KeyTrack& b, double tolerance, const std::string& what) {
  ASSERT_EQ(a.count(), b.count()) << what;
  for (int64 i = 0; i < a.count(); ++i) {
    const KeyTrack::Key x = a.at(i), y = b.at(i);
    ASSERT_EQ(x.time, y.time) << what << ", key " << i;
    for (size_t axis = 0; axis < static_cast<size_t>(a.width()); ++axis)
      ASSERT_NEAR(x.values[axis], y.values[axis], tolerance * std::max(1.0, std::abs(x.values[axis])))
          << what << ", key " << i;
  }
}

void expectSameTake(const Take& a, const Take& b, double tolerance) {
  EXPECT_EQ(a.rate, b.rate);
  EXPECT_EQ(a.firstFrame, b.firstFrame);
  EXPECT_EQ(a.frameCount, b.frameCount);
  EXPECT_EQ(a.fileUnit, b.fileUnit);
  EXPECT_EQ(a.unitInMillimetres, b.unitInMillimetres);
  EXPECT_EQ(a.up, b.up);
  EXPECT_EQ(a.analogRate, b.analogRate);
  ASSERT_EQ(a.points.size(), b.points.size());
  for (size_t i = 0; i < a.points.size(); ++i) {
    const TakePoint &x = a.points[i], &y = b.points[i];
    EXPECT_EQ(x.subject, y.subject);
    EXPECT_EQ(x.label, y.label);
    EXPECT_EQ(x.description, y.description);
    EXPECT_EQ(x.cameras, y.cameras) << x.label;
    expectSameTrack(x.positions, y.positions, tolerance, x.label);
    expectSameTrack(x.residuals, y.residuals, tolerance, "residuals of " + x.label);
  }
  ASSERT_EQ(a.outputs.size(), b.outputs.size());
  for (size_t i = 0; i < a.outputs.size(); ++i) {
    EXPECT_EQ(a.outputs[i].name, b.outputs[i].name);
    EXPECT_EQ(a.outputs[i].unit, b.outputs[i].unit);
    EXPECT_EQ(a.outputs[i].kind, b.outputs[i].kind);
    expectSameTrack(a.outputs[i].values, b.outputs[i].values, tolerance, a.outputs[i].name);
  }
  ASSERT_EQ(a.analog.size(), b.analog.size());
  for (size_t i = 0; i < a.analog.size(); ++i) {
    EXPECT_EQ(a.analog[i].name, b.analog[i].name);
    EXPECT_EQ(a.analog[i].unit, b.analog[i].unit);
    EXPECT_EQ(a.analog[i].description, b.analog[i].description);
    expectSameTrack(a.analog[i].samples, b.analog[i].samples, tolerance, a.analog[i].name);
  }
  ASSERT_EQ(a.events.size(), b.events.size());
  for (size_t i = 0; i < a.events.size(); ++i) {
    EXPECT_EQ(a.events[i].label, b.events[i].label);
    EXPECT_EQ(a.events[i].context, b.events[i].context);
    EXPECT_EQ(a.events[i].subject, b.events[i].subject);
    EXPECT_EQ(a.events[i].description, b.events[i].description);
    EXPECT_NEAR(a.events[i].seconds, b.events[i].seconds, 1e-5);
  }
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
