// What the pages say of keys is what the program says.

#include "driver/manual.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "text/files.h"

namespace qrex {
namespace {

TEST(ManualTest, PageOfProjectsHasTheTableOfKeys) {
  const std::string path = QREX_SOURCE_DIR "/docs/projects.md";
  const std::string heading = "### All keys\n\n";
  std::string page;
  ASSERT_TRUE(ReadWholeFile(page, path));
  const size_t begin = page.find(heading) + heading.size();
  const size_t end = page.find("\n## ", begin);
  ASSERT_NE(std::string::npos, end);
  if (std::getenv("QREX_UPDATE")) {
    ReplaceFile(path, page.replace(begin, end - begin, KeyTable()));
  } else {
    ASSERT_EQ(KeyTable(), page.substr(begin, end - begin));
  }
}

}  // namespace
}  // namespace qrex
