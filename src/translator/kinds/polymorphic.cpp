#include "translator/kinds/polymorphic.h"

#include "translator/emit/emit.h"
#include "translator/kinds/global_defs.h"
#include "translator/kinds/variant_def.h"
#include "translator/reader/qrex_parser.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

constexpr size_t kMaxLevels = 100, kMaxLeaves = 100000;

// One level per polymorphic argument; each has a case per item of its variant.
class Dispatch {
 public:
  Dispatch(QrexParser& parser, const GlobalFunctionDef& def)
      : m_out(parser.out), m_def(def), m_isVoid(IsVoid(def.m_signature.returnType)) {
    size_t leaves = 1;
    for (const FunctionArg& argument : def.m_signature.arguments) {
      if (!argument.polymorphic) continue;
      const VariantDef* variant = VariantOf(argument);
      if (!variant || variant->m_items.empty()) {
        parser.Fail("Polymorphic argument " + argument.name + " is not a defined $variant");
      }
      m_levels.push_back({&argument, variant, 0});
      for (const auto& item : variant->m_items) {
        if (!item->isVoid) continue;
        parser.WarnOfText("Polymorphic argument " + argument.name +
                              " may be void, which no overload takes: give the item of " + PrintedElement(*variant) +
                              " a struct without fields, { } name",
                          def);
      }
      leaves *= variant->m_items.size();
      if (leaves > kMaxLeaves || m_levels.size() > kMaxLevels)
        parser.Fail("Too many combinations of polymorphic arguments");
    }
  }

  void WriteAll() {
    Block body(m_out);
    if (!m_levels.empty()) WriteLevel(0);
  }

 private:
  struct Level {
    const FunctionArg* argument;
    const VariantDef* variant;
    size_t item;  // whose case is being written
  };

  const VariantDef* VariantOf(const FunctionArg& argument) const {
    NameSpace& root = *m_def.owner.rootNameSpace;
    TypeView type = WithoutDecorators(argument.type, root).type;
    if (type.Op() == kOpReference) type = WithoutDecorators(type.Inner(), root).type;
    return type.Op() == kOpVariant ? dynamic_cast<const VariantDef*>(NamedElement(type, root)) : nullptr;
  }

  void WriteLevel(size_t depth) {
    Level& level = m_levels[depth];
    const bool isLast = depth + 1 == m_levels.size();
    auto writeCases = [&] {
      for (level.item = 0; level.item < level.variant->m_items.size(); ++level.item) {
        m_out << "case " << level.item << (isLast ? " : " : " :\n");
        if (isLast) {
          WriteCall();
        } else {
          WriteLevel(depth + 1);
          if (m_isVoid && m_def.WantsCompilableText()) m_out << "    break;\n";  // a call does not return from here
        }
      }
    };
    const IndentScope indent(m_out, 4);
    Write(m_out, R"(
      switch($argument$.GetTag())
      {
      $cases$
      default: vxAssertUnreachable();
      }
    )",
          "argument"_ = level.argument->name, "cases"_ = writeCases);
  }

  // Of the overload for the current item of each level.
  void WriteCall() {
    m_out << (m_isVoid ? "" : "return ") << m_def.name << "(";
    auto level = m_levels.begin();
    for (const FunctionArg& argument : m_def.m_signature.arguments) {
      if (&argument != &m_def.m_signature.arguments.front()) m_out << ",";
      m_out << argument.name;
      if (!argument.polymorphic) continue;
      m_out << ".as<" << ItemName(*level->variant, *level->variant->m_items[level->item]) << ">()";
      ++level;
    }
    m_out << (m_isVoid ? "); break;\n" : ");\n");
  }

  // The struct of a named item is in the class of the variant.
  std::string ItemName(const VariantDef& variant, const VariantItem& item) const {
    const bool inVariant = item.IsNamed() && m_def.WantsCompilableText();
    return (inVariant ? variant.GetQualifiedName() + "::" : "") + item.EffectiveName();
  }

  TextWriter& m_out;
  const GlobalFunctionDef& m_def;
  const bool m_isVoid;
  std::vector<Level> m_levels;
};

}  // namespace

void WriteDispatchBody(QrexParser& parser, const GlobalFunctionDef& def) { Dispatch(parser, def).WriteAll(); }

}  // namespace qrex
