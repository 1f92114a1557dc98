#include <gtest/gtest.h>

#include <limits>
#include <sstream>
#include <string>

#include "klv.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::klv::assertionOf;
using zelta_test::klv::join;
using zelta_test::klv::outputOf;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const fillKeyVersion1 = "06 0e 2b 34 01 01 01 01 03 01 02 10 01 00 00 00";
const char* const fillKeyVersion2 = "06 0e 2b 34 01 01 01 02 03 01 02 10 01 00 00 00";
const char* const universalSetKey = "06 0e 2b 34 02 01 01 01 0d 01 01 01 01 01 01 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";
const char* const berLocalSetKey = "06 0e 2b 34 02 13 01 01 0d 01 01 01 01 01 2f 00";
const char* const oneOctetLocalSetKey = "06 0e 2b 34 02 23 01 01 0d 01 01 01 01 01 2f 00";
const char* const variableLengthPackKey = "06 0e 2b 34 02 24 01 01 0d 01 01 01 01 01 30 00";
const char* const fixedLengthPackKey = "06 0e 2b 34 02 05 01 01 0d 01 02 01 01 02 04 00";
const char* const wrapperKey = "06 0e 2b 34 03 01 01 01 0d 01 02 01 01 01 01 00";
const char* const labelKey = "06 0e 2b 34 04 01 01 01 0d 01 02 01 01 01 01 00";

// A writer on its own string stream, already started.
struct StartedWriter {
  StartedWriter() : writer(out) { writer.startStream(true); }
  std::ostringstream out;
  GenericKLVWriter writer;
  std::uint8_t* buffer = nullptr;
};

}  // namespace

TEST(GenericKLVWriter, StartIndividualItemBeforeAnyLengthFormWritesKeyThenFailsValidCurrentForm) {
  StartedWriter w;
  EXPECT_EQ(assertionOf([&] { w.writer.startIndividualItem(keyOf(itemKey), 5, w.buffer); }),
            "assertion failure: valid current form");
  EXPECT_EQ(outputOf(w.out), bytesOf(itemKey));
}

TEST(GenericKLVWriter, LongFormOf0x81CannotHoldLength256) {
  StartedWriter w;
  w.writer.setLengthForm(0x81);
  EXPECT_EQ(assertionOf([&] { w.writer.startIndividualItem(keyOf(itemKey), 256, w.buffer); }),
            "assertion failure: enough subsequent octets");
}

TEST(GenericKLVWriter, LongFormOf0x81TakesLength255) {
  StartedWriter w;
  w.writer.setLengthForm(0x81);
  w.writer.startIndividualItem(keyOf(itemKey), 255, w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(itemKey), bytesOf("81 ff")}));
}

TEST(GenericKLVWriter, LongFormOf0x88TakesTheLargestLength) {
  StartedWriter w;
  w.writer.setLengthForm(0x88);
  w.writer.startIndividualItem(keyOf(itemKey), std::numeric_limits<std::uint64_t>::max(), w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(itemKey), bytesOf("88 ff ff ff ff ff ff ff ff")}));
}

TEST(GenericKLVWriter, LongFormPadsTheLengthWithLeadingZeros) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  w.writer.startIndividualItem(keyOf(itemKey), 5, w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(itemKey), bytesOf("83 00 00 05")}));
}

TEST(GenericKLVWriter, ShortFormLengthMustBeBelow128) {
  StartedWriter w;
  w.writer.setLengthForm(1);
  w.writer.startIndividualItem(keyOf(itemKey), 127, w.buffer);
  EXPECT_EQ(assertionOf([&] { w.writer.startIndividualItem(keyOf(itemKey), 128, w.buffer); }),
            "assertion failure: valid short form length");
  EXPECT_EQ(outputOf(w.out), join({bytesOf(itemKey), bytesOf("7f"), bytesOf(itemKey)}));
}

TEST(GenericKLVWriter, LongFormOfMoreThanEightOctetsFailsValidLongForm) {
  StartedWriter w;
  w.writer.setLengthForm(0x89);
  EXPECT_EQ(assertionOf([&] { w.writer.startIndividualItem(keyOf(itemKey), 1, w.buffer); }),
            "assertion failure: valid long form");
}

TEST(GenericKLVWriter, FormMustBeShortOrLong) {
  StartedWriter w;
  EXPECT_EQ(assertionOf([&] { w.writer.setLengthForm(0x80); }), "assertion failure: valid form");
  EXPECT_EQ(assertionOf([&] { w.writer.setLengthForm(0); }), "assertion failure: valid form");
  EXPECT_EQ(assertionOf([&] { w.writer.setLengthForm(2); }), "assertion failure: valid form");
  EXPECT_EQ(w.writer.getLengthForm(), KLVNoLengthForm);
}

TEST(GenericKLVWriter, LongFormOctetsRequireLongForm) {
  StartedWriter w;
  w.writer.setLengthForm(1);
  EXPECT_EQ(assertionOf([&] { w.writer.getLongFormOctets(); }), "assertion failure: long form");
  w.writer.setLengthForm(0x83);
  EXPECT_EQ(w.writer.getLengthForm(), 0x83);
  EXPECT_EQ(w.writer.getLongFormOctets(), 3u);
}

TEST(GenericKLVWriter, BERLocalItemLengthUnderForm0x83TakesFourOctets) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  w.writer.startLocalSet(keyOf(berLocalSetKey), 8, KLVTagType2, KLVLengthTypeBER);
  w.writer.startLocalItem(0x3c0a, 2, w.buffer);
  w.writer.value(bytesOf("ab cd").data(), 2);
  EXPECT_EQ(outputOf(w.out),
            join({bytesOf(berLocalSetKey), bytesOf("83 00 00 08"), bytesOf("3c 0a 83 00 00 02 ab cd")}));
}

TEST(GenericKLVWriter, FillItemKeyTakesTheStreamsVersion) {
  StartedWriter w;
  setFillItemKeyVersion(w.out, 2);
  w.writer.setLengthForm(1);
  w.writer.startIndividualItem(keyOf(fillKeyVersion1), 0, w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(fillKeyVersion2), bytesOf("00")}));
}

TEST(GenericKLVWriter, FillItemKeyIsWrittenAsGivenWithoutVersion) {
  StartedWriter w;
  w.writer.setLengthForm(1);
  w.writer.startIndividualItem(keyOf(fillKeyVersion1), 0, w.buffer);
  w.writer.startIndividualItem(keyOf(fillKeyVersion2), 0, w.buffer);
  EXPECT_EQ(outputOf(w.out),
            join({bytesOf(fillKeyVersion1), bytesOf("00"), bytesOf(fillKeyVersion2), bytesOf("00")}));
}

TEST(GenericKLVWriter, OtherKeysKeepTheirVersionOctetWhenTheStreamHasAFillVersion) {
  StartedWriter w;
  setFillItemKeyVersion(w.out, 2);
  w.writer.setLengthForm(1);
  w.writer.startIndividualItem(keyOf(itemKey), 0, w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(itemKey), bytesOf("00")}));
}

TEST(GenericKLVWriter, FillItemKeyVersionIsLookedUpAtTheFirstFillItemOfAStream) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  std::uint8_t* buffer = nullptr;
  writer.startStream(true);
  writer.setLengthForm(1);
  setFillItemKeyVersion(out, 2);
  writer.startIndividualItem(keyOf(fillKeyVersion1), 0, buffer);
  setFillItemKeyVersion(out, 0);
  writer.startIndividualItem(keyOf(fillKeyVersion1), 0, buffer);
  writer.endStream(false);
  writer.startStream(true);
  writer.startIndividualItem(keyOf(fillKeyVersion1), 0, buffer);
  EXPECT_EQ(outputOf(out), join({bytesOf(fillKeyVersion2), bytesOf("00"), bytesOf(fillKeyVersion2), bytesOf("00"),
                                 bytesOf(fillKeyVersion1), bytesOf("00")}));
}

TEST(GenericKLVWriter, LocalSetKeyMustAgreeWithTagAndLengthTypes) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  EXPECT_EQ(assertionOf([&] { w.writer.startLocalSet(keyOf(localSetKey), 0, KLVTagType1, KLVLengthType2); }),
            "assertion failure: correct local item type and length");
  EXPECT_EQ(assertionOf([&] { w.writer.startLocalSet(keyOf(localSetKey), 0, KLVTagType2, KLVLengthType1); }),
            "assertion failure: correct local item type and length");
  EXPECT_TRUE(outputOf(w.out).empty());
}

TEST(GenericKLVWriter, LocalSetNeedsALocalSetKey) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  EXPECT_EQ(assertionOf([&] { w.writer.startLocalSet(keyOf(itemKey), 0, KLVTagType2, KLVLengthType2); }),
            "assertion failure: valid local set key");
}

TEST(GenericKLVWriter, FixedSizeTagsAndLengthsMustFit) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  w.writer.startLocalSet(keyOf(oneOctetLocalSetKey), 0, KLVTagType1, KLVLengthType1);
  EXPECT_EQ(assertionOf([&] { w.writer.startLocalItem(0x100, 1, w.buffer); }), "assertion failure: enough octets");
  EXPECT_EQ(assertionOf([&] { w.writer.startLocalItem(0xff, 0x100, w.buffer); }), "assertion failure: enough octets");
  w.writer.startLocalItem(0xfe, 0xff, w.buffer);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(oneOctetLocalSetKey), bytesOf("83 00 00 00 ff fe ff")}));
}

TEST(GenericKLVWriter, VariableLengthItemsTakeThePacksLengthType) {
  StartedWriter w;
  w.writer.setLengthForm(0x81);
  w.writer.startVariableLengthPack(keyOf(variableLengthPackKey), 5, KLVLengthType1);
  EXPECT_EQ(w.writer.getLengthType(), KLVLengthType1);
  w.writer.startVariableLengthItem(1, w.buffer);
  w.writer.value(bytesOf("aa").data(), 1);
  w.writer.startVariableLengthItem(0, w.buffer);
  w.writer.startVariableLengthItem(1, w.buffer);
  w.writer.value(bytesOf("bb").data(), 1);
  EXPECT_EQ(outputOf(w.out), join({bytesOf(variableLengthPackKey), bytesOf("81 05 01 aa 00 01 bb")}));
}

TEST(GenericKLVWriter, TagAndLengthTypesCanBeSetByHand) {
  StartedWriter w;
  w.writer.setLengthForm(0x82);
  w.writer.setTagType(KLVTagType4);
  w.writer.setLengthType(KLVLengthTypeBER);
  EXPECT_EQ(w.writer.getTagType(), KLVTagType4);
  w.writer.startLocalItem(0x01020304, 3, w.buffer);
  w.writer.setLengthType(KLVLengthType4);
  w.writer.startLocalItem(7, 3, w.buffer);
  EXPECT_EQ(outputOf(w.out), bytesOf("01 02 03 04 82 00 03 00 00 00 07 00 00 00 03"));
}

TEST(GenericKLVWriter, LabelWritesItsKeyOnly) {
  StartedWriter w;
  EXPECT_TRUE(w.writer.startLabel(keyOf(labelKey)));
  w.writer.endLabel(keyOf(labelKey));
  EXPECT_EQ(outputOf(w.out), bytesOf(labelKey));
}

TEST(GenericKLVWriter, StartEventsTakeEveryValueWithoutNamingABuffer) {
  StartedWriter w;
  w.writer.setLengthForm(0x83);
  EXPECT_TRUE(w.writer.startIndividualItem(keyOf(itemKey), 0, w.buffer));
  EXPECT_TRUE(w.writer.startUniversalSet(keyOf(universalSetKey), 0));
  EXPECT_TRUE(w.writer.startLocalSet(keyOf(localSetKey), 0, KLVTagType2, KLVLengthType2));
  EXPECT_TRUE(w.writer.startLocalItem(1, 0, w.buffer));
  EXPECT_TRUE(w.writer.startFixedLengthPack(keyOf(fixedLengthPackKey), 0, w.buffer));
  EXPECT_TRUE(w.writer.startVariableLengthPack(keyOf(variableLengthPackKey), 0, KLVLengthType1));
  EXPECT_TRUE(w.writer.startVariableLengthItem(0, w.buffer));
  EXPECT_TRUE(w.writer.startWrapper(keyOf(wrapperKey), 0, false, w.buffer));
  EXPECT_EQ(w.buffer, nullptr);
}

// Every kind of element, in the octets that a reader takes apart.
TEST(GenericKLVWriter, WritesEveryKindOfElement) {
  StartedWriter w;
  GenericKLVWriter& k = w.writer;
  k.setLengthForm(0x83);
  k.startUniversalSet(keyOf(universalSetKey), 35);
  k.setLengthForm(1);
  k.startIndividualItem(keyOf(itemKey), 2, w.buffer);
  k.value(bytesOf("01 02").data(), 2);
  k.endIndividualItem(keyOf(itemKey));
  k.startLabel(keyOf(labelKey));
  k.endLabel(keyOf(labelKey));
  k.endUniversalSet(keyOf(universalSetKey));
  k.setLengthForm(0x83);
  k.startLocalSet(keyOf(localSetKey), 5, KLVTagType2, KLVLengthType2);
  k.startLocalItem(0x3c0a, 1, w.buffer);
  k.value(bytesOf("ee").data(), 1);
  k.endLocalItem(0x3c0a);
  k.endLocalSet(keyOf(localSetKey));
  k.startFixedLengthPack(keyOf(fixedLengthPackKey), 1, w.buffer);
  k.value(bytesOf("0f").data(), 1);
  k.endFixedLengthPack(keyOf(fixedLengthPackKey));
  k.startWrapper(keyOf(wrapperKey), 0, true, w.buffer);
  k.endWrapper(keyOf(wrapperKey));
  k.endStream(false);
  EXPECT_EQ(outputOf(w.out),
            join({bytesOf(universalSetKey), bytesOf("83 00 00 23"), bytesOf(itemKey), bytesOf("02 01 02"),
                  bytesOf(labelKey), bytesOf(localSetKey), bytesOf("83 00 00 05 3c 0a 00 01 ee"),
                  bytesOf(fixedLengthPackKey), bytesOf("83 00 00 01 0f"), bytesOf(wrapperKey),
                  bytesOf("83 00 00 00")}));
}

TEST(GenericKLVWriter, EmptyValueWritesNothing) {
  StartedWriter w;
  w.writer.value(nullptr, 0);
  EXPECT_TRUE(outputOf(w.out).empty());
}

TEST(GenericKLVWriter, ValueOfNegativeSizeFailsValidStreamsize) {
  StartedWriter w;
  EXPECT_EQ(assertionOf([&] { w.writer.value(nullptr, -1); }), "assertion failure: valid streamsize");
}

TEST(GenericKLVWriter, StartStreamTwiceFailsHasNotStarted) {
  StartedWriter w;
  EXPECT_EQ(assertionOf([&] { w.writer.startStream(true); }), "assertion failure: has not started");
}

TEST(GenericKLVWriter, StartStreamWithoutAccurateLengthsFails) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  EXPECT_EQ(assertionOf([&] { writer.startStream(false); }), "assertion failure: unbuffered output is possible");
}

TEST(GenericKLVWriter, EventsOutsideAStreamFailHasStarted) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  std::uint8_t* buffer = nullptr;
  const std::string text = "assertion failure: has started";
  EXPECT_EQ(assertionOf([&] { writer.endStream(false); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startIndividualItem(keyOf(itemKey), 0, buffer); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startLabel(keyOf(labelKey)); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startUniversalSet(keyOf(universalSetKey), 0); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startLocalSet(keyOf(localSetKey), 0, KLVTagType2, KLVLengthType2); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startLocalItem(1, 0, buffer); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startFixedLengthPack(keyOf(fixedLengthPackKey), 0, buffer); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startVariableLengthPack(keyOf(variableLengthPackKey), 0, 1); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startVariableLengthItem(0, buffer); }), text);
  EXPECT_EQ(assertionOf([&] { writer.startWrapper(keyOf(wrapperKey), 0, true, buffer); }), text);
  EXPECT_EQ(assertionOf([&] { writer.value(nullptr, 0); }), text);
  EXPECT_TRUE(outputOf(out).empty());
}

TEST(GenericKLVWriter, EndStreamEndsTheStream) {
  StartedWriter w;
  w.writer.endStream(false);
  EXPECT_EQ(assertionOf([&] { w.writer.endStream(false); }), "assertion failure: has started");
  w.writer.startStream(true);
}

TEST(GenericKLVWriter, FailedWriteFailsSuccessfulWrite) {
  StartedWriter w;
  w.out.setstate(std::ios_base::badbit);
  EXPECT_EQ(assertionOf([&] { w.writer.startLabel(keyOf(labelKey)); }), "assertion failure: successful write()");
  EXPECT_EQ(assertionOf([&] { w.writer.value(bytesOf("01").data(), 1); }), "assertion failure: successful write()");
}
