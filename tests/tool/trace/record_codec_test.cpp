#include "trace/record_codec.h"

#include <gtest/gtest.h>

#include <iterator>
#include <ostream>
#include <string>

#include "input_error.h"
#include "parsed.h"
#include "trace/hex.h"

namespace senseloom::tool {
namespace {

std::string encoded(const std::string& sensor, const std::string& record) {
  return toHex(encodeRecord(sensorNamed(sensor), parsed(record).get()));
}

std::string decoded(const std::string& sensor, const std::string& hex) {
  const Json fields = decodeResult(sensorNamed(sensor), *fromHex(hex));
  return fields == nullptr ? "nothing" : compactText(fields.get());
}

std::string errorOf(const std::string& sensor, const std::string& record) {
  try {
    return "no error, but " + encoded(sensor, record);
  } catch (const InputError& error) {
    return error.what();
  }
}

// A record by fields, its bytes, and the fields of a result of the same bytes.
struct Sample {
  const char* sensor;
  std::string record;
  std::string hex;
  std::string result;

  friend std::ostream& operator<<(std::ostream& out, const Sample& sample) { return out << sample.sensor; }
};

class RecordOfKind : public testing::TestWithParam<Sample> {};

TEST_P(RecordOfKind, IsEncodedByFields) {
  EXPECT_EQ(encoded(GetParam().sensor, GetParam().record), GetParam().hex);
}

TEST_P(RecordOfKind, IsDecodedToFields) {
  EXPECT_EQ(decoded(GetParam().sensor, GetParam().hex), GetParam().result);
}

TEST_P(RecordOfKind, IsAcceptedAsHex) {
  EXPECT_EQ(encoded(GetParam().sensor, R"({"hex":")" + GetParam().hex + R"("})"), GetParam().hex);
}

TEST_P(RecordOfKind, DecodesWithBytesBeyondItsEnd) {
  EXPECT_EQ(decoded(GetParam().sensor, GetParam().hex + "aabb"), GetParam().result);
}

TEST_P(RecordOfKind, DoesNotDecodeWhenCutShortWithinItsFields) {
  const size_t head = std::string(GetParam().sensor) == "ISACT" || std::string(GetParam().sensor) == "SCOUN" ? 12 : 10;
  for (size_t bytes = 0; bytes < head; ++bytes) {
    EXPECT_EQ(decoded(GetParam().sensor, GetParam().hex.substr(0, 2 * bytes)), "nothing") << bytes;
  }
}

const std::string kItem1(56, '1');
const std::string kItem2 = "0123456789abcdef0123456789abcdef0123456789abcdef01234567";
const Sample kSamples[] = {
    // 0x0053: class 3 in the low 4 bits, 5 above; 0x7ff0 and 0x800f: the bounds of a sequence number of 12 bits.
    {"PHYAC", R"({"timestamp":81,"items":[{"class":3,"seq":5},{"class":0,"seq":2047},{"class":15,"seq":-2048}]})",
     "5100000000000000"
     "0300"
     "5300f07f0f80",
     R"({"timestamp":81,"items":[{"class":3,"seq":5},{"class":0,"seq":2047},{"class":15,"seq":-2048}]})"},
    {"STAP", R"({"timestamp":1000,"classes":3})", "e8030000000000000300", R"({"timestamp":1000,"classes":3})"},
    {"GSFLK", R"({"timestamp":1000,"class":33})", "e8030000000000002100", R"({"timestamp":1000,"class":33})"},
    {"SHAKI", R"({"timestamp":1000,"class":-1})", "e803000000000000ffff", R"({"timestamp":1000,"class":-1})"},
    {"ISACT", R"({"timestamp":1000,"class":65536})", "e80300000000000000000100", R"({"timestamp":1000,"class":65536})"},
    {"SCOUN", R"({"timestamp":1000,"steps":-100})", "e8030000000000009cffffff", R"({"timestamp":1000,"steps":-100})"},
    // The length of the samples, 24 bytes, stands at byte 10. A result has a class where the record has "prx".
    {"GSPX", R"({"timestamp":1000,"prx":1,"samples":[[1,2,3,4,5,6],[-1,-32768,32767,0,0,256]]})",
     "e803000000000000"
     "0100"
     "1800"
     "010002000300040005000600"
     "ffff0080ff7f000000000001",
     R"({"timestamp":1000,"class":1})"},
    {"DTWGS", R"({"timestamp":1000,"classes":-32768})", "e8030000000000000080",
     R"({"timestamp":1000,"classes":-32768})"},
    {"GSETH", R"({"timestamp":1000,"class":2})", "e8030000000000000200", R"({"timestamp":1000,"class":2})"},
    {"LPE_P", R"({"timestamp":1000,"class":32767})", "e803000000000000ff7f", R"({"timestamp":1000,"class":32767})"},
    {"PDR", R"({"timestamp":1000,"items":[")" + kItem1 + R"(",")" + kItem2 + R"("]})",
     "e8030000000000000200" + kItem1 + kItem2,
     R"({"timestamp":1000,"items":[")" + kItem1 + R"(",")" + kItem2 + R"("]})"},
    {"LIFT", R"({"timestamp":1000,"class":0})", "e8030000000000000000", R"({"timestamp":1000,"class":0})"},
};
INSTANTIATE_TEST_SUITE_P(All, RecordOfKind, testing::ValuesIn(kSamples),
                         [](const auto& sample) { return std::string(sample.param.sensor); });

TEST(RecordCodec, EncodesRecordsWithoutElements) {
  EXPECT_EQ(encoded("PHYAC", R"({"timestamp":1,"items":[]})"), "01000000000000000000");
  EXPECT_EQ(encoded("PDR", R"({"timestamp":1,"items":[]})"), "01000000000000000000");
  EXPECT_EQ(encoded("GSPX", R"({"timestamp":1,"prx":0,"samples":[]})"), "010000000000000000000000");
}

TEST(RecordCodec, EncodesTheGreatestTimestampOfJson) {
  EXPECT_EQ(encoded("STAP", R"({"timestamp":9223372036854775807,"classes":0})"), "ffffffffffffff7f0000");
}

TEST(RecordCodec, DecodesGreaterTimestampsAsStrings) {
  EXPECT_EQ(decoded("STAP", "ffffffffffffff7f0100"), R"({"timestamp":9223372036854775807,"classes":1})");
  EXPECT_EQ(decoded("STAP", "00000000000000800100"), R"({"timestamp":"9223372036854775808","classes":1})");
  EXPECT_EQ(decoded("STAP", "ffffffffffffffff0100"), R"({"timestamp":"18446744073709551615","classes":1})");
}

TEST(RecordCodec, DecodesNoResultThatCountsMoreElementsThanItHolds) {
  EXPECT_EQ(decoded("PHYAC", "010000000000000002005300"), "nothing");
  EXPECT_EQ(decoded("PHYAC", "0100000000000000ffff5300"), "nothing");
  EXPECT_EQ(decoded("PHYAC", "0100000000000000000053"), R"({"timestamp":1,"items":[]})");
  EXPECT_EQ(decoded("PDR", "01000000000000000100" + kItem1.substr(2)), "nothing");
}

TEST(RecordCodec, AcceptsHexOfAnyLengthInEitherCase) {
  EXPECT_EQ(encoded("LIFT", R"({"hex":""})"), "");
  EXPECT_EQ(encoded("PDR", R"({"hex":"aBCd01"})"), "abcd01");
}

TEST(RecordCodec, RefusesWhatIsNotHex) {
  const std::string message = "record field \"hex\" must be a string of hexadecimal digits, two a byte";
  EXPECT_EQ(errorOf("STAP", R"({"hex":"abc"})"), message);
  EXPECT_EQ(errorOf("STAP", R"({"hex":"zz"})"), message);
  EXPECT_EQ(errorOf("STAP", R"({"hex":12})"), message);
}

TEST(RecordCodec, RefusesUnknownFields) {
  EXPECT_EQ(errorOf("STAP", R"({"timestamp":1,"class":1})"),
            "unknown record field \"class\"; the nearest is \"classes\"");
  EXPECT_EQ(errorOf("SCOUN", R"({"timestamp":1,"steps":1,"items":[]})"),
            "unknown record field \"items\"; the nearest is \"steps\"");
  EXPECT_EQ(errorOf("STAP", R"({"hex":"","timestamp":1})"),
            "unknown record field \"timestamp\"; the nearest is \"hex\"");
  EXPECT_EQ(errorOf("PHYAC", R"({"timestamp":1,"items":[{"class":1,"seq":1,"level":1}]})"),
            "unknown record field \"level\"; the nearest is \"seq\"");
}

TEST(RecordCodec, RefusesMissingFields) {
  EXPECT_EQ(errorOf("STAP", R"({})"), "missing record field \"timestamp\"");
  EXPECT_EQ(errorOf("STAP", R"({"timestamp":1})"), "missing record field \"classes\"");
  EXPECT_EQ(errorOf("GSPX", R"({"timestamp":1,"prx":1})"), "missing record field \"samples\"");
  EXPECT_EQ(errorOf("PHYAC", R"({"timestamp":1,"items":[{"class":1}]})"), "missing record field \"seq\"");
}

TEST(RecordCodec, RefusesTimestampsOutOfRangeOrOfAnotherType) {
  const std::string message = "record field \"timestamp\" must be an integer from 0 to 9223372036854775807";
  for (const char* timestamp : {"-1", "1.0", "\"1\"", "true", "null", "[]"}) {
    EXPECT_EQ(errorOf("STAP", std::string(R"({"classes":1,"timestamp":)") + timestamp + "}"), message) << timestamp;
  }
}

TEST(RecordCodec, RefusesValuesOutOfTheirFieldsRange) {
  const std::string of16 = " must be an integer from -32768 to 32767";
  EXPECT_EQ(errorOf("STAP", R"({"timestamp":1,"classes":32768})"), "record field \"classes\"" + of16);
  EXPECT_EQ(errorOf("GSETH", R"({"timestamp":1,"class":-32769})"), "record field \"class\"" + of16);
  EXPECT_EQ(errorOf("GSPX", R"({"timestamp":1,"prx":70000,"samples":[]})"), "record field \"prx\"" + of16);
  EXPECT_EQ(errorOf("GSPX", R"({"timestamp":1,"prx":0,"samples":[[0,0,0,0,0,32768]]})"),
            "record field \"samples\"" + of16);
  const std::string of32 = " must be an integer from -2147483648 to 2147483647";
  EXPECT_EQ(errorOf("SCOUN", R"({"timestamp":1,"steps":2147483648})"), "record field \"steps\"" + of32);
  EXPECT_EQ(errorOf("ISACT", R"({"timestamp":1,"class":-2147483649})"), "record field \"class\"" + of32);
  EXPECT_EQ(errorOf("ISACT", R"({"timestamp":1,"class":2.0})"), "record field \"class\"" + of32);
}

TEST(RecordCodec, RefusesClassRecordsOutOfRange) {
  const auto errorOfItem = [](const std::string& item) {
    return errorOf("PHYAC", R"({"timestamp":1,"items":[)" + item + "]}");
  };
  EXPECT_EQ(errorOfItem(R"({"class":16,"seq":0})"), "record field \"class\" must be an integer from 0 to 15");
  EXPECT_EQ(errorOfItem(R"({"class":-1,"seq":0})"), "record field \"class\" must be an integer from 0 to 15");
  EXPECT_EQ(errorOfItem(R"({"class":0,"seq":2048})"), "record field \"seq\" must be an integer from -2048 to 2047");
  EXPECT_EQ(errorOfItem(R"({"class":0,"seq":-2049})"), "record field \"seq\" must be an integer from -2048 to 2047");
  EXPECT_EQ(errorOfItem("3"), "record field \"items\" must hold objects");
}

TEST(RecordCodec, RefusesElementsOfAnotherForm) {
  const std::string ofSamples = "record field \"samples\" must hold arrays of six integers";
  for (const char* sample : {"1", "[1,2,3,4,5]", "[1,2,3,4,5,6,7]", "{}"}) {
    EXPECT_EQ(errorOf("GSPX", std::string(R"({"timestamp":1,"prx":0,"samples":[)") + sample + "]}"), ofSamples);
  }
  const std::string ofItems = "record field \"items\" must hold strings of 56 hexadecimal digits";
  for (const std::string& item :
       {std::string("1"), '"' + kItem1.substr(2) + '"', '"' + kItem1 + "00\"", '"' + kItem1.substr(1) + "x\""}) {
    EXPECT_EQ(errorOf("PDR", R"({"timestamp":1,"items":[)" + item + "]}"), ofItems) << item;
  }
  EXPECT_EQ(errorOf("PDR", R"({"timestamp":1,"items":{}})"),
            "record field \"items\" must be an array of at most 32767");
}

TEST(RecordCodec, EncodesAsManyElementsAsARecordCanCountAndNoMore) {
  const auto recordOf = [](const char* sensor, const std::string& head, const std::string& element, size_t count) {
    std::string record = head;
    for (size_t i = 0; i < count; ++i) record += (i == 0 ? "" : ",") + element;
    return errorOf(sensor, record + "]}").substr(0, 64);
  };
  const std::string items = R"({"timestamp":0,"items":[)";
  const std::string activity = R"({"class":1,"seq":0})";
  EXPECT_EQ(recordOf("PHYAC", items, activity, 32767).substr(0, 34), "no error, but 0000000000000000ff7f");
  EXPECT_EQ(recordOf("PHYAC", items, activity, 32768), "record field \"items\" must be an array of at most 32767");
  const std::string samples = R"({"timestamp":0,"prx":0,"samples":[)";
  const std::string sample = "[0,0,0,0,0,0]";
  // 5461 samples are 65532 bytes.
  EXPECT_EQ(recordOf("GSPX", samples, sample, 5461).substr(0, 38), "no error, but 00000000000000000000fcff");
  EXPECT_EQ(recordOf("GSPX", samples, sample, 5462), "record field \"samples\" must be an array of at most 5461");
}

}  // namespace
}  // namespace senseloom::tool
