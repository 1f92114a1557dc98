#include <gtest/gtest.h>

#include "metadata/primer_building.h"

namespace {

KLVKey numberedKey(std::uint32_t n) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x01, 0x0E, 0x7E, 0x00, 0x00,
                                             static_cast<std::uint8_t>(n >> 24), static_cast<std::uint8_t>(n >> 16),
                                             static_cast<std::uint8_t>(n >> 8), static_cast<std::uint8_t>(n)});
}

std::string failureOf(const MXFKeyToTagMap& primer) {
  try {
    zelta::buildPrimerEntries(primer);
  } catch (const util::assertion_failure& failure) {
    return failure.what();
  }
  return "no failure";
}

}  // namespace

TEST(PrimerBuilding, EntriesAscendByTagWithDynamicTagsSteppingOverStaticOnes) {
  const MXFKeyToTagMap primer{{numberedKey(1), 0}, {numberedKey(2), 0x8001}, {numberedKey(3), 0},
                              {numberedKey(4), 0x3C0A}, {numberedKey(5), 0x8003}, {numberedKey(6), 0}};
  EXPECT_EQ((MXFPrimerEntries{{0x3C0A, numberedKey(4)}, {0x8000, numberedKey(1)}, {0x8001, numberedKey(2)},
                              {0x8002, numberedKey(3)}, {0x8003, numberedKey(5)}, {0x8004, numberedKey(6)}}),
            zelta::buildPrimerEntries(primer));
}

TEST(PrimerBuilding, TwoKeysWithOneStaticTagFailConsistentPrimerEntry) {
  EXPECT_EQ("assertion failure: consistent primer entry",
            failureOf({{numberedKey(1), 0x3C0A}, {numberedKey(2), 0x3C0A}}));
}

TEST(PrimerBuilding, LastFreeTagIs0xFFFFAndOneMoreDynamicEntryFails) {
  MXFKeyToTagMap primer;
  for (std::uint32_t n = 0; n < 0x8000; ++n) primer[numberedKey(n)] = 0;
  const MXFPrimerEntries entries = zelta::buildPrimerEntries(primer);
  ASSERT_EQ(0x8000u, entries.size());
  EXPECT_EQ((MXFPrimerEntry{0xFFFF, numberedKey(0x7FFF)}), entries.back());
  primer[numberedKey(0x8000)] = 0;
  EXPECT_EQ("assertion failure: dynamic tag available", failureOf(primer));
}

TEST(PrimerBuilding, SearchEndingOnTakenLastTagGivesNoTagAndTheNextDynamicEntryFails) {
  MXFKeyToTagMap primer{{numberedKey(0), 0xFFFF}};
  for (std::uint32_t n = 1; n <= 0x8000; ++n) primer[numberedKey(n)] = 0;
  const MXFPrimerEntries entries = zelta::buildPrimerEntries(primer);
  ASSERT_EQ(0x8000u, entries.size());
  EXPECT_EQ((MXFPrimerEntry{0xFFFE, numberedKey(0x7FFF)}), entries[0x7FFE]);
  EXPECT_EQ((MXFPrimerEntry{0xFFFF, numberedKey(0)}), entries.back());
  primer[numberedKey(0x8001)] = 0;
  EXPECT_EQ("assertion failure: dynamic tag available", failureOf(primer));
}
