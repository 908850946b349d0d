#include "host/scene/ChangeSetBuilder.h"

#include <algorithm>
#include <charconv>
#include <variant>

#include "host/keys/KeyDifference.h"
#include "host/scene/Database.h"

std::string textOf(double number) {
  char text[32];
  return {text, std::to_chars(text, text + sizeof text, number).ptr};
}

std::string textOf(Vec3 const& v) { return textOf(v.x) + " " + textOf(v.y) + " " + textOf(v.z); }

std::string textOf(TalixRotation const& rotation) {
  double q[4];
  rotation.getQuaternion(q);
  return textOfList(q);
}

std::string textOf(Module const* module) { return module ? module->getFullPathString().GetString() : ""; }

namespace {

struct ValueText {
  std::string operator()(std::monostate) const { return ""; }
  std::string operator()(bool value) const { return value ? "true" : "false"; }
  std::string operator()(int value) const { return std::to_string(value); }
  std::string operator()(int64 value) const { return std::to_string(value); }
  std::string operator()(HString const& text) const { return text.GetString(); }
  std::string operator()(Attribute::Bits const& bits) const {
    std::string text;
    for (bool const bit : bits) text += bit ? '1' : '0';
    return text;
  }
  std::string operator()(Attribute::Modules const& modules) const { return textOfList(modules); }
  std::string operator()(Matrix const& matrix) const {
    std::vector<double> values;
    for (uint64 row = 0; row < matrix.rows(); ++row)
      for (uint64 column = 0; column < matrix.cols(); ++column) values.push_back(matrix[row][column]);
    return textOfList(values);
  }
  template <class T>
  std::string operator()(T const& value) const {
    return textOf(value);
  }
};

}  // namespace

std::string textOf(Attribute::Value const& value) { return std::visit(ValueText(), value); }

void ChangeSetBuilder::tell(Kind kind, Module const* module, std::string const& name, std::string before,
                            std::string after, bool differs) {
  m_texts[{module, kind, name}] = {std::move(before), std::move(after), differs};
}

KeyTrack& ChangeSetBuilder::keysBefore(Controller& channel, NLEClip* clip, int layer) {
  TrackName const name{&channel, clip, layer};
  auto const known = m_tracks.find(name);
  if (known != m_tracks.end()) return known->second;
  KeyTrack const* now = channel.findTrack(clip, layer);
  return m_tracks.emplace(name, now ? *now : KeyTrack(Controller::shapeOf(channel.getPropertyType())))
      .first->second;
}

void ChangeSetBuilder::tellNoKeys(Controller& channel) {
  channel.forEachTrack([&](NLEClip* clip, int layer, KeyTrack const&) { keysBefore(channel, clip, layer); });
  for (auto& [name, track] : m_tracks)
    if (name.channel == &channel) track.clear();
}

HString ChangeSetBuilder::pathBefore(Module const* module) const {
  std::string path;
  while (module) {
    auto const name = m_names.find(module);
    auto const parent = m_parents.find(module);
    path = "\\" + (name == m_names.end() ? module->getName() : name->second).GetString() + path;
    module = parent == m_parents.end() ? module->getParent() : parent->second;
  }
  return HString(path);
}

// Came or went in this step, so that nothing else is told of it.
bool ChangeSetBuilder::isNew(Module const* module) const {
  auto const known = m_inScene.find(module);
  return !module->isInScene() || (known != m_inScene.end() && !known->second);
}

// A setting of a channel that came in this step.
bool ChangeSetBuilder::isOfNewChannel(Module const* module, Kind kind, std::string const& name) const {
  if (kind != Kind::byDefault && kind != Kind::attribute) return false;
  return m_texts.contains({module, Kind::created, name.substr(0, name.find('.'))});
}

void ChangeSetBuilder::add(SceneChange change, Module const* module) {
  if (module) {
    change.id = module->getID();
    change.path = change.kind == Kind::removed ? pathBefore(module) : module->getFullPathString();
  }
  m_set.push_back(std::move(change));
}

void ChangeSetBuilder::addKeys(TrackName const& track, KeyTrack const& before) {
  KeyTrack const* now = track.channel->findTrack(track.clip, track.layer);
  KeyTrack const none(before.shape());
  KeyDifference const difference = differenceOf(before, now ? *now : none);
  if (difference.added + difference.removed + difference.changed == 0) return;
  add({.kind = Kind::keys,
       .name = track.channel->getName(),
       .clip = track.clip->getID(),
       .layer = track.layer,
       .range = HTimeRange(difference.first, difference.last),
       .added = difference.added,
       .removed = difference.removed,
       .changed = difference.changed,
       .largest = difference.largest},
      track.channel->getModule());
}

ChangeSet ChangeSetBuilder::finish() {
  for (auto const& [module, before] : m_inScene)
    if (before != module->isInScene()) add({.kind = before ? Kind::removed : Kind::created}, module);
  for (auto const& [module, before] : m_names)
    if (!isNew(module) && before != module->getName())
      add({.kind = Kind::renamed, .before = before, .after = module->getName()}, module);
  for (auto const& [module, before] : m_parents) {
    Module const* now = module->getParent();
    if (isNew(module) || before == now) continue;
    add({.kind = Kind::parent,
         .before = pathBefore(before),
         .after = now ? now->getFullPathString() : HString()},
        module);
  }
  for (auto const& [key, text] : m_texts) {
    auto const& [module, kind, name] = key;
    if ((module && isNew(module)) || !text.differs || isOfNewChannel(module, kind, name)) continue;
    add({.kind = kind, .name = HString(name), .before = HString(text.before), .after = HString(text.after)},
        module);
  }
  for (auto const& [name, before] : m_tracks)
    if (!isNew(name.channel->getModule())) addKeys(name, before);
  std::stable_sort(m_set.begin(), m_set.end(), [](SceneChange const& a, SceneChange const& b) {
    return a.id.getNumber() < b.id.getNumber();
  });
  return std::move(m_set);
}
