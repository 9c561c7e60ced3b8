#include "text/paths.h"

#include <algorithm>
#include <utility>

#include "platform/file_system.h"

namespace qrex {

namespace {

char Fold(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c; }

// The component at the head, with the rest moved behind its slash; false when the text has no slash.
bool TakeComponent(std::string_view& path, std::string_view& component) {
  const size_t slash = path.find('/');
  if (slash == std::string_view::npos) return false;
  component = path.substr(0, slash);
  path.remove_prefix(slash + 1);
  return true;
}

}  // namespace

bool EqualIgnoringCase(std::string_view a, std::string_view b) {
  return a.size() == b.size() &&
         std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) { return Fold(x) == Fold(y); });
}

bool StartsWithIgnoringCase(std::string_view text, std::string_view prefix) {
  return text.size() >= prefix.size() && EqualIgnoringCase(text.substr(0, prefix.size()), prefix);
}

bool LeadsAbove(std::string_view path) {
  if (path.find("..") == std::string_view::npos) return false;
  const std::string collapsed = CollapseDots(path);
  return collapsed == ".." || collapsed.starts_with("../");
}

bool IsAbsolutePath(std::string_view path) {
  return (!path.empty() && path[0] == '/') || (path.size() >= 4 && path[1] == ':' && path[2] == '/');
}

std::string_view DriveOf(std::string_view path) {
  return path.substr(0, IsAbsolutePath(path) && path.front() != '/' ? path.find('/') : 0);
}

std::string_view FileNameOf(std::string_view path) {
  const size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

std::string FolderOf(std::string_view path) {
  const size_t slash = path.rfind('/');
  return std::string(path.substr(0, slash == std::string_view::npos ? 0 : slash));
}

bool StemOf(std::string_view path, std::string& stem) {
  const std::string_view name = FileNameOf(path);
  const size_t dot = name.rfind('.');
  if (dot == std::string_view::npos || dot == 0) return false;
  stem = std::string(name.substr(0, dot));
  return true;
}

std::string NormalisePath(std::string_view path) {
  std::string normal(path);
  std::replace(normal.begin(), normal.end(), '\\', '/');
  if (!normal.empty() && normal.back() == '/') normal.pop_back();
  return normal;
}

std::string CollapseDots(std::string_view path) { return platform::CollapseDots(path); }

bool HasExtension(std::string_view path, std::string_view extension) {
  const size_t dot = path.rfind('.');
  return dot != std::string_view::npos && EqualIgnoringCase(path.substr(dot + 1), extension);
}

bool ReplaceExtension(std::string_view path, std::string_view extension, std::string& out) {
  const size_t dot = path.rfind('.');
  if (dot == std::string_view::npos) return false;
  std::string replaced(path.substr(0, dot + 1));  // the path may be a view of `out`
  replaced.append(extension);
  out = std::move(replaced);
  return true;
}

std::string PathJoin(std::string_view left, std::string_view right) {
  for (;;) {
    if (left.empty() || left == "." || IsAbsolutePath(right)) return std::string(right);
    if (right == ".") return std::string(left);
    if (right.substr(0, 2) != ".." || left == "..") break;
    right.remove_prefix(2);
    if (!right.empty() && right.front() == '/') right.remove_prefix(1);
    const size_t slash = left.rfind('/');
    left = slash == std::string_view::npos ? std::string_view() : left.substr(0, slash);
    if (right.empty()) return std::string(left);
  }
  std::string joined;
  joined.reserve(left.size() + 1 + right.size());
  joined.append(left).append("/").append(right);
  return joined;
}

std::string PathJoin3(std::string_view a, std::string_view b, std::string_view c) {
  return PathJoin(PathJoin(a, b), c);
}

std::string RelativePath(std::string_view target, std::string_view base) {
  bool matched = false;
  for (;;) {
    std::string_view restOfTarget = target, restOfBase = base, a, b;
    if (!TakeComponent(restOfTarget, a) || !TakeComponent(restOfBase, b) || !EqualIgnoringCase(a, b)) break;
    target = restOfTarget;
    base = restOfBase;
    matched = true;
  }
  std::string result;
  if (matched && !base.empty()) {
    for (auto count = std::count(base.begin(), base.end(), '/') + 1; count > 0; --count) result += "../";
  }
  result += target;
  return result.empty() ? "." : result;
}

void ToBackslashes(TextWriter& writer, std::string_view path) {
  for (char c : path) writer << (c == '/' ? '\\' : c);
}

}  // namespace qrex
