#include <algorithm>
#include <charconv>
#include <cmath>

#include "app/InfoForms.h"
#include "io/TakeGaps.h"

namespace talix {

namespace {

constexpr size_t kLineWidth = 100;
constexpr size_t kHeadWidth = 10;  // of the words before the first lines' values

constexpr char const* kAxisNames[] = {"x", "y", "z"};

// How many characters a UTF-8 text shows.
size_t widthOf(std::string_view text) {
  return static_cast<size_t>(
      std::count_if(text.begin(), text.end(), [](char c) { return (c & 0xc0) != 0x80; }));
}

std::string padded(std::string const& text, size_t width, bool toTheRight = false) {
  std::string const blanks(width - std::min(width, widthOf(text)), ' ');
  return toTheRight ? blanks + text : text + blanks;
}

// At most so many decimals, no zeros at the end.
std::string number(double value, int decimals = 3) {
  char digits[400];
  char* end = std::to_chars(digits, std::end(digits), value, std::chars_format::fixed, decimals).ptr;
  if (decimals > 0) {
    while (end[-1] == '0') --end;
    if (end[-1] == '.') --end;
  }
  return {digits, end};
}

std::string percent(int64 part, int64 whole) {
  char digits[32];
  double const value = whole ? 100.0 * static_cast<double>(part) / static_cast<double>(whole) : 0;
  return {digits, std::to_chars(digits, std::end(digits), value, std::chars_format::fixed, 1).ptr};
}

std::string counted(size_t count, std::string const& noun) {
  return std::to_string(count) + " " + noun + (count == 1 ? "" : "s");
}

// Lines of cells below a heading; each column is as wide as its widest cell.
class Table {
 public:
  explicit Table(std::vector<bool> toTheRight)
      : m_toTheRight(std::move(toTheRight)), m_widths(m_toTheRight.size()) {}

  void add(std::vector<std::string> row) {
    for (size_t i = 0; i < row.size(); ++i) m_widths[i] = std::max(m_widths[i], widthOf(row[i]));
    m_rows.push_back(std::move(row));
  }
  void appendTo(std::string& text, size_t indent) const {
    for (auto const& row : m_rows) {
      std::string line(indent, ' ');
      for (size_t i = 0; i < row.size(); ++i) {
        if (i > 0) line += m_toTheRight[i] ? "  " : "   ";
        line += padded(row[i], m_widths[i], m_toTheRight[i]);
      }
      line.erase(line.find_last_not_of(' ') + 1);
      text += line + "\n";
    }
  }

 private:
  std::vector<bool> m_toTheRight;
  std::vector<size_t> m_widths;
  std::vector<std::vector<std::string>> m_rows;
};

class TakeText {
 public:
  explicit TakeText(Take const& take) : m_take(take) {}

  std::string make(std::string const& file) {
    m_text = printable(file) + "\n";
    addHead();
    addMarkers();
    addGaps();
    addOutputs();
    addAnalog();
    addSkeleton();
    addEvents();
    addNotes();
    return std::move(m_text);
  }

 private:
  void head(char const* what, std::string const& value) {
    m_text += "  " + padded(what, kHeadWidth) + value + "\n";
  }
  void section(std::string const& title) { m_text += "\n  " + title + "\n"; }

  void addHead() {
    head("format", m_take.format + (m_take.variant.empty() ? "" : ", " + printable(m_take.variant)));
    int64 const last = m_take.firstFrame + m_take.frameCount - 1;
    std::string frames = std::to_string(m_take.frameCount);
    if (m_take.frameCount > 0)
      frames += " (" + std::to_string(m_take.firstFrame) + " to " + std::to_string(last) + ")";
    head("frames", frames + " at " + number(m_take.rate, 4) + " a second, " +
                       number(static_cast<double>(m_take.frameCount) / m_take.rate) + " s");
    head("unit", printable(m_take.fileUnit) + (m_take.unitAssumed ? " (assumed)" : ""));
    head("up axis",
         std::string(kAxisNames[static_cast<int>(m_take.up)]) + (m_take.upAssumed ? " (assumed)" : ""));
    if (!m_take.points.empty()) head("markers", markerCounts());
  }

  std::string markerCounts() const {
    auto const unlabelled = static_cast<size_t>(std::count_if(
        m_take.points.begin(), m_take.points.end(), [](TakePoint const& p) { return p.label.empty(); }));
    size_t const labelled = m_take.points.size() - unlabelled;
    std::string text = std::to_string(labelled) + " labelled";
    if (unlabelled) text += ", " + std::to_string(unlabelled) + " unlabelled";
    auto const named = subjects();
    if (auto const count = static_cast<size_t>(
            std::count_if(named.begin(), named.end(), [](std::string const& name) { return !name.empty(); })))
      text += ", " + counted(count, "subject");
    return text;
  }

  // In the order of the file; empty for what has none.
  std::vector<std::string> subjects() const {
    std::vector<std::string> names;
    for (TakePoint const& point : m_take.points)
      if (!point.label.empty() && std::find(names.begin(), names.end(), point.subject) == names.end())
        names.push_back(point.subject);
    return names;
  }

  void addMarkers() {
    auto const names = subjects();
    for (std::string const& subject : names) {
      std::vector<std::string> labels;
      for (TakePoint const& point : m_take.points)
        if (!point.label.empty() && point.subject == subject) labels.push_back(printable(point.label));
      std::string title = "markers";
      if (!subject.empty()) title += " of " + printable(subject);
      if (subject.empty() && names.size() > 1) title += " of no subject";
      section(title + " (" + std::to_string(labels.size()) + ")");
      addColumns(labels);
    }
  }

  // Row by row, as many columns as fit.
  void addColumns(std::vector<std::string> const& words) {
    constexpr size_t kIndent = 4, kBetween = 2;
    size_t widest = 1;
    for (std::string const& word : words) widest = std::max(widest, widthOf(word));
    size_t const columns = std::max<size_t>(1, (kLineWidth - kIndent + kBetween) / (widest + kBetween));
    for (size_t i = 0; i < words.size(); ++i) {
      if (i % columns == 0) m_text += std::string(kIndent, ' ');
      bool const ends = i + 1 == words.size() || (i + 1) % columns == 0;
      m_text += ends ? words[i] + "\n" : padded(words[i], widest + kBetween);
    }
  }

  void addGaps() {
    if (m_take.points.empty() || m_take.frameCount == 0) return;
    struct Row {
      TakePoint const* point;
      TakeGaps gaps;
    };
    std::vector<Row> rows;
    size_t complete = 0, unlabelled = 0;
    TakeGaps ofUnlabelled;
    for (TakePoint const& point : m_take.points) {
      TakeGaps const gaps = gapsOf(m_take, point.positions);
      if (point.label.empty()) {
        ++unlabelled;
        ofUnlabelled.missing += gaps.missing;
        ofUnlabelled.count += gaps.count;
        ofUnlabelled.longest = std::max(ofUnlabelled.longest, gaps.longest);
      } else if (gaps.count == 0) {
        ++complete;
      } else {
        rows.push_back({&point, gaps});
      }
    }
    if (rows.empty() && ofUnlabelled.count == 0) {
      section("gaps: none");
      return;
    }
    std::stable_sort(rows.begin(), rows.end(),
                     [](Row const& a, Row const& b) { return a.gaps.missing > b.gaps.missing; });
    section("gaps");
    bool const withSubject = subjects().size() > 1;
    Table table({false, true, true, true, true});
    table.add({"marker", "frames missing", "%", "gaps", "longest"});
    auto const addRow = [&](std::string const& name, TakeGaps const& gaps, int64 frames) {
      table.add({name, std::to_string(gaps.missing), percent(gaps.missing, frames),
                 std::to_string(gaps.count), std::to_string(gaps.longest)});
    };
    for (Row const& row : rows)
      addRow(
          printable(withSubject && !row.point->subject.empty() ? row.point->subject + ":" + row.point->label
                                                               : row.point->label),
          row.gaps, m_take.frameCount);
    if (ofUnlabelled.count)
      addRow(std::to_string(unlabelled) + " unlabelled", ofUnlabelled,
             static_cast<int64>(unlabelled) * m_take.frameCount);
    table.appendTo(m_text, 4);
    if (complete)
      m_text +=
          "    " + std::to_string(complete) + (complete == 1 ? " marker is" : " markers are") + " complete\n";
  }

  void addOutputs() {
    std::vector<std::string> kinds;
    for (ModelOutput const& output : m_take.outputs)
      if (std::find(kinds.begin(), kinds.end(), output.kind) == kinds.end()) kinds.push_back(output.kind);
    for (std::string const& kind : kinds) {
      std::vector<std::string> names;
      std::string unit;
      for (ModelOutput const& output : m_take.outputs)
        if (output.kind == kind) names.push_back(printable(output.name)), unit = output.unit;
      std::string title = kind.empty() ? "outputs" : printable(kind);
      std::transform(title.begin(), title.end(), title.begin(),
                     [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
      section(title + (unit.empty() ? "" : " in " + printable(unit)) + " (" + std::to_string(names.size()) +
              ")");
      addColumns(names);
    }
  }

  void addAnalog() {
    if (m_take.analog.empty()) return;
    std::vector<std::string> names;
    for (TakeAnalogChannel const& channel : m_take.analog)
      names.push_back((channel.name.empty() ? "(no name)" : printable(channel.name)) +
                      (channel.unit.empty() ? "" : " [" + printable(channel.unit) + "]"));
    section("analog channels (" + std::to_string(names.size()) + ") at " + number(m_take.analogRate) +
            " a second");
    addColumns(names);
  }

  void addSkeleton() {
    if (m_take.joints.empty()) return;
    std::vector<size_t> depths, ends(m_take.joints.size());
    size_t endSites = 0, channels = 0;
    for (TakeJoint const& joint : m_take.joints) {
      auto const parent = static_cast<size_t>(joint.parent);
      depths.push_back(joint.parent < 0 ? 0 : depths[parent] + 1);
      channels += joint.channels.size();
      if (!joint.endSite) continue;
      ++endSites;
      if (joint.parent >= 0) ++ends[parent];
    }
    section("skeleton: " + counted(m_take.joints.size() - endSites, "joint") + ", " +
            counted(endSites, "end site") + ", " + counted(channels, "channel"));
    Table table({false, false, false});
    for (size_t i = 0; i < m_take.joints.size(); ++i) {
      TakeJoint const& joint = m_take.joints[i];
      if (joint.endSite) continue;
      std::string moves;
      for (std::string const& channel : joint.channels)
        moves += (moves.empty() ? "" : " ") + shortChannel(channel);
      table.add({std::string(2 * depths[i], ' ') + printable(joint.name), moves,
                 ends[i] == 0   ? ""
                 : ends[i] == 1 ? "end"
                                : std::to_string(ends[i]) + " ends"});
    }
    table.appendTo(m_text, 4);
  }

  void addEvents() {
    if (m_take.events.empty()) return;
    std::vector<TakeEvent const*> events;
    for (TakeEvent const& event : m_take.events) events.push_back(&event);
    std::stable_sort(events.begin(), events.end(),
                     [](TakeEvent const* a, TakeEvent const* b) { return a->seconds < b->seconds; });
    section("events (" + std::to_string(events.size()) + ")");
    Table table({true, false, false, false, false});
    for (TakeEvent const* event : events) {
      char digits[400];
      std::string const seconds(
          digits, std::to_chars(digits, std::end(digits), event->seconds, std::chars_format::fixed, 3).ptr);
      table.add({seconds + " s", printable(event->label), printable(event->context),
                 printable(event->subject), printable(event->description)});
    }
    table.appendTo(m_text, 4);
  }

  void addNotes() {
    if (m_take.notes.empty()) return;
    section("notes");
    for (TakeNote const& note : m_take.notes)
      m_text += std::string("    ") + (note.level == TakeNote::Level::Warning ? "warning: " : "") +
                printable(note.text) + "\n";
  }

  Take const& m_take;
  std::string m_text;
};

}  // namespace

std::string takeAsText(Take const& take, std::string const& file) { return TakeText(take).make(file); }

}  // namespace talix
