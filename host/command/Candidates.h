// The modules that a writer of properties works on: that of "-onMod", else all ("-all") or the selected ones,
// of which "-type" leaves those of exactly one class. The database owns them.
#pragma once

#include "host/command/Targets.h"

class Candidates {
 public:
  // The options' indices in a command's declaration.
  struct Options {
    int all, onMod, type;
  };
  // In the order given; of an option given several times each value must hold and the last counts. False,
  // with a message, for a path that names no module and for a name of no class.
  [[nodiscard]] bool read(Given const& given, Options const& options);

  // Null: the command works on every candidate.
  Module* getOnMod() const { return m_onMod; }
  // Whether there is any, whatever its class. Without one logs the message for "-all" or for the selection.
  [[nodiscard]] bool exist(char const* noModules, char const* noSelection) const;
  // Calls work(module) for each candidate of the class until it returns false; returns whether it never did.
  template <class Work>
  bool each(Work work) const {
    return eachModule(m_among, [&](Module& module) {
      return (m_class && module.getRuntimeClass() != m_class) || work(module);
    });
  }

 private:
  Module* m_onMod = nullptr;
  HRuntimeClass const* m_class = nullptr;  // null: any
  Among m_among = Among::selected;
};
