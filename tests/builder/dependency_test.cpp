// The dependency file against bytes written by hand, and what it makes stale.

#include "builder/dependency_file.h"
#include "builder/staleness.h"
#include "driver/run_workspace.h"
#include "message_of.h"
#include "world_fixture.h"

namespace qrex {
namespace {

std::string LittleEndian(uint64_t value, size_t bytes) {
  std::string text;
  for (size_t i = 0; i < bytes; ++i) text += static_cast<char>(value >> 8 * i);
  return text;
}

// Strings shorter than 128 bytes.
std::string Text(const std::string& text) { return static_cast<char>(text.size()) + text; }

std::string Entry(const std::string& path, int64_t time, const std::vector<std::string>& imports,
                  bool declares = false) {
  std::string bytes = Text(path) + LittleEndian(static_cast<uint64_t>(time), 8) + LittleEndian(imports.size(), 4);
  for (const std::string& import : imports) bytes += Text(import);
  return bytes + (declares ? '\1' : '\0');
}

const std::string kNoRegistrations("\0\0\0", 3);  // the end of the files, and both registries

class DependencyTest : public WorldTest {
 protected:
  DependencyTest() {
    settings.mode = RunMode::Build;
    WriteProject("lib", "Static Library", "qrex { \"l.h\" \"l.cpp\" }");
    WriteProject("app", "qrex { \"a.h\" \"b.h\" \"c.h\" \"x.cpp\" \"y.cpp\" \"app.cpp\" }");
    EXPECT_TRUE(Load({"app", "lib"}) && workspace->CheckFileReferences()) << trace;
    StartBuild();
  }
  void WriteDependencies(const std::string& payload) { WriteCheckedFile(0x2AEF78F1, payload, "dep"); }

  // Gives a file the time of so many ticks of 100 ns behind a moment of the past.
  static void SetTime(const std::string& path, int64_t ticks) {
    Write(path, "");
    SetStamp(path, s_moment + std::chrono::nanoseconds(100 * ticks));
  }
  static int64_t Moment() {
    SetTime("moment", 0);
    return LastWriteTime("moment");
  }
  // Writes sources and outputs, with times relative to the moment; no output where the time is negative.
  void WriteFiles(const std::map<std::string, std::pair<int, int>>& times) {
    for (const auto& [name, time] : times) {
      SetTime("tree/app/" + name, time.first);
      if (time.second >= 0) SetTime("qrexsource/x64/Debug/app/" + name, time.second);
    }
  }
  std::string Stale() {
    std::string names;
    for (ProjectFile* file : App().files) {
      if (NeedsTranslation(*builder, builder->GetScannedFile(*file))) names += file->name + " ";
    }
    return names;
  }

 private:
  static inline const auto s_moment = std::filesystem::file_time_type::clock::now() - std::chrono::hours(1);
};

TEST_F(DependencyTest, Bytes) {
  EXPECT_EQ(kNoRegistrations, DependencyPayload(*builder));
  const std::string payload = Entry("app/a.h", 0x0102030405060708, {"lib/l.h", "app/b.h"}, true) +
                              Entry("app/b.h", 0, {}) + Entry("app/x.cpp", -1, {"app/a.h"}) +
                              Entry("lib/l.h", 0, {}, true) + '\0' + "\x02" + Text("app/x.cpp") + "\x02" +
                              Text("n::A") + Text("x0") + Text("app/y.cpp") + "\x01" + Text("y0") + "\x01" +
                              Text("app/x.cpp") + "\x01" + Text("A");
  WriteDependencies(payload);
  EXPECT_EQ(std::string("\xF1\x78\xEF\x2A", 4), Read("dep").substr(0, 4));
  EXPECT_EQ(LittleEndian(payload.size(), 8) + payload, Read("dep").substr(8));
  builder->registerMap.dirty = true;
  EXPECT_TRUE(LoadDependencyFile(*builder, "dep"));
  EXPECT_TRUE(builder->dependencyFileLoaded);
  EXPECT_FALSE(builder->registerMap.dirty || builder->unregisterMap.dirty);
  EXPECT_EQ(&Scanned("lib/l.h"), Scanned("app/a.h").imports.at(0));
  EXPECT_EQ(0x0102030405060708, Scanned("app/a.h").times.translation);
  EXPECT_TRUE(Scanned("app/a.h").hasDeclarations && !Scanned("app/b.h").hasDeclarations);
  EXPECT_EQ(payload, DependencyPayload(*builder));
  builder->registerMap.dirty = true;
  SaveDependencyFile(*builder, "deep/er/dep");
  EXPECT_EQ(Read("dep"), Read("deep/er/dep"));
  EXPECT_FALSE(builder->registerMap.dirty);
  EXPECT_EQ("", trace);
  SaveDependencyFile(*builder, "deep/er");
  EXPECT_EQ("*** Couldn't save dependency file deep/er\n", trace);
}

TEST_F(DependencyTest, DamagedFiles) {
  const std::string payload =
      Entry("app/a.h", 5, {"app/b.h"}) + '\0' + "\x01" + Text("app/x.cpp") + "\x01" + Text("x0") + '\0';
  WriteDependencies(payload);
  const std::string whole = Read("dep");
  auto assertAbsent = [&](const std::string& expected) {
    StartBuild();
    EXPECT_FALSE(LoadDependencyFile(*builder, "dep"));
    EXPECT_EQ(expected, TakeTrace());
    EXPECT_FALSE(builder->dependencyFileLoaded);
    EXPECT_EQ(kNoRegistrations, DependencyPayload(*builder));
  };
  for (size_t i = 0; i < whole.size(); ++i) {
    std::string flipped = whole;
    flipped[i] = static_cast<char>(flipped[i] ^ 1 << i % 8);
    Write("dep", flipped);
    assertAbsent("");
    Write("dep", whole.substr(0, i));
    assertAbsent("");
  }
  for (size_t i = 0; i < payload.size(); ++i) {  // well-formed outside
    WriteDependencies(payload.substr(0, i));
    assertAbsent("*** Error reading dep : Deserialisation error\n");
  }
  std::filesystem::remove("dep");
  assertAbsent("");
  WriteDependencies(Entry("app/a.h", 5, {"app/b.h"}) + Entry("app/gone.h", 5, {}) + kNoRegistrations);
  assertAbsent("*** Cannot find file app/gone.h\n");
  WriteDependencies(Entry("app/a.h", 5, {"app/b.h", "gone.h"}) + kNoRegistrations);
  assertAbsent("*** Cannot find file gone.h\n");
  WriteDependencies(Text("app/a.h") + LittleEndian(5, 8) + LittleEndian(0xFFFFFFFF, 4) + Text("app/b.h"));
  assertAbsent("*** Error reading dep : Deserialisation error\n");
  const std::string registered = "\x01" + Text("lib/l.cpp") + "\x01" + Text("l0") + '\0';
  WriteDependencies(Entry("app/x.cpp", 5, {}) + Entry("lib/l.cpp", 5, {}) + '\0' + registered);  // of another project
  assertAbsent("");
  WriteDependencies(Entry("lib/l.h", 5, {}) + kNoRegistrations);
  assertAbsent("");
  WriteDependencies(Entry("app/x.cpp", 5, {"lib/l.cpp"}) + Entry("lib/l.cpp", 5, {}) + '\0' + registered);
  StartBuild();
  EXPECT_TRUE(LoadDependencyFile(*builder, "dep"));
  WriteDependencies(payload + "rest");
  StartBuild();
  EXPECT_TRUE(LoadDependencyFile(*builder, "dep"));
}

TEST_F(DependencyTest, Staleness) {
  const int64_t moment = Moment();
  // a.h <- b.h <- x.cpp; c.h <- y.cpp
  auto load = [&](int64_t a, int64_t b, int64_t c, int64_t x, int64_t y, int64_t main) {
    StartBuild();
    ASSERT_TRUE(ParseDependencyPayload(
        *builder, Entry("app/a.h", moment + a, {}) + Entry("app/app.cpp", moment + main, {}) +
                      Entry("app/b.h", moment + b, {"app/a.h"}) + Entry("app/c.h", moment + c, {}) +
                      Entry("app/x.cpp", moment + x, {"app/b.h"}) + Entry("app/y.cpp", moment + y, {"app/c.h"}) +
                      kNoRegistrations));
  };
  WriteFiles({{"a.h", {1, 50}},
              {"b.h", {2, 50}},
              {"c.h", {3, 50}},
              {"x.cpp", {4, 50}},
              {"y.cpp", {5, 50}},
              {"app.cpp", {6, 50}}});
  load(2, 3, 4, 5, 6, 7);
  EXPECT_EQ("", Stale());
  load(1, 3, 4, 5, 6, 7);  // an equal time is stale, for the file itself ...
  EXPECT_EQ("a.h ", Stale());
  SetTime("tree/app/a.h", 3);
  load(4, 3, 4, 5, 3, 7);  // ... and through imports
  EXPECT_EQ("b.h y.cpp ", Stale());
  SetTime("tree/app/a.h", 9);
  load(10, 10, 10, 9, 10, 10);  // through two imports
  EXPECT_EQ("x.cpp ", Stale());
  load(10, 10, 10, 10, 72'000'000'000, 10);  // a time that is still to come is none
  EXPECT_EQ("y.cpp ", Stale());
  std::filesystem::remove("qrexsource/x64/Debug/app/c.h");
  load(10, 10, 10, 10, 10, 10);  // a missing output concerns its own file only
  EXPECT_EQ("c.h ", Stale());
  std::filesystem::remove("tree/app/c.h");
  load(10, 10, 10, 10, 10, 10);  // a missing source concerns all that import it
  EXPECT_EQ("c.h y.cpp ", Stale());
  StartBuild();  // a file that is new to the dependency file
  EXPECT_EQ("a.h b.h c.h x.cpp y.cpp app.cpp ", Stale());
}

TEST_F(DependencyTest, LatestTimes) {
  const int64_t moment = Moment();
  WriteFiles({{"a.h", {1, 20}}, {"b.h", {2, 10}}, {"c.h", {3, -1}}});
  Scanned("app/b.h").imports = {&Scanned("app/a.h")};
  Scanned("app/a.h").imports = {&Scanned("app/b.h")};  // as no run writes it
  EXPECT_EQ(moment + 2, LatestSourceTime(*builder, Scanned("app/b.h")));
  EXPECT_EQ(moment + 20, LatestTargetTime(*builder, Scanned("app/b.h")));
  std::filesystem::remove("tree/app/b.h");
  EXPECT_EQ(moment + 2, LatestSourceTime(*builder, Scanned("app/b.h")));  // looked up once
  EXPECT_EQ("Error - file not translated by qrex : app/c.h",
            MessageOf([&] { LatestTargetTime(*builder, Scanned("app/c.h")); }));
}

TEST_F(DependencyTest, RegisteringFiles) {
  ScannedFile& x = Scanned("app/x.cpp");
  x.imports = {&Scanned("app/a.h"), &Scanned("app/b.h"), &Scanned("app/c.h"), &Scanned("lib/l.h")};
  Scanned("app/b.h").file.pairedSource = &Scanned("app/y.cpp").file;
  Scanned("app/c.h").file.pairedSource = &x.file;
  MarkRegistered(x);
  EXPECT_TRUE(x.tail.isRegistered && Scanned("app/a.h").tail.isRegistered && Scanned("app/c.h").tail.isRegistered);
  EXPECT_FALSE(Scanned("app/b.h").tail.isRegistered || Scanned("lib/l.h").tail.isRegistered);
  ScannedFile& y = Scanned("app/y.cpp");
  y.imports = {&Scanned("app/b.h")};
  y.tail.isRegistered = true;
  MarkRegistered(y);
  EXPECT_FALSE(Scanned("app/b.h").tail.isRegistered);
}

}  // namespace
}  // namespace qrex
