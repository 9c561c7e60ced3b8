// Models: the block of data fields with its schema, and the text that it becomes.
#pragma once

#include "translator/declared/class_def.h"
#include "translator/emit/byte_code.h"
#include "translator/model/type_expansion.h"

namespace qrex {

class QrexParser;

// The current token is the `{` or `<<` of the block, afterwards the closing `}`. Constructor text is written while it
// is read. `expansion`: what will be generated of the fields.
void ParseModelBlock(QrexParser& parser, ClassDef& def, Expansion expansion);

// The whole of a model struct: heading, block (read here), members, "};\n". The current token is the `{` or `<<`,
// afterwards the `}`.
void ParseModelStruct(QrexParser& parser, ClassDef& def);

void WriteModelFieldsAndAccessors(TextWriter& out, const ClassDef& def);  // of a model in a class body
void WriteSerialise(TextWriter& out, const ClassDef& def, Placement placement);
void WriteDeserialise(TextWriter& out, const ClassDef& def, Placement placement);
void WriteVisiting(TextWriter& out, const ClassDef& def, Placement placement);
void WriteVisitingDeclarations(TextWriter& out, const ClassDef& def);
void WriteModelMixin(TextWriter& out, const ClassDef& def);

// At class level, in the reflection tail: what must be declared ahead of the class's definitions, and the two functions
// that keep the data source's release number.
void WriteModelRsnDeclarations(TextWriter& out, const ClassDef& def);
// All that those of a class may call, where they are in the class itself.
void WriteTargetDeclarations(TextWriter& out, const ClassDef& def);
void WriteDataSourceRsnFunctions(TextWriter& out, const ClassDef& def, Placement placement);

void WriteModelStreamInsertion(TextWriter& out, const ClassDef& def);  // when `os` is unset
void WriteModelStreamInsertionInTail(TextWriter& out, const ClassDef& def);
// Behind metadata, decorators and fixed arrays, is there a map or a set? That type, or none.
TypeView MapOrSetIn(TypeView type);
inline bool HoldsMapOrSet(TypeView type) { return !MapOrSetIn(type).Empty(); }
// The rows of `_modelFields`; returns their number.
size_t WriteModelFieldRows(TextWriter& out, const ClassDef& def);
// The fields that those rows describe: the class's own, then those of its mixins.
struct MixedModelField {
  const ModelField* field;
  bool inMember;  // of `_model_`
};
std::vector<MixedModelField> AllModelFields(const ClassDef& def);

}  // namespace qrex
