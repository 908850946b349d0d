// The host string: 8-bit text, used for every name, path and message.
#pragma once

#include <string>
#include <string_view>

#include "host/base/Types.h"

#if defined(__GNUC__)
#define TALIX_PRINTF(text, first) __attribute__((format(printf, text, first)))
#else
#define TALIX_PRINTF(text, first)
#endif

class HString {
 public:
  static HString const EMPTY_STRING;

  HString() = default;
  HString(HString const&) = default;
  HString(HString&&) noexcept = default;
  HString(char const* text) : m_text(text ? text : "") {}
  HString(std::string& text) : m_text(text) {}
  HString(std::string const& text) : m_text(text) {}
  HString(std::string&& text) noexcept : m_text(std::move(text)) {}
  explicit HString(std::string_view text) : m_text(text) {}
  HString& operator=(HString const&) = default;
  HString& operator=(HString&&) noexcept = default;
  HString const& operator=(char const* text) { return m_text = text ? text : "", *this; }
  HString const& operator=(std::string const& text) { return m_text = text, *this; }

  bool IsEmpty() const { return m_text.empty(); }
  int GetLength() const { return static_cast<int>(m_text.size()); }
  char const* GetStr() const { return m_text.c_str(); }
  std::string const& GetString() const { return m_text; }
  operator char const*() const { return m_text.c_str(); }
  char operator[](int i) const { return m_text[static_cast<size_t>(i)]; }
  char& operator[](int i) { return m_text[static_cast<size_t>(i)]; }

  // The first (last) `count` characters; the whole text when it is shorter.
  HString Left(uint64 count) const { return HString(std::string_view(m_text).substr(0, count)); }
  HString Right(uint64 count) const {
    return count >= m_text.size() ? *this : HString(std::string_view(m_text).substr(m_text.size() - count));
  }
  // Index of the last such character, -1 when there is none.
  int ReverseFind(char c) const;
  void MakeLower();
  // printf into this string.
  void Format(char const* format, ...) TALIX_PRINTF(2, 3);

  HString operator+(HString const& o) const { return HString(m_text + o.m_text); }
  HString operator+(char const* o) const { return HString(m_text + o); }
  HString const& operator+=(HString const& o) { return m_text += o.m_text, *this; }
  bool operator==(HString const& o) const { return m_text == o.m_text; }
  bool operator==(char const* o) const { return m_text == o; }
  bool operator!=(HString const& o) const { return m_text != o.m_text; }
  bool operator!=(char const* o) const { return m_text != o; }

 private:
  std::string m_text;
};

inline bool operator==(char const* a, HString const& b) { return b == a; }
