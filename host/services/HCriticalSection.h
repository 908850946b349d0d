// A lock that one thread may take several times, and its holder for the length of a scope.
#pragma once

#include <mutex>

class HCriticalSection {
 public:
  HCriticalSection() = default;
  HCriticalSection(HCriticalSection const&) = delete;
  HCriticalSection& operator=(HCriticalSection const&) = delete;

  void lock() const { m_mutex.lock(); }
  void unlock() const { m_mutex.unlock(); }

 private:
  mutable std::recursive_mutex m_mutex;
};

class HLock {
 public:
  explicit HLock(HCriticalSection const& section) : m_section(section) { m_section.lock(); }
  ~HLock() { m_section.unlock(); }
  HLock(HLock const&) = delete;
  HLock& operator=(HLock const&) = delete;

 private:
  HCriticalSection const& m_section;
};
