// Stamps that are read ahead of the builds that ask for them.
#include "builder/times_ahead.h"

#include "world_fixture.h"

namespace qrex {
namespace {

class TimesAheadTest : public WorldTest {
 protected:
  static constexpr size_t kFiles = 500;  // enough for threads

  TimesAheadTest() {
    for (const std::string name : {"a", "b"}) {
      std::string files;
      for (size_t i = 0; i < kFiles; ++i) {
        const std::string file = name + std::to_string(i) + (i % 3 == 0 ? ".h" : ".cpp");
        files += "\"" + file + "\" ";
        if (i % 5 != 0) Write("tree/" + name + "/src/" + file, std::string(i, 'x'));
        if (i % 7 != 0) Write("qrexsource/x64/Debug/" + name + "/src/" + file, std::string(i + 1, 'x'));
        if (i % 4 != 0) Write("x64/Debug/" + name + "/" + name + std::to_string(i) + ".o", std::string(i + 2, 'x'));
      }
      AddProject(name, "Static Library", "qrex { \"src\" { " + files + "} }");
    }
    for (const auto& project : workspace->projects) ahead.Add(*project, *project->configs.front(), true);
  }

  void ExpectStampsOfDisk(const Project& project) {
    const std::vector<TimesAhead::Stamps>* const known = ahead.Of(project);
    ASSERT_TRUE(known);
    ASSERT_EQ(kFiles, known->size());
    const BuildPaths paths(project, *project.configs.front());
    for (size_t i = 0; i < kFiles; ++i) {
      const ProjectFile& file = *project.files[i];
      EXPECT_EQ(StampOf(project.SourcePath(file)), (*known)[i].source) << file.path;
      EXPECT_EQ(StampOf(paths.Translated(file)), (*known)[i].translation) << file.path;
      const FileStamp object = HasObject(file) ? StampOf(paths.Object(file)) : FileStamp();
      EXPECT_EQ(object, (*known)[i].object) << file.path;
    }
  }

  TimesAhead ahead{settings.leftovers};
};

TEST_F(TimesAheadTest, StampsAreThoseOfTheDisk) {
  ahead.Begin();
  for (const auto& project : workspace->projects) ExpectStampsOfDisk(*project);
}

TEST_F(TimesAheadTest, NothingIsKnownBehindAWrite) {
  ahead.Begin();
  ExpectStampsOfDisk(*workspace->projects[0]);
  settings.leftovers.Beside("tree/b/src/b1.cpp");
  EXPECT_FALSE(ahead.Of(*workspace->projects[1]));
  EXPECT_FALSE(ahead.Of(*workspace->projects[0]));
}

}  // namespace
}  // namespace qrex
