// Byte code arrays, string tables and TypeOps initialisers by example.

#include "translator/byte_code.h"

#include <gtest/gtest.h>

#include "translator/type_code.h"

namespace qrex {
namespace {

std::string Code(std::initializer_list<int> bytes) {
  std::string code;
  for (int byte : bytes) code += static_cast<char>(byte);
  return code;
}

TypeCode Named(uint8_t op, std::string_view name) {
  TypeCode code;
  AppendNamedType(code, op, name);
  return code;
}

std::string TypeArray(const TypeCode& code, StringTable& strings) {
  MemoryTextWriter out;
  WriteTypeByteCode(out, "A", strings, code);
  return out.TakeText();
}

std::string Array(const std::string& rows) { return "static const vesk::octet_t A[] =\n{\n" + rows + "};\n"; }

TEST(ByteCode, PlainTypesNeedNoStrings) {
  StringTable strings;
  EXPECT_EQ(Array("    0x51,0x10,0x04\n"), TypeArray(Code({kOpMap, kOpString8, kOpInt32}), strings));
  EXPECT_EQ(Array("    0x50,0x03,0x01,0x00,0x00,0x35,0x31,0x02\n"),
            TypeArray(Code({kOpArray, 3, 1, 0, 0, kOpPointer, kOpConst, kOpInt8}), strings));
  EXPECT_TRUE(strings.Empty());
  MemoryTextWriter out;
  WriteStringTable(out, strings, "N");
  EXPECT_EQ("", out.TakeText());
}

TEST(ByteCode, NamesBecomeIndices) {
  StringTable strings;
  const TypeCode map = Code({kOpMap}) + Named(kOpClass, "a::K") + Code({kOpVector}) + Named(kOpEnum, "E");
  EXPECT_EQ(Array("    0x51,0x20,0x00,0x00,0x44,0x23,0x01,0x00\n"), TypeArray(map, strings));
  EXPECT_EQ(Array("    0x20,0x00,0x00\n"), TypeArray(Named(kOpClass, "a::K"), strings)) << "stored once";
  MemoryTextWriter out;
  WriteStringTable(out, strings, "N");
  EXPECT_EQ("static vesk::ConstStringZ N_stringTable[] =\n{\n    \"a::K\",\n    \"E\",\n};\n", out.TakeText());
}

TEST(ByteCode, Metadata) {
  StringTable strings;
  // int32 : [ 7, "x\n", true, 1.0, f(g) ]
  std::string code = Code({kOpMetaList + 5,
                           kOpMetaInt,
                           7,
                           0,
                           0,
                           0,
                           kOpMetaString,
                           2,
                           'x',
                           '\n',
                           kOpMetaBool,
                           1,
                           kOpMetaFloat,
                           0,
                           0,
                           0,
                           0,
                           0,
                           0,
                           0xf0,
                           0x3f,
                           kOpMetaFunctor + 1,
                           1,
                           'f',
                           kOpMetaFunctor,
                           1,
                           'g',
                           kOpInt32});
  EXPECT_EQ(Array("    0xe5,0xa2,0x07,0x00,0x00,0x00,0xa4,0x00,0x00,0xa1,0x01,0xa3,0x00,0x00,0x00,0x00,\n"
                  "    0x00,0x00,0xf0,0x3f,0xc1,0x01,0x00,0xc0,0x02,0x00,0x04\n"),
            TypeArray(code, strings));
  MemoryTextWriter out;
  WriteStringTable(out, strings, "");
  WriteMetadataByteCode(out, "B", strings, Code({kOpMetaList}));
  EXPECT_EQ(
      "static vesk::ConstStringZ _stringTable[] =\n{\n    \"x\\n\",\n    \"f\",\n    \"g\",\n};\n"
      "static const vesk::octet_t B[] =\n{\n    0xe0\n};\n",
      out.TakeText());
}

TEST(ByteCode, LinesHoldSixteenBytes) {
  StringTable strings;
  std::string line = "    0x35";
  for (int i = 0; i < 14; ++i) line += ",0x35";
  const TypeCode pointers(15, static_cast<char>(kOpPointer));
  EXPECT_EQ(Array(line + ",0x04\n"), TypeArray(pointers + Code({kOpInt32}), strings));
  EXPECT_EQ(Array(line + ",0x35,\n    0x04\n"), TypeArray(pointers + Code({kOpPointer, kOpInt32}), strings));
}

TEST(ByteCode, LongNames) {
  StringTable strings;
  const std::string name(300, 'n');
  EXPECT_EQ(Array("    0x21,0x00,0x00\n"), TypeArray(Named(kOpInterface, name), strings));
  EXPECT_EQ(name, strings.Strings().front());
}

TEST(ByteCode, TypeOps) {
  MemoryTextWriter out;
  WriteTypeOps(out, "T", 0);
  EXPECT_EQ("sizeof(T),\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0,\n0\n", out.TakeText());
  WriteTypeOps(out, "T", kOpsLess | kOpsCopy);
  EXPECT_EQ(
      "sizeof(T),\n0,\n(vesk::CompareVariableFn) (bool (*)(T const*, T const*)) vesk::VariableLess<T>,\n0,\n0,\n"
      "(vesk::CopyConstructArrayFn) (void (*)(T*, vesk::ssize_t, T const*, vesk::ssize_t, vesk::ssize_t)) "
      "vesk::CopyConstructArray<T>,\n"
      "(vesk::AssignArrayFn) (void (*)(T*, vesk::ssize_t, T const*, vesk::ssize_t, vesk::ssize_t)) "
      "vesk::AssignArray<T>,\n0,\n0,\n0,\n0,\n0,\n"
      "(vesk::FindInArrayFn) (vesk::ssize_t (*)(T const*, vesk::ssize_t, vesk::ssize_t, T const*)) "
      "vesk::BinaryLowerBound<T>,\n"
      "(vesk::FindInArrayFn) (vesk::ssize_t (*)(T const*, vesk::ssize_t, vesk::ssize_t, T const*)) "
      "vesk::BinaryUpperBound<T>\n",
      out.TakeText());
}

}  // namespace
}  // namespace qrex
