// The steps of an undo journal one after the other, in few bytes.
//
// A step whose changes all fit into some bytes each (UndoChange::pack), as that of a key does, is a run of
// bytes: its name and the tracks that it concerns stand in tables, once for all steps. Any other step is an
// object, of which the run holds the address.
#pragma once

#include <cstring>
#include <deque>
#include <memory>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include "host/base/Types.h"

class Controller;
class Module;
class NLEClip;
class UndoChange;
using UndoChanges = std::vector<std::unique_ptr<UndoChange>>;

// Keeps a module alive, in the scene or out of it; null: nothing.
class ModuleHold {
 public:
  explicit ModuleHold(Module* module);
  ~ModuleHold();
  ModuleHold(ModuleHold const&) = delete;
  ModuleHold& operator=(ModuleHold const&) = delete;

 private:
  Module* m_module;
};

// One track of keys.
struct TrackName {
  Controller* channel;
  NLEClip* clip;
  int layer;
  bool operator==(TrackName const&) const = default;
};

// Values that stand once, however often they are used; Entry lives as long as its value is used.
template <class T, class Entry, class Hash>
class SharedTable {
 public:
  uint32 use(T const& value) {
    auto const [found, fresh] = m_numbers.try_emplace(value, static_cast<uint32>(m_slots.size()));
    if (!fresh) {
      ++m_slots[found->second].uses;
      return found->second;
    }
    try {
      auto entry = std::make_unique<Entry>(value);
      if (m_free.empty()) {
        if (m_free.capacity() <= m_slots.size()) m_free.reserve(2 * m_slots.size() + 8);  // for release()
        m_slots.push_back({std::move(entry), 1});
      } else {
        found->second = m_free.back();
        m_free.pop_back();
        m_slots[found->second] = {std::move(entry), 1};
      }
    } catch (...) {
      m_numbers.erase(found);
      throw;
    }
    return found->second;
  }
  Entry const& at(uint32 number) const { return *m_slots[number].entry; }
  void release(uint32 number) noexcept {
    if (--m_slots[number].uses > 0) return;
    m_free.push_back(number);
    m_numbers.erase(m_slots[number].entry->value);
    std::unique_ptr<Entry> const last = std::move(m_slots[number].entry);
  }

 private:
  struct Slot {
    std::unique_ptr<Entry> entry;
    uint64 uses;
  };
  std::vector<Slot> m_slots;
  std::vector<uint32> m_free;
  std::unordered_map<T, uint32, Hash> m_numbers;
};

// What steps share.
struct UndoTables {
  struct Name {
    explicit Name(std::string const& text) : value(text) {}
    std::string value;
  };
  struct Track {
    explicit Track(TrackName const& name);
    TrackName value;
    ModuleHold module;
  };
  struct TrackHash {
    size_t operator()(TrackName const& name) const {
      return std::hash<void const*>()(name.channel) * 31 + std::hash<void const*>()(name.clip) +
             static_cast<size_t>(name.layer);
    }
  };
  SharedTable<std::string, Name, std::hash<std::string>> names;
  SharedTable<TrackName, Track, TrackHash> tracks;
};

// Writes the bytes of one step, and reads them.
class PackedStep {
 public:
  explicit PackedStep(UndoTables& tables) : m_tables(tables) { m_bytes.reserve(kUsual); }
  PackedStep(UndoTables& tables, std::vector<unsigned char> bytes)
      : m_tables(tables), m_bytes(std::move(bytes)) {}
  // What was used is released unless it was kept.
  ~PackedStep() {
    if (m_hasName) m_tables.names.release(m_name);
    for (uint32 const track : m_tracks) m_tables.tracks.release(track);
  }
  PackedStep(PackedStep const&) = delete;
  PackedStep& operator=(PackedStep const&) = delete;

  template <class T>
  void put(T const& value) {
    auto const* bytes = reinterpret_cast<unsigned char const*>(&value);
    m_bytes.insert(m_bytes.end(), bytes, bytes + sizeof value);
  }
  void putName(std::string const& name) {
    m_name = m_tables.names.use(name);
    m_hasName = true;
    put(m_name);
  }
  void putTrack(TrackName const& track) {
    m_tracks.reserve(m_tracks.size() + 1);
    m_tracks.push_back(m_tables.tracks.use(track));
    put(m_tracks.back());
  }
  std::vector<unsigned char> const& bytes() const { return m_bytes; }
  void keep() {
    m_hasName = false;
    m_tracks.clear();
  }

  template <class T>
  T take() {
    T value;
    std::memcpy(&value, m_bytes.data() + m_read, sizeof value);
    m_read += sizeof value;
    return value;
  }
  // What is taken of the tables is released with this object, when it was not to stay.
  std::string const& takeName(bool toStay) {
    m_name = take<uint32>();
    m_hasName = !toStay;
    return m_tables.names.at(m_name).value;
  }
  TrackName const& takeTrack(bool toStay) {
    auto const track = take<uint32>();
    if (!toStay) m_tracks.push_back(track);
    return m_tables.tracks.at(track).value;
  }
  bool atEnd() const { return m_read == m_bytes.size(); }

 private:
  static constexpr size_t kUsual = 64;

  UndoTables& m_tables;
  std::vector<unsigned char> m_bytes;
  size_t m_read = 0;
  uint32 m_name = 0;
  bool m_hasName = false;
  std::vector<uint32> m_tracks;
};

class UndoSteps {
 public:
  explicit UndoSteps(UndoTables& tables) : m_tables(tables) {}
  ~UndoSteps() { clear(); }
  UndoSteps(UndoSteps const&) = delete;
  UndoSteps& operator=(UndoSteps const&) = delete;

  int getCount() const { return m_count; }
  int64 getMemory() const { return m_memory; }
  int64 getLastMemory() const;  // of the last step; there must be one

  // Adds a step and leaves `changes` empty. On an exception nothing has changed.
  void push(UndoChanges& changes, std::string const& name);
  // Takes the last step away; there must be one.
  UndoChanges pop(std::string& name);
  void dropFirst();
  void clear();
  // The changes of the last step, which stays; `unpacked` holds them when they are no objects.
  UndoChanges const* getLast(UndoChanges& unpacked) const;

 private:
  struct Object;
  using Length = unsigned short;
  static constexpr size_t kFrame = 2 * sizeof(Length);  // before and after each step

  void append(std::vector<unsigned char> const& bytes);
  std::vector<unsigned char> bytesOf(bool last) const;
  void erase(bool last, size_t size);
  UndoChanges unpack(PackedStep& step, bool toStay) const;
  static Object* objectIn(std::vector<unsigned char> const& bytes);  // null: the changes are in the bytes

  UndoTables& m_tables;
  std::deque<unsigned char> m_bytes;
  int m_count = 0;
  int64 m_memory = 0;
};
