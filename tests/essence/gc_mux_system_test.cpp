// System elements coded by the muxer's system handler.
#include <gtest/gtest.h>

#include "essence/gc_mux_fixture.h"
#include "support/klv_streams.h"

using namespace zelta_test;
using namespace zelta_test::gcmux;
using zelta_test::klv::assertionOf;
using zelta_test::klv::join;

TEST(MXFGCSystemCoder, AnswersThatEverySystemElementIsWanted) {
  MuxedContainer container;
  EXPECT_TRUE(container.system().startSystemElement(systemPackKey));
  EXPECT_TRUE(container.system().startSystemElement(pictureKey));
}

TEST(MXFGCSystemCoder, LocalSetIsCodedByItsKeyWithAFourOctetSetLength) {
  MuxedContainer container;
  container.structure().start(0);
  container.system().systemLocalSet(systemSetKey, {{0x0001, bytesOf("AA BB")}, {0x8102, {}}});
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00 83 00 00 0A"),
                                     bytesOf("00 01 00 02 AA BB"), bytesOf("81 02 00 00")}));
}

TEST(MXFGCSystemCoder, LocalSetWithBERItemLengthsGivesThemFourOctets) {
  MuxedContainer container;
  container.structure().start(0);
  container.system().systemLocalSet(keyOf("06.0E.2B.34.02.13.01.01.0D.01.03.01.14.02.01.00"),
                                    {{0x0001, bytesOf("AA BB")}});
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 02 13 01 01 0D 01 03 01 14 02 01 00 83 00 00 08"),
                                     bytesOf("00 01 83 00 00 02 AA BB")}));
}

TEST(MXFGCSystemCoder, FixedPackIsCodedWithAFourOctetLength) {
  MuxedContainer container;
  container.structure().start(0);
  container.system().systemFixedPack(systemPackKey, bytesOf("01 02 03"));
  EXPECT_EQ(container.bytes(), bytesOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00 83 00 00 03 01 02 03"));
}

TEST(MXFGCSystemCoder, VariablePackIsCodedWithItsKeysItemLengths) {
  MuxedContainer container;
  container.structure().start(0);
  container.system().systemVariablePack(systemVariablePackKey, {bytesOf("01 02"), bytesOf("03"), {}});
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 02 44 01 01 0D 01 03 01 04 01 02 00 83 00 00 09"),
                                     bytesOf("00 02 01 02 00 01 03 00 00")}));
}

TEST(MXFGCSystemCoder, VariablePackWithBERItemLengthsGivesThemFourOctets) {
  MuxedContainer container;
  container.structure().start(0);
  container.system().systemVariablePack(keyOf("06.0E.2B.34.02.04.01.01.0D.01.03.01.04.01.02.00"), {bytesOf("01 02")});
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 02 04 01 01 0D 01 03 01 04 01 02 00 83 00 00 06"),
                                     bytesOf("83 00 00 02 01 02")}));
}

TEST(MXFGCSystemCoder, VariablePackNeedsAValidVariableLengthPackKey) {
  MuxedContainer container;
  container.structure().start(0);
  // A local set coding, and a key outside the group family.
  EXPECT_EQ(assertionOf([&] { container.system().systemVariablePack(systemSetKey, {bytesOf("01")}); }),
            "assertion failure: valid variable length pack key");
  EXPECT_EQ(assertionOf([&] { container.system().systemVariablePack(pictureKey, {bytesOf("01")}); }),
            "assertion failure: valid variable length pack key");
  EXPECT_TRUE(container.bytes().empty());
}

TEST(MXFGCSystemCoder, SystemElementsKeepFourOctetLengthsAfterEssenceOfAnotherForm) {
  MuxedContainer container;
  container.structure().start(0);
  container.essence().essenceLengthForm(0x87);
  const ByteVector picture = bytesOf("10 20");
  container.essence().pictureElement(pictureKey, picture.data(), picture.size());
  container.system().systemFixedPack(systemPackKey, bytesOf("01"));
  EXPECT_EQ(slice(container.bytes(), 16, 24), bytesOf("87 00 00 00 00 00 00 02"));
  EXPECT_EQ(slice(container.bytes(), 26 + 16, 26 + 20), bytesOf("83 00 00 01"));
}
