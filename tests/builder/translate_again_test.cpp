// Random edits of a small workspace. After each, what one living builder, or run after run, has made of it must be what
// a fresh one makes.
#include <algorithm>
#include <map>
#include <random>
#include <vector>

#include "platform/file_system.h"
#include "platform/system.h"
#include "text/output_policy.h"
#include "text/source_texts.h"
#include "text/stream_adapters.h"
#include "translator/file/translate_file.h"
#include "world_fixture.h"

namespace qrex {
namespace {

constexpr int kHeaders = 5;
constexpr int kSources = 4;  // the last one is the main source

class Kept : public MessageConsumer {
 public:
  void Take(const Message& message) override { messages.push_back(message); }
  std::vector<Message> messages;
};

class TranslateAgainTest : public WorldTest {
 protected:
  TranslateAgainTest() {
    std::string files;
    settings.macroWorld.sources = &m_texts;
    settings.macroWorld.messages = &m_kept;
    for (const std::string& name : Names()) {
      files += "\"src/" + name + "\" as \"" + name + "\" ";
    }
    AddProject("app", "Console Application", "qrex { " + files + "}");
    AddProject("Vesk/vxObject", "Utility Project", "qrex { \"IObject.h\" }");
    Lay("tree/Vesk/vxObject/IObject.h", "namespace vesk\n{\n$interface+ IObject\n{\n};\n}\n");
    workspace->CheckFileReferences();
  }

  static std::vector<std::string> Names() {
    std::vector<std::string> names;
    for (int i = 0; i < kHeaders; ++i) names.push_back("h" + std::to_string(i) + ".h");
    for (int i = 0; i + 1 < kSources; ++i) names.push_back((i == 0 ? "h" : "s") + std::to_string(i) + ".cpp");
    names.push_back("app.cpp");
    return names;
  }

  // In memory, and on the disk with a time of its own, finer than the ticks of the system's clock.
  void Lay(const std::string& path, const std::string& text) {
    m_texts.Lay(path, text);
    Write(path, text);
    platform::SetWriteTime(path, platform::SystemFileTime());  // what libraries set may be in whole seconds
  }

  size_t Below(size_t end) { return m_random() % end; }
  bool Chance(size_t percent) { return Below(100) < percent; }

  // Each header has names of its own; now and then a file takes another's, so that files clash and hide each other.
  std::string NameOf(size_t header) {
    if (Chance(4)) header = Below(kHeaders + 1);
    return std::string(1, static_cast<char>('A' + 3 * header + Below(3)));
  }
  // A type that was declared in one of the headers when it was written, and may be gone.
  std::string Type(const std::vector<size_t>& imports) {
    if (imports.empty() || Chance(20)) return "int32";
    const std::string& names = m_declared[imports[Below(imports.size())]];
    return names.empty() ? "int32" : std::string(1, names[Below(names.size())]);
  }

  std::string Declaration(size_t header, const std::vector<size_t>& imports) {
    const std::string name = NameOf(header), type = Type(imports), plus = Chance(50) ? "+ " : " ";
    if (Chance(15)) return header < kHeaders ? "$struct X;\n" : Chance(30) ? "$enum X { x };\n" : "";
    const size_t form = Below(12);
    if (form < 7 && header < kHeaders) m_declared[header] += name;
    switch (form) {
      case 0:
        return "$enum" + plus + name + " { one" + name + ", two" + name + " };\n";
      case 1:
        return "$struct" + plus + name + " { $" + type + " x; $int32 y; };\n";
      case 2:
        return "$class" + plus + name + " { $xvector<" + type + "> x; };\n";
      case 3:
        return "$typedef" + plus + type + " " + name + ";\n";
      case 4:
        return "$model" + plus + name + " { int32 a; " + type + " b; };\n";
      case 5:
        return "$variant" + plus + name + " { int32 i; " + type + " o; };\n";
      case 6:
        return "$struct" + plus + NameOf(Below(kHeaders)) + ";\n";
      case 7:
        return "@def mac" + name + "(x) = x + " + std::to_string(Below(9)) + "\n";
      case 8:
        return "int i" + name + " = mac" + NameOf(Below(kHeaders)) + "(1);\n";
      case 9:
        return "$init { int i = 0; }\n";
      case 10:
        return "$function" + plus + "void f" + name + "(" + type + " t);\n";
      default:
        return "namespace n { $enum" + plus + name + " { in" + name + " }; }\n";
    }
  }

  void Text(const std::string& name) {
    std::string text = "@import \"Vesk/vxObject/IObject.h\"\n";
    const bool isHeader = name.ends_with(".h");
    const size_t header = isHeader ? static_cast<size_t>(name[1] - '0') : kHeaders;
    if (isHeader) m_declared[header].clear();
    std::vector<size_t> imports;
    for (size_t i = 0; i < header; ++i) {
      if (!Chance(isHeader ? 35 : 60)) continue;
      imports.push_back(i);
      text += "@import \"h" + std::to_string(i) + ".h\"\n";
    }
    if (Chance(2)) text += "@import \"h" + std::to_string(Below(kHeaders)) + ".h\"\n";  // a cycle, perhaps
    for (size_t i = Below(4); i > 0; --i) text += Declaration(header, imports);
    Lay("tree/app/src/" + name, text);
  }

  std::map<std::string, std::string> Outputs() const {
    std::map<std::string, std::string> outputs;
    for (const ProjectFile* file : workspace->projects.front()->files) {
      const std::string path = builder->paths.Translated(*file);
      if (FileExists(path)) outputs[path] = Read(path);
    }
    return outputs;
  }

  // With the note ahead of one that tells of another declaration: which of several that is depends on their order.
  template <typename Work>
  std::string ErrorOf(Work work) {
    m_kept.messages.clear();
    try {
      work();
      return {};
    } catch (const IException& exception) {
      MemoryTextWriter text;
      const std::string error = ExceptionText(exception);
      if (error.find(" conflicts with ") != error.npos) WriteMessage(text, m_kept.messages.back());
      text << error;
      return text.TakeText();
    }
  }

  // The error of a fresh build, and what it has written.
  std::pair<std::string, std::map<std::string, std::string>> Fresh() {
    namespace fs = std::filesystem;
    fs::create_directories("qrexsource");
    fs::rename("qrexsource", "living");
    ProjectBuilder fresh(settings, App(), *App().configs.front(), *scheduler);
    std::pair<std::string, std::map<std::string, std::string>> result;
    result.first = ErrorOf([&] { fresh.Build("fresh.qrexdep", nullptr); });
    result.second = Outputs();
    platform::RemoveTree("qrexsource");
    fs::remove("fresh.qrexdep");
    fs::rename("living", "qrexsource");
    return result;
  }

  enum class Way { Living, RunAfterRun };
  void StartRun() {
    settings.begun = platform::SystemFileTime();
    StartBuild();
  }
  // A run, now and then after one of a single file, or with an output that is gone.
  std::string ErrorOfRun() {
    if (Chance(15)) {
      settings.mode = RunMode::Compile;
      StartRun();
      ErrorOf([&] {
        builder->Build("app.qrexdep", workspace->FindFile("app/src/" + Names()[kHeaders + Below(kSources)]));
      });
      settings.mode = RunMode::Build;
    }
    if (const auto outputs = Outputs(); Chance(15) && !outputs.empty()) {
      DeleteThoughReadOnly(std::next(outputs.begin(), static_cast<ptrdiff_t>(Below(outputs.size())))->first);
    }
    StartRun();
    return ErrorOf([&] { builder->Build("app.qrexdep", nullptr); });
  }
  std::vector<int64_t> Times() const {
    std::vector<int64_t> times;
    for (const auto& [path, text] : Outputs()) times.push_back(LastWriteTime(path));
    return times;
  }

  // Gives how many states of the workspace were sound.
  int Edit(unsigned seed, int edits, Way way) {
    platform::RemoveTree("qrexsource");
    std::filesystem::remove("app.qrexdep");
    settings.macroWorld.sources = way == Way::Living ? &m_texts : m_disk;
    m_random.seed(seed);
    for (const std::string& name : Names()) Text(name);
    StartBuild();
    std::string error = way == Way::Living ? ErrorOf([&] { builder->Build("app.qrexdep", nullptr); }) : ErrorOfRun();
    int sound = 0;
    for (int i = 0; i < edits; ++i) {
      const auto [freshError, outputs] = Fresh();
      SCOPED_TRACE("edit " + std::to_string(i) + " of seed " + std::to_string(seed));
      if (way == Way::Living || freshError.empty()) {
        EXPECT_EQ(freshError, error);  // runs may meet another one of several first
      } else {
        EXPECT_NE("", error);
      }
      if (freshError.empty()) {
        ++sound;
        EXPECT_EQ(outputs, Outputs());
      }
      if (freshError.empty() && way == Way::RunAfterRun) {
        const std::vector<int64_t> times = Times();
        StartRun();
        builder->Build("app.qrexdep", nullptr);
        EXPECT_EQ(times, Times()) << "nothing was left to do";
      }
      if (HasFailure()) return sound;
      std::vector<std::string> names = Names();
      std::shuffle(names.begin(), names.end(), m_random);
      // What is broken would often stay so: then much is written anew.
      names.resize(freshError.empty() || Chance(50) ? 1 + Below(2) : names.size());
      std::vector<ProjectFile*> changed;
      for (const std::string& name : names) {
        Text(name);
        changed.push_back(workspace->FindFile("app/src/" + name));
      }
      error = way == Way::Living ? ErrorOf([&] { builder->TranslateAgain(changed); }) : ErrorOfRun();
    }
    return sound;
  }
  int EditSeeds(Way way) {
    int sound = 0;
    for (unsigned seed = 1; seed <= 6; ++seed) sound += Edit(seed, 60, way);
    return sound;
  }

 protected:
  const SourceTexts* const m_disk = settings.macroWorld.sources;
  OverlaidTexts m_texts;
  Kept m_kept;

 private:
  std::string m_declared[kHeaders];
  std::mt19937 m_random{1};
};

TEST_F(TranslateAgainTest, IsWhatAFreshBuildWouldBe) { EXPECT_GT(EditSeeds(Way::Living), 60); }

TEST_F(TranslateAgainTest, RunAfterRunIsWhatAFreshBuildWouldBe) { EXPECT_GT(EditSeeds(Way::RunAfterRun), 60); }

TEST_F(TranslateAgainTest, FromMemoryWithoutWriting) {
  for (const std::string& name : Names()) m_texts.Lay("tree/app/src/" + name, "");
  m_texts.Lay("tree/app/src/h0.h", "@def one = 1\r\n$enum+ E { a };\n");
  m_texts.Lay("tree/app/src/app.cpp", "@import \"h0.h\"\nint i = one;\n\n$enum+ E;\n");
  StartBuild();
  PagedBuffer buffer;
  PagedBufferToOutputStreamAdapter target(buffer);
  TranslateInto(Scanned("app/src/app.cpp"), target);
  std::string text;
  buffer.AppendTo(text);
  EXPECT_NE(text.find("#include \"h0.h\"\nint i = 1;\n"), std::string::npos) << text;
  EXPECT_FALSE(FileExists("qrexsource/x64/Debug/app/src/app.cpp") || FileExists("qrexsource/x64/Debug/app/src/h0.h"));
  ASSERT_EQ(1u, m_kept.messages.size());
  const Message& warning = m_kept.messages[0];
  EXPECT_EQ(Severity::Warning, warning.severity);
  EXPECT_EQ("1017 tree/app/src/app.cpp 4",
            std::to_string(warning.code) + " " + warning.place.file + " " + std::to_string(warning.place.line));
  EXPECT_EQ("", trace);
}

}  // namespace
}  // namespace qrex
