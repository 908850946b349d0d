// The program's own face towards the user.
#pragma once

#include <functional>

#include "host/base/HString.h"

class HInterface {
 public:
  // Puts a yes-or-no question; without anyone to ask the answer is no. Answers 1 for yes, 0 for no.
  int askQuestion(HString const& text, int buttons);
  void setAsker(std::function<bool(HString const&)> asker) { m_asker = std::move(asker); }

 private:
  std::function<bool(HString const&)> m_asker;
};

extern HInterface* g_interface;
