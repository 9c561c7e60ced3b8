// What is recorded of a build, as a trace: hostile names, spans that did not end, the slots.

#include "report/trace_file.h"

#include "report/json_writer.h"
#include "world_fixture.h"

namespace qrex {
namespace {

TEST(JsonWriterTest, TextsOfAnyBytes) {
  JsonWriter json;
  json.Open('{').Member("a", "</script><b>\"\\\n\x7f \xff \u00e9").Key("l").Open('[').Value(int64_t{-1}).Value(true);
  json.Open('[').Close(']').Line().Value("").Close(']').Close('}');
  EXPECT_EQ("{\"a\":\"\\u003c/script>\\u003cb>\\\"\\\\\\u000a\\u007f \u00ff \u00e9\",\"l\":[-1,true,[],\n\"\"]}",
            json.Text());
}

class TraceFileTest : public WorldTest {
 protected:
  static ToolTask Compiling(const std::string& name) {
    return {ToolKind::Compiler, "app", "app/src/" + name + ".cpp", name + ".o", {}};
  }
};

TEST_F(TraceFileTest, ToolsTakeTheFirstFreeSlot) {
  BuildRecord record(TraceMessages());
  record.ToolBegins(0, Compiling("a"));
  record.ToolBegins(1, Compiling("b"));
  record.ToolEnds(0, {});
  record.ToolBegins(2, Compiling("c"));
  record.ToolEnds(2, {.code = 1});
  record.IsStale("c.o", {MakeReason::Cause::Changed, "tree/t.h", 1});
  record.End();
  ASSERT_EQ(3u, record.spans.size());
  EXPECT_EQ("1 2 1", std::to_string(record.spans[0].slot) + " " + std::to_string(record.spans[1].slot) + " " +
                         std::to_string(record.spans[2].slot));
  const std::string text = TraceText(record);
  const auto holds = [&](std::string_view part) { return text.find(part) != std::string::npos; };
  EXPECT_TRUE(holds("\"args\":{\"name\":\"slot 2\"}")) << text;
  EXPECT_TRUE(holds("\"output\":\"b.o\",\"ended\":\"with the run\"}")) << text;
  EXPECT_TRUE(holds("\"output\":\"c.o\",\"why\":\"tree/t.h was newer\",\"failed\":true}")) << text;
}

}  // namespace
}  // namespace qrex
