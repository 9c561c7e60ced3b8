// What the layer makes of the system below: error codes, file times, a stack of any size.

#include "platform/system.h"

#include <cmath>
#include <cstdlib>

#include "platform/arithmetic.h"
#include "platform/console.h"
#include "platform/error.h"
#include "platform/file_system.h"
#include "world_fixture.h"

namespace qrex::platform {

using SystemTest = WorldTest;

TEST_F(SystemTest, DeepStack) {
  struct Deep {
    static size_t Recurse(size_t depth) {
      volatile char frame[1024];
      frame[0] = static_cast<char>(depth);
      return depth == 0 ? static_cast<size_t>(frame[0]) : 1 + Recurse(depth - 1);
    }
  };
  size_t depth = 0;
  RunOnStack(size_t{1} << 28, [&] { depth = Deep::Recurse(60000); });
  EXPECT_EQ(60000u, depth);
  EXPECT_THROW(RunOnStack(1 << 20, [] { throw 1; }), int);

  // Who recurses without a bound is told when it ends.
  struct Careful {
    static size_t Recurse(size_t depth) {
      volatile char frame[1024];
      frame[0] = 0;
      if (IsStackShort()) return depth;
      return Recurse(depth + 1) + static_cast<size_t>(frame[0]);  // read behind the call: no loop can serve
    }
  };
  EXPECT_TRUE(RunOnStack(size_t{1} << 24, [&] { depth = Careful::Recurse(0); }));
  EXPECT_GT(depth, 1000u);
  EXPECT_FALSE(IsStackShort());
}

TEST_F(SystemTest, ErrorCodes) {
  const std::string path = "f";
  std::string content;
  Write(path, "x");
  EXPECT_EQ(0u, ReadFile(path, content).Code());
  EXPECT_EQ(2u, ReadFile(path + "none", content).Code());
  EXPECT_EQ(3u, ReadFile(path + "/a", content).Code());
  EXPECT_EQ(5u, ReadFile(".", content).Code());
  EXPECT_EQ(80u, MakeEmptyFile(path, false).Code());
  SetReadOnlyAttribute(path, true);
  EXPECT_EQ(5u, MakeEmptyFile(path, true).Code());  // also for the superuser
  EXPECT_FALSE(RemoveFile(path));
  SetReadOnlyAttribute(path, false);
  EXPECT_TRUE(RemoveFile(path));
  std::string sentence;
  EXPECT_FALSE(ErrorSentence(12345, sentence));
}

// The same on every system.
TEST(ArithmeticTest, Values) {
  EXPECT_EQ(9.882117688026186, Power(2.5, 2.5));
  EXPECT_EQ(-15.625, Power(-2.5, 3));
  EXPECT_EQ(0.0256, Power(-2.5, -4));
  EXPECT_EQ(1e300, Power(10, 300));
  EXPECT_TRUE(std::isinf(Power(10, 400)) && std::isnan(Power(-1, 0.5)));
  EXPECT_EQ(0.1411200080598672, Sine(3));
  EXPECT_EQ(20.085536923187668, Exponential(3));
  EXPECT_EQ(1.0986122886681098, Logarithm(3));
}

TEST(ConsoleTest, Utf8) {
  EXPECT_TRUE(IsValidUtf8("a\xc3\xa9\xe2\x82\xac\xf0\x9f\x98\x80"));
  for (const char* wrong :
       {"\x80", "\xc0\x80", "\xc3", "\xe0\x9f\x80", "\xed\xa0\x80", "\xf4\x90\x80\x80", "\xf5\x80\x80\x80"}) {
    EXPECT_FALSE(IsValidUtf8(wrong));
  }
  EXPECT_EQ("\xc3\xa9|\xc3\xa9\xc2\x80", WidenBytes("\xc3\xa9|\xe9\x80"));
}

}  // namespace qrex::platform
