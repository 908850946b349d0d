#include "session/hostcommands/UndoSteps.h"

#include "host/scene/Database.h"

namespace talix {

bool isStepCount(Args const& args) {
  return args.getCount() == 0 ||
         (args.getCount() == 1 && args[0].getType() == Variable::Int && args[0].getIntValue(-1) >= 1);
}

void goSteps(Args const& args, bool (UndoJournal::*go)(HString&), char const* name, char const* done) {
  int const wanted = args.getCount() ? args[0].getIntValue(-1) : 1;
  int count = 0;
  HString step;
  while (count < wanted && (g_db->getUndoJournal().*go)(step)) ++count;
  if (count == 1)
    writeLog(LogLevel::Info, std::string(done) + ": " + step.GetString());
  else if (count > 1)
    writeLog(LogLevel::Info, std::string(done) + " " + std::to_string(count) + " steps");
  if (count == 0)
    writeLog(LogLevel::Warning, std::string("There is nothing to ") + name + ".");
  else if (count < wanted)
    writeLog(LogLevel::Warning, std::string("There is nothing more to ") + name + ".");
}

}  // namespace talix
