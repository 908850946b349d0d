// Keeping the motion of several nodes in one go (MotionKeeping.h): as long as a scope stands, all of them are
// kept as they moved at its first call, whatever the earlier calls have changed, so that a set of nodes with
// their descendants keeps its motion in whatever order it is gone through.
#pragma once

#include <map>
#include <memory>
#include <unordered_map>
#include <unordered_set>

#include "host/scene/SceneReader.h"

class MotionScope {
 public:
  // Scopes of one scene may stand inside each other: the outermost counts. Between its making and its end
  // nodes are hung elsewhere and kept in their motion, and not edited otherwise.
  explicit MotionScope(Database& scene);
  ~MotionScope();
  MotionScope(MotionScope const&) = delete;
  MotionScope& operator=(MotionScope const&) = delete;

 private:
  friend class MotionKeeper;
  friend class Node;

  // How the space of a former parent lies to that of a new one, in one clip (null: by default).
  struct Relation {
    struct Spaces {
      Transform from, to;
      bool operator==(Spaces const&) const = default;
    };
    Spaces spaces;             // the world transforms of the former and the new parent at time 0
    bool moves = false;        // else they lie so at all times
    bool scales = false;       // one of them, or what is above, is scaled
    std::vector<int64> times;  // of the keys of both and of what is above them
  };

  void start();  // at the first call
  // A node as it was at the first call; null: as it is now.
  NodeState const* former(Node const* node);
  Node const* formerParent(Node const* node) const;
  void remember(Node const& node);  // before it is changed
  NodeState stateOf(Node const& node) const;
  // `target` is looked at as it is now.
  Relation const& relation(Node const* parent, Node const* target, NLEClip const* clip);
  bool isFirstWarning(Node const& node) { return m_warned.insert(&node).second; }
  Database& getScene() const { return m_scene; }

  Database& m_scene;
  bool m_outermost;
  bool m_started = false;
  std::unordered_map<Node const*, Node const*> m_parents;  // of all nodes at the first call
  std::unordered_map<Node const*, NodeState> m_former;
  std::map<std::tuple<Node const*, Node const*, NLEClip const*>, Relation> m_relations;
  std::unordered_set<Node const*> m_warned;
};
