// The text of a class beyond its source: members, operators, record. Each answer about what a class can do is a
// predicate of ClassDef, so that traits, TypeOps and members agree.
#pragma once

#include <vector>

#include "translator/declared/class_def.h"

namespace qrex {

void WriteClassMembers(TextWriter& out, const ClassDef& def);    // in-class text, at the closing brace
void WriteClassOperators(TextWriter& out, const ClassDef& def);  // at name-space scope, behind the class
void WriteEvictDgsNodes(TextWriter& out, const ClassDef& def);
void WriteInterfaceDefinitions(TextWriter& out, const ClassDef& def);  // QueryInterface, GetReflectedClass out of line
void WriteGetReflected(TextWriter& out, const ClassDef& def);
void WriteCreateInstanceMember(TextWriter& out,
                               const ClassDef& def);  // its declaration; whole where no tail defines it
void WriteGetTypeOps(TextWriter& out, const ClassDef& def);

void WriteForwardDeclaration(TextWriter& out, const ClassDef& def);
void WriteReflectionDeclarations(TextWriter& out, const ClassDef& def);

// The interfaces of `isa` with their flattened bases ahead of each, as QueryInterface walks them.
std::vector<const InterfaceDef*> AllInterfaces(const ClassDef& def);
bool HasCreateFunction(const ClassDef& def);

}  // namespace qrex
