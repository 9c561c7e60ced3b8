// The sentences that the system below does not have.

#include "world_fixture.h"

namespace qrex::platform {

TEST(ErrorTest, Sentences) {
  EXPECT_EQ("The system cannot find the file specified.", SentenceOf(2));
  EXPECT_EQ("The system cannot find the path specified.", SentenceOf(3));
  EXPECT_EQ("Access is denied.", SentenceOf(5));
}

}  // namespace qrex::platform
