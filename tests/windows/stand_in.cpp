// Stands for the tools of a build where a test would give a script to other systems, and for programs that do what a
// test needs: steps in a row, with "+" between them.
//
// Called by another name than its own it is a tool: it notes in `log` how it was called and what its response files
// hold, prints what is in `say`, and ends with the status in `status`. NAME.exe.script beside it may hold "touch FILE",
// "sleep MILLISECONDS" or "exit N".
#include <fcntl.h>
#include <io.h>
#include <windows.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <string>
#include <vector>

namespace {

std::string TextOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

std::string OwnPath() {
  char path[MAX_PATH];
  return {path, GetModuleFileNameA(nullptr, path, MAX_PATH)};
}

// The number of the process, or its exit code where it is waited for.
DWORD Start(const std::string& arguments, bool waits) {
  std::string line = "\"" + OwnPath() + "\" " + arguments;
  STARTUPINFOA start = {};
  start.cb = sizeof start;
  PROCESS_INFORMATION made;
  if (!CreateProcessA(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &made)) return 0;
  DWORD code = made.dwProcessId;
  if (waits) {
    WaitForSingleObject(made.hProcess, INFINITE);
    GetExitCodeProcess(made.hProcess, &code);
  }
  return code;
}

void Take(const std::vector<std::string>& words) {
  const std::string& verb = words.front();
  const std::string first = words.size() > 1 ? words[1] : "";
  if (verb == "out") std::cout << first << "\n" << std::flush;
  if (verb == "err") std::cerr << first << "\n" << std::flush;
  if (verb == "bytes") std::cout << static_cast<char>(std::stoi(first, nullptr, 16)) << std::flush;
  if (verb == "large") std::cout << std::string(std::stoul(first), 'x') << std::flush;
  if (verb == "words") {
    for (size_t i = 1; i < words.size(); ++i) std::cout << "<" << words[i] << ">";
    std::cout << std::flush;
  }
  if (verb == "env") std::cout << (std::getenv(first.c_str()) ? std::getenv(first.c_str()) : "none") << std::flush;
  if (verb == "read") std::cout << std::string(std::istreambuf_iterator<char>(std::cin), {}) << "." << std::flush;
  for (std::string line; verb == "answer" && std::getline(std::cin, line);) std::cout << line << "!" << std::flush;
  if (verb == "sleep") Sleep(static_cast<DWORD>(std::stoul(first)));
  if (verb == "touch") std::ofstream(first) << "";
  if (verb == "start") std::ofstream(first) << Start("sleep 30000", false);
  if (verb == "crash") RaiseException(EXCEPTION_ACCESS_VIOLATION, 0, 0, nullptr);
  if (verb == "stop") ExitProcess(0xC000013A);  // as one that Ctrl-C ended
  if (verb == "handle") {                       // whether this number is one that it was given
    DWORD flags;
    std::cout << (GetHandleInformation(reinterpret_cast<HANDLE>(std::stoull(first)), &flags) ? "given" : "none")
              << std::flush;
  }
  if (verb == "exit") std::exit(std::stoi(first));
}

int PlayTool(const std::string& name, const std::vector<std::string>& words) {
  HANDLE lock;  // of the log: what two append at once may be lost
  while ((lock = CreateFileA("log.lock", GENERIC_WRITE, 0, nullptr, OPEN_ALWAYS, 0, nullptr)) == INVALID_HANDLE_VALUE)
    Sleep(1);
  std::ofstream log("log", std::ios::app | std::ios::binary);
  log << name;
  for (const std::string& word : words) log << " " << word;
  log << "\n";
  for (const std::string& word : words) {
    if (word.starts_with('@')) log << TextOf(word.substr(1)) << "\n";
  }
  log.close();
  CloseHandle(lock);
  std::cout << TextOf("say") << std::flush;
  const std::string script = TextOf(OwnPath() + ".script");
  if (script.starts_with("sleep ")) Sleep(static_cast<DWORD>(std::stoul(script.substr(6))));
  if (script.starts_with("touch ")) std::ofstream(script.substr(6, script.find('\n') - 6)) << "";
  if (const size_t exits = script.find("exit ");
      exits == 0 || (exits != std::string::npos && script[exits - 1] == '\n')) {
    return std::atoi(script.c_str() + exits + 5);
  }
  return script.starts_with("touch ") || script.starts_with("sleep ") ? 0 : std::atoi(TextOf("status").c_str());
}

}  // namespace

int main(int count, char** arguments) {
  _setmode(_fileno(stdout), _O_BINARY);
  std::string name = arguments[0];
  name = name.substr(name.find_last_of("/\\") + 1);
  std::vector<std::string> words(arguments + 1, arguments + count);
  if (name.find("stand_in") == std::string::npos) return PlayTool(name, words);
  std::vector<std::string> step;
  words.push_back("+");
  for (const std::string& word : words) {
    if (word != "+") {
      step.push_back(word);
    } else if (!step.empty()) {
      Take(step);
      step.clear();
    }
  }
}
