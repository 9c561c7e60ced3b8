// The vocabulary of all emitters: scopes that write brackets, and the lists and prefixes that generated text shares. An
// emitter reads as the text it writes, in order; what must be undone is a scope.
#pragma once

#include <functional>
#include <string>
#include <string_view>

#include "text/text_writer.h"
#include "translator/emit/write.h"
#include "translator/symbols/name_space.h"
#include "translator/types/type_view.h"

namespace qrex {

// "{\n", the content indented by 4, then "}", the suffix, "\n". Block(out, ";") closes a record or class.
class Block {
 public:
  explicit Block(TextWriter& out, std::string_view suffix = {});
  ~Block();
  Block(const Block&) = delete;
  Block& operator=(const Block&) = delete;

 private:
  TextWriter& m_out;
  std::string m_suffix;
};

// A hole may be a type.
inline void WriteValue(TextWriter& out, TypeView type) { PrintType(out, type); }

// Opens the name spaces around an element, outermost first ("namespace N\n{\n"), and closes them ("} // N\n").
class NameSpaceFrame {
 public:
  NameSpaceFrame(TextWriter& out, const NameSpace* innermost);
  ~NameSpaceFrame();

 private:
  TextWriter& m_out;
  std::vector<const NameSpace*> m_path;  // outermost first
};
// Closes the open name spaces, writes, and opens them again.
void WriteOutsideNameSpaces(TextWriter& out, const NameSpace* innermost, const std::function<void()>& write);
std::vector<const NameSpace*> EnclosingNameSpaces(const NameSpace* innermost);  // below the root, outermost first

std::string ExportPrefix(const NameSpaceElement& element);      // "P_API " for an exported element of a DLL, else ""
std::string TargetIdentifier(const NameSpaceElement& element);  // X: the project folder with `/` as `_`
inline std::string_view BoolText(bool value) { return value ? "true" : "false"; }
inline char BitText(bool value) { return value ? '1' : '0'; }

// Argument lists, all without their parentheses.
void WriteArgDeclarations(TextWriter& out, const std::vector<FunctionArg>& arguments);  // "T a,U b"
// "N const* _self,T a,U b": the arguments of a function that replaces a method of N.
void WriteSelfAndArgDeclarations(TextWriter& out, std::string_view className, const FunctionSignature& method);
void WriteArgNames(TextWriter& out, const std::vector<FunctionArg>& arguments);  // "a,b"
void WriteReturn(TextWriter& out, const TypeCode& returnType);                   // "return " unless void

// "inline T name(T a=1,U b) const": a signature as C++. A hole may be one.
void WriteSignature(TextWriter& out, const FunctionSignature& signature);
inline void WriteValue(TextWriter& out, const FunctionSignature& signature) { WriteSignature(out, signature); }

// Pieces of records: "NAME" or "0"; "NAME,count" or "0,0".
std::string NameOrZero(bool present, const std::string& name);
std::string CountedName(size_t count, const std::string& name);

}  // namespace qrex
