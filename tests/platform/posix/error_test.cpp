// The sentences that the system below does not have.

#include "platform/error.h"

#include <gtest/gtest.h>

namespace qrex::platform {

TEST(ErrorTest, Sentences) {
  std::string sentence;
  EXPECT_TRUE(ErrorSentence(2, sentence));
  EXPECT_EQ("The system cannot find the file specified.", sentence);
  EXPECT_TRUE(ErrorSentence(3, sentence));
  EXPECT_EQ("The system cannot find the path specified.", sentence);
  EXPECT_TRUE(ErrorSentence(5, sentence));
  EXPECT_EQ("Access is denied.", sentence);
}

}  // namespace qrex::platform
