// The textual forms of the trace database and of the debug database (white-box: the
// internal readers and writers are built into this program).
#include "DebugTestSupport.h"

#include "debug/DebugDatabaseText.h"
#include "debug/TraceDatabaseText.h"

#include <climits>
#include <cstdint>

namespace kelcore::debug {
namespace {

using testing::Narrow;
using testing::U8;

TEST(TraceTextTest, LeadingIntegerReadsAsStrtolDoes) {
  // Cases chosen against the C library's strtol in the "C" locale.
  const struct {
    const char* text;
    std::int64_t value;
  } cases[] = {
      {"7", 7},
      {"-12", -12},
      {"+3", 3},
      {" \t\r\n\v\f42", 42},
      {"1abc", 1},
      {"abc", 0},
      {"", 0},
      {"-", 0},
      {"- 5", 0},
      {"0x10", 0},
      {"007", 7},
      {"9223372036854775807", INT64_MAX},
      {"9223372036854775808", INT64_MAX},
      {"-9223372036854775808", INT64_MIN},
      {"-99999999999999999999", INT64_MIN},
      {"5\r", 5},
  };
  for (const auto& c : cases) {
    const UTF8String text = U8(c.text);
    EXPECT_EQ(ParseLeadingInteger(text.data(), text.data() + text.size()), c.value) << c.text;
  }
}

TEST(TraceTextTest, RecordsAreReadFieldByField) {
  const auto records = ParseTraceRecords(U8("A\t0\t9\nB\t1\t2"));
  ASSERT_EQ(records.size(), 1u);  // B has no final LF
  EXPECT_EQ(Narrow(records[0].name), "A");
  EXPECT_FALSE(records[0].enabled);
  EXPECT_EQ(records[0].volume, 9);

  // Enabled is exactly the integer 1; volumes are clamped to 32 bits; CR LF files read.
  const auto fields =
      ParseTraceRecords(U8("a\t2\t1\nb\ttrue\t1\nc\t01\t-3\r\nd\t1x\t99999999999\ne\t1\tjunk\n"));
  ASSERT_EQ(fields.size(), 5u);
  EXPECT_FALSE(fields[0].enabled);
  EXPECT_FALSE(fields[1].enabled);
  EXPECT_TRUE(fields[2].enabled);
  EXPECT_EQ(fields[2].volume, -3);
  EXPECT_TRUE(fields[3].enabled);
  EXPECT_EQ(fields[3].volume, INT32_MAX);
  EXPECT_EQ(fields[4].volume, 0);
}

TEST(TraceTextTest, JunkMakesOddRecordsAndNeverMore) {
  // A name runs to its TAB, LFs included; text without two TABs and a LF yields nothing.
  const auto records = ParseTraceRecords(U8("junk\nName\t1\t4\n\t\t\n"));
  ASSERT_EQ(records.size(), 2u);
  EXPECT_EQ(Narrow(records[0].name), "junk\nName");
  EXPECT_EQ(Narrow(records[1].name), "");
  EXPECT_FALSE(records[1].enabled);
  EXPECT_EQ(records[1].volume, 0);
  for (const char* junk : {"", "\n\n\n", "no tabs at all", "one\ttab", "a\tb\tc", "\t\t"}) {
    EXPECT_TRUE(ParseTraceRecords(U8(junk)).empty()) << junk;
  }
  // Every byte value, in every position, is read without fault.
  UTF8String all;
  for (int i = 0; i < 256; ++i) all.push_back(static_cast<unsigned char>(i));
  all += all;
  EXPECT_LE(ParseTraceRecords(all).size(), 2u);
}

TEST(TraceTextTest, WrittenRecordsReadBack) {
  UTF8String text;
  AppendTraceRecord(text, U8("Master"), true, 10);
  AppendTraceRecord(text, U8("FileIO"), false, -7);
  AppendTraceRecord(text, U8("Edge"), true, INT32_MIN);
  EXPECT_EQ(Narrow(text), "Master\t1\t10\nFileIO\t0\t-7\nEdge\t1\t-2147483648\n");
  const auto records = ParseTraceRecords(text);
  ASSERT_EQ(records.size(), 3u);
  EXPECT_EQ(records[2].volume, INT32_MIN);
  EXPECT_FALSE(records[1].enabled);
}

TEST(DebugDatabaseTextTest, ReadIsTheInverseOfWrite) {
  UTF8String text;
  AppendDebugDatabaseLine(text, U8("TraceAsync"), U8("true"), U8("false"));
  AppendDebugDatabaseLine(text, U8("Empty"), U8(""), U8(""));
  AppendDebugDatabaseLine(text, U8("Tabbed"), U8("a\tb"), U8("d"));
  EXPECT_EQ(Narrow(text), "TraceAsync\ttrue\tfalse\r\nEmpty\t\t\r\nTabbed\ta\tb\td\r\n");
  const auto lines = ParseDebugDatabaseText(text);
  ASSERT_EQ(lines.size(), 3u);
  EXPECT_EQ(Narrow(lines[0].value), "true");
  EXPECT_EQ(Narrow(lines[0].defaultValue), "false");
  EXPECT_EQ(Narrow(lines[1].key), "Empty");
  EXPECT_EQ(Narrow(lines[2].value), "a\tb");
  EXPECT_EQ(Narrow(lines[2].defaultValue), "d");
}

TEST(DebugDatabaseTextTest, HandEditedFilesAreRead) {
  // LF-only ends, a last line without its end, lines without TABs and without defaults.
  const auto lines = ParseDebugDatabaseText(U8("# note\n\nA\t1\nB\t2\t3\r\n\r\nC\tx\ty"));
  ASSERT_EQ(lines.size(), 3u);
  EXPECT_EQ(Narrow(lines[0].key), "A");
  EXPECT_EQ(Narrow(lines[0].value), "1");
  EXPECT_EQ(Narrow(lines[0].defaultValue), "");
  EXPECT_EQ(Narrow(lines[1].defaultValue), "3");
  EXPECT_EQ(Narrow(lines[2].defaultValue), "y");
}

}  // namespace
}  // namespace kelcore::debug
