#include "macro/frame.h"

#include <algorithm>
#include <unordered_set>

#include "lex/scanner.h"

namespace qrex {

VarType TypeCodeOf(std::string_view word) {
  static constexpr std::pair<std::string_view, VarType> kWords[] = {{"bool", VarType::Bool},
                                                                    {"int", VarType::Int},
                                                                    {"double", VarType::Double},
                                                                    {"char", VarType::Char},
                                                                    {"string", VarType::String}};
  for (const auto& [keyword, type] : kWords) {
    if (keyword == word) return type;
  }
  return VarType::Macro;
}

// --- Variables

std::string LSMacroVariable::Signature() const {
  std::string signature = name.Text();
  for (size_t i = 0; i < formals.size(); ++i) signature += (i == 0 ? "(" : ",") + formals[i].name.Text();
  return formals.empty() ? signature : signature + ")";
}

void LSMacroVariable::WriteDefinition(TextWriter& writer) const { writer << Signature() << " = " << body.View(); }
void LSMacroVariable::WriteValue(TextWriter& writer) const { writer << body.View(); }
std::unique_ptr<LSVariable> LSMacroVariable::Clone() const { return std::make_unique<LSMacroVariable>(*this); }

void LSMacroVariable::OwnText(TextRange text) {
  auto owned = std::make_shared<const std::string>(text.View());
  auto move = [&](TextRange& range) {
    if (range.Empty()) range.end = range.begin;
    range.begin = owned->data() + (range.begin - text.begin);
    range.end = owned->data() + (range.end - text.begin);
  };
  move(name);
  move(body);
  for (MacroFormal& formal : formals) move(formal.name);
  ownedText = std::move(owned);
}

void LSMacroVariable::OwnBody() {
  auto owned = std::make_shared<const std::string>(body.View());
  body = TextRange(std::string_view(*owned));
  ownedText = std::move(owned);
}

void LSValueVariable::WriteDefinition(TextWriter& writer) const { writer << name.View() << " = " << value; }
void LSValueVariable::WriteValue(TextWriter& writer) const { writer << value; }

std::unique_ptr<LSVariable> LSValueVariable::Clone() const {
  auto clone = std::make_unique<LSValueVariable>(type, value);
  clone->name = name;
  return clone;
}

LSVar::LSVar(std::string name, VarType type, std::string value)
    : LSValueVariable(type, std::move(value)), ownName(std::move(name)) {
  this->name = TextRange(std::string_view(ownName));
}

std::unique_ptr<LSVariable> LSVar::Clone() const { return std::make_unique<LSVar>(ownName, type, value); }

// --- Frames

LSFrame::LSFrame(LSFrame* parent) : m_world(parent->m_world), m_parent(parent), m_fileFrame(parent->m_fileFrame) {}
LSFrame::LSFrame(MacroWorld& world) : m_world(world) {}
LSFrame::~LSFrame() = default;

void LSFrame::AddVariable(std::unique_ptr<LSVariable> variable) {
  LSVariable& added = *variable;
  const bool replaces = m_fileFrame == this && FindLocal(added.name.View());  // only file frames ask
  m_variables.push_back(std::move(variable));
  m_world.names.Add(added.name.View());
  if (m_names) {
    EnterInIndex(added);
  } else if (m_variables.size() > kMostWithoutIndex) {
    m_names = std::make_unique<Index>();
    for (const auto& each : m_variables) EnterInIndex(*each);
  }
  OnAdded(added, replaces);
}

void LSFrame::EnterInIndex(LSVariable& variable) {
  m_names->erase(variable.name.View());  // the key must refer to the text of the newest
  m_names->emplace(variable.name.View(), &variable);
}

LSVariable* LSFrame::FindLocal(std::string_view name) const {
  if (m_names) {
    auto found = m_names->find(name);
    return found == m_names->end() ? nullptr : found->second;
  }
  for (size_t i = m_variables.size(); i-- > 0;) {
    if (m_variables[i]->name == name) return m_variables[i].get();
  }
  return nullptr;
}

LSVariable* LSFrame::FindInChain(std::string_view name) const {
  for (const LSFrame* frame = this; frame; frame = frame->m_parent) {
    if (LSVariable* found = frame->FindLocal(name)) return found;
  }
  return nullptr;
}

LSVariable* LSFrame::FindInFrame(std::string_view name, const char*) const { return FindLocal(name); }

LSVariable* LSFrame::Find(std::string_view name, const char* position) const {
  for (const LSFrame* frame = this; frame; frame = frame->m_parent) {
    if (LSVariable* found = frame->FindInFrame(name, position)) return found;
  }
  return nullptr;
}

void LSFrame::WriteFrame(TextWriter& writer) const {
  writer << "{\n";
  {
    IndentScope indent(writer, 4);
    writer << "Local vars\n[\n";
    for (auto it = m_variables.rbegin(); it != m_variables.rend(); ++it) {
      (*it)->WriteDefinition(writer);
      writer << "\n";
    }
    writer << "]\n";
    if (m_parent) {
      writer << "Parent frame\n";
      m_parent->WriteFrame(writer);
    }
  }
  writer << "}\n";
}

// --- File frames

std::string_view DefinitionTable::Enter(std::string_view name, size_t frame, LSVariable* variable) {
  auto& [ownName, entries] = *m_entries.try_emplace(std::string(name)).first;
  entries.push_back({frame, variable});
  return ownName;
}

void DefinitionTable::Replace(std::string_view name, size_t frame, LSVariable* variable) {
  for (Entry& entry : m_entries.find(name)->second) {
    if (entry.frame == frame) entry.variable = variable;
  }
}

void DefinitionTable::Remove(std::string_view name, size_t frame) {
  auto found = m_entries.find(name);
  if (found == m_entries.end()) return;
  std::erase_if(found->second, [&](const Entry& entry) { return entry.frame == frame; });
  if (found->second.empty()) m_entries.erase(found);
}

namespace {

// Every file has its own @filename and the like; they are never looked up through imports.
bool IsPredefined(std::string_view name) { return name.substr(0, 1) == "@"; }

constexpr int kMaxPasses = 100;
constexpr size_t kMaxSubstituted = 64u << 20;

}  // namespace

LSFileFrame::LSFileFrame(MacroWorld& world) : LSFrame(world), m_index(world.fileFrames++) { m_fileFrame = this; }
LSFileFrame::LSFileFrame(LSFrame* parent) : LSFrame(parent), m_index(m_world.fileFrames++) { m_fileFrame = this; }

LSFileFrame::~LSFileFrame() { LeaveDefinitions(); }

// Not by the names of the variables: these may be in the text of another file, which may be gone.
void LSFileFrame::LeaveDefinitions() {
  for (std::string_view name : m_entered) m_world.definitions.Remove(name, m_index);
}

void LSFileFrame::Clear() {
  LeaveDefinitions();
  m_entered.clear();
  m_names.reset();
  m_variables.clear();
  m_allImports = {};
  m_directImports.clear();
  m_orderedImports.clear();
  m_substitutions.clear();
}

void LSFileFrame::OnAdded(LSVariable& variable, bool replaces) {
  const std::string_view name = variable.name.View();
  if (IsPredefined(name)) return;
  if (replaces) {
    m_world.definitions.Replace(name, m_index, &variable);
  } else {
    m_entered.push_back(m_world.definitions.Enter(name, m_index, &variable));
  }
}

void LSFileFrame::AddImport(LSFileFrame& imported) {
  m_allImports.Add(imported.m_index);
  m_allImports.Add(imported.m_allImports);
  m_directImports.push_back(&imported);
}

void LSFileFrame::AddOrderedImport(LSFileFrame& imported) {
  AddImport(imported);
  m_orderedImports.push_back(&imported);
}

// Where several definitions are in view, those of nearer files hide those of the files that they import; only direct
// imports that really disagree are ambiguous. Each frame is asked once.
class LSFileFrame::NearestDefinition {
 public:
  NearestDefinition(std::string_view name, const char* position) : m_name(name), m_position(position) {}

  LSVariable* In(const LSFileFrame& frame) {
    auto [known, isNew] = m_answers.emplace(&frame, nullptr);
    if (!isNew) return known->second;
    LSVariable* found = frame.FindLocal(m_name);
    if (!found) found = AmongImports(frame);
    m_answers[&frame] = found;
    return found;
  }

  LSVariable* AmongImports(const LSFileFrame& frame) {
    LSVariable* found = nullptr;
    bool several = false;
    for (const DefinitionTable::Entry& entry : *frame.m_world.definitions.Find(m_name)) {
      if (!frame.m_allImports.Has(entry.frame)) continue;
      several = found && found != entry.variable;
      found = entry.variable;
      if (several) break;
    }
    if (!several) return found;
    found = nullptr;
    for (const LSFileFrame* import : frame.m_directImports) {
      LSVariable* nearest = In(*import);
      if (nearest && found && nearest != found) {
        throw LexScannerException("Ambiguous macro name : " + std::string(m_name), m_position);
      }
      if (nearest) found = nearest;
    }
    return found;
  }

 private:
  std::string_view m_name;
  const char* m_position;
  std::unordered_map<const LSFileFrame*, LSVariable*> m_answers;
};

LSVariable* LSFileFrame::FindInFrame(std::string_view name, const char* position) const {
  if (LSVariable* own = FindLocal(name)) return own;
  if (m_allImports.Empty() || !m_world.definitions.Find(name)) return nullptr;
  return NearestDefinition(name, position).AmongImports(*this);
}

void LSFileFrame::DefineSubstitution(const std::string& name, const std::string& value) {
  m_substitutions[name] = value;
  AddVariable(std::make_unique<LSVar>("_" + name + "_", value));
}

const std::string* LSFileFrame::FindSubstitution(std::string_view name) const {
  auto own = m_substitutions.find(name);
  if (own != m_substitutions.end()) return &own->second;
  if (m_orderedImports.empty() || !m_world.definitions.Find("_" + std::string(name) + "_")) return nullptr;
  std::vector<const LSFileFrame*> pending{this};
  std::unordered_set<const LSFileFrame*> seen;
  while (!pending.empty()) {
    const LSFileFrame* frame = pending.back();
    pending.pop_back();
    if (!seen.insert(frame).second) continue;
    auto found = frame->m_substitutions.find(name);
    if (found != frame->m_substitutions.end()) return &found->second;
    pending.insert(pending.end(), frame->m_orderedImports.rbegin(), frame->m_orderedImports.rend());
  }
  return nullptr;
}

bool LSFileFrame::SubstituteOnce(std::string& text) const {
  std::string result;
  size_t copied = 0;
  for (size_t at = 0; (at = text.find("$(", at)) != std::string::npos;) {
    size_t end = at + 2;
    if (end < text.size() && IsIdentifierStart(text[end])) {
      while (end < text.size() && IsIdentifierPart(text[end])) ++end;
    }
    const std::string* value = nullptr;
    if (end > at + 2 && end < text.size() && text[end] == ')') {
      value = FindSubstitution(std::string_view(text).substr(at + 2, end - at - 2));
    }
    if (!value) {
      ++at;
      continue;
    }
    result.append(text, copied, at - copied).append(*value);
    copied = at = end + 1;
  }
  if (copied == 0) return false;
  text = result.append(text, copied);
  return true;
}

bool LSFileFrame::Substitute(std::string& text) const {
  bool changed = false;
  for (int pass = 0; SubstituteOnce(text); ++pass) {
    if (pass == kMaxPasses || text.size() > kMaxSubstituted) {
      throw LexScannerException("Cyclic reference in $(name) substitution", nullptr);
    }
    changed = true;
  }
  return changed;
}

void LSFileFrame::CopyFrom(const LSFileFrame& other) {
  for (const auto& variable : other.m_variables) AddVariable(variable->Clone());
  m_substitutions.insert(other.m_substitutions.begin(), other.m_substitutions.end());
}

}  // namespace qrex
