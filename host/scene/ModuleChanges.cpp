// The mutators of a module: its name, its parent, what attributes and channels it has.
#include "host/scene/ChangeSetBuilder.h"
#include "host/scene/Database.h"
#include "host/scene/ModuleChildren.h"
#include "host/scene/SceneIndex.h"

// --- name ---

struct Module::NameChange : UndoChange {
  explicit NameChange(Module& concerned) : UndoChange(&concerned), module(concerned), name(module.m_name) {}
  void swap() override {
    HString now = module.m_name;
    module.storeName(name);
    name = std::move(now);
  }
  bool isVoid() const override { return name == module.m_name; }
  int64 memoryUse() const override {
    return static_cast<int64>(sizeof *this +
                              std::max(name.GetString().size(), module.m_name.GetString().size()));
  }

  void tell(ChangeSetBuilder& changes) const override { changes.tellName(module, name); }

  Module& module;
  HString name;
};

void Module::storeName(HString const& name) {
  if (isRecorded()) journal().add(std::make_unique<NameChange>(*this));
  bool const indexed = isInScene();
  HString given = name;
  if (indexed) m_database->getIndex().remove(this);
  m_name = std::move(given);
  if (indexed) m_database->getIndex().add(this);
}

// --- parent ---

struct Module::ParentChange : UndoChange {
  explicit ParentChange(Module& concerned)
      : UndoChange(&concerned), module(concerned), parent(module.m_parent), order(module.m_childOrder) {}
  void swap() override {
    Module* now = module.m_parent;
    uint64 const orderNow = module.m_childOrder;
    module.moveTo(parent, order);
    parent = now;
    order = orderNow;
  }
  int64 memoryUse() const override { return sizeof *this; }
  void tell(ChangeSetBuilder& changes) const override { changes.tellParent(module, parent); }

  Module& module;
  Module* parent;
  uint64 order;
};

void Module::storeParent(Module* parent) {
  if (isRecorded()) journal().add(std::make_unique<ParentChange>(*this));
  moveTo(parent, ++m_database->m_linked);
}

void Module::moveTo(Module* parent, uint64 order) {
  bool const indexed = isInScene();
  if (indexed) m_database->getIndex().remove(this);
  unlinkFromParent();
  m_parent = parent;
  m_childOrder = order;
  linkToParent();
  if (indexed) m_database->getIndex().add(this);
  Node::markMoved(this);
}

void Module::linkToParent() {
  if (!m_parent || m_childSlot != kNoSlot) return;
  auto const& siblings = m_parent->children().all;
  int const count = siblings.getCount();
  if (count > 0 && siblings.at(count - 1)->m_childOrder > m_childOrder) m_database->needsSorting(m_parent);
  m_parent->children().editFor(this, [this](auto& list) { list.append(this); });
}

void Module::unlinkFromParent() {
  if (m_parent && m_childSlot != kNoSlot)
    m_parent->children().editFor(this, [this](auto& list) { list.remove(this); });
}

void Module::sortChildren() {
  auto const earlier = [](Module const* a, Module const* b) { return a->m_childOrder < b->m_childOrder; };
  children().all.sort(earlier);
  children().nodes.sort(earlier);
  children().markers.sort(earlier);
}

// --- attributes and channels that a module has ---

// Of attributes (channels), the last one: later ones have gone before it.
template <class T>
struct Module::Addition : UndoChange {
  Addition(Module& concerned, std::vector<std::unique_ptr<T>>& list)
      : UndoChange(&concerned), module(concerned), items(list), before(list.size()) {}
  void swap() override {
    if (held) {
      items.push_back(std::move(held));
    } else if (items.size() > before) {
      held = std::move(items.back());
      items.pop_back();
    }
  }
  int64 memoryUse() const override { return sizeof *this + sizeof(T); }
  void tell(ChangeSetBuilder& changes) const override {
    if (items.size() > before) tell(changes, *items[before]);
  }
  void tell(ChangeSetBuilder& changes, Attribute const& added) const {
    changes.tell(SceneChange::Kind::attribute, &module, added.getName().GetString(), "",
                 textOf(added.getRawValue()), true);
  }
  void tell(ChangeSetBuilder& changes, Controller& added) const {
    changes.tell(SceneChange::Kind::created, &module, added.getName().GetString(), "", "", true);
  }

  Module& module;
  std::vector<std::unique_ptr<T>>& items;
  size_t before;  // how many there were
  std::unique_ptr<T> held;
};

void Module::storeAttribute(std::unique_ptr<Attribute> attribute) {
  if (isRecorded()) journal().add(std::make_unique<Addition<Attribute>>(*this, m_attributes));
  m_attributes.push_back(std::move(attribute));
}

void Module::storeChannel(std::unique_ptr<Controller> channel) {
  if (isRecorded()) journal().add(std::make_unique<Addition<Controller>>(*this, m_channels));
  m_channels.push_back(std::move(channel));
}

int64 Module::memoryUse() const {
  size_t bytes = sizeof(Node) + m_attributes.size() * (sizeof(StringAttribute) + sizeof(void*)) +
                 m_channels.size() * (sizeof(Vec3Controller) + sizeof(void*)) + m_name.GetString().size();
  int64 keys = 0;
  for (auto const& channel : m_channels) keys += channel->memoryAlone();
  return static_cast<int64>(bytes) + keys;
}
