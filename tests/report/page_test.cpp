// The data of the page: what follows from the record alone.

#include "report/page.h"

#include "world_fixture.h"

namespace qrex {
namespace {

class PageTest : public WorldTest {
 protected:
  // A step from `begin` to `end`, in units of a millisecond.
  void Add(Span::Kind kind, ToolTask task, int64_t begin, int64_t end) {
    Span span;
    span.kind = kind;
    span.task = std::move(task);
    span.begin = m_record.begin + begin * 10'000;
    span.end = m_record.begin + end * 10'000;
    span.isOver = true;
    m_record.spans.push_back(std::move(span));
  }
  void Translate(const std::string& name, int64_t begin, int64_t end) {
    Add(Span::Kind::Translation,
        {.project = "app", .source = name + ".cpp", .output = "t/" + name + ".cpp", .inputs = {}}, begin, end);
  }
  void Compile(const std::string& name, int64_t begin, int64_t end) {
    Add(Span::Kind::Tool, {ToolKind::Compiler, "app", name + ".cpp", name + ".o", {"t/" + name + ".cpp"}}, begin, end);
  }
  void Link(const std::string& output, std::vector<std::string> inputs, int64_t begin, int64_t end) {
    Add(Span::Kind::Tool, {ToolKind::Linker, "app", "", output, std::move(inputs)}, begin, end);
  }

  BuildRecord m_record{TraceMessages()};
};

TEST_F(PageTest, CriticalPathIsTheLongestChainOfNeeds) {
  EXPECT_EQ(0u, CriticalPath(m_record).size());
  Translate("a", 0, 10);
  Compile("a", 10, 110);
  Translate("b", 10, 90);
  Compile("b", 90, 150);  // 140 of its chain, 110 of the one of a
  Link("lib", {"a.o", "b.o", "c.o"}, 150, 160);
  Compile("d", 150, 290);                   // 140, without a need
  Link("app", {"d.o", "lib"}, 290, 300);    // 160 by the library, 150 by d
  Link("app", {"app.manifest"}, 300, 305);  // goes on with what is there
  EXPECT_EQ((std::vector<size_t>{2, 3, 4, 6, 7}), CriticalPath(m_record));
}

TEST_F(PageTest, MessagesHaveTheLinesOfTheirSources) {
  Write("tree/t.h", "one\ntwo\nthree\nfour " + std::string(400, 'x') + "\n\xff");
  m_record.files["t.h"] = {"app", "tree/t.h", {"u.h"}};
  const auto take = [&](const std::string& file, int64_t line, const std::string& generated) {
    m_record.Take(ToolMessage{Severity::Warning, "warning: <b>", {file, line}, {generated, 7}});
  };
  take("tree/t.h", 4, "gen/t.h");
  take("tree/t.h", 1, "");
  take("tree/t.h", 99, "");
  take("/dev/zero", 1, "");
  take("nosuch\xff", 1, "");
  m_record.End();
  const std::string page = PageText(m_record, {"</title><b>", "x", false});
  const auto holds = [&](const std::string& part) { return page.find(part) != std::string::npos; };
  const std::string head = R"({"severity":"warning","text":"warning: \u003cb>","place":")";
  const std::string cut = "four " + std::string(295, 'x');
  EXPECT_TRUE(holds(head + R"(tree/t.h","line":4,"generated":"gen/t.h:7","path":"t.h","lines":[[3,"three"],[4,")" +
                    cut + R"("],[5,"ÿ"]]})"))
      << page;
  EXPECT_TRUE(holds(head + R"(tree/t.h","line":1,"path":"t.h","lines":[[1,"one"],[2,"two"]]})"));
  EXPECT_TRUE(holds(head + R"(tree/t.h","line":99,"path":"t.h","lines":[]})"));
  EXPECT_TRUE(holds(head + R"(/dev/zero","line":1,"lines":[]})"));
  EXPECT_TRUE(holds(head + R"(nosuchÿ","line":1,"lines":[]})"));
  EXPECT_TRUE(holds(R"("title":"\u003c/title>\u003cb>")") && holds(R"("completed":false)"));
  for (const char* mark : {"/*style*/", "/*data*/", "/*script*/"}) EXPECT_FALSE(holds(mark));
}

}  // namespace
}  // namespace qrex
