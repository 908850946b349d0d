// The program's own face towards the user: questions and settings. Safe from several threads.
#pragma once

#include <functional>
#include <optional>

#include "host/base/HString.h"
#include "host/services/HCriticalSection.h"
#include "host/services/Profile.h"
#include "host/services/ProfileValues.h"

class HInterface {
 public:
  // Puts a yes-or-no question to whoever answers those of the current scene; without anyone the answer is no.
  // Returns 1 for yes, 0 for no.
  int askQuestion(HString const& text, int buttons);
  void setAsker(std::function<bool(HString const&)> asker);

  // --- profile: settings by section and entry, in memory and in INI files ---
  //
  // An empty file name means the default profile, which is in memory and, once loadProfile has named a file,
  // there too; known settings (ProfileValues.h) read as their default in it while they are not set. Any other
  // file is read and written at each call. Names and texts compare exactly; blanks around them are dropped.

  // The value; `byDefault` when there is no such entry or, with a warning, when it is of another kind or
  // cannot be read.
  int getProfileInt(HString const& section, HString const& entry, int byDefault,
                    HString const& file = HString::EMPTY_STRING) const;
  double getProfileDouble(HString const& section, HString const& entry, double byDefault,
                          HString const& file = HString::EMPTY_STRING) const;
  // true, false, on, off, yes, no, 1, 0
  bool getProfileBool(HString const& section, HString const& entry, bool byDefault,
                      HString const& file = HString::EMPTY_STRING) const;
  HString getProfileString(HString const& section, HString const& entry, HString const& byDefault,
                           HString const& file = HString::EMPTY_STRING) const;

  // A known setting; its default, with a warning, when what is set is no such number or below the least.
  int getProfile(ProfileInt const& known) const;
  double getProfile(ProfileDouble const& known) const;

  // False, with a warning, when the value cannot be held (Profile::set) or its file cannot be written; one
  // that can be held then still counts in the default profile as long as the program runs.
  bool writeProfileInt(HString const& section, HString const& entry, int value,
                       HString const& file = HString::EMPTY_STRING);
  bool writeProfileDouble(HString const& section, HString const& entry, double value,
                          HString const& file = HString::EMPTY_STRING);
  bool writeProfileBool(HString const& section, HString const& entry, bool value,
                        HString const& file = HString::EMPTY_STRING);
  bool writeProfileString(HString const& section, HString const& entry, HString const& value,
                          HString const& file = HString::EMPTY_STRING);

  // Makes a file the default profile's and reads it when it exists. False, with a warning that names file and
  // line, when it cannot be read: the values stay as they were and are then kept in memory only.
  bool loadProfile(HString const& path);
  // Writes the default profile into a file. False, with a warning, when that fails.
  bool saveProfile(HString const& path) const;

 private:
  // The text that is set, or known by default; nothing when there is neither.
  std::optional<std::string> findProfileText(HString const& section, HString const& entry,
                                             HString const& file) const;

  HCriticalSection m_section;  // guards what follows
  Profile m_profile;
  std::string m_profileFile;  // empty: the default profile is in memory only
};

extern HInterface* g_interface;
