#include "host/scene/UndoSteps.h"

#include <algorithm>

#include "host/scene/Database.h"

ModuleHold::ModuleHold(Module* module) : m_module(module) {
  if (m_module) ++m_module->m_undoHolds;
}

ModuleHold::~ModuleHold() {
  if (m_module && --m_module->m_undoHolds == 0 && !m_module->isInScene()) delete m_module;
}

UndoTables::Track::Track(TrackName const& name) : value(name), module(name.channel->getModule()) {}

namespace {

enum StepKind : unsigned char { kObject, kPacked };

}  // namespace

struct UndoSteps::Object {
  std::string name;
  int64 memory;
  UndoChanges changes;
};

void UndoSteps::push(UndoChanges& changes, std::string const& name) {
  PackedStep step(m_tables);
  if (std::all_of(changes.begin(), changes.end(), [](auto const& change) { return change->isSmall(); })) {
    step.put(kPacked);
    step.putName(name);
    for (auto const& change : changes) change->pack(step);
    if (step.bytes().size() <= 0xffff) {
      append(step.bytes());
      step.keep();
      m_memory += static_cast<int64>(step.bytes().size() + kFrame);
      changes.clear();
      return;
    }
  }
  auto object = std::make_unique<Object>(Object{name, 0, {}});
  object->memory = static_cast<int64>(sizeof(Object) + changes.size() * sizeof changes[0]);
  for (auto const& change : changes) object->memory += change->memoryUse();
  PackedStep whole(m_tables);
  whole.put(kObject);
  whole.put(object.get());
  append(whole.bytes());
  m_memory += object->memory;
  object.release()->changes.swap(changes);
}

void UndoSteps::append(std::vector<unsigned char> const& bytes) {
  unsigned char size[sizeof(Length)];
  auto const length = static_cast<Length>(bytes.size());
  std::memcpy(size, &length, sizeof size);
  size_t const before = m_bytes.size();
  try {
    m_bytes.insert(m_bytes.end(), size, size + sizeof size);
    m_bytes.insert(m_bytes.end(), bytes.begin(), bytes.end());
    m_bytes.insert(m_bytes.end(), size, size + sizeof size);
  } catch (...) {
    m_bytes.resize(before);
    throw;
  }
  ++m_count;
}

std::vector<unsigned char> UndoSteps::bytesOf(bool last) const {
  unsigned char length[sizeof(Length)];
  std::copy_n(last ? m_bytes.end() - sizeof length : m_bytes.begin(), sizeof length, length);
  Length size;
  std::memcpy(&size, length, sizeof size);
  auto const from = last ? m_bytes.end() - static_cast<std::ptrdiff_t>(sizeof size + size)
                         : m_bytes.begin() + static_cast<std::ptrdiff_t>(sizeof size);
  return {from, from + size};
}

int64 UndoSteps::getLastMemory() const {
  std::vector<unsigned char> const bytes = bytesOf(true);
  Object const* object = objectIn(bytes);
  return object ? object->memory : static_cast<int64>(bytes.size() + kFrame);
}

void UndoSteps::erase(bool last, size_t size) {
  auto const whole = static_cast<std::ptrdiff_t>(size + kFrame);
  last ? m_bytes.erase(m_bytes.end() - whole, m_bytes.end())
       : m_bytes.erase(m_bytes.begin(), m_bytes.begin() + whole);
  --m_count;
}

UndoSteps::Object* UndoSteps::objectIn(std::vector<unsigned char> const& bytes) {
  if (bytes[0] != kObject) return nullptr;
  Object* object;
  std::memcpy(&object, bytes.data() + 1, sizeof object);
  return object;
}

UndoChanges UndoSteps::unpack(PackedStep& step, bool toStay) const {
  UndoChanges changes;
  while (!step.atEnd()) changes.push_back(Controller::unpackKeys(step.takeTrack(toStay), step));
  return changes;
}

UndoChanges UndoSteps::pop(std::string& name) {
  std::vector<unsigned char> bytes = bytesOf(true);
  size_t const size = bytes.size();
  if (Object* object = objectIn(bytes)) {
    std::unique_ptr<Object> const owned(object);
    erase(true, size);
    m_memory -= owned->memory;
    name = std::move(owned->name);
    return std::move(owned->changes);
  }
  PackedStep step(m_tables, std::move(bytes));
  step.take<unsigned char>();
  name = step.takeName(false);
  UndoChanges changes = unpack(step, false);
  erase(true, size);
  m_memory -= static_cast<int64>(size + kFrame);
  return changes;
}

void UndoSteps::dropFirst() {
  std::vector<unsigned char> bytes = bytesOf(false);
  size_t const size = bytes.size();
  if (Object* object = objectIn(bytes)) {
    m_memory -= object->memory;
    delete object;
  } else {
    PackedStep step(m_tables, std::move(bytes));
    step.take<unsigned char>();
    step.takeName(false);
    unpack(step, false);
    m_memory -= static_cast<int64>(size + kFrame);
  }
  erase(false, size);
}

void UndoSteps::clear() {
  while (m_count > 0) dropFirst();
}

UndoChanges const* UndoSteps::getLast(UndoChanges& unpacked) const {
  std::vector<unsigned char> bytes = bytesOf(true);
  if (Object* object = objectIn(bytes)) return &object->changes;
  PackedStep step(m_tables, std::move(bytes));
  step.take<unsigned char>();
  step.takeName(true);
  unpacked = unpack(step, true);
  return &unpacked;
}
