// What a type is to accessors, attribute structs and forwarders, which write other functions for each shape.
#pragma once

#include <string>

#include "translator/declared/class_def.h"
#include "translator/model/field_path.h"

namespace qrex {

enum class Shape {
  Value,    // read and set as a whole
  Model,    // field by field
  Vector,   // also a string: pieces are inserted and erased
  Indexed,  // an array or a map: each element has accessors of its own
  KeySet    // keys are inserted and deleted
};

struct TypeShape {
  Shape shape = Shape::Value;
  const ClassDef* model = nullptr;  // of Model
  TypeView element = {};            // of containers: of a map the value, of a set the key
  TypeView key = {};                // of a map; else elements have numbers
  int64_t bound = -1;               // of a fixed array

  // Of Indexed:
  PathElement Step() const { return key.Empty() ? PathElement::Index(bound) : PathElement::Key(key); }
  std::string KeyText() const { return key.Empty() ? "vesk::ssize_t" : TypeText(key); }
};

// Of a type that has no metadata, typedef or decorator at its head. It views the type.
TypeShape ShapeOf(TypeView type, NameSpace& root);

}  // namespace qrex
