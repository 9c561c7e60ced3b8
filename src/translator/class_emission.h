// The text of a class beyond its source: members, operators, record.
#pragma once

#include "translator/class_def.h"

namespace qrex {

void WriteClassMembers(TextWriter& out, const ClassDef& def);    // in-class text, at the closing brace
void WriteClassOperators(TextWriter& out, const ClassDef& def);  // at name-space scope, behind the class
void WriteEvictDgsNodes(TextWriter& out, const ClassDef& def);
void WriteGetTypeOps(TextWriter& out, const ClassDef& def);
void WriteGetReflectedClassRecord(TextWriter& out, const ClassDef& def);  // the definition of _GetReflected

}  // namespace qrex
