#include "translator/polymorphic.h"

#include "translator/emit.h"
#include "translator/scanned_file.h"
#include "translator/variant_def.h"

namespace qrex {

namespace {

// One level per polymorphic argument; each has a case per item of its variant.
class Dispatch {
 public:
  Dispatch(TextWriter& out, const GlobalFunctionDef& def) : m_out(out), m_def(def) {
    for (const FunctionArg& argument : def.signature.arguments) {
      if (argument.polymorphic) m_levels.push_back({&argument, VariantOf(argument), 0});
    }
  }

  void Write() {
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
    uint32_t decorators = 0;
    std::string_view code = SkipDecorators(argument.type, root, decorators);
    if (static_cast<uint8_t>(code.front()) == kOpReference) code = SkipDecorators(code.substr(1), root, decorators);
    if (static_cast<uint8_t>(code.front()) != kOpVariant) return nullptr;
    return dynamic_cast<const VariantDef*>(NamedElement(code, root));
  }

  void WriteLevel(size_t depth) {
    Level& level = m_levels[depth];
    IndentScope indent(m_out, 4);
    m_out << "switch(" << level.argument->name << ".GetTag())\n{\n";
    const size_t count = level.variant ? level.variant->m_items.size() : 0;
    for (level.item = 0; level.item < count; ++level.item) {
      if (depth + 1 == m_levels.size()) {
        WriteLeaf(level.item);
      } else {
        m_out << "case " << level.item << " :\n";
        WriteLevel(depth + 1);
      }
    }
    m_out << "default: vxAssertUnreachable();\n}\n";
  }

  void WriteLeaf(size_t item) {
    const bool isVoid = IsVoid(m_def.signature.returnType);
    m_out << "case " << item << " : " << (isVoid ? "" : "return ") << m_def.name << "(";
    size_t depth = 0;
    for (const FunctionArg& argument : m_def.signature.arguments) {
      if (&argument != &m_def.signature.arguments.front()) m_out << ",";
      m_out << argument.name;
      if (!argument.polymorphic) continue;
      const Level& level = m_levels[depth++];
      m_out << ".as<" << level.variant->m_items[level.item]->EffectiveName() << ">()";
    }
    m_out << ");" << (isVoid ? " break;\n" : "\n");
  }

  TextWriter& m_out;
  const GlobalFunctionDef& m_def;
  std::vector<Level> m_levels;
};

}  // namespace

void WriteDispatchBody(TextWriter& out, const GlobalFunctionDef& def) { Dispatch(out, def).Write(); }

}  // namespace qrex
