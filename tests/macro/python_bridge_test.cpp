// The bridge against a real interpreter; skipped where there is none.

#include "macro/python_bridge.h"

#include <gtest/gtest.h>

#include "macro/expand.h"
#include "message_of.h"
#include "text_cases.h"

namespace qrex {
namespace {

class PythonTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const std::string answer = Eval("1");
    if (answer.find("can't be loaded") != std::string::npos) GTEST_SKIP() << answer;
  }

  static std::string Eval(const std::string& expression) {
    return MessageOf([&] { return EvalPython(expression, nullptr); });
  }
  static std::string Run(const std::string& code) {
    return MessageOf([&] {
      RunPython("commands block", code, nullptr);
      return std::string();
    });
  }
  // Each call is a file of its own.
  std::string Expand(std::string_view text) {
    return MessageOf([&] {
      MacroWorld world;
      LSFileFrame frame(world);
      return ExpandToString(nullptr, frame, TextRange(text));
    });
  }
};

TEST_F(PythonTest, ValuesAsText) {
  for (const auto& [name, expression, text] : TextCasesOf("macro/cases/python_values.txt")) {
    EXPECT_EQ(Eval(expression), text) << expression;
  }
  Run("endless = []\nendless.append(endless)\n");
  EXPECT_EQ(Eval("endless"), "Python list nested too deeply");
}

TEST_F(PythonTest, ErrorsBringTheTracebackAndLeaveNoneBehind) {
  EXPECT_EQ(Eval("x = 1"),
            "Eval python error:   File \"<string>\", line 1\n    x = 1\n      ^\nSyntaxError: invalid syntax\n");
  EXPECT_EQ(Eval("missing"),
            "Eval python error: Traceback (most recent call last):\n  File \"<string>\", line 1, in <module>\n"
            "NameError: name 'missing' is not defined\n");
  EXPECT_EQ(Run("if True\n"),
            "Python compilation error:   File \"commands block\", line 1\n    if True\n          ^\n"
            "SyntaxError: invalid syntax\n");
  EXPECT_EQ(Run("x = 1\nimport no_such_module\n"),
            "RunPython error: Traceback (most recent call last):\n  File \"commands block\", line 2, in <module>\n"
            "ImportError: No module named no_such_module\n");
  EXPECT_EQ(Run("import sys\nsys.exit()\n"), "RunPython error: SystemExit: \n");
  EXPECT_EQ(Run("import sys\nsys.exit(3)\n"), "RunPython error: SystemExit: 3\n");
  EXPECT_EQ(Eval("exit('why')"), "Eval python error: SystemExit: why\n");
  EXPECT_EQ(Eval("1 + 1"), "2");
}

TEST_F(PythonTest, NamesAreSharedByAllFilesOfARun) {
  EXPECT_EQ(Expand("@runpython\n"
                   "{\n"
                   "    import math\n"
                   "    def root(x):\n"
                   "        return int(math.sqrt(x))\n"
                   "}\n"
                   "first\n"),
            "first\n");
  EXPECT_EQ(Expand("@runpython {\n"
                   "    if base0:\n"
                   "        base0 = 0\n"
                   "}\n"),
            "RunPython error: Traceback (most recent call last):\n  File \"\", line 1, in <module>\n    \n"
            "NameError: name 'base0' is not defined\n\n    in @runpython()\n");
  EXPECT_EQ(Expand("@def n = 64\n"
                   "@runpython { base = n }\n"
                   "@defpython eighth(x) = root(base) + x\n"
                   "eighth(n + 1)|eighth(2)\n"),
            "73|10\n");
}

TEST_F(PythonTest, ErrorsOfDirectivesNameThem) {
  EXPECT_EQ(Expand("@runpython { 1 / 0 }"),
            "RunPython error: Traceback (most recent call last):\n  File \"\", line 1, in <module>\n    \n"
            "ZeroDivisionError: integer division or modulo by zero\n\n    in @runpython()\n");
  // Python counts the lines as they are written, from the one behind the brace.
  for (const auto& [block, line] : {std::pair{"@runpython {\n\n  \n    x = 1\n    1 / 0\n}", "line 4,"},
                                    {"@runpython\n{\n\n    if 1:\n        1 / 0\n}", "line 3,"},
                                    {"@runpython {  \n1 / 0 }", "line 2,"}}) {
    EXPECT_NE(Expand(block).find(line), std::string::npos) << Expand(block);
  }
  EXPECT_EQ(Expand("@defpython nothing(x) = None\nnothing(1)"),
            "Can't convert python result of type NoneType\n    invoking python macro nothing\n"
            "    invoking macro nothing(x) with x=1");
  EXPECT_EQ(Expand("@assertfails(@runpython { 1 / 0 })rest"), "rest");
}

}  // namespace
}  // namespace qrex
