// Under the name of a tool it has the program of that name, one of the system that Wine runs on, do its work: it asks
// the server of `bridges.py`, which QREX_BRIDGES names (PORT:KEY), gives on what that program prints, and ends as it
// did. The server ends the program when this one is gone.
#include <winsock2.h>
// clang-format off
#include <windows.h>
// clang-format on

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

int _dowildcard = 0;  // words reach the program as they are

namespace {

constexpr int kNoServer = 97;

std::string Narrow(const wchar_t* text) {
  const int size = WideCharToMultiByte(CP_UTF8, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string narrow(static_cast<size_t>(size), '\0');
  WideCharToMultiByte(CP_UTF8, 0, text, -1, narrow.data(), size, nullptr, nullptr);
  narrow.pop_back();
  return narrow;
}

void Append(std::string& list, const std::string& text) {
  const auto size = static_cast<uint32_t>(text.size());
  list.append(reinterpret_cast<const char*>(&size), sizeof size).append(text);
}

// Key, own path, folder, the number of words and the words, then the environment: each text behind its length.
std::string Request(const std::string& key, int count, wchar_t** words) {
  static wchar_t path[32768];
  std::string texts;
  Append(texts, key);
  GetModuleFileNameW(nullptr, path, 32768);
  Append(texts, Narrow(path));
  GetCurrentDirectoryW(32768, path);
  Append(texts, Narrow(path));
  Append(texts, std::to_string(count - 1));
  for (int i = 1; i < count; ++i) Append(texts, Narrow(words[i]));
  for (const wchar_t* each = GetEnvironmentStringsW(); *each; each += wcslen(each) + 1) Append(texts, Narrow(each));
  std::string request;
  Append(request, texts);
  return request;
}

SOCKET Connect(int port) {
  WSADATA data;
  WSAStartup(MAKEWORD(2, 2), &data);
  const SOCKET server = socket(AF_INET, SOCK_STREAM, 0);
  sockaddr_in address = {};
  address.sin_family = AF_INET;
  address.sin_port = htons(static_cast<u_short>(port));
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  return connect(server, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0 ? server : INVALID_SOCKET;
}

bool Receive(SOCKET server, void* target, size_t size) {
  for (char* at = static_cast<char*>(target); size > 0;) {
    const int count = recv(server, at, static_cast<int>(size), 0);
    if (count <= 0) return false;
    at += count;
    size -= static_cast<size_t>(count);
  }
  return true;
}

// Parts of what the program prints, each behind its stream (1, 2) and its size; 0 and the status are the end.
DWORD GiveOn(SOCKET server) {
  for (;;) {
    uint32_t head[2];
    if (!Receive(server, head, sizeof head)) return kNoServer;
    if (head[0] == 0) return head[1];
    std::string part(head[1], '\0');
    if (!Receive(server, part.data(), part.size())) return kNoServer;
    DWORD written;
    WriteFile(GetStdHandle(head[0] == 1 ? STD_OUTPUT_HANDLE : STD_ERROR_HANDLE), part.data(), head[1], &written,
              nullptr);
  }
}

}  // namespace

int wmain(int count, wchar_t** words) {
  const std::string address = std::getenv("QREX_BRIDGES") ? std::getenv("QREX_BRIDGES") : "";
  const size_t colon = address.find(':');
  const SOCKET server = colon == std::string::npos ? INVALID_SOCKET : Connect(std::atoi(address.c_str()));
  if (server == INVALID_SOCKET) {
    std::fputs("no server of bridges\n", stderr);
    return kNoServer;
  }
  const std::string request = Request(address.substr(colon + 1), count, words);
  send(server, request.data(), static_cast<int>(request.size()), 0);
  ExitProcess(GiveOn(server));
}
