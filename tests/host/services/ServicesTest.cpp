// Events, the operation stack, questions, the log.
#include <atomic>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <thread>

#include "host/base/Log.h"
#include "host/command/Command.h"
#include "host/services/HEvent.h"
#include "host/services/HInterface.h"
#include "host/services/OperationStack.h"

namespace {

using testing::ElementsAre;

class Numbered : public HEvent {
 public:
  explicit Numbered(int number) : m_number(number) {}
  std::unique_ptr<HEvent> clone() const override { return std::make_unique<Numbered>(*this); }
  int getNumber() const { return m_number; }

 private:
  int m_number;
};

class Refresh : public HDontSubmitIfAnotherQueuedEvent {
 public:
  std::unique_ptr<HEvent> clone() const override { return std::make_unique<Refresh>(*this); }
};

class Redraw : public HDontSubmitIfAnotherQueuedEvent {
 public:
  std::unique_ptr<HEvent> clone() const override { return std::make_unique<Redraw>(*this); }
};

class EventTest : public testing::Test {
 protected:
  EventTest() {
    g_eventManager->deliverQueued();
    m_listener = g_eventManager->addListener([this](HEvent const& event) {
      if (auto const* numbered = dynamic_cast<Numbered const*>(&event))
        m_numbers.push_back(numbered->getNumber());
      m_refreshes += dynamic_cast<Refresh const*>(&event) != nullptr;
      m_redraws += dynamic_cast<Redraw const*>(&event) != nullptr;
    });
  }
  ~EventTest() override { g_eventManager->removeListener(m_listener); }

  std::vector<int> m_numbers;
  int m_refreshes = 0, m_redraws = 0, m_listener = 0;
};

TEST_F(EventTest, AreDeliveredInOrderWhenAsked) {
  for (int i = 0; i < 3; ++i) HEventManager::safeSubmit(Numbered(i));
  EXPECT_TRUE(m_numbers.empty());
  EXPECT_TRUE(g_eventManager->submitImmediate(Numbered(9)));
  g_eventManager->deliverQueued();
  EXPECT_THAT(m_numbers, ElementsAre(9, 0, 1, 2));
  g_eventManager->removeListener(m_listener);
  EXPECT_FALSE(g_eventManager->submitImmediate(Numbered(1)));
}

TEST_F(EventTest, OneOfAClassIsPendingAtMost) {
  for (int i = 0; i < 3; ++i) HEventManager::safeSubmit(Refresh()), HEventManager::safeSubmit(Redraw());
  g_eventManager->deliverQueued();
  EXPECT_TRUE(m_refreshes == 1 && m_redraws == 1);
  HEventManager::safeSubmit(Refresh());
  g_eventManager->deliverQueued();
  EXPECT_EQ(m_refreshes, 2) << "the former one is no longer pending";
}

TEST_F(EventTest, ListenersMaySubmitAndLeave) {
  int own = 0, heard = 0;
  own = g_eventManager->addListener([&](HEvent const&) {
    if (++heard == 1) HEventManager::safeSubmit(Numbered(77));
    if (heard == 2) g_eventManager->removeListener(own);
  });
  HEventManager::safeSubmit(Numbered(1));
  g_eventManager->deliverQueued();
  HEventManager::safeSubmit(Numbered(2));
  g_eventManager->deliverQueued();
  EXPECT_EQ(heard, 2);
  EXPECT_THAT(m_numbers, ElementsAre(1, 77, 2));
}

TEST_F(EventTest, AreSubmittedFromAnyThread) {
  constexpr int kThreads = 4, kEach = 2000;
  std::atomic<int> running = kThreads;
  std::vector<std::jthread> threads;
  for (int thread = 0; thread < kThreads; ++thread)
    threads.emplace_back([&, thread] {
      for (int i = 0; i < kEach; ++i) {
        HEventManager::safeSubmit(Numbered(thread * kEach + i));
        HEventManager::safeSubmit(Refresh());
      }
      --running;
    });
  while (running) g_eventManager->deliverQueued();
  threads.clear();
  g_eventManager->deliverQueued();
  ASSERT_EQ(m_numbers.size(), size_t{kThreads * kEach});
  std::vector<int> next(kThreads);
  for (int const number : m_numbers) ASSERT_EQ(number % kEach, next[static_cast<size_t>(number / kEach)]++);
  EXPECT_TRUE(m_refreshes >= 1 && m_refreshes <= kThreads * kEach);
  int const before = m_refreshes;
  HEventManager::safeSubmit(Refresh());
  g_eventManager->deliverQueued();
  EXPECT_EQ(m_refreshes, before + 1) << "none is thought pending for ever";
}

TEST(OperationStack, TasksStandInsideEachOther) {
  OperationStack stack;
  std::vector<std::string> shown;
  stack.setDisplay([&](OperationStack::Task const* task) {
    shown.push_back(task ? task->caption.GetString() + std::to_string(task->position) : "done");
  });
  stack.popTask();
  stack.stepTask();
  stack.setTaskCaption("nobody");
  EXPECT_TRUE(shown.empty());
  EXPECT_TRUE(stack.pushTask(0, 10, 2, 4, true, "a"));
  stack.stepTask();
  EXPECT_TRUE(stack.pushTask(0, 5, 0, 1, false, "b"));
  stack.setTaskPos(3);
  stack.popTask();
  stack.setTaskCaption("c");
  EXPECT_EQ(stack.getNumTasks(), 1);
  stack.popTask();
  EXPECT_THAT(shown, ElementsAre("a2", "a6", "b0", "b3", "a6", "c6", "done"));
}

TEST(OperationStack, CancelLastsUntilReset) {
  OperationStack stack;
  stack.pushTask(0, 1, 0, 1, true, "a");
  std::jthread([&] { stack.cancel(); }).join();
  EXPECT_TRUE(stack.isCancelled());
  EXPECT_FALSE(stack.pushTask(0, 1, 0, 1, true, "b"));
  stack.reset();
  EXPECT_TRUE(!stack.isCancelled() && stack.getNumTasks() == 0);
  EXPECT_TRUE(stack.pushTask(0, 1, 0, 1, true, "c"));
}

TEST(Interface, WithoutAnyoneToAskTheAnswerIsNo) {
  EXPECT_EQ(g_interface->askQuestion("Sure?", 0), 0);
  std::string asked;
  g_interface->setAsker([&](HString const& text) { return asked = text.GetString(), true; });
  EXPECT_EQ(g_interface->askQuestion("Sure?", 0), 1);
  EXPECT_EQ(asked, "Sure?");
  g_interface->setAsker(nullptr);
}

class Lines : public LogSink {
 public:
  void write(LogLevel level, std::string_view text) override {
    lines.push_back(std::string(getLogLevelName(level)) + ": " + std::string(text));
  }
  std::vector<std::string> lines;
};

TEST(Log, LinesHaveLevelsAndAnyLength) {
  Lines sink;
  LogSink* former = setLogSink(&sink);
  Command::logError("%s  is not %d%%", "it", 5);
  Command::logWarning("%s", std::string(3000, 'x').c_str());
  Command::logInfo("plain");
  EXPECT_EQ(setLogSink(former), &sink);
  EXPECT_THAT(sink.lines,
              ElementsAre("error: it  is not 5%", "warning: " + std::string(3000, 'x'), "info: plain"));
}

}  // namespace
