#include "text/output_notes.h"

#include <filesystem>
#include <fstream>
#include <set>

#include "world_fixture.h"

namespace qrex {
namespace {

constexpr char kPath[] = "notes";

// What a run finds deleted of these, if an earlier one has left the notes so.
std::set<std::string> DeletedBy(std::string_view notes) {
  const std::set<std::string> files{"a.o", "b.o"};
  std::ofstream(kPath, std::ios::binary) << notes;
  for (const std::string& file : files) std::ofstream(file) << "half";
  EXPECT_TRUE(OutputNotes(kPath).DeleteNoted());
  EXPECT_FALSE(FileExists(kPath));
  std::set<std::string> deleted;
  for (const std::string& file : files) {
    if (!FileExists(file)) deleted.insert(file);
  }
  return deleted;
}

class OutputNotesTest : public WorldTest {};

TEST_F(OutputNotesTest, HoldWhatHasBegunAndIsNotOver) {
  OutputNotes notes(kPath);
  std::vector<std::string> texts;
  const auto keep = [&] { texts.push_back(World::Read(kPath)); };
  notes.Add(settings.leftovers, {"a.o"});
  keep();
  notes.Add(settings.leftovers, {"b.o"});
  keep();
  notes.Remove({"a.o"});
  keep();
  notes.Remove({"b.o"});
  EXPECT_FALSE(FileExists(kPath));

  const std::string& whole = texts.back();
  for (size_t length = 0; length <= whole.size(); ++length) {  // as a run that is killed may leave it
    std::set<std::string> expected;
    if (length >= texts[0].size() && length < whole.size()) expected.insert("a.o");
    if (length >= texts[1].size()) expected.insert("b.o");
    EXPECT_EQ(expected, DeletedBy(whole.substr(0, length))) << length;
  }
}

TEST_F(OutputNotesTest, StayShortHoweverLongTheRun) {
  OutputNotes notes(kPath);
  notes.Add(settings.leftovers, {"a.o"});
  for (int i = 0; i < 20'000; ++i) {
    const std::string name = std::to_string(i % 10);
    notes.Add(settings.leftovers, {name});
    notes.Remove({name});
  }
  EXPECT_LT(World::Read(kPath).size(), 100'000u);
  EXPECT_EQ(std::set<std::string>{"a.o"}, DeletedBy(World::Read(kPath)));
}

TEST_F(OutputNotesTest, OtherTextEndsTheRun) {
  std::ofstream(kPath) << "somebody else's";
  EXPECT_FALSE(OutputNotes(kPath).DeleteNoted());
  EXPECT_EQ("Error: Couldn't read notes, which names what an earlier run left half-written\n", trace);
}

TEST_F(OutputNotesTest, WhatCannotBeContinuedIsReplaced) {
  OutputNotes notes(kPath);
  notes.Add(settings.leftovers, {"a.o"});
  std::filesystem::remove(kPath);
  std::filesystem::create_directory(kPath);
  EXPECT_THROW(notes.Add(settings.leftovers, {"b.o"}), FileException);
  std::filesystem::remove(kPath);
  notes.Add(settings.leftovers, {"b.o"});
  EXPECT_EQ((std::set<std::string>{"a.o", "b.o"}), DeletedBy(World::Read(kPath)));
}

}  // namespace
}  // namespace qrex
