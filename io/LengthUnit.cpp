#include <algorithm>
#include <cctype>
#include <string>

#include "io/TakeFormats.h"

namespace talix {

namespace {

struct UnitSpelling {
  char const* text;  // lower case, without a plural s
  double millimetres;
};

constexpr UnitSpelling kSpellings[] = {
    {"mm", 1},          {"millimetre", 1}, {"millimeter", 1},  {"cm", 10},         {"centimetre", 10},
    {"centimeter", 10}, {"dm", 100},       {"decimetre", 100}, {"decimeter", 100}, {"m", 1000},
    {"metre", 1000},    {"meter", 1000},   {"in", 25.4},       {"inch", 25.4},     {"inche", 25.4},
    {"ft", 304.8},      {"foot", 304.8},   {"feet", 304.8}};

}  // namespace

double millimetresPerUnit(std::string const& unit) {
  std::string word;
  for (unsigned char const c : unit)
    if (!std::isspace(c) && c != 0 && c != '.') word += static_cast<char>(std::tolower(c));
  if (word.size() > 2 && word.back() == 's') word.pop_back();
  auto const* found = std::find_if(std::begin(kSpellings), std::end(kSpellings),
                                   [&](UnitSpelling const& spelling) { return word == spelling.text; });
  return found == std::end(kSpellings) ? 0 : found->millimetres;
}

}  // namespace talix
