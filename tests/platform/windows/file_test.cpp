// Paths and files as Windows has them.

#include <windows.h>

#include <thread>

#include "platform/dynamic_library.h"
#include "platform/file_claim.h"
#include "platform/file_system.h"
#include "platform/folder_lock.h"
#include "platform/job_server.h"
#include "platform/system.h"
#include "platform/windows/api.h"
#include "platform/windows/patience.h"
#include "world_fixture.h"

namespace qrex::platform {

using WindowsFileTest = WorldTest;

TEST_F(WindowsFileTest, PathsOfCalls) {
  EXPECT_EQ(L"a/b", WidePath("a/b"));
  EXPECT_EQ(L"tr\u00e9e \u00fc/\U0001F600", WidePath("tr\u00e9e \u00fc/\U0001F600"));
  const std::string name(kLongPath, 'n');
  EXPECT_EQ(L"\\\\?\\C:\\a\\" + Wide(name), WidePath("C:/a/b/../" + name));
  EXPECT_EQ(L"\\\\?\\UNC\\server\\share\\" + Wide(name), WidePath("//server/share/" + name));
  EXPECT_TRUE(WidePath(name).starts_with(L"\\\\?\\"));
  EXPECT_EQ("C:/a", PathFrom(L"\\\\?\\C:\\a"));
  EXPECT_EQ("//server/a", PathFrom(L"\\\\?\\UNC\\server\\a"));
  const std::string short247 = "C:/" + std::string(kLongPath - 4, 'n');
  EXPECT_EQ(Wide(short247), WidePath(short247));
}

TEST_F(WindowsFileTest, LongPaths) {
  const std::string folder = "tr\u00e9e \u00fc";
  std::string path = folder;
  for (int i = 0; i < 8; ++i) path += "/" + std::string(50, static_cast<char>('a' + i));
  CreateDirectories(path, true);
  path += "/file";
  ASSERT_TRUE(WriteFile(path, "text"));
  std::string content;
  EXPECT_TRUE(ReadFile(path, content));
  EXPECT_EQ("text", content);
  EXPECT_TRUE(RenameFile(path, path + "2"));
  std::vector<std::string> names;
  EXPECT_TRUE(EntryNames(path.substr(0, path.rfind('/')), names));
  EXPECT_EQ((std::vector<std::string>{".", "..", "file2"}), names);
  EXPECT_TRUE(RemoveTree(folder));
  FileInfo info;
  EXPECT_FALSE(Stat(folder, info));
}

TEST_F(WindowsFileTest, Attributes) {
  Write("f", "old");
  ASSERT_TRUE(SetFileAttributesW(L"f", FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN));
  FileInfo info;
  ASSERT_TRUE(Stat("F", info));  // names differ in case alone: one file
  EXPECT_TRUE(info.isReadOnly && info.isPlain);
  EXPECT_FALSE(RemoveFile("f"));
  EXPECT_TRUE(SetReadOnlyAttribute("f", false));
  EXPECT_TRUE(SetReadOnlyAttribute("f", true));
  Write("new", "new");
  EXPECT_TRUE(RenameFile("new", "f"));  // in place of what is read-only
  std::string content;
  EXPECT_TRUE(ReadFile("f", content));
  EXPECT_EQ("new", content);
  EXPECT_FALSE(Stat("nul", info) && info.isPlain);
  EXPECT_FALSE(CanRead("nul") || ReadFile("nul", content));
}

TEST_F(WindowsFileTest, WhatOthersHoldIsWaitedForAMoment) {
  Write("held", "old");
  Write("new", "new");
  Handle holder = OpenFile("held", GENERIC_READ, OPEN_EXISTING, 0, FILE_SHARE_READ);
  std::thread release([&] {
    Sleep(100);
    holder.Close();
  });
  EXPECT_TRUE(RenameFile("new", "held"));
  release.join();
  EXPECT_EQ("new", Read("held"));
  Write("new", "newer");
  holder = OpenFile("held", GENERIC_READ, OPEN_EXISTING, 0, FILE_SHARE_READ);
  EXPECT_TRUE(MayBeHeld(RenameFile("new", "held").Code()));
}

TEST_F(WindowsFileTest, ClaimsAndLocks) {
  FileClaim claim;
  ASSERT_TRUE(claim.Make("x.part"));
  EXPECT_TRUE(WriteFile("x.part", "half"));
  FileClaim::RemoveAbandoned("x.part");
  EXPECT_TRUE(FileExists("x.part"));
  Write("y.part", "half");
  SetReadOnlyAttribute("y.part", true);
  FileClaim::RemoveAbandoned("y.part");
  EXPECT_FALSE(FileExists("y.part"));

  auto first = std::make_unique<FolderLock>(".");
  EXPECT_TRUE(first->TryToTake());
  const auto taken = [](const std::string& folder) {  // a mutex knows its thread
    bool isTaken = false;
    std::thread([&] { isTaken = FolderLock(folder).TryToTake(); }).join();
    return isTaken;
  };
  std::filesystem::create_directory("other");
  EXPECT_FALSE(taken("other/.."));
  EXPECT_TRUE(taken("other"));
  first.reset();
  EXPECT_TRUE(taken("."));
}

TEST_F(WindowsFileTest, JobServerOfMake) {
  const Handle semaphore(CreateSemaphoreW(nullptr, 2, 2, L"qrex-test-jobs"));
  SetEnvironment("MAKEFLAGS", " -j3 --jobserver-auth=qrex-test-jobs");
  const auto server = JobServer::FromEnvironment();
  ASSERT_TRUE(server);
  EXPECT_TRUE(server->TryTakeToken() && server->TryTakeToken());
  EXPECT_FALSE(server->TryTakeToken());
  server->KeepTokens(1);
  EXPECT_TRUE(server->TryTakeToken());
  SetEnvironment("MAKEFLAGS", " --jobserver-auth=qrex-none");
  EXPECT_FALSE(JobServer::FromEnvironment());
  SetEnvironment("MAKEFLAGS", "");
}

TEST(ErrorTest, Sentences) {
  wchar_t text[512];
  const DWORD length = FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM, nullptr, 5, 0, text, 512, nullptr);
  std::string expected = Narrow({text, length});
  expected.erase(expected.find_last_not_of("\r\n") + 1);
  EXPECT_FALSE(expected.empty());
  EXPECT_EQ(expected, SentenceOf(5));
}

TEST_F(WindowsFileTest, Libraries) {
  std::string error;
  void* const library = LoadDynamicLibrary("kernel32.dll", error);
  ASSERT_TRUE(library) << error;
  void* const symbol = FindSymbol(library, "GetTickCount");
  ASSERT_TRUE(symbol);
  EXPECT_NE(std::string::npos, LibraryPathOf(symbol).find('/'));
  EXPECT_FALSE(LoadDynamicLibrary("none/none.dll", error));
  EXPECT_TRUE(error.starts_with("none/none.dll: ")) << error;
}

// The program says that it takes long paths, and which release it is.
TEST_F(WindowsFileTest, ResourcesOfTheProgram) {
  const HMODULE program = LoadLibraryExW(Wide(QREX_PROGRAM).c_str(), nullptr, LOAD_LIBRARY_AS_DATAFILE);
  ASSERT_TRUE(program);
  const HRSRC found = FindResourceW(program, MAKEINTRESOURCEW(1), MAKEINTRESOURCEW(24));
  ASSERT_TRUE(found);
  const std::string manifest(static_cast<const char*>(LockResource(LoadResource(program, found))),
                             SizeofResource(program, found));
  EXPECT_NE(std::string::npos, manifest.find(">true</longPathAware>"));
  EXPECT_TRUE(FindResourceW(program, MAKEINTRESOURCEW(1), MAKEINTRESOURCEW(16)));  // the version
}

}  // namespace qrex::platform
