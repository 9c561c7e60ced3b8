// Random edits of a small workspace. After each, what one living builder has made of it must be what a fresh one makes.
#include <map>
#include <random>
#include <vector>

#include "text/source_texts.h"
#include "text/stream_adapters.h"
#include "translator/file/translate_file.h"
#include "world_fixture.h"

namespace qrex {
namespace {

constexpr int kHeaders = 5;
constexpr int kSources = 4;  // the last one is the main source

class TranslateAgainTest : public WorldTest {
 protected:
  TranslateAgainTest() {
    std::string files;
    settings.macroWorld.sources = &m_texts;
    for (const std::string& name : Names()) {
      files += "\"src/" + name + "\" as \"" + name + "\" ";
    }
    AddProject("app", "Console Application", "qrex { }\n{ " + files + "}");
    workspace->CheckFileReferences();
  }

  static std::vector<std::string> Names() {
    std::vector<std::string> names;
    for (int i = 0; i < kHeaders; ++i) names.push_back("h" + std::to_string(i) + ".h");
    for (int i = 0; i + 1 < kSources; ++i) names.push_back((i == 0 ? "h" : "s") + std::to_string(i) + ".cpp");
    names.push_back("app.cpp");
    return names;
  }

  size_t Below(size_t end) { return m_random() % end; }
  bool Chance(size_t percent) { return Below(100) < percent; }
  std::string Name() { return std::string(1, static_cast<char>('A' + Below(8))); }

  // What stands in one file: of few names, so that files clash, hide each other and miss what they use.
  std::string Declaration() {
    const std::string name = Name(), other = Name(), scope = Chance(30) ? "n" : "";
    const std::string body = [&]() -> std::string {
      switch (Below(11)) {
        case 0:
          return "$enum+ " + name + " { one" + name + ", two };\n";
        case 1:
          return "$struct+ " + name + " { $int32 x; $" + other + " y; };\n";
        case 2:
          return "$class " + name + " { $int32 x; };\n";
        case 3:
          return "$class " + other + ";\n";
        case 4:
          return "$class+ " + other + ";\n";
        case 5:
          return "$typedef+ " + other + " " + name + ";\n";
        case 6:
          return "$model+ " + name + " { int32 a; " + (Chance(50) ? other + " b; " : "") + "};\n";
        case 7:
          return "@def mac" + name + "(x) = x+" + other + "\nint i" + other + " = mac" + other + "(1);\n";
        case 8:
          return "$init { }\n";
        case 9:
          return "$variant+ " + name + " { int32 i; " + other + " o; };\n";
        default:
          return "$struct " + name + " : " + other + " { };\n";
      }
    }();
    return scope.empty() ? body : "namespace " + scope + " {\n" + body + "}\n";
  }

  void Text(const std::string& name) {
    std::string text;
    const size_t headers = name[0] == 'h' && name.ends_with(".h") ? static_cast<size_t>(name[1] - '0') : kHeaders;
    for (size_t i = 0; i < headers; ++i) {
      if (Chance(35)) text += "@import \"h" + std::to_string(i) + ".h\"\n";
    }
    if (Chance(4)) text += "@import \"h" + std::to_string(Below(kHeaders)) + ".h\"\n";  // a cycle, perhaps
    for (size_t i = Below(3); i > 0; --i) text += Declaration();
    m_texts.Lay("tree/app/src/" + name, text);
  }

  std::map<std::string, std::string> Outputs() const {
    std::map<std::string, std::string> outputs;
    for (const ProjectFile* file : workspace->projects.front()->files) {
      const std::string path = builder->TranslatedPath(*file);
      if (FileExists(path)) outputs[path] = Read(path);
    }
    return outputs;
  }

  template <typename Work>
  static std::string ErrorOf(Work work) {
    try {
      work();
      return {};
    } catch (const IException& exception) {
      return ExceptionText(exception);
    }
  }

  // The error of a fresh build, and what it has written.
  std::pair<std::string, std::map<std::string, std::string>> Fresh() {
    namespace fs = std::filesystem;
    fs::create_directories("qrexsource");
    fs::rename("qrexsource", "living");
    ProjectBuilder fresh(settings, App(), *App().configs.front());
    std::pair<std::string, std::map<std::string, std::string>> result;
    result.first = ErrorOf([&] { fresh.Build("fresh.qrexdep", nullptr); });
    result.second = Outputs();
    fs::remove_all("qrexsource");
    fs::remove("fresh.qrexdep");
    fs::rename("living", "qrexsource");
    return result;
  }

  // Gives how many states of the workspace were sound.
  int Edit(unsigned seed, int edits) {
    m_random.seed(seed);
    for (const std::string& name : Names()) Text(name);
    StartBuild();
    std::string error = ErrorOf([&] { builder->Build("app.qrexdep", nullptr); });
    int sound = 0;
    for (int i = 0; i < edits; ++i) {
      const auto [freshError, outputs] = Fresh();
      EXPECT_EQ(freshError, error) << "edit " << i << " of seed " << seed;
      if (freshError.empty()) {
        ++sound;
        EXPECT_EQ(outputs, Outputs()) << "edit " << i << " of seed " << seed;
      }
      if (HasFailure()) return sound;
      std::vector<ProjectFile*> changed;
      for (size_t count = Chance(80) ? 1 : 2; count > 0; --count) {
        const std::vector<std::string> names = Names();
        const std::string& name = names[Below(names.size())];
        Text(name);
        changed.push_back(workspace->FindFile("app/src/" + name));
      }
      error = ErrorOf([&] { builder->TranslateAgain(changed); });
    }
    return sound;
  }

 protected:
  OverlaidTexts m_texts;

 private:
  std::mt19937 m_random{1};
};

TEST_F(TranslateAgainTest, IsWhatAFreshBuildWouldBe) {
  int sound = 0;
  for (unsigned seed = 1; seed <= 6; ++seed) sound += Edit(seed, 60);
  EXPECT_GT(sound, 60);
}

class Kept : public MessageConsumer {
 public:
  void Take(const Message& message) override { messages.push_back(message); }
  std::vector<Message> messages;
};

TEST_F(TranslateAgainTest, FromMemoryWithoutWriting) {
  for (const std::string& name : Names()) m_texts.Lay("tree/app/src/" + name, "");
  m_texts.Lay("tree/app/src/h0.h", "@def one = 1\r\n$enum+ E { a };\n");
  m_texts.Lay("tree/app/src/app.cpp", "@import \"h0.h\"\nint i = one;\n\n$enum+ E;\n");
  Kept kept;
  settings.macroWorld.messages = &kept;
  StartBuild();
  PagedBuffer buffer;
  PagedBufferToOutputStreamAdapter target(buffer);
  TranslateInto(Scanned("app/src/app.cpp"), target);
  std::string text;
  buffer.AppendTo(text);
  EXPECT_NE(text.find("#include \"h0.h\"\nint i = 1;\n"), std::string::npos) << text;
  EXPECT_FALSE(FileExists("qrexsource/x64/Debug/app/src/app.cpp") || FileExists("qrexsource/x64/Debug/app/src/h0.h"));
  ASSERT_EQ(1u, kept.messages.size());
  const Message& warning = kept.messages[0];
  EXPECT_EQ(Severity::Warning, warning.severity);
  EXPECT_EQ("1017 tree/app/src/app.cpp 4",
            std::to_string(warning.code) + " " + warning.place.file + " " + std::to_string(warning.place.line));
  EXPECT_EQ("", trace);
}

}  // namespace
}  // namespace qrex
