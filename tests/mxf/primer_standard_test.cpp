// The standard primer against the tag and key tables of the format classes
// and of the index table segment, spelled here entry by entry.
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;

namespace {

struct TableEntry {
  std::uint16_t tag;
  const char* key;
  const char* property;
};

// In table order. The generation identifier's key is the one that the
// independent dump bmx/avid_opatom_dv25_625_v1.mxf.mxfdump.txt shows under
// tag 01.02.
const std::vector<TableEntry> table{
    {0x3C0A, "06 0E 2B 34 01 01 01 01 01 01 15 02 00 00 00 00", "MetadataRoot.instanceUID"},
    {0x0102, "06 0E 2B 34 01 01 01 02 05 20 07 01 08 00 00 00", "MetadataObject.generationUID"},
    {0x3B02, "06 0E 2B 34 01 01 01 02 07 02 01 10 02 04 00 00", "Preface.lastModifiedDate"},
    {0x3B05, "06 0E 2B 34 01 01 01 02 03 01 02 01 05 00 00 00", "Preface.version"},
    {0x3B07, "06 0E 2B 34 01 01 01 02 03 01 02 01 04 00 00 00", "Preface.objectModelVersion"},
    {0x3B08, "06 0E 2B 34 01 01 01 04 06 01 01 04 01 08 00 00", "Preface.primaryPackage"},
    {0x3B06, "06 0E 2B 34 01 01 01 02 06 01 01 04 06 04 00 00", "Preface.identifications"},
    {0x3B03, "06 0E 2B 34 01 01 01 02 06 01 01 04 02 01 00 00", "Preface.contentStorage"},
    {0x3B09, "06 0E 2B 34 01 01 01 05 01 02 02 03 00 00 00 00", "Preface.operationalPattern"},
    {0x3B0A, "06 0E 2B 34 01 01 01 05 01 02 02 10 02 01 00 00", "Preface.essenceContainers"},
    {0x3B0B, "06 0E 2B 34 01 01 01 05 01 02 02 10 02 02 00 00", "Preface.dmSchemes"},
    {0x3C09, "06 0E 2B 34 01 01 01 02 05 20 07 01 01 00 00 00", "Identification.thisGenerationUID"},
    {0x3C01, "06 0E 2B 34 01 01 01 02 05 20 07 01 02 01 00 00", "Identification.companyName"},
    {0x3C02, "06 0E 2B 34 01 01 01 02 05 20 07 01 03 01 00 00", "Identification.productName"},
    {0x3C03, "06 0E 2B 34 01 01 01 02 05 20 07 01 04 00 00 00", "Identification.productVersion"},
    {0x3C04, "06 0E 2B 34 01 01 01 02 05 20 07 01 05 01 00 00", "Identification.versionString"},
    {0x3C05, "06 0E 2B 34 01 01 01 02 05 20 07 01 07 00 00 00", "Identification.productUID"},
    {0x3C06, "06 0E 2B 34 01 01 01 02 07 02 01 10 02 03 00 00", "Identification.modificationDate"},
    {0x3C07, "06 0E 2B 34 01 01 01 02 05 20 07 01 0A 00 00 00", "Identification.toolkitVersion"},
    {0x3C08, "06 0E 2B 34 01 01 01 02 05 20 07 01 06 01 00 00", "Identification.platform"},
    {0x0201, "06 0E 2B 34 01 01 01 02 04 07 01 00 00 00 00 00", "Component.dataDefinition"},
    {0x0202, "06 0E 2B 34 01 01 01 02 07 02 02 01 01 03 00 00", "Component.duration"},
    {0x1001, "06 0E 2B 34 01 01 01 02 06 01 01 04 06 09 00 00", "Sequence.components"},
    {0x1101, "06 0E 2B 34 01 01 01 02 06 01 01 03 01 00 00 00", "SourceReference.sourcePackageID"},
    {0x1102, "06 0E 2B 34 01 01 01 02 06 01 01 03 02 00 00 00", "SourceReference.sourceTrackID"},
    {0x1201, "06 0E 2B 34 01 01 01 02 07 02 01 03 01 04 00 00", "SourceClip.startPosition"},
    {0x1501, "06 0E 2B 34 01 01 01 02 07 02 01 03 01 05 00 00", "TimecodeComponent.startTimecode"},
    {0x1502, "06 0E 2B 34 01 01 01 02 04 04 01 01 02 06 00 00", "TimecodeComponent.roundedTimecodeBase"},
    {0x1503, "06 0E 2B 34 01 01 01 01 04 04 01 01 05 00 00 00", "TimecodeComponent.dropFrame"},
    {0x0601, "06 0E 2B 34 01 01 01 02 07 02 01 03 03 03 00 00", "Event.position"},
    {0x0602, "06 0E 2B 34 01 01 01 02 05 30 04 04 01 00 00 00", "Event.comment"},
    {0x6102, "06 0E 2B 34 01 01 01 04 01 07 01 05 00 00 00 00", "DMSegment.targetTrackIDs"},
    {0x6101, "06 0E 2B 34 01 01 01 05 06 01 01 04 02 0C 00 00", "DMSegment.dmFramework"},
    {0x6103, "06 0E 2B 34 01 01 01 05 01 07 01 06 00 00 00 00", "DMSourceClip.targetTrackIDs"},
    {0x1901, "06 0E 2B 34 01 01 01 02 06 01 01 04 05 01 00 00", "ContentStorage.packages"},
    {0x1902, "06 0E 2B 34 01 01 01 02 06 01 01 04 05 02 00 00", "ContentStorage.essenceContainerData"},
    {0x2701, "06 0E 2B 34 01 01 01 02 06 01 01 06 01 00 00 00", "EssenceContainerData.linkedPackageUID"},
    {0x3F06, "06 0E 2B 34 01 01 01 04 01 03 04 05 00 00 00 00", "EssenceContainerData.indexSID"},
    {0x3F07, "06 0E 2B 34 01 01 01 04 01 03 04 04 00 00 00 00", "EssenceContainerData.bodySID"},
    {0x2F01, "06 0E 2B 34 01 01 01 02 06 01 01 04 06 03 00 00", "GenericDescriptor.locators"},
    {0x3006, "06 0E 2B 34 01 01 01 05 06 01 01 03 05 00 00 00", "FileDescriptor.linkedTrackID"},
    {0x3001, "06 0E 2B 34 01 01 01 01 04 06 01 01 00 00 00 00", "FileDescriptor.sampleRate"},
    {0x3002, "06 0E 2B 34 01 01 01 01 04 06 01 02 00 00 00 00", "FileDescriptor.containerDuration"},
    {0x3004, "06 0E 2B 34 01 01 01 02 06 01 01 04 01 02 00 00", "FileDescriptor.essenceContainer"},
    {0x3005, "06 0E 2B 34 01 01 01 02 06 01 01 04 01 03 00 00", "FileDescriptor.codec"},
    {0x3215, "06 0E 2B 34 01 01 01 05 04 05 01 13 00 00 00 00", "PictureDescriptor.signalStandard"},
    {0x320C, "06 0E 2B 34 01 01 01 01 04 01 03 01 04 00 00 00", "PictureDescriptor.frameLayout"},
    {0x3203, "06 0E 2B 34 01 01 01 01 04 01 05 02 02 00 00 00", "PictureDescriptor.storedWidth"},
    {0x3202, "06 0E 2B 34 01 01 01 01 04 01 05 02 01 00 00 00", "PictureDescriptor.storedHeight"},
    {0x3216, "06 0E 2B 34 01 01 01 05 04 01 03 02 08 00 00 00", "PictureDescriptor.storedF2Offset"},
    {0x3205, "06 0E 2B 34 01 01 01 01 04 01 05 01 08 00 00 00", "PictureDescriptor.sampledWidth"},
    {0x3204, "06 0E 2B 34 01 01 01 01 04 01 05 01 07 00 00 00", "PictureDescriptor.sampledHeight"},
    {0x3206, "06 0E 2B 34 01 01 01 01 04 01 05 01 09 00 00 00", "PictureDescriptor.sampledXOffset"},
    {0x3207, "06 0E 2B 34 01 01 01 01 04 01 05 01 0A 00 00 00", "PictureDescriptor.sampledYOffset"},
    {0x3208, "06 0E 2B 34 01 01 01 01 04 01 05 01 0B 00 00 00", "PictureDescriptor.displayHeight"},
    {0x3209, "06 0E 2B 34 01 01 01 01 04 01 05 01 0C 00 00 00", "PictureDescriptor.displayWidth"},
    {0x320A, "06 0E 2B 34 01 01 01 01 04 01 05 01 0D 00 00 00", "PictureDescriptor.displayXOffset"},
    {0x320B, "06 0E 2B 34 01 01 01 01 04 01 05 01 0E 00 00 00", "PictureDescriptor.displayYOffset"},
    {0x3217, "06 0E 2B 34 01 01 01 05 04 01 03 02 07 00 00 00", "PictureDescriptor.displayF2Offset"},
    {0x320E, "06 0E 2B 34 01 01 01 01 04 01 01 01 01 00 00 00", "PictureDescriptor.aspectRatio"},
    {0x3218, "06 0E 2B 34 01 01 01 05 04 01 03 02 09 00 00 00", "PictureDescriptor.activeFormatDescriptor"},
    {0x320D, "06 0E 2B 34 01 01 01 02 04 01 03 02 05 00 00 00", "PictureDescriptor.videoLineMap"},
    {0x320F, "06 0E 2B 34 01 01 01 02 05 20 01 02 00 00 00 00", "PictureDescriptor.alphaTransparency"},
    {0x3210, "06 0E 2B 34 01 01 01 02 04 01 02 01 01 01 02 00", "PictureDescriptor.captureGamma"},
    {0x3211, "06 0E 2B 34 01 01 01 02 04 18 01 01 00 00 00 00", "PictureDescriptor.imageAlignmentOffset"},
    {0x3213, "06 0E 2B 34 01 01 01 02 04 18 01 02 00 00 00 00", "PictureDescriptor.imageStartOffset"},
    {0x3214, "06 0E 2B 34 01 01 01 02 04 18 01 03 00 00 00 00", "PictureDescriptor.imageEndOffset"},
    {0x3212, "06 0E 2B 34 01 01 01 02 04 01 03 01 06 00 00 00", "PictureDescriptor.fieldDominance"},
    {0x3201, "06 0E 2B 34 01 01 01 02 04 01 06 01 00 00 00 00", "PictureDescriptor.pictureEssenceCoding"},
    {0x3219, "06 0E 2B 34 01 01 01 09 04 01 02 01 01 06 01 00", "PictureDescriptor.colourPrimaries"},
    {0x321A, "06 0E 2B 34 01 01 01 02 04 01 02 01 01 03 01 00", "PictureDescriptor.codingEquations"},
    {0x3301, "06 0E 2B 34 01 01 01 02 04 01 05 03 0A 00 00 00", "CDCIPictureDescriptor.componentDepth"},
    {0x3302, "06 0E 2B 34 01 01 01 01 04 01 05 01 05 00 00 00", "CDCIPictureDescriptor.horizontalSubsampling"},
    {0x3308, "06 0E 2B 34 01 01 01 02 04 01 05 01 10 00 00 00", "CDCIPictureDescriptor.verticalSubsampling"},
    {0x3303, "06 0E 2B 34 01 01 01 01 04 01 05 01 06 00 00 00", "CDCIPictureDescriptor.colourSiting"},
    {0x330B, "06 0E 2B 34 01 01 01 05 03 01 02 01 0A 00 00 00", "CDCIPictureDescriptor.reversedByteOrder"},
    {0x3307, "06 0E 2B 34 01 01 01 02 04 18 01 04 00 00 00 00", "CDCIPictureDescriptor.paddingBits"},
    {0x3309, "06 0E 2B 34 01 01 01 02 04 01 05 03 07 00 00 00", "CDCIPictureDescriptor.alphaSamplingDepth"},
    {0x3304, "06 0E 2B 34 01 01 01 01 04 01 05 03 03 00 00 00", "CDCIPictureDescriptor.blackReferenceLevel"},
    {0x3305, "06 0E 2B 34 01 01 01 01 04 01 05 03 04 00 00 00", "CDCIPictureDescriptor.whiteReferenceLevel"},
    {0x3306, "06 0E 2B 34 01 01 01 02 04 01 05 03 05 00 00 00", "CDCIPictureDescriptor.colourRange"},
    {0x3406, "06 0E 2B 34 01 01 01 05 04 01 05 03 0B 00 00 00", "RGBAPictureDescriptor.componentMaxReferenceLevel"},
    {0x3407, "06 0E 2B 34 01 01 01 05 04 01 05 03 0C 00 00 00", "RGBAPictureDescriptor.componentMinReferenceLevel"},
    {0x3408, "06 0E 2B 34 01 01 01 05 04 01 05 03 0D 00 00 00", "RGBAPictureDescriptor.alphaMaxReferenceLevel"},
    {0x3409, "06 0E 2B 34 01 01 01 05 04 01 05 03 0E 00 00 00", "RGBAPictureDescriptor.alphaMinReferenceLevel"},
    {0x3405, "06 0E 2B 34 01 01 01 05 04 01 04 04 01 00 00 00", "RGBAPictureDescriptor.scanningDirection"},
    {0x3401, "06 0E 2B 34 01 01 01 02 04 01 05 03 06 00 00 00", "RGBAPictureDescriptor.pixelLayout"},
    {0x3403, "06 0E 2B 34 01 01 01 02 04 01 05 03 08 00 00 00", "RGBAPictureDescriptor.palette"},
    {0x3404, "06 0E 2B 34 01 01 01 02 04 01 05 03 09 00 00 00", "RGBAPictureDescriptor.paletteLayout"},
    {0x3D03, "06 0E 2B 34 01 01 01 05 04 02 03 01 01 01 00 00", "SoundDescriptor.audioSamplingRate"},
    {0x3D02, "06 0E 2B 34 01 01 01 04 04 02 03 01 04 00 00 00", "SoundDescriptor.locked"},
    {0x3D04, "06 0E 2B 34 01 01 01 01 04 02 01 01 03 00 00 00", "SoundDescriptor.audioReferenceLevel"},
    {0x3D05, "06 0E 2B 34 01 01 01 01 04 02 01 01 01 00 00 00", "SoundDescriptor.electroSpatialFormulation"},
    {0x3D07, "06 0E 2B 34 01 01 01 05 04 02 01 01 04 00 00 00", "SoundDescriptor.channelCount"},
    {0x3D01, "06 0E 2B 34 01 01 01 04 04 02 03 03 04 00 00 00", "SoundDescriptor.quantizationBits"},
    {0x3D0C, "06 0E 2B 34 01 01 01 05 04 02 07 01 00 00 00 00", "SoundDescriptor.dialNorm"},
    {0x3D06, "06 0E 2B 34 01 01 01 02 04 02 04 02 00 00 00 00", "SoundDescriptor.soundEssenceCompression"},
    {0x3E01, "06 0E 2B 34 01 01 01 03 04 03 03 02 00 00 00 00", "DataDescriptor.dataEssenceCoding"},
    {0x3F01, "06 0E 2B 34 01 01 01 04 06 01 01 04 06 0B 00 00", "MultipleDescriptor.subDescriptors"},
    {0x4801, "06 0E 2B 34 01 01 01 02 01 07 01 01 00 00 00 00", "Track.trackID"},
    {0x4804, "06 0E 2B 34 01 01 01 02 01 04 01 03 00 00 00 00", "Track.trackNumber"},
    {0x4802, "06 0E 2B 34 01 01 01 02 01 07 01 02 01 00 00 00", "Track.trackName"},
    {0x4803, "06 0E 2B 34 01 01 01 02 06 01 01 04 02 04 00 00", "Track.segment"},
    {0x4B01, "06 0E 2B 34 01 01 01 02 05 30 04 05 00 00 00 00", "TimelineTrack.editRate"},
    {0x4B02, "06 0E 2B 34 01 01 01 02 07 02 01 03 01 03 00 00", "TimelineTrack.origin"},
    {0x4901, "06 0E 2B 34 01 01 01 02 05 30 04 02 00 00 00 00", "EventTrack.editRate"},
    {0x4902, "06 0E 2B 34 01 01 01 05 07 02 01 03 01 0B 00 00", "EventTrack.origin"},
    {0x4401, "06 0E 2B 34 01 01 01 01 01 01 15 10 00 00 00 00", "GenericPackage.packageUID"},
    {0x4402, "06 0E 2B 34 01 01 01 01 01 03 03 02 01 00 00 00", "GenericPackage.name"},
    {0x4405, "06 0E 2B 34 01 01 01 02 07 02 01 10 01 03 00 00", "GenericPackage.packageCreationDate"},
    {0x4404, "06 0E 2B 34 01 01 01 02 07 02 01 10 02 05 00 00", "GenericPackage.packageModifiedDate"},
    {0x4403, "06 0E 2B 34 01 01 01 02 06 01 01 04 06 05 00 00", "GenericPackage.tracks"},
    {0x4701, "06 0E 2B 34 01 01 01 02 06 01 01 04 02 03 00 00", "SourcePackage.descriptor"},
    {0x4001, "06 0E 2B 34 01 01 01 01 01 02 01 01 01 00 00 00", "NetworkLocator.urlString"},
    {0x4101, "06 0E 2B 34 01 01 01 02 01 04 01 02 01 00 00 00", "TextLocator.locatorName"},
    {0x3F05, "06 0E 2B 34 01 01 01 04 04 06 02 01 00 00 00 00", "IndexTableSegment.editUnitByteCount"},
    {0x3F08, "06 0E 2B 34 01 01 01 04 04 04 04 01 01 00 00 00", "IndexTableSegment.sliceCount"},
    {0x3F09, "06 0E 2B 34 01 01 01 05 04 04 04 01 06 00 00 00", "IndexTableSegment.deltaEntryArray"},
    {0x3F0A, "06 0E 2B 34 01 01 01 05 04 04 04 02 05 00 00 00", "IndexTableSegment.indexEntryArray"},
    {0x3F0B, "06 0E 2B 34 01 01 01 05 05 30 04 06 00 00 00 00", "IndexTableSegment.indexEditRate"},
    {0x3F0C, "06 0E 2B 34 01 01 01 05 07 02 01 03 01 0A 00 00", "IndexTableSegment.indexStartPosition"},
    {0x3F0D, "06 0E 2B 34 01 01 01 05 07 02 02 01 01 02 00 00", "IndexTableSegment.indexDuration"},
    {0x3F0E, "06 0E 2B 34 01 01 01 05 04 04 04 01 07 00 00 00", "IndexTableSegment.posTableCount"},
};

}  // namespace

TEST(MXFStandardPrimer, HoldsTheTableEntryByEntryWithVersionOctets) {
  const MXFPrimerEntries& entries = getMXFStandardPrimer();
  ASSERT_EQ(123u, table.size());
  ASSERT_EQ(table.size(), entries.size());
  for (std::size_t i = 0; i < table.size(); ++i) {
    EXPECT_EQ(table[i].tag, entries[i].tag) << table[i].property;
    // Octet 7 counts here: it is written into every primer.
    EXPECT_EQ(bytesOf(table[i].key), ByteVector(entries[i].key.data(), entries[i].key.data() + 16))
        << table[i].property;
  }
}

TEST(MXFStandardPrimer, MapsAgreeWithTheTableBothWays) {
  const MXFTagToKeyMap& keys = getMXFStandardPrimerKeys();
  const MXFKeyToTagMap& tags = getMXFStandardPrimerTags();
  ASSERT_EQ(123u, keys.size());
  ASSERT_EQ(123u, tags.size());
  for (const TableEntry& entry : table) {
    EXPECT_EQ(keyOf(entry.key), keys.at(entry.tag)) << entry.property;
    EXPECT_EQ(entry.tag, tags.at(keyOf(entry.key))) << entry.property;
  }
}

TEST(MXFStandardPrimer, TagsAndKeysAreUnique) {
  std::set<std::uint16_t> tags;
  std::set<KLVKey> keys;
  for (const TableEntry& entry : table) {
    EXPECT_TRUE(tags.insert(entry.tag).second) << entry.property;
    EXPECT_TRUE(keys.insert(keyOf(entry.key)).second) << entry.property;
  }
}

TEST(MXFStandardPrimer, LeavesOutTheCommentMarkerAnnotationAndTheDynamicTags) {
  const MXFKeyToTagMap& tags = getMXFStandardPrimerTags();
  // CommentMarker.annotation, GenericDescriptor.genericSubDescriptors
  EXPECT_EQ(0u, getMXFStandardPrimerKeys().count(0x0901));
  EXPECT_EQ(0u, tags.count(keyOf("06 0E 2B 34 01 01 01 02 06 01 01 04 02 0A 00 00")));
  EXPECT_EQ(0u, tags.count(keyOf("06 0E 2B 34 01 01 01 09 06 01 01 04 06 10 00 00")));
}
