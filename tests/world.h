// The world of a test: the settings of a run, files below the current folder, and projects, which are texts under
// `tree` that the loader reads.
#pragma once

#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <string_view>

#include "builder/project_builder.h"
#include "platform/file_system.h"
#include "text/files.h"
#include "workspace/workspace.h"

namespace qrex {

// A folder of this process's own. It is the current one, and goes with this object.
class OwnFolder {
 public:
  explicit OwnFolder(const std::filesystem::path& parent)
      : m_start(std::filesystem::current_path()), m_path(parent / ("qrex." + std::to_string(getpid()))) {
    platform::RemoveTree(m_path.string());
    std::filesystem::create_directories(m_path);
    std::filesystem::current_path(m_path);
  }
  ~OwnFolder() {
    std::error_code ignored;
    std::filesystem::current_path(m_start, ignored);
    platform::RemoveTree(m_path.string());
  }
  OwnFolder(const OwnFolder&) = delete;

 private:
  std::filesystem::path m_start, m_path;
};

// What this system says of an error.
inline std::string SentenceOf(uint32_t code) {
  std::string sentence = "no sentence";
  platform::ErrorSentence(code, sentence);
  return sentence;
}

struct World {
  World() {
    settings.begun = 0;  // no translation waits for the clock of stamps to pass it
    settings.virtualTree = {"tree"};
    settings.exportLib = "lib";
    settings.exportTranslatedInclude = "tinc";
    settings.exportUntranslatedInclude = "uinc";
    settings.systemName = "Linux";
    settings.config = "Debug";
    settings.platform = "x64";
    settings.compiler = CompilerKind::gcc;
    settings.translateOnly = true;
    Load({});
  }

  static void Write(const std::string& path, std::string_view text) {
    CreateDirectories(path, false);
    platform::RemoveTree(path);
    std::ofstream(path, std::ios::binary) << text;
  }
  // To the tick, also where the standard library keeps seconds.
  static void SetStamp(const std::string& path, std::filesystem::file_time_type time) {
    constexpr int64_t kUnixEpoch = 116444736000000000;
    using Ticks = std::chrono::duration<int64_t, std::ratio<1, 10'000'000>>;
    const auto sinceEpoch = std::chrono::file_clock::to_sys(time).time_since_epoch();
    platform::SetWriteTime(path, kUnixEpoch + std::chrono::floor<Ticks>(sinceEpoch).count());
  }
  static std::string Read(const std::string& path) {
    std::string bytes;
    return ReadWholeFile(bytes, path) ? bytes : "no file " + path;
  }
  static std::string ReadText(const std::string& path) {  // with its line ends folded
    std::string text;
    if (!LoadText(text, path, true)) throw FileException(path);
    return text;
  }

  // tree/DIRECTORY/src/NAME.qrpj; the statements begin on its fourth line.
  void WriteProject(const std::string& directory, std::string_view targetType, const std::string& statements) const {
    Write("tree/" + ProjectPathOf(directory), "$TARGET_TYPE = \"" + std::string(targetType) +
                                                  "\"\n$ROOT_TO_PROJDIR = \"" + directory + "\"\nconfig { " + configs +
                                                  " }\n" + statements);
  }
  void WriteProject(const std::string& directory, const std::string& statements) const {
    WriteProject(directory, "Console Application", statements);
  }
  // A new workspace of these projects and what they depend on. False, with a message, when one of them fails.
  bool Load(std::initializer_list<std::string> entries) {
    builder.reset();
    workspace = std::make_unique<Workspace>(settings);
    workspace->name = "all";
    bool loaded = true;
    for (const std::string& entry : entries) loaded = workspace->LoadProject(ProjectPathOf(entry)) && loaded;
    return loaded;
  }
  Project& App() { return *workspace->projects.front(); }
  void StartBuild() {
    builder.reset();
    scheduler = std::make_unique<Scheduler>(settings);
    builder = std::make_unique<ProjectBuilder>(settings, App(), *App().configs.front(), *scheduler);
  }
  ScannedFile& Scanned(const std::string& path) { return builder->GetScannedFile(*builder->FindFile(path)); }

  ConfigSettings settings;
  std::string configs = "\"Debug|x64\"";  // of the projects that are written
  std::unique_ptr<Workspace> workspace;
  std::unique_ptr<Scheduler> scheduler;
  std::unique_ptr<ProjectBuilder> builder;  // of the first project
};

}  // namespace qrex
