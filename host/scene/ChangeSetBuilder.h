// Collects what the changes of a step tell, from the last to the first, and makes the change set of it.
#pragma once

#include <map>
#include <string>
#include <tuple>

#include "host/keys/KeyTrack.h"
#include "host/scene/Attribute.h"
#include "host/scene/ChangeSet.h"
#include "host/scene/UndoSteps.h"

// Texts of states, as change sets give them.
std::string textOf(double number);
std::string textOf(Vec3 const& v);
std::string textOf(TalixRotation const& rotation);  // its quaternion
std::string textOf(Module const* module);           // its path, empty for none
std::string textOf(Attribute::Value const& value);
template <class List>
std::string textOfList(List const& list) {
  std::string text;
  for (auto const& each : list) text += (text.empty() ? "" : " ") + textOf(each);
  return text;
}

class ChangeSetBuilder {
 public:
  using Kind = SceneChange::Kind;

  // Something that has a text before and after, of a module or (null) of the scene.
  // differs: also where the texts are the same, as those of two modules with one path.
  void tell(Kind kind, Module const* module, std::string const& name, std::string before, std::string after,
            bool differs);
  void tell(Kind kind, Module const* module, std::string const& name, std::string const& before,
            std::string const& after) {
    tell(kind, module, name, before, after, before != after);
  }
  void tellName(Module const& module, HString const& before) { m_names[&module] = before; }
  void tellParent(Module const& module, Module const* before) { m_parents[&module] = before; }
  void tellMembership(Module const& module, bool before) { m_inScene[&module] = before; }
  // The keys of a track, which the teller brings back to what they were before his change.
  KeyTrack& keysBefore(Controller& channel, NLEClip* clip, int layer);
  // Every track that is known by now, or there, held no keys unless it is told again.
  void tellNoKeys(Controller& channel);

  ChangeSet finish();

 private:
  bool isNew(Module const* module) const;
  bool isOfNewChannel(Module const* module, Kind kind, std::string const& name) const;
  HString pathBefore(Module const* module) const;
  void add(SceneChange change, Module const* module);
  void addKeys(TrackName const& track, KeyTrack const& before);

  struct Text {
    std::string before, after;
    bool differs;
  };
  struct Less {
    bool operator()(TrackName const& a, TrackName const& b) const {
      return std::tie(a.channel, a.clip, a.layer) < std::tie(b.channel, b.clip, b.layer);
    }
  };
  std::map<std::tuple<Module const*, Kind, std::string>, Text> m_texts;
  std::map<Module const*, HString> m_names;
  std::map<Module const*, Module const*> m_parents;
  std::map<Module const*, bool> m_inScene;
  std::map<TrackName, KeyTrack, Less> m_tracks;
  ChangeSet m_set;
};
