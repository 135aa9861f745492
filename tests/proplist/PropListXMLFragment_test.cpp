#include "PropListTestSupport.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <list>
#include <string>

namespace kelcore::proplist {
namespace {

std::string Fragment(const PropList& list) {
  UTF8String out = U8("before\n");
  list.OutputAsXMLFragment(out);
  return std::string(out.begin(), out.end());
}

std::string Pair(const std::string& key, const std::string& value) {
  return "<prop.pair>\n<key>" + key + "</key>\n" + value + "</prop.pair>\n";
}

std::string Array(const std::string& emptyTag, const std::string& elements) {
  return "<array>\n<array.type>" + emptyTag + "</array.type>\n" + elements + "</array>\n";
}

TEST(PropListXMLFragment, EmptyList) {
  EXPECT_EQ(Fragment(PropList()), "before\n<prop.list>\n</prop.list>\n");
}

// Every element form of the file format, written in key order, with keys and texts
// escaped, floats to 8 and doubles to 16 significant digits.
TEST(PropListXMLFragment, EveryValueForm) {
  PropList list;
  list.SetValue(U8("q<"), std::list<float>{1e10f});
  list.SetValue(U8("b"), -5);
  list.SetValue(U8("a"), U16(u"<\u00E9&>"));
  list.NewSubList(U8("c"))->SetValue(U8("z"), std::uint16_t(65535));
  list.SetValue(U8("d"), std::list<std::int32_t>{});
  list.SetValue(U8("e"), std::list<bool>{true, false});
  list.SetValue(U8("f"), 1.0f / 3);
  list.SetValue(U8("g"), std::list<double>{0.1, 1.0 / 3, 1e100});
  list.SetValue(U8("h"), std::numeric_limits<std::uint64_t>::max());
  list.SetValue(U8("i"), std::numeric_limits<std::int64_t>::min());
  list.SetValue(U8("j"), std::numeric_limits<std::uint32_t>::max());
  list.SetValue(U8("k"), U8("'q\""));
  list.SetValue(U8("l"), false);
  list.SetValue(U8("m"), std::list<UTF8String>{});
  list.SetValue(U8("n"), std::list<std::uint16_t>{1});
  list.SetValue(U8("o"), std::list<std::uint64_t>{2});
  list.SetValue(U8("p"), std::list<UTF16String>{U16(u"x")});

  const std::string expected =
      "before\n<prop.list>\n" + Pair("a", "<ustring>&lt;\xC3\xA9&amp;&gt;</ustring>\n") +
      Pair("b", "<int type='signed' size='32'>-5</int>\n") +
      Pair("c", "<prop.list>\n" + Pair("z", "<int type='unsigned' size='16'>65535</int>\n") +
                    "</prop.list>\n") +
      Pair("d", Array("<int type='signed' size='32'/>", "")) +
      Pair("e", Array("<bool/>", "<true/>\n<false/>\n")) +
      Pair("f", "<float>0.33333334</float>\n") +
      Pair("g", Array("<double/>",
                      "<double>0.1</double>\n<double>0.3333333333333333</double>\n"
                      "<double>1e+100</double>\n")) +
      Pair("h", "<int type='unsigned' size='64'>18446744073709551615</int>\n") +
      Pair("i", "<int type='signed' size='64'>-9223372036854775808</int>\n") +
      Pair("j", "<int type='unsigned' size='32'>4294967295</int>\n") +
      Pair("k", "<string>&apos;q&quot;</string>\n") + Pair("l", "<false/>\n") +
      Pair("m", Array("<string/>", "")) +
      Pair("n",
           Array("<int type='unsigned' size='16'/>", "<int type='unsigned' size='16'>1</int>\n")) +
      Pair("o",
           Array("<int type='unsigned' size='64'/>", "<int type='unsigned' size='64'>2</int>\n")) +
      Pair("p", Array("<ustring/>", "<ustring>x</ustring>\n")) +
      Pair("q&lt;", Array("<float/>", "<float>1e+10</float>\n")) + "</prop.list>\n";
  EXPECT_EQ(Fragment(list), expected);
}

}  // namespace
}  // namespace kelcore::proplist
