// Generated text, written in the emitter as it will be in the output:
//
//   Write(out, R"(
//     struct $name$
//     {
//         $fields$
//         bool operator==($name$ const& _rhs) const { return true$equalities$; }
//     };
//   )", "name"_ = def.name, "fields"_([&] { WriteFields(out, def); }), "equalities"_ = equalities);
//
// The first line end, the margin (that of the first line with text) and the blanks of the last line are no part of the
// text; a text on one line is taken as it is. `$name$` is a hole. A hole that is alone on its line writes whole lines,
// indented by the blanks ahead of it: a text that gets its line end, and nothing at all when it is empty, or a function
// that writes line ends itself. Within a line the further lines of what fills a hole get the blanks of that line. An
// empty line gets the blanks of the line ahead of it, as within an IndentScope. A function is given by a call, since
// clang-format would move a text beside `= [&] {...}`. The text is parsed while compiling: a
// hole without a value or a value without a hole is an error there, named by one of the functions in `emission_error`.
//
// What several texts say is given once, and kept as it is then; each text takes of it what it has holes for:
//
//   const auto vars = WithVars(out, "name"_ = def.name, "type"_ = TypeText(type));
//   vars.Write("$type$ $name$() const { return $value$; }\n", "value"_ = value);
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <tuple>
#include <type_traits>
#include <utility>

#include "text/text_writer.h"

namespace qrex {

namespace emission_error {  // not constexpr: a call stops the compiler, which then shows its name
void HoleIsNotClosed();
void HoleWithoutValue();
void ValueWithoutHole();
void LineBeginsLeftOfMargin();
void TooManyPieces();
void TooManyBlanks();
}  // namespace emission_error

inline constexpr std::string_view kBlanks = "                                ";  // the deepest line of a text

template <size_t size>
struct HoleName {
  consteval HoleName(const char (&text)[size]) {
    for (size_t i = 0; i < size; ++i) name[i] = text[i];
  }
  constexpr std::string_view View() const { return {name, size - 1}; }
  char name[size]{};
};

template <HoleName name, typename T>
struct Hole {
  static constexpr std::string_view kName = name.View();
  const T& value;  // outlives the call of Write that it is an argument of
};

template <HoleName name>
struct NamedHole {
  template <typename T>
  constexpr Hole<name, T> operator=(const T& value) const {
    return {value};
  }
  template <typename WriteIt>
  constexpr Hole<name, WriteIt> operator()(const WriteIt& writeIt) const {
    return {writeIt};
  }
};

template <HoleName name>
constexpr NamedHole<name> operator""_() {
  return {};
}

// The pieces of a text: what is alike for all lists of holes, so that it is compiled once.
class TextPieces {
 public:
  // A part of the text, then a hole, if it is one.
  struct Piece {
    uint16_t begin = 0, length = 0;
    int8_t hole = -1;
    bool isLine = false;  // the hole is alone on its line
    uint8_t blanks = 0;   // that begin the line
  };

  std::string_view PartOf(const Piece& piece) const { return {m_text + piece.begin, piece.length}; }
  const Piece* begin() const { return m_pieces.data(); }
  const Piece* end() const { return m_pieces.data() + m_count; }

  // `names` ends with an empty one; the text must have holes for the first `required` of them.
  constexpr TextPieces(const char* raw, const std::string_view* names, size_t required) : m_names(names) {
    std::string_view text(raw);
    size_t margin = 0;
    if (text.starts_with('\n')) {
      text.remove_prefix(1);
      margin = MarginOf(text);
      while (text.ends_with(' ')) text.remove_suffix(1);
    }
    m_text = text.data();
    for (size_t begin = 0; begin < text.size();) {
      const size_t lineFeed = text.find('\n', begin);
      const size_t next = lineFeed == std::string_view::npos ? text.size() : lineFeed + 1;
      AddLine(text.substr(begin, next - begin), margin);
      begin = next;
    }
    for (size_t hole = 0; hole < required; ++hole) {
      if ((m_used >> hole & 1) == 0) emission_error::ValueWithoutHole();
    }
  }

 private:
  static constexpr size_t MarginOf(std::string_view text) {
    while (text.starts_with('\n')) text.remove_prefix(1);
    size_t margin = 0;
    while (margin < text.size() && text[margin] == ' ') ++margin;
    return margin;
  }

  constexpr void AddLine(std::string_view line, size_t margin) {
    for (; margin > 0 && !line.starts_with('\n'); --margin) {
      if (!line.starts_with(' ')) emission_error::LineBeginsLeftOfMargin();
      line.remove_prefix(1);
    }
    if (line == "\n") {
      Add({m_blanksAhead});
      return Add({line});
    }
    const size_t blanks = line.find_first_not_of(' ');
    m_blanksAhead = line.substr(0, blanks);
    if (m_blanksAhead.size() > kBlanks.size()) emission_error::TooManyBlanks();
    for (size_t open; (open = line.find('$')) != std::string_view::npos;) {
      const size_t close = line.find('$', open + 1);
      if (close == std::string_view::npos) emission_error::HoleIsNotClosed();
      const int8_t hole = HoleOf(line.substr(open + 1, close - open - 1));
      const std::string_view ahead = line.substr(0, open);
      line.remove_prefix(close + 1);
      if (ahead.data() == m_blanksAhead.data() && open == blanks && line == "\n") return Add({{}, hole, true});
      Add({ahead, hole});
    }
    Add({line});
  }

  constexpr int8_t HoleOf(std::string_view name) {
    int8_t hole = 0;
    while (!m_names[hole].empty() && m_names[hole] != name) ++hole;
    if (m_names[hole].empty()) emission_error::HoleWithoutValue();
    m_used |= uint64_t{1} << hole;
    return hole;
  }

  struct Found {
    std::string_view part;
    int8_t hole = -1;
    bool isLine = false;
  };
  constexpr void Add(Found found) {
    if (found.part.empty() && found.hole < 0) return;
    if (m_count == m_pieces.size()) emission_error::TooManyPieces();
    const auto begin = found.part.empty() ? 0 : static_cast<uint16_t>(found.part.data() - m_text);
    m_pieces[m_count++] = {static_cast<uint16_t>(begin), static_cast<uint16_t>(found.part.size()), found.hole,
                           found.isLine, static_cast<uint8_t>(m_blanksAhead.size())};
  }

  const char* m_text = nullptr;
  const std::string_view* m_names;
  uint64_t m_used = 0;
  std::string_view m_blanksAhead;
  size_t m_count = 0;
  std::array<Piece, 64> m_pieces{};
};

template <size_t required, typename... Holes>
struct TextRequiring {
  consteval TextRequiring(const char* raw) : pieces(raw, kNames, required) {}

  static constexpr std::string_view kNames[] = {Holes::kName..., {}};
  const TextPieces pieces;  // no base: clang 14 crashes on a constant of a derived class
};

// What else can fill a hole has an overload of its own, declared ahead of the emitter.
inline void WriteValue(TextWriter& out, std::string_view text) { out << text; }
inline void WriteValue(TextWriter& out, const std::string& text) { out << text; }
inline void WriteValue(TextWriter& out, const char* text) { out << text; }
template <typename T, typename = std::enable_if_t<std::is_integral_v<T>>>
void WriteValue(TextWriter& out, T value) {
  out << value;
}

// A text of several lines within a line that begins with blanks.
void WriteIndentedText(TextWriter& out, std::string_view text, size_t blanks);

template <typename T>
void FillHole(TextWriter& out, const T& value, bool isLine, size_t blanks) {
  const auto columns = static_cast<int64_t>(blanks);
  if constexpr (std::is_convertible_v<const T&, std::string_view>) {
    const std::string_view text(value);
    if (isLine && text.empty()) return;
    if (isLine) out << kBlanks.substr(0, blanks);
    WriteIndentedText(out, text, blanks);
    if (isLine) out << '\n';
  } else if constexpr (std::is_invocable_v<const T&>) {
    if (blanks == 0) return value();
    if (isLine) {
      const IndentScope lines(out, columns);
      value();
    } else {
      const LineRestScope rest(out, columns);
      value();
    }
  } else {
    if (isLine) out << kBlanks.substr(0, blanks);
    if (std::is_integral_v<T> || blanks == 0) {
      WriteValue(out, value);
    } else {
      const LineRestScope rest(out, columns);
      WriteValue(out, value);
    }
    if (isLine) out << '\n';
  }
}

template <typename... Holes>
using EmittedText = TextRequiring<sizeof...(Holes), Holes...>;

template <typename... Holes>
void WritePieces(TextWriter& out, const TextPieces& pieces, const Holes&... holes) {
  for (const auto& piece : pieces) {
    if (piece.length > 0) out << pieces.PartOf(piece);
    if (piece.hole < 0) continue;
    [[maybe_unused]] int index = 0;
    ((index++ == piece.hole ? FillHole(out, holes.value, piece.isLine, piece.blanks) : void()), ...);
  }
}

template <typename... Holes>
void Write(TextWriter& out, const std::type_identity_t<EmittedText<Holes...>>& text, const Holes&... holes) {
  WritePieces(out, text.pieces, holes...);
}

template <HoleName name, typename T>
struct KeptHole {
  static constexpr std::string_view kName = name.View();
  T value;
};

template <typename... Kept>
class VarScope {
 public:
  explicit VarScope(TextWriter& out, Kept... kept) : m_out(out), m_kept(std::move(kept)...) {}

  template <typename... Holes>
  void Write(const std::type_identity_t<TextRequiring<sizeof...(Holes), Holes..., Kept...>>& text,
             const Holes&... holes) const {
    std::apply([&](const Kept&... kept) { WritePieces(m_out, text.pieces, holes..., kept...); }, m_kept);
  }

 private:
  TextWriter& m_out;
  std::tuple<Kept...> m_kept;
};

template <HoleName... names, typename... T>
auto WithVars(TextWriter& out, const Hole<names, T>&... holes) {
  return VarScope(out, KeptHole<names, std::decay_t<const T&>>{holes.value}...);
}

// Fills a hole with all items, each by `writeOne`, with the separator between them.
template <typename Items, typename WriteOne>
auto Each(TextWriter& out, const Items& items, std::string_view separator, WriteOne writeOne) {
  return [&out, &items, separator, writeOne] {
    bool isFirst = true;
    for (const auto& item : items) {
      if (!isFirst) out << separator;
      isFirst = false;
      writeOne(item);
    }
  };
}

// Fills a hole only under a condition: else the text is empty, and the function writes nothing.
inline std::string_view If(bool condition, std::string_view text) { return condition ? text : std::string_view(); }
template <typename WriteIt, typename = std::enable_if_t<std::is_invocable_v<WriteIt>>>
auto If(bool condition, WriteIt write) {
  return [condition, write] {
    if (condition) write();
  };
}

}  // namespace qrex
