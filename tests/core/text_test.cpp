#include <gtest/gtest.h>

#include <istream>
#include <locale>
#include <sstream>
#include <string>

#include "failure.h"
#include "klv.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;

namespace {

std::wstring wideOf(const std::string& hex) {
  std::wstring text;
  internalize(bytesOf(hex), text);
  return text;
}

std::string wideFailure(const std::string& hex) {
  return failureOf([&] { wideOf(hex); });
}

ByteVector utf16Of(const std::wstring& text) {
  ByteVector bytes;
  externalize(bytes, text, true);
  return bytes;
}

std::string utf8Failure(const std::string& octets) {
  try {
    util::utf8::decode(octets);
  } catch (const util::utf8::exception& e) {
    return e.what();
  }
  return "no failure";
}

std::string utf8EncodeFailure(const std::wstring& text) {
  try {
    util::utf8::encode(text);
  } catch (const util::utf8::exception& e) {
    return e.what();
  }
  return "no failure";
}

// A global locale that writes numbers the way much of Europe does, with no
// need for an installed named locale.
class CommaNumpunct : public std::numpunct<char> {
 protected:
  char do_decimal_point() const override { return ','; }
  char do_thousands_sep() const override { return '.'; }
  std::string do_grouping() const override { return "\3"; }
};

// A stream buffer over octets that cannot seek, like a pipe's.
class UnseekableBuffer : public std::streambuf {
 public:
  explicit UnseekableBuffer(const ByteVector& bytes) : octets_(bytes.begin(), bytes.end()) {
    setg(&octets_[0], &octets_[0], &octets_[0] + octets_.size());
  }

 private:
  std::string octets_;
};

class GlobalLocaleWithComma : public ::testing::Test {
 protected:
  void SetUp() override { previous_ = std::locale::global(std::locale(std::locale::classic(), new CommaNumpunct)); }
  void TearDown() override { std::locale::global(previous_); }

 private:
  std::locale previous_;
};

}  // namespace

TEST(WideText, EmptyVectorReadsAsEmptyString) {
  std::wstring text = L"old";
  internalize(ByteVector(), text);
  EXPECT_EQ(text, L"");
}

TEST(NarrowText, EmptyVectorReadsAsEmptyString) {
  std::string text = "old";
  internalize(ByteVector(), text);
  EXPECT_EQ(text, "");
}

TEST(WideText, ReadsBigEndianUnitsAsCodePoints) {
  EXPECT_EQ(wideOf("00 41 00 E9 20 AC FF FD"), L"A\u00e9\u20ac\ufffd");
}

TEST(WideText, SurrogatePairBecomesOneCodePoint) {
  std::wstring text = wideOf("00 41 D8 3D DE 00 DB FF DF FF");
  ASSERT_EQ(text.size(), 3u);
  EXPECT_EQ(static_cast<std::uint32_t>(text[1]), 0x1F600u);
  EXPECT_EQ(static_cast<std::uint32_t>(text[2]), 0x10FFFFu);
}

TEST(WideText, OddSizeFailsCorrectSizeOfUtf16String) {
  EXPECT_EQ(wideFailure("00 41 00"), "assertion failure: correct size of UTF-16 string");
  EXPECT_EQ(wideFailure("41"), "assertion failure: correct size of UTF-16 string");
}

TEST(WideText, SizeCountsFromTheCurrentPosition) {
  ByteVector bytes = bytesOf("FF 00 41");
  util::vector_istream in(bytes);
  in.get();
  std::wstring text;
  internalize(in, text);
  EXPECT_EQ(text, L"A");
}

TEST(WideText, ReadsFromAStreamThatCannotSeek) {
  UnseekableBuffer buffer(bytesOf("00 41 D8 3D DE 00"));
  std::istream in(&buffer);
  ASSERT_EQ(in.tellg(), std::streampos(-1));
  std::wstring text;
  internalize(in, text);
  EXPECT_EQ(text, (std::wstring{L'A', wchar_t(0x1F600)}));
}

TEST(WideText, OddSizeFromAStreamThatCannotSeekFailsSuccessfulGet) {
  UnseekableBuffer buffer(bytesOf("00 41 00"));
  std::istream in(&buffer);
  std::wstring text;
  EXPECT_EQ(failureOf([&] { internalize(in, text); }), "assertion failure: successful get()");
}

TEST(WideText, LoneTrailingSurrogateAtStartFails) {
  EXPECT_EQ(wideFailure("DC 00 00 41"), "assertion failure: expected UTF-16 character or leading surrogate");
  EXPECT_EQ(wideFailure("DF FF"), "assertion failure: expected UTF-16 character or leading surrogate");
}

TEST(WideText, LoneLeadingSurrogateAtEndFails) {
  EXPECT_EQ(wideFailure("00 41 D8 00"), "assertion failure: expected UTF-16 trailing surrogate");
}

TEST(WideText, LeadingSurrogateFollowedByNonTrailingFails) {
  EXPECT_EQ(wideFailure("D8 00 00 41"), "assertion failure: expected UTF-16 trailing surrogate");
  EXPECT_EQ(wideFailure("DB FF DB FF DC 00"), "assertion failure: expected UTF-16 trailing surrogate");
}

TEST(WideText, U10000WritesAsD800DC00) {
  EXPECT_EQ(utf16Of(std::wstring(1, wchar_t(0x10000))), bytesOf("D8 00 DC 00"));
}

TEST(WideText, WritesBasicPlaneAsOneUnitAndOthersAsPairs) {
  EXPECT_EQ(utf16Of(L"A\u00e9"), bytesOf("00 41 00 E9"));
  EXPECT_EQ(utf16Of(std::wstring(1, wchar_t(0x10FFFF))), bytesOf("DB FF DF FF"));
  EXPECT_EQ(utf16Of(std::wstring(1, wchar_t(0x1F600))), bytesOf("D8 3D DE 00"));
  EXPECT_EQ(utf16Of(L""), ByteVector());
}

TEST(WideText, BasicPlaneValuesAreWrittenWithoutSurrogateCheck) {
  EXPECT_EQ(utf16Of(std::wstring(1, wchar_t(0xDC00))), bytesOf("DC 00"));
}

TEST(WideText, CodePointBeyond10FFFFFailsExpectedLegalUtf32CodePoint) {
  EXPECT_EQ(failureOf([] { utf16Of(std::wstring(1, wchar_t(0x110000))); }),
            "assertion failure: expected legal UTF-32 code point");
}

TEST(NarrowText, ReadsOctetsAsTheyStandWithoutDecoding) {
  std::string text;
  internalize(bytesOf("C3 A9 00 FF 41"), text);
  EXPECT_EQ(text, std::string("\xC3\xA9\0\xFF"
                              "A",
                              5));
}

TEST(NarrowText, ReadsToTheEndFromTheCurrentPosition) {
  ByteVector bytes = bytesOf("01 02 41 42");
  util::vector_istream in(bytes);
  in.get();
  in.get();
  std::string text;
  internalize(in, text);
  EXPECT_EQ(text, "AB");
  EXPECT_EQ(in.peek(), std::istream::traits_type::eof());
}

TEST(NarrowText, ReadsFromAStreamThatCannotSeek) {
  UnseekableBuffer buffer(bytesOf("41 00 42"));
  std::istream in(&buffer);
  std::string text;
  internalize(in, text);
  EXPECT_EQ(text, std::string("A\0B", 3));
}

TEST(NarrowText, WritesOctetsAsTheyStand) {
  ByteVector bytes;
  externalize(bytes, std::string("\xC3\xA9\0A", 4), true);
  EXPECT_EQ(bytes, bytesOf("C3 A9 00 41"));
}

TEST(Utf8, DecodesEachSequenceLength) {
  EXPECT_EQ(util::utf8::decode("A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"),
            (std::wstring{L'A', wchar_t(0xE9), wchar_t(0x20AC), wchar_t(0x1F600)}));
  EXPECT_EQ(util::utf8::decode(""), L"");
}

TEST(Utf8, EncodesEachSequenceLength) {
  EXPECT_EQ(util::utf8::encode(std::wstring{L'A', wchar_t(0xE9), wchar_t(0x20AC), wchar_t(0x1F600)}),
            "A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST(Utf8, BoundaryCodePointsRoundTrip) {
  const std::wstring text{wchar_t(0x00),   wchar_t(0x7F),   wchar_t(0x80),   wchar_t(0x7FF),   wchar_t(0x800),
                          wchar_t(0xD7FF), wchar_t(0xE000), wchar_t(0xFFFF), wchar_t(0x10000), wchar_t(0x10FFFF)};
  std::string encoded = util::utf8::encode(text);
  EXPECT_EQ(encoded, std::string("\x00\x7F\xC2\x80\xDF\xBF\xE0\xA0\x80\xED\x9F\xBF\xEE\x80\x80\xEF\xBF\xBF"
                                 "\xF0\x90\x80\x80\xF4\x8F\xBF\xBF",
                                 26));
  EXPECT_EQ(util::utf8::decode(encoded), text);
}

TEST(Utf8, OverlongFormsAreInvalid) {
  EXPECT_EQ(utf8Failure("\xC0\x80"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xC1\xBF"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xE0\x9F\xBF"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xF0\x8F\xBF\xBF"), "Invalid code point");
}

TEST(Utf8, SurrogatesAreInvalid) {
  EXPECT_EQ(utf8Failure("\xED\xA0\x80"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xED\xBF\xBF"), "Invalid code point");
}

TEST(Utf8, ValuesBeyond10FFFFAreInvalid) {
  EXPECT_EQ(utf8Failure("\xF4\x90\x80\x80"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xF7\xBF\xBF\xBF"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xF8\x88\x80\x80\x80"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xFF"), "Invalid code point");
}

TEST(Utf8, TruncatedSequencesAreInvalid) {
  EXPECT_EQ(utf8Failure("\xC3"), "Invalid code point");
  EXPECT_EQ(utf8Failure("A\xE2\x82"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xF0\x9F\x98"), "Invalid code point");
  EXPECT_EQ(utf8Failure("\xE2\x82"
                        "A"),
            "Invalid code point");
}

TEST(Utf8, StrayContinuationOctetIsInvalid) {
  EXPECT_EQ(utf8Failure("\x80"), "Invalid code point");
  EXPECT_EQ(utf8Failure("A\xBF"), "Invalid code point");
}

TEST(Utf8, EncodingSurrogatesOrValuesBeyond10FFFFFails) {
  EXPECT_EQ(utf8EncodeFailure(std::wstring(1, wchar_t(0xD800))), "Invalid code point");
  EXPECT_EQ(utf8EncodeFailure(std::wstring(1, wchar_t(0xDFFF))), "Invalid code point");
  EXPECT_EQ(utf8EncodeFailure(std::wstring(1, wchar_t(0x110000))), "Invalid code point");
}

TEST(Utf8, InvalidCodePointIsAUtf8ExceptionAndAStandardException) {
  try {
    util::utf8::decode("\xC0\x80");
    FAIL() << "no exception";
  } catch (const util::utf8::invalid_code_point& e) {
    const std::exception& standard = e;
    EXPECT_STREQ(standard.what(), "Invalid code point");
  }
}

TEST_F(GlobalLocaleWithComma, PlainStreamsFollowTheGlobalLocale) {
  std::ostringstream out;
  out << 1.5 << ' ' << 1234567;
  EXPECT_EQ(out.str(), "1,5 1.234.567");
}

TEST_F(GlobalLocaleWithComma, ClassicOutputStreamUsesAPoint) {
  loomlib::ostringstream_classic out;
  out << 1.5 << ' ' << 1234567;
  EXPECT_EQ(out.str(), "1.5 1234567");
}

TEST_F(GlobalLocaleWithComma, ClassicInputStreamReadsAPoint) {
  loomlib::istringstream_classic in("2.25 1234");
  double d = 0;
  int i = 0;
  in >> d >> i;
  EXPECT_FALSE(in.fail());
  EXPECT_EQ(d, 2.25);
  EXPECT_EQ(i, 1234);
}

TEST_F(GlobalLocaleWithComma, DefaultClassicInputStreamReadsAPoint) {
  loomlib::istringstream_classic in;
  in.str("0.5");
  double d = 0;
  in >> d;
  EXPECT_EQ(d, 0.5);
}
