// Streams, the indenting writer, the trace log.

#include "text/streams.h"

#include <regex>

#include "text/stream_adapters.h"
#include "world_fixture.h"

namespace qrex {

TEST(StreamsTest, Readers) {
  PagedBuffer buffer(4);
  PagedBufferToOutputStreamAdapter(buffer).Write("abcdefghij", 10);
  const std::string block = "abcdefghij";
  PagedBufferToInputStreamAdapter paged(buffer);
  BufferToInputStreamAdapter plain(block.data(), block.size());
  for (ISeekableInputStream* in :
       {static_cast<ISeekableInputStream*>(&paged), static_cast<ISeekableInputStream*>(&plain)}) {
    char bytes[16];
    EXPECT_EQ(10, in->Length());
    EXPECT_EQ(6u, in->Read(bytes, 6));
    EXPECT_EQ("abcdef", std::string(bytes, 6));
    EXPECT_EQ(6, in->Position());
    EXPECT_EQ(4u, in->Read(bytes, 16));
    EXPECT_EQ(0u, in->Read(bytes, 16));
    EXPECT_TRUE(in->Seek(3));
    EXPECT_EQ(1u, in->Read(bytes, 1));
    EXPECT_EQ('d', bytes[0]);
    EXPECT_FALSE(in->Seek(-1));
  }
  char room[4] = {};
  BufferToOutputStreamAdapter out(room, sizeof room);
  out.Write("abc", 3);
  EXPECT_THROW(out.Write("de", 2), BufferOverflowException);
  EXPECT_EQ(1u, out.Room());
  EXPECT_EQ(0, room[3]);
}

TEST(StreamsTest, Copies) {
  const std::string block(20000, 'x');
  BufferToInputStreamAdapter in(block.data(), block.size());
  MemoryTextWriter writer;
  EXPECT_EQ(9000, CopyStream(writer, in, 9000));
  EXPECT_EQ(11000, CopyStream(writer, in));
  EXPECT_EQ(block, writer.TakeText());
}

TEST(TextWriterTest, Values) {
  MemoryTextWriter writer;
  writer << -1 << ' ' << uint64_t{18446744073709551615u} << ' ' << int64_t{INT64_MIN} << ' ' << 0.1 << ' ' << 1e30
         << ' ' << 2.0f << ' ' << DeserialisationException() << std::string("s") << std::string_view("v");
  writer.EndLine();
  EXPECT_EQ("-1 18446744073709551615 -9223372036854775808 0.1 1e+30 2 Deserialisation errorsv\n", writer.TakeText());
}

using FileStreamTest = WorldTest;

TEST_F(FileStreamTest, LineEndsInTextMode) {
  auto* stream = new OFileStream("f", true);
  stream->Write("a\n\nb", 4);
  stream->Write("\n", 1);
  stream->Flush();
  stream->Close();
  EXPECT_EQ("a\r\n\r\nb\r\n", Read("f"));
  { OFileStream("f", false).Write("a\n", 2); }
  EXPECT_EQ("a\n", Read("f"));
  SetReadOnly("f", true);
  try {
    OFileStream refused("f", false);
    FAIL();
  } catch (const FileException& exception) {
    EXPECT_EQ("File error (f) : " + SentenceOf(5), ExceptionText(exception));
  }
  EXPECT_THROW(OFileStream("a\xff", false), StringConversionException);
}

TEST_F(FileStreamTest, TraceLog) {
  CloseTrace();  // what came before is gone
  TraceWriter() << "early\n";
  EXPECT_FALSE(OpenTrace("none/f", false, false));
  EXPECT_TRUE(OpenTrace("f", false, false));
  EXPECT_EQ("early\n", Read("f"));
  {
    TraceIndentScope indent(2);
    TraceWriter() << "a\n\nb" << 1;
  }
  TraceWriter() << "\n";
  EXPECT_EQ("early\n  a\n\n  b1\n", Read("f"));
  EXPECT_EQ("early\nearly\n  a\n\n  b1\n", trace);
  CloseTrace();
  EXPECT_TRUE(OpenTrace("f", true, true));
  TraceWriter() << "x\n";
  EXPECT_TRUE(
      std::regex_match(Read("f").substr(16), std::regex("\\d+ \\d\\d/\\d\\d/\\d{4} \\d\\d:\\d\\d:\\d\\d\\.\\d{3} x\n")))
      << Read("f");
  CloseTrace();
  OpenTrace("stdout", false, false);
  ::testing::internal::CaptureStdout();
  TraceWriter() << "caf\xc3\xa9 \xe9\n";  // no text is lost: a byte that is no UTF-8 is taken for a character
  EXPECT_EQ("caf\xc3\xa9 \xc3\xa9\n", ::testing::internal::GetCapturedStdout());
  ::testing::internal::CaptureStdout();
  EXPECT_THROW(StdioOutputStream().Write("\xe9", 1), StringConversionException);
  StdioOutputStream().Write("ok", 2);
  EXPECT_EQ("ok", ::testing::internal::GetCapturedStdout());
  CloseTrace();
}

}  // namespace qrex
