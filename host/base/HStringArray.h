// The host's array of strings.
#pragma once

#include "host/base/HString.h"
#include "host/base/TArray.h"

class HStringArray : public TArray<HString> {
 public:
  using TArray<HString>::TArray;

  // The pieces of `text` between any of the delimiter texts (the longest that fits wins), into `out`.
  // keepEmpty: pieces of no length count as well. trim: blanks and tabs around each piece are dropped.
  static void Tokenize(HString const& text, HStringArray const& delimiters, HStringArray& out, bool keepEmpty,
                       bool trim);
};
