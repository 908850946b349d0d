#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <random>

#include "session/ScriptLine.h"
#include "session/ScriptRunner.h"
#include "session/ScriptText.h"

namespace talix {
namespace {

// A command that takes anything, so that a printed value can be read back.
class AnyCmd final : public ScriptCommand<AnyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "any",
      .displayName = "Any",
      .category = "Testing",
      .args = {"value ...", 0, ArgsInfo::kAny},
      .options = {{"number", 1, Variable::Float}, {"word", 1, Variable::String}}};
  bool execute(Given const&, Args const&, Variable&) override { return true; }
};

class ScriptTextTest : public testing::Test {
 protected:
  ScriptTextTest() { m_registry.add(&m_any, "test"); }

  ScriptLine::Outcome read(std::string const& text) { return m_line.read("any " + text, m_registry); }

  void expectRoundTrip(Variable const& value) {
    std::string const text = toText(value);
    ASSERT_EQ(read(text), ScriptLine::Outcome::Command) << text << ": " << m_line.problem();
    ASSERT_EQ(m_line.args().getCount(), 1) << text;
    Variable const& back = m_line.args()[0];
    EXPECT_EQ(back.getType(), value.getType()) << text;
    ASSERT_EQ(back.getNumItems(), value.getNumItems()) << text;
    for (int i = 0; i < value.getNumItems(); ++i) {
      EXPECT_STREQ(back.getStringValue(i), value.getStringValue(i)) << text;
      EXPECT_EQ(back.getVecValue(i), value.getVecValue(i)) << text;
      double const a = back.getFloatValue(i), b = value.getFloatValue(i);
      EXPECT_EQ(std::memcmp(&a, &b, sizeof a), 0) << text;
    }
  }

  double anyDouble() {
    double value;
    do {
      uint64 const bits = m_random();
      std::memcpy(&value, &bits, sizeof value);
    } while (!std::isfinite(value));
    // Half of them as people write numbers.
    return m_random() % 2 ? value : std::round(static_cast<double>(m_random() % 2000000) - 1e6) / 100;
  }

  // Texts of characters that mean something to the grammar, and of words that do.
  std::string anyText() {
    static constexpr char const* pieces[] = {"a",   "\\",   "\"", "'", "<", ">",  "[",  "]",
                                             "#",   " ",    "-",  ",", "1", ".",  "e5", "on",
                                             "nan", "true", "\t", "ä", "+", "inf"};
    std::string text;
    for (size_t count = m_random() % 6; count > 0; --count) text += pieces[m_random() % std::size(pieces)];
    return text;
  }

  std::mt19937_64 m_random{7};
  AnyCmd m_any;
  CommandRegistry m_registry;
  ScriptLine m_line;
};

TEST_F(ScriptTextTest, WhatIsPrintedReadsBackTheSame) {
  for (int i = 0; i < 20000 && !HasFailure(); ++i) {
    int const count = 1 + static_cast<int>(m_random() % 4);
    Variable texts(Variable::StringArray, count), numbers(Variable::FloatArray, count),
        vectors(Variable::VectorArray, count), booleans(Variable::BoolArray, count), number, vector, integer;
    for (int k = 0; k < count; ++k) {
      texts.setValue(anyText().c_str(), k);
      numbers.setValue(anyDouble(), k);
      vectors.setValue(Vec3(anyDouble(), anyDouble(), anyDouble()), k);
      booleans.setValue(static_cast<int>(m_random() % 3), k);
    }
    number.setValue(anyDouble(), -1);
    vector.setValue(Vec3(anyDouble(), anyDouble(), anyDouble()), -1);
    integer.setValue(static_cast<int>(static_cast<uint32>(m_random())), -1);
    for (Variable const& value : {texts, numbers, vectors, booleans, number, vector, integer})
      expectRoundTrip(value);
    std::string const text = anyText(), quoted = quotedText(text);
    ASSERT_EQ(read(quoted + " -word " + quoted), ScriptLine::Outcome::Command) << text;
    EXPECT_EQ(m_line.args()[0].getStringValue(-1), text);
    EXPECT_EQ(m_line.options()[0].getArg(0).getStringValue(-1), text);
  }
}

// Whatever the bytes, a line is read or refused with one clear text, and leaves nothing behind for the next
// one.
TEST_F(ScriptTextTest, AnyBytesAreReadOrRefused) {
  static constexpr std::string_view bytes = "any<>[]\"'#-, \t.0123456789eE+truenfi\\\r\n\0\xc3\xa4\xff";
  int refused = 0;
  for (int i = 0; i < 200000; ++i) {
    std::string line = m_random() % 4 ? "any " : "";
    for (size_t length = m_random() % 24; length > 0; --length)
      line += m_random() % 8 ? bytes[m_random() % bytes.size()] : static_cast<char>(m_random());
    ScriptLine::Outcome const outcome = m_line.read(line, m_registry);
    if (outcome != ScriptLine::Outcome::Refused) continue;
    ++refused;
    ASSERT_FALSE(m_line.problem().empty()) << line;
    ASSERT_TRUE(m_line.problem().starts_with("Column ") || m_line.problem().starts_with("Unknown ") ||
                m_line.problem().starts_with("Option -"))
        << m_line.problem();
  }
  EXPECT_GT(refused, 1000);
  EXPECT_EQ(read("1 -number 2"), ScriptLine::Outcome::Command);
  EXPECT_EQ(m_line.args().getCount(), 1);
  EXPECT_EQ(m_line.options().getCount(), 1);
}

TEST_F(ScriptTextTest, ColumnsCountCharactersAndZeroBytesAreRefused) {
  EXPECT_EQ(read("ääää <1 2>"), ScriptLine::Outcome::Refused);
  EXPECT_EQ(m_line.problem(), "Column 10: a vector holds three numbers");
  EXPECT_EQ(read(std::string("a\0b", 3)), ScriptLine::Outcome::Refused);
  EXPECT_EQ(m_line.problem(), "Column 6: a zero byte cannot be part of a script");
  EXPECT_EQ(read(std::string("# \0", 3)), ScriptLine::Outcome::Refused);
}

TEST_F(ScriptTextTest, LineEndsAndTabsAreBlanks) {
  EXPECT_EQ(m_line.read("\tany\t1\t<1\t2,\t3>\r", m_registry), ScriptLine::Outcome::Command);
  EXPECT_EQ(m_line.args().getCount(), 2);
  EXPECT_EQ(m_line.read("\r", m_registry), ScriptLine::Outcome::Blank);
}

TEST(UsesUndo, FindsTheLinesThatNameIt) {
  EXPECT_TRUE(usesUndo("select a\n  undo 3"));
  EXPECT_TRUE(usesUndo("\tredo\r\n"));
  EXPECT_FALSE(usesUndo("# undo\nselect undo\nundoing\n\n"));
  EXPECT_FALSE(usesUndo(""));
}

}  // namespace
}  // namespace talix
