// Every file of tests/data through createZeltaReader with every handler
// set, against the chain of the lower layers that the kit's reader
// assembles: the same partitions, models, index segments, edit units,
// system items and element octets.
#include <gtest/gtest.h>

#include <fstream>
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
