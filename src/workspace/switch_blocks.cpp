#include "workspace/switch_blocks.h"

#include <algorithm>

#include "lex/literals.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

namespace {

constexpr std::string_view kNoInherit = "$(NOINHERIT)";
constexpr std::string_view kDefaultThroughHeader = "./$(CONFIG)/$(PROJNAME)/$(PROJNAME).h";
constexpr std::string_view kAdditionalOptions = "AdditionalOptions";

void AppendText(std::string& text, std::string_view more) {
  if (!text.empty()) text += ' ';
  text += more;
}

// A value text such as "2"; an item such as "3rdparty" is none.
bool IsNonZeroInteger(const std::string& text) {
  int64_t value;
  std::string error;
  return ParseNumber(text, value, error) && value != 0;
}

bool BeginsWithAny(std::string_view text, std::span<const std::string_view> prefixes) {
  return std::any_of(prefixes.begin(), prefixes.end(),
                     [&](std::string_view prefix) { return text.substr(0, prefix.size()) == prefix; });
}

// Reads the switches of one block into the entries of its changes.
class SwitchReader {
 public:
  SwitchReader(MpfwParser& parser, SwitchChanges& changes) : m_parser(parser), m_changes(changes) {}

  void ReadBlock(bool (SwitchReader::*readSwitch)()) {
    Require(kOpenBrace, "Expected '{' when read ");
    while ((this->*readSwitch)()) {
    }
    Require(kCloseBrace, "Expected '}' when read ");
  }

  bool ReadCompilerSwitch();
  bool ReadResourceSwitch();

 private:
  int32_t Kind() const { return m_parser.current.kind; }
  std::string& Entry(std::string_view property) { return m_changes.entries[std::string(property)]; }
  [[noreturn]] void Fail(std::string message) const { throw LexScannerException(std::move(message), m_parser.current); }
  [[noreturn]] void FailAtSwitch(std::string message) const { throw LexScannerException(std::move(message), m_switch); }

  void Require(int32_t kind, std::string_view message) {
    if (Kind() != kind) Fail(std::string(message) + Printed(m_parser.current));
    m_parser.Advance();
  }

  std::string ReadValue() {
    std::string value;
    m_parser.ReadString(value);
    m_parser.Advance();
    return value;
  }

  std::string ReadSwitchText();
  void ReadColonPart(const char*& end);
  void ReadPrecompiledHeader(char which);
  void ReadDisabledWarning(const std::string& text);

  MpfwParser& m_parser;
  SwitchChanges& m_changes;
  const char* m_switch = nullptr;  // the `/` of the switch being read
};

// From the `/`, which is the current token, to the end of the word behind it; behind the word afterwards.
std::string SwitchReader::ReadSwitchText() {
  m_switch = m_parser.current.text.begin;
  m_parser.Advance();
  const char* end = m_parser.current.text.end;
  const bool mayHaveColon = std::find(std::begin(kWordsWithColon), std::end(kWordsWithColon),
                                      m_parser.current.text.View()) != std::end(kWordsWithColon);
  m_parser.Advance();
  if (mayHaveColon && Kind() == kColon) ReadColonPart(end);
  return std::string(m_switch, end);
}

void SwitchReader::ReadColonPart(const char*& end) {
  const std::string soFar(m_switch, end);
  m_parser.Advance();
  if (Kind() != kIdentifier) Fail("Expected identifier after " + soFar + " when read " + Printed(m_parser.current));
  end = m_parser.current.text.end;
  m_parser.Advance();
}

bool SwitchReader::ReadCompilerSwitch() {
  if (Kind() != kSlash) return false;
  const std::string text = ReadSwitchText();
  if (BeginsWithAny(text, kDeprecated)) TraceWriter() << "warning: Compiler switch " << text << " is deprecated\n";

  if (const auto* row = FindSwitch(kSignedFlags, text)) {
    const bool negated = Kind() == kMinus;
    if (negated) m_parser.Advance();
    Entry(row->property) = negated ? "false" : "true";
  } else if (const auto* flag = FindSwitch(kFlags, text)) {
    Entry(flag->property) = "true";
  } else if (const auto* enumerated = FindSwitch(kEnumerated, text)) {
    Entry(enumerated->property) = enumerated->valueText;
  } else if (const auto* fileName = FindSwitch(kFileNames, text)) {
    std::string& value = Entry(fileName->property);
    if (!m_changes.isRemoval || Kind() == kDoubleQuoted) value = ReadValue();
  } else if (const auto* list = FindSwitch(kLists, text)) {
    AppendItem(Entry(list->property), ReadValue());
  } else if (BeginsWithAny(text, kPassedOn)) {
    AppendText(Entry(kAdditionalOptions), text);
  } else if (text == "/Yc" || text == "/Yu" || text == "/YX") {
    ReadPrecompiledHeader(text[2]);
  } else if (text == "/wd") {
    ReadDisabledWarning(text);
  } else if (text == "/Gf") {
    FailAtSwitch("/Gf not supported, use /GF instead");
  } else {
    FailAtSwitch("Invalid switch " + text);
  }
  return true;
}

void SwitchReader::ReadPrecompiledHeader(char which) {
  std::string through(kDefaultThroughHeader);
  if (Kind() == kDoubleQuoted) through = ReadValue();
  Entry("UsePrecompiledHeader") = which == 'c' ? "1" : which == 'u' ? "2" : "0";
  if (!m_changes.isRemoval) Entry("PrecompiledHeaderThrough") = through;
}

void SwitchReader::ReadDisabledWarning(const std::string& text) {
  if (m_changes.isRemoval) FailAtSwitch("Subtraction of " + text + " not supported");
  if (Kind() != kDecimal) Fail("Expected warning number after " + text + " when read " + Printed(m_parser.current));
  AppendItem(Entry("DisableSpecificWarnings"), ToString(DecimalValue64(m_parser.current)));
  m_parser.Advance();
}

bool SwitchReader::ReadResourceSwitch() {
  if (Kind() != kSlash) return false;
  m_switch = m_parser.current.text.begin;
  m_parser.Advance();
  const std::string text(m_switch, m_parser.current.text.end);
  m_parser.Advance();
  if (const auto* flag = FindSwitch(kResourceFlags, text)) {
    Entry(flag->property) = "true";
  } else if (text == "/fo") {
    Entry("ResourceOutputFileName") = ReadValue();
  } else if (const auto* list = FindSwitch(kResourceLists, text)) {
    AppendItem(Entry(list->property), ReadValue());
  } else if (text == "/l") {
    if (Kind() != kHex) Fail("Expected hex integer after " + text + " when read " + Printed(m_parser.current));
    Entry("Culture") = m_parser.current.text.Text();
    m_parser.Advance();
  } else {
    FailAtSwitch("Invalid resource compiler switch " + text);
  }
  return true;
}

SwitchChanges ReadSwitches(MpfwParser& parser, bool isRemoval, std::span<const SwitchProperty> lists,
                           bool (SwitchReader::*readSwitch)()) {
  SwitchChanges changes;
  changes.isRemoval = isRemoval;
  changes.lists = lists;
  SwitchReader(parser, changes).ReadBlock(readSwitch);
  return changes;
}

}  // namespace

SwitchChanges ReadCompilerSwitches(MpfwParser& parser, bool isRemoval) {
  return ReadSwitches(parser, isRemoval, kLists, &SwitchReader::ReadCompilerSwitch);
}

SwitchChanges ReadResourceSwitches(MpfwParser& parser, bool isRemoval) {
  return ReadSwitches(parser, isRemoval, kResourceLists, &SwitchReader::ReadResourceSwitch);
}

// --- Changes

void SwitchChanges::Apply(OptionMap& options) const {
  for (const auto& [property, value] : entries) {
    if (isRemoval) {
      if (IsList(property)) {
        RemoveItems(options[property], value);
      } else {
        options.erase(property);
      }
    } else if (IsList(property)) {
      AddMissingItems(options[property], value);
    } else if (property == kAdditionalOptions) {
      AppendText(options[property], value);
    } else {
      options[property] = value;
    }
  }
}

void SwitchChanges::ApplyToFile(OptionMap& record, const OptionMap& configOptions) const {
  for (const auto& [property, value] : entries) {
    if (value == "true" || value == "false") {
      record[property] = value == "true" ? "false" : "true";
    } else if (IsNonZeroInteger(value)) {
      record[property] = "0";
    } else if (!IsList(property)) {
      TraceWriter() << "Warning, unable to subtract option " << property << " = \"" << value
                    << "\". It will be ignored\n";
    } else {
      auto own = record.find(property);
      auto inherited = configOptions.find(property);
      const bool stoppedInheriting = own != record.end() && HasItem(own->second, kNoInherit);
      if (!stoppedInheriting && inherited != configOptions.end() && ShareItem(inherited->second, value)) {
        if (own == record.end()) {
          own = record.emplace(property, inherited->second).first;
        } else {
          AddMissingItems(own->second, inherited->second);
        }
        AppendItem(own->second, kNoInherit);
      }
      if (own != record.end()) RemoveItems(own->second, value);
    }
  }
}

// --- Command lines

bool CreatesPrecompiledHeader(const ProjectFile& file) {
  if (file.configRecords.empty()) return false;
  const OptionMap& options = file.configRecords.front()->options;
  auto found = options.find("UsePrecompiledHeader");
  return found != options.end() && found->second == "1";
}

namespace {

void WriteListSwitches(TextWriter& out, std::string_view name, const std::string& list) {
  for (const std::string& item : ListItems(list)) out << name << " \"" << item << "\" ";
}

}  // namespace

void WriteCompilerSwitches(TextWriter& out, const ProjectFile& file, const ProjectConfig& config) {
  for (const auto& [property, value] : config.compilerOptions) {
    if (const auto* row = FindProperty(kSignedFlags, property)) {
      out << row->name << (value == "true" ? " " : "- ");
    } else if (const auto* flag = FindProperty(kFlags, property)) {
      if (value == "true") out << flag->name << " ";
    } else if (const auto* enumerated = FindValue(kEnumerated, property, value)) {
      out << enumerated->name << " ";
    } else if (property == kAdditionalOptions) {
      out << value << " ";
    } else if (const auto* list = FindProperty(kLists, property)) {
      WriteListSwitches(out, list->name, value);
    }
  }
  auto isOne = [](const std::map<std::string, std::string>& options) {
    auto found = options.find("WholeProgramOptimization");
    return found != options.end() && found->second == "1";
  };
  if (!isOne(config.compilerOptions) && isOne(config.generalOptions)) out << "/GL ";
  if (file.kind == FileKind::Cpp) {
    out << (CreatesPrecompiledHeader(file) ? "/Yc\"StdAfx.h\" " : "/Yu\"StdAfx.h\" ");
  }
}

void WriteResourceSwitches(TextWriter& out, const ProjectConfig& config) {
  for (const auto& [property, value] : config.resourceOptions) {
    const auto* flag = FindProperty(kResourceFlags, property);
    if (flag && value == "true") {
      out << flag->name << " ";
    } else if (const auto* list = FindProperty(kResourceLists, property)) {
      WriteListSwitches(out, list->name, value);
    } else {
      TraceWriter() << "Ignored : " << property << " = " << value << "\n";
    }
  }
}

// --- Lists

std::vector<std::string> ListItems(const std::string& list) {
  std::vector<std::string> items;
  SplitString(list, items, ";");
  return items;
}

void AppendItem(std::string& list, std::string_view item) {
  if (!list.empty()) list += ';';
  list += item;
}

void AddMissingItems(std::string& list, const std::string& items) {
  for (const std::string& item : ListItems(items)) {
    if (!HasItem(list, item)) AppendItem(list, item);
  }
}

bool HasItem(const std::string& list, std::string_view item) {
  const std::vector<std::string> items = ListItems(list);
  return std::find(items.begin(), items.end(), item) != items.end();
}

void RemoveItems(std::string& list, const std::string& items) {
  std::string kept;
  for (const std::string& item : ListItems(list)) {
    if (!HasItem(items, item)) AppendItem(kept, item);
  }
  list = std::move(kept);
}

bool ShareItem(const std::string& a, const std::string& b) {
  const std::vector<std::string> items = ListItems(b);
  return std::any_of(items.begin(), items.end(), [&](const std::string& item) { return HasItem(a, item); });
}

}  // namespace qrex
