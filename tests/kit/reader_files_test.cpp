// Every file of tests/data through createZeltaReader with every handler
// set, against the chain of the lower layers that the kit's reader
// assembles: the same partitions, models, index segments, edit units,
// system items and element octets.
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "kit.h"
#include "support/essence_recording.h"
#include "support/kit_readers.h"
#include "support/model_reading.h"
#include "support/mxf_index_segments.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const char* const wellFormedFiles[] = {"bmx_d10_50m_625_8ch24.mxf",
                                       "bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf",
                                       "bmx_op1a_dv25_625_bodypart_part4.mxf",
                                       "bmx_op1a_dv25_625_singlepass.mxf",
                                       "bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf",
                                       "bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf",
                                       "ffmpeg_d10_50m_525_4ch16.mxf",
                                       "ffmpeg_d10_50m_625_noaudio.mxf",
                                       "ffmpeg_dv25_625_420_2mono.mxf",
                                       "ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
                                       "ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf",
                                       "ffmpeg_opatom_dv25_625_v1.mxf",
                                       "gst_dv25_625_420_2mono.mxf",
                                       "gst_h264_high_longgop_1080p25_2mono.mxf"};

// Damaged copies, and bmx's Avid OP-Atom file, whose two non-SMPTE keys at
// offset 5120 end the read at the KLV layer.
const char* const damagedFiles[] = {"damaged_flipped_header_partition_key_byte13.mxf", "damaged_no_rip.mxf",
                                    "damaged_truncated_50pct.mxf", "bmx_avid_opatom_dv25_625_v1.mxf"};

void expectSameEvents(const ReadRecord& lower, const ReadRecord& kit) {
  ZeltaMetadataFactory factory;
  EXPECT_EQ(lower.failure, kit.failure);
  EXPECT_EQ(lower.structure.events, kit.structure.events);
  ASSERT_EQ(lower.metadata.models.size(), kit.metadata.models.size());
  for (std::size_t i = 0; i < lower.metadata.models.size(); ++i)
    EXPECT_EQ(modelDifference(lower.metadata.models[i], kit.metadata.models[i], factory), "") << "model " << i;
  EXPECT_EQ(lower.metadata.events, kit.metadata.events);
  EXPECT_EQ(lower.index.events, kit.index.events);
  EXPECT_TRUE(lower.index.segments == kit.index.segments);
  EXPECT_EQ(lower.gc.events, kit.gc.events);
  ASSERT_EQ(lower.gc.elements.size(), kit.gc.elements.size());
  for (std::size_t i = 0; i < lower.gc.elements.size(); ++i) {
    EXPECT_EQ(lower.gc.elements[i].kind, kit.gc.elements[i].kind);
    EXPECT_EQ(lower.gc.elements[i].bytes, kit.gc.elements[i].bytes) << "element " << i;
  }
  EXPECT_EQ(lower.sdticp.events, kit.sdticp.events);
  EXPECT_EQ(lower.proxy.events, kit.proxy.events);
  EXPECT_EQ(reportLines(lower.errors.reports), reportLines(withoutKitReports(kit.errors.reports)));
}

TEST(ReaderFiles, EveryWellFormedFileGivesTheEventsOfTheLowerLayers) {
  for (const char* name : wellFormedFiles) {
    SCOPED_TRACE(name);
    ReadRecord lower;
    readThroughLowerLayers(dataPath(name), lower);
    ReadRecord kit;
    readThroughZeltaReader(dataPath(name), kit, true);
    EXPECT_EQ(lower.failure, "");
    EXPECT_FALSE(lower.structure.events.empty());
    EXPECT_FALSE(lower.gc.elements.empty());
    expectSameEvents(lower, kit);
  }
}

// What the kit's validators find in each file of another writer, in order,
// with the reason from the independent dumps (mxfdump of the original).
// Partition by partition: the header, the body partitions, the footer.
const std::map<std::string, std::vector<std::string>> expectedFindings{
    // ffmpeg and bmx's D-10 and long GOP files keep every rule that the
    // partitions, the index and the system items show.
    {"bmx_d10_50m_625_8ch24.mxf", {}},
    {"bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf", {}},
    {"ffmpeg_d10_50m_525_4ch16.mxf", {}},
    {"ffmpeg_d10_50m_625_noaudio.mxf", {}},
    {"ffmpeg_dv25_625_420_2mono.mxf", {}},
    {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf", {}},
    {"ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf", {}},
    // bmx's OP1a files: KAGSize = 00000001 in every partition pack; the
    // essence containers list the wave sound container (0D 01 03 01 02 06 01
    // 00), which the kit's formats do not use. The DV files put their
    // essence in body partitions, which DV may not have, so that their
    // header partition says BodySID = 00000000 (and the single pass file's
    // IndexSID = 00000000 too); the single pass file leaves its header open.
    {"bmx_op1a_dv25_625_bodypart_part4.mxf",
     {"error 02 unexpected essenceContainers value", "error 07 unsupported KAG value",
      "error 09 unexpected bodySID value", "error 07 unsupported KAG value", "error 03 unexpected body partition",
      "error 07 unsupported KAG value", "error 03 unexpected body partition", "error 07 unsupported KAG value"}},
    {"bmx_op1a_dv25_625_singlepass.mxf",
     {"error 02 unexpected essenceContainers value", "error 07 unsupported KAG value",
      "warning 04 open or incomplete partition status", "error 09 unexpected bodySID value",
      "error 0A unexpected indexSID value", "error 07 unsupported KAG value", "error 03 unexpected body partition",
      "error 07 unsupported KAG value", "error 03 unexpected body partition", "error 07 unsupported KAG value"}},
    // An H.264 file's body partitions are not asked for stream identifiers.
    {"bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf",
     {"error 02 unexpected essenceContainers value", "error 07 unsupported KAG value", "error 07 unsupported KAG value",
      "error 07 unsupported KAG value", "error 07 unsupported KAG value"}},
    // The body partition that holds only the index has BodySID = 00000000.
    {"bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf",
     {"error 02 unexpected essenceContainers value", "error 07 unsupported KAG value", "error 07 unsupported KAG value",
      "error 07 unsupported KAG value", "error 09 unexpected bodySID value", "error 07 unsupported KAG value"}},
    // OP-Atom is no pattern of the kit's, in each of the three partitions;
    // the essence stands in a body partition, the header partition naming
    // neither stream; the footer of a closed header names index SID 2.
    {"ffmpeg_opatom_dv25_625_v1.mxf",
     {"error 02 unsupported operationalPattern value", "error 09 unexpected bodySID value",
      "error 0A unexpected indexSID value", "error 02 unsupported operationalPattern value",
      "error 03 unexpected body partition", "error 02 unsupported operationalPattern value",
      "warning 0A non-zero indexSID value"}},
    // GStreamer: KAGSize = 00000001; the essence containers list the DV or
    // AVC picture and the wave sound container without the multiple essence
    // label; DV in a body partition, the header naming neither stream, and
    // its footer names index SID 2.
    {"gst_dv25_625_420_2mono.mxf",
     {"warning 02 unexpected essenceContainers value (missing MULTIPLE_ESSENCE)",
      "error 02 unexpected essenceContainers value", "error 07 unsupported KAG value",
      "error 09 unexpected bodySID value", "error 0A unexpected indexSID value", "error 07 unsupported KAG value",
      "error 03 unexpected body partition", "error 07 unsupported KAG value", "warning 0A non-zero indexSID value"}},
    {"gst_h264_high_longgop_1080p25_2mono.mxf",
     {"warning 02 unexpected essenceContainers value (missing MULTIPLE_ESSENCE)",
      "error 02 unexpected essenceContainers value", "error 07 unsupported KAG value", "error 07 unsupported KAG value",
      "error 07 unsupported KAG value"}},
};

TEST(ReaderFiles, KitValidatorsFindWhatEachWriterBreaks) {
  for (const char* name : wellFormedFiles) {
    SCOPED_TRACE(name);
    ReadRecord kit;
    readThroughZeltaReader(dataPath(name), kit, true);
    ASSERT_EQ(expectedFindings.count(name), 1u);
    EXPECT_EQ(kitFindings(kit.errors.reports), expectedFindings.at(name));
  }
}

TEST(ReaderFiles, DamagedFilesEndAsTheLowerLayersEndThem) {
  for (const char* name : damagedFiles) {
    SCOPED_TRACE(name);
    ReadRecord lower;
    readThroughLowerLayers(dataPath(name), lower);
    ReadRecord kit;
    readThroughZeltaReader(dataPath(name), kit, true);
    expectSameEvents(lower, kit);
  }
}

}  // namespace
