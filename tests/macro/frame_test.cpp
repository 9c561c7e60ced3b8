// Names, imports and substitutions of frames; the map from the output back to the source.

#include "expand_fixture.h"
#include "message_of.h"

namespace qrex {

class FrameTest : public ::testing::Test {
 protected:
  static void Define(LSFrame& frame, const char* name, const char* value) {
    frame.AddVariable(std::make_unique<LSVar>(name, value));
  }
  static std::string Find(const LSFrame& frame, const char* name) {
    return MessageOf([&] {
      const LSVariable* found = frame.Find(name, nullptr);
      return found ? found->ValueText() : "none";
    });
  }

  MacroWorld world;
  LSFileFrame a{world}, b{world}, c{world}, d{world};
};

TEST_F(FrameTest, ImportsThatDisagree) {
  Define(d, "x", "d");
  b.AddImport(d);
  c.AddImport(d);
  a.AddImport(b);
  a.AddImport(c);
  EXPECT_EQ("d", Find(a, "x"));  // one variable by two ways
  Define(b, "x", "b");
  EXPECT_EQ("Ambiguous macro name : x", Find(a, "x"));
  Define(c, "x", "c");
  EXPECT_EQ("Ambiguous macro name : x", Find(a, "x"));
  EXPECT_EQ("b", Find(b, "x"));
  LSFileFrame e(world);
  e.AddImport(b);
  EXPECT_EQ("b", Find(e, "x"));  // the nearer one, though d is in view
}

TEST_F(FrameTest, Substitutions) {
  a.AddOrderedImport(b);
  a.AddOrderedImport(c);
  b.AddOrderedImport(d);
  a.AddImport(d);
  d.DefineSubstitution("x", "of d");
  c.DefineSubstitution("x", "of c");
  c.DefineSubstitution("y", "<$(x)>");
  std::string text = "$(x) $(y) $(z) $() $(1) $(x";
  EXPECT_TRUE(a.Substitute(text));
  EXPECT_EQ("of d <of d> $(z) $() $(1) $(x", text);  // in the order of the imports, depth first
  a.DefineSubstitution("x", "1");
  a.DefineSubstitution("x", "2");
  text = "$(x)$$(x)";
  EXPECT_TRUE(a.Substitute(text));
  EXPECT_EQ("2$2", text);
  EXPECT_EQ("2", Find(a, "_x_"));
  EXPECT_FALSE(a.Substitute(text));
}

TEST_F(FrameTest, Dump) {
  const std::string text = "@def m(x,int y) = x + y\n@let int i = 4\n";
  ExpandToString(nullptr, a, TextRange(std::string_view(text)));
  LSFrame child(&a);
  MemoryTextWriter writer;
  child.WriteFrame(writer);
  EXPECT_EQ(
      "{\n    Local vars\n    [\n    ]\n    Parent frame\n    {\n        Local vars\n        [\n        i = 4\n"
      "        m(x,y) = x + y\n        ]\n    }\n}\n",
      writer.TakeText());
}

// --- Source maps

// The runs as "begin+length" of the source text, "=" in front of a generated one, "indent" for blanks.
std::string Runs(const SourceMap& map, const std::string& source) {
  std::string runs;
  EXPECT_EQ(1u, map.PageCount());
  for (const SourceMapRun* it = map.PageBegin(0); it != map.PageEnd(0); ++it) {
    const SourceMapRun& run = *it;
    if (!runs.empty()) runs += " ";
    if (!run.SourceBegin()) {
      runs += "indent+" + std::to_string(run.Length());
    } else {
      runs += (run.IsGenerated() ? "=" : "") + std::to_string(run.SourceBegin() - source.data()) + "+" +
              std::to_string(run.Length());
    }
  }
  return runs;
}

TEST(SourceMapTest, Sink) {
  const std::string source = "ab\ncd";
  const TextRange whole{std::string_view(source)};
  ExpansionSink sink;
  sink.WriteVerbatim(whole, 0);
  EXPECT_EQ("0+5", Runs(sink.map, source));
  sink = {};
  sink.WriteVerbatim(whole, 4);
  EXPECT_EQ("    ab\n    cd", sink.output);
  EXPECT_EQ("indent+4 0+3 indent+4 3+2", Runs(sink.map, source));
  EXPECT_EQ(6u, sink.ColumnHere().ColumnsIn(sink.output));
  sink.WriteGenerated("\t1\n2", source.data() + 1, 4);
  EXPECT_EQ("    ab\n    cd\t1\n    2", sink.output);
  EXPECT_EQ("indent+4 0+3 indent+4 3+2 =1+8", Runs(sink.map, source));
  EXPECT_EQ(5u, sink.ColumnHere().ColumnsIn(sink.output));
  sink.WriteGenerated("", source.data(), 4);
  sink.WriteVerbatim({source.data() + 2, source.data() + 2}, 4);
  EXPECT_EQ("indent+4 0+3 indent+4 3+2 =1+8", Runs(sink.map, source));
  EXPECT_EQ(nullptr, MapOutputOffset(sink.map, 3));
  EXPECT_EQ(source.data(), MapOutputOffset(sink.map, 4));
  EXPECT_EQ(source.data() + 4, MapOutputOffset(sink.map, 12));
  EXPECT_EQ(source.data() + 1, MapOutputOffset(sink.map, 20));
  MapCursor cursor(sink.map);
  for (int64_t offset = 0; offset < 21; ++offset) {
    EXPECT_EQ(MapOutputOffset(sink.map, offset), cursor.Map(offset)) << offset;
  }
  EXPECT_THROW(MapOutputOffset(sink.map, 21), ExceptionBase);
}

TEST(SourceMapTest, Expansions) {
  const std::string source = "x@//\n\n  m \"$(v)\" @@y @(1 + 1)\n@if (true)\n{\n  m\n  n\n}\n";
  MacroWorld world;
  LSFileFrame frame(world);
  frame.AddVariable(std::make_unique<LSVar>("m", "long"));
  frame.DefineSubstitution("v", "w");
  SourceMap map;
  const std::string output = ExpandToStringWithMap(nullptr, frame, TextRange(std::string_view(source)), 0, 0, map);
  EXPECT_EQ("x  long \"w\" y 2\nlong\nn\n", output);
  EXPECT_EQ("0+1 6+2 =8+4 9+1 =10+3 16+1 19+2 =21+1 29+1 =45+4 46+1 49+1 52+1", Runs(map, source));
}

}  // namespace qrex
