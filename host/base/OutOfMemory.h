// What a program does when memory runs out.
//
// Code here throws std::bad_alloc as everywhere. Only an undo step puts back what the exception left half
// done, so a program that keeps none asks to be ended by the first allocation that fails, before anything is
// torn.
#pragma once

// From now on an allocation by `new` that fails ends the program (endForLackOfMemory), except where a
// ThrowsBadAlloc lives. For programs; libraries leave the choice to them.
void endProgramWhenOutOfMemory();

// Ends the program at once: prints what standard output still holds, then one line; exit status 4. Destroys
// nothing and needs no memory.
[[noreturn]] void endForLackOfMemory();

// While one lives (and `throws`), a failed allocation of this thread throws std::bad_alloc: its owner can
// take back what was begun.
class ThrowsBadAlloc {
 public:
  explicit ThrowsBadAlloc(bool throws);
  ~ThrowsBadAlloc();
  ThrowsBadAlloc(ThrowsBadAlloc const&) = delete;
  ThrowsBadAlloc& operator=(ThrowsBadAlloc const&) = delete;

 private:
  bool m_throws;
};

// Some memory put aside for work that must be finished, such as taking back.
class MemoryReserve {
 public:
  MemoryReserve() = default;
  ~MemoryReserve() { release(); }
  MemoryReserve(MemoryReserve const&) = delete;
  MemoryReserve& operator=(MemoryReserve const&) = delete;

  // False when there is none to put aside.
  bool fill();
  // False when there was none.
  bool release();

 private:
  void* m_block = nullptr;
};

// While one lives, an allocation of this thread that fails is tried again with the reserve; when that does
// not help it ends the program, also where none has asked for that.
class MustFinish {
 public:
  explicit MustFinish(MemoryReserve& reserve);
  ~MustFinish();
  MustFinish(MustFinish const&) = delete;
  MustFinish& operator=(MustFinish const&) = delete;

 private:
  MemoryReserve* m_former;
};
