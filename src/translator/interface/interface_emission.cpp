#include "translator/interface/interface_emission.h"

#include <algorithm>

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/interface/remote_interface.h"
#include "translator/model/attribute_struct.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

void WriteVoidSelf(TextWriter& out, const FunctionSignature& method) {
  out << "void" << (method.isConst ? " const" : "") << "* _self";
  for (const FunctionArg& argument : method.arguments) {
    out << ",";
    PrintDeclaration(out, argument.type, argument.name, DeclarationMode::Plain);
  }
}

void WriteTableSlot(TextWriter& out, const FunctionSignature& method) {
  PrintType(out, method.returnType);
  out << " (__stdcall *" << method.name << ")(";
  WriteVoidSelf(out, method);
  out << ")";
}

void WriteStub(TextWriter& out, const FunctionSignature& method) {
  out << "static ";
  PrintType(out, method.returnType);
  out << " __stdcall " << method.name << "(";
  WriteVoidSelf(out, method);
  out << ") { ";
  WriteReturn(out, method.returnType);
  out << (method.isConst ? "((const T*)_self)->" : "((T*)_self)->") << method.name << "(";
  WriteArgNames(out, method.arguments);
  out << "); }\n";
}

void WriteForwarder(TextWriter& out, const FunctionSignature& method, const std::string& path) {
  WriteSignature(out, method);
  out << " { ";
  WriteReturn(out, method.returnType);
  out << "m_table->" << path << method.name << "(m_self" << (method.arguments.empty() ? "" : ",");
  WriteArgNames(out, method.arguments);
  out << "); }\n";
}

void WriteBaseTable(TextWriter& out, const InterfaceDef& base) {
  Block table(out, ",");
  for (const InterfaceDef* deeper : base.m_bases) WriteBaseTable(out, *deeper);
  for (const FunctionSignature& method : base.m_methods) {
    out << "&" << base.GetQualifiedName() << "::Stubs<T>::" << method.name << ",\n";
  }
}

void WriteGetTable(TextWriter& out, const InterfaceDef& interface) {
  out << "static const FnTable& GetTable()\n";
  Block body(out);
  out << "static const FnTable t";
  if (interface.m_bases.empty() && interface.m_methods.empty()) {
    out << " = {};\n";
  } else {
    out << " =\n";
    Block table(out, ";");
    for (const InterfaceDef* base : interface.m_bases) WriteBaseTable(out, *base);
    for (const FunctionSignature& method : interface.m_methods) {
      out << "&" << method.name << (&method == &interface.m_methods.back() ? "\n" : ",\n");
    }
  }
  out << "return t;\n";
}

void WriteTables(TextWriter& out, const InterfaceDef& interface) {
  out << "struct FnTable\n";
  {
    Block table(out, ";");
    for (const InterfaceDef* base : interface.m_bases) {
      out << base->GetQualifiedName() << "::FnTable _" << base->name << ";\n";
    }
    for (const FunctionSignature& method : interface.m_methods) {
      WriteTableSlot(out, method);
      out << ";\n";
    }
  }
  WriteText(out,
            "$0(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}\n\n"
            "void AssignFrom($0& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }\n"
            "void AssignFrom($0 const& _rhs) const { const_cast<$0*>(this)->m_self = _rhs.m_self; "
            "const_cast<$0*>(this)->m_table = _rhs.m_table; }\n\n",
            {interface.name});
  out << "template<typename T> struct Stubs\n";
  {
    Block stubs(out, ";");
    for (const FunctionSignature& method : interface.m_methods) WriteStub(out, method);
    WriteGetTable(out, interface);
  }
  WriteText(out,
            "\ntemplate<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }\n"
            "template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<$0*>(this)->m_self = "
            "const_cast<T*>(_rhs); const_cast<$0*>(this)->m_table = &Stubs<T>::GetTable(); }\n\n",
            {interface.name});
}

}  // namespace

void WriteInterfaceHandle(TextWriter& out, const InterfaceDef& interface) {
  const std::vector<InterfaceDef::FlatBase> flattened = interface.FlattenedBases();
  out << "struct " << interface.name << "\n";
  Block handle(out, ";");
  WriteTables(out, interface);
  for (const auto& [base, path] : flattened) {
    for (const FunctionSignature& method : base->m_methods) WriteForwarder(out, method, path + ".");
  }
  for (const FunctionSignature& method : interface.m_methods) WriteForwarder(out, method, "");
  if (!interface.m_bases.empty()) out << "\n";
  for (const auto& [base, path] : flattened) {
    WriteText(out, "operator $0() const { return $0(m_self, &m_table->$1); }\n", {base->GetQualifiedName(), path});
  }
  out << "\nunion\n";
  {
    Block attributes(out, ";");
    for (const AttributeDef& attribute : interface.m_attributes) {
      AttributeWriter writer(out, *interface.owner.rootNameSpace, Access::Methods);
      writer.WriteStruct(interface.name, attribute.type, attribute.name, attribute.name, attribute.name, false);
    }
    out << "void* m_self;\n";
  }
  out << "FnTable const* m_table;\n";
}

void WriteInterfaceDeclarations(TextWriter& out, const InterfaceDef& interface) {
  out << "template <typename BC>\nstruct " << interface.name << "DelegatorMixin : public BC\n";
  {
    Block body(out, ";");
    for (const FunctionSignature& method : interface.m_methods) {
      WriteSignature(out, method);
      out << " { ";
      WriteReturn(out, method.returnType);
      out << "BC::Get" << interface.name << "()." << method.name << "(";
      WriteArgNames(out, method.arguments);
      out << "); }\n";
    }
  }
  if (interface.m_registered) {
    out << "\n"
        << ExportPrefix(interface) << "vesk::ReflectedInterface const& _GetReflected(" << interface.name
        << " const*);\n";
  }
  if (interface.m_isIpc || interface.m_isRmi) {
    out << "\ninline vesk::ConstStringZ _GetIpcInterfaceName(" << interface.name << " const*) { return \""
        << interface.GetQualifiedName() << "\"; }\n";
  }
}

void InterfaceDef::WriteExtraTraits(TextWriter& out) const {
  const std::string& qualified = GetQualifiedName();
  out << "template<> struct InterfaceTypeTraits<" << qualified << ">\n";
  {
    Block traits(out, ";");
    out << "static const bool is_ipc = " << BoolText(m_isIpc) << ";\n";
    out << "static const bool is_rmi = " << BoolText(m_isRmi) << ";\n";
  }
  auto write = [&](std::string_view how, const InterfaceDef& base) {
    WriteText(out, "template<> struct _is_$0_superinterface_of<$1,$2> { static const bool value = true; };\n",
              {how, base.GetQualifiedName(), qualified});
  };
  for (const InterfaceDef* base : m_bases) write("direct", *base);
  for (const FlatBase& flat : FlattenedBases()) {
    if (std::find(m_bases.begin(), m_bases.end(), flat.base) == m_bases.end()) write("indirect", *flat.base);
  }
}

// --- Record

namespace {

class InterfaceRecord {
 public:
  InterfaceRecord(TextWriter& out, const InterfaceDef& interface)
      : m_out(out), m_interface(interface), m_name(interface.name) {}

  void Write() {
    m_out << ExportPrefix(m_interface) << "vesk::ReflectedInterface const& _GetReflected(" << m_name << " const*)\n";
    Block body(m_out);
    if (!m_interface.metadata.empty()) {
      WriteMetadataByteCode(m_out, m_name + "_metadata", m_strings, m_interface.metadata);
    }
    WriteBases();
    for (const FunctionSignature& method : m_interface.m_methods) {
      WriteSignatureArrays(m_out, m_name + "_" + method.name, method, m_strings);
    }
    WriteAttributes();
    WriteStringTable(m_out, m_strings, m_name);
    WriteMethods();
    WriteInterface();
    m_out << "return " << m_name << "_interface;\n";
  }

 private:
  void WriteBases() {
    if (m_interface.m_bases.empty()) return;
    m_out << "static vesk::ConstStringZ " << m_name << "_bases[] =\n";
    Block rows(m_out, ";");
    for (const InterfaceDef* base : m_interface.m_bases) m_out << "\"" << base->GetQualifiedName() << "\",\n";
  }

  void WriteAttributes() {
    for (const AttributeDef& attribute : m_interface.m_attributes) {
      WriteTypeByteCode(m_out, m_name + "_" + attribute.name, m_strings, attribute.type);
    }
    if (m_interface.m_attributes.empty()) return;
    m_out << "static const vesk::ReflectedAttribute " << m_name << "_attributes[] =\n";
    Block rows(m_out, ";");
    for (const AttributeDef& attribute : m_interface.m_attributes) {
      WriteText(m_out, "{ \"$1\",$0_$1 },\n", {m_name, attribute.name});
    }
  }

  void WriteMethods() {
    if (m_interface.m_methods.empty()) return;
    m_out << "static const vesk::ReflectedInterfaceMethod " << m_name << "_methods[] =\n";
    Block rows(m_out, ";");
    for (const FunctionSignature& method : m_interface.m_methods) {
      const std::string prefix = m_name + "_" + method.name;
      m_out << "{\"" << method.name << "\",{" << NameOrZero(!IsVoid(method.returnType), prefix + "_return") << "},"
            << CountedName(method.arguments.size(), prefix + "_args") << ","
            << NameOrZero(!method.metadata.empty(), prefix + "_metadata") << "},\n";
    }
  }

  void WriteInterface() {
    m_out << "static const vesk::ReflectedInterface " << m_name << "_interface =\n";
    Block record(m_out, ";");
    m_out << "\"" << m_interface.GetQualifiedName() << "\",\n";
    m_out << NameOrZero(!m_interface.metadata.empty(), m_name + "_metadata") << ",\n";
    m_out << CountedName(m_interface.m_bases.size(), m_name + "_bases") << ",\n";
    m_out << m_interface.InheritedMethodCount() << ",\n";
    m_out << CountedName(m_interface.m_methods.size(), m_name + "_methods") << ",\n";
    m_out << CountedName(m_interface.m_attributes.size(), m_name + "_attributes") << ",\n";
    m_out << NameOrZero(!m_strings.Empty(), m_name + "_stringTable") << "\n";
  }

  TextWriter& m_out;
  const InterfaceDef& m_interface;
  const std::string& m_name;
  StringTable m_strings;
};

}  // namespace

void InterfaceDef::WriteReflectedDefinition(TextWriter& out) { InterfaceRecord(out, *this).Write(); }

void InterfaceDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  RecordedElement::WriteReflection(out, lists);
  if (status == DeclStatus::Defined && m_isIpc) WriteRemoteInterface(out, *this);
}

}  // namespace qrex
