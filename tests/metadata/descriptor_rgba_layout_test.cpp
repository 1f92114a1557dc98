#include <gtest/gtest.h>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/rgba_layout.h"
#include "support/recording.h"

using namespace zelta_test;

TEST(RGBALayout, SixteenOctetsAreEightPairsOfCodeAndDepth) {
  RGBALayout layout;
  internalize(bytesOf("52 0A 47 0A 42 0A 41 02 00 00 00 00 00 00 00 00"), layout);
  EXPECT_EQ(0x52, layout.components[0].code);
  EXPECT_EQ(10, layout.components[0].depth);
  EXPECT_EQ(0x41, layout.components[3].code);
  EXPECT_EQ(2, layout.components[3].depth);
  EXPECT_EQ(RGBALayout::Component(), layout.components[7]);
}

TEST(RGBALayout, IsWrittenAsItStands) {
  RGBALayout layout;
  layout.components[0] = {0x52, 8};
  layout.components[7] = {0xFF, 0x10};
  ByteVector bytes;
  externalize(bytes, layout, true);
  EXPECT_EQ(bytesOf("52 08 00 00 00 00 00 00 00 00 00 00 00 00 FF 10"), bytes);
}

TEST(RGBALayout, FifteenOctetsFailValidSize) {
  RGBALayout layout;
  EXPECT_EQ("assertion failure: valid size",
            failureOf([&] { internalize(bytesOf("52 08 47 08 42 08 00 00 00 00 00 00 00 00 00"), layout); }));
}

TEST(RGBALayout, SeventeenOctetsFailValidSize) {
  RGBALayout layout;
  EXPECT_EQ("assertion failure: valid size",
            failureOf([&] { internalize(bytesOf("52 08 47 08 42 08 00 00 00 00 00 00 00 00 00 00 00"), layout); }));
}
