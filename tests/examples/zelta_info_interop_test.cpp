// zelta-info over files that other MXF writers made. The expected partitions
// and random indexes are those of an independent KLV walk of each file (the
// mxfdump and mediainfo traces that came with the files), not Zelta's own.

#include <gtest/gtest.h>

#include <cctype>
#include <string>
#include <vector>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

struct ExpectedPartition {
  long long offset;
  const char* kind;
  int status;  // key octet 14
  int minorVersion;
  long long kagSize, thisPartition, previousPartition, footerPartition, headerByteCount, indexByteCount;
  long long indexSID, bodyOffset, bodySID;
};

struct ExpectedRandomIndexEntry {
  long long bodySID, byteOffset;
};

struct ExpectedFile {
  const char* name;
  std::vector<ExpectedPartition> partitions;
  std::vector<ExpectedRandomIndexEntry> randomIndex;
};

void PrintTo(const ExpectedFile& file, std::ostream* out) { *out << file.name; }

const char* const statusNames[] = {"", "open incomplete", "closed incomplete", "open complete", "closed complete"};

// Offsets, pack fields and random index entries as the independent dumps give them.
const std::vector<ExpectedFile> expectedFiles = {
    {"ffmpeg_d10_50m_625_noaudio.mxf",
     {{0, "header", 4, 3, 512, 0, 0, 758272, 4608, 512, 2, 0, 1},
      {758272, "footer", 4, 3, 512, 758272, 0, 758272, 0, 0, 0, 0, 0}},
     {{1, 0}, {0, 758272}}},
    {"ffmpeg_dv25_625_420_2mono.mxf",
     {{0, "header", 4, 3, 512, 0, 0, 926208, 6656, 512, 2, 0, 1},
      {926208, "footer", 4, 3, 512, 926208, 0, 926208, 0, 0, 0, 0, 0}},
     {{1, 0}, {0, 926208}}},
    {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
     {{0, "header", 4, 3, 512, 0, 0, 1175552, 6656, 0, 0, 0, 0},
      {7168, "body", 4, 3, 512, 7168, 0, 1175552, 0, 0, 0, 0, 1},
      {1175552, "footer", 4, 3, 512, 1175552, 7168, 1175552, 0, 1024, 2, 0, 0}},
     {{0, 0}, {1, 7168}, {0, 1175552}}},
    {"ffmpeg_opatom_dv25_625_v1.mxf",
     {{0, "header", 4, 3, 512, 0, 0, 869888, 4608, 0, 0, 0, 0},
      {5120, "body", 4, 3, 512, 5120, 0, 869888, 0, 0, 0, 0, 1},
      {869888, "footer", 4, 3, 512, 869888, 5120, 869888, 0, 512, 2, 0, 0}},
     {{0, 0}, {1, 5120}, {0, 869888}}},
    {"gst_dv25_625_420_2mono.mxf",
     {{0, "header", 4, 2, 1, 0, 0, 916104, 5402, 0, 0, 0, 0},
      {5539, "body", 4, 2, 1, 5539, 0, 916104, 0, 0, 0, 0, 1},
      {916104, "footer", 4, 2, 1, 916104, 5539, 916104, 5402, 198, 2, 0, 0}},
     {{0, 0}, {1, 5539}, {0, 916104}}},
    {"gst_h264_high_longgop_1080p25_2mono.mxf",
     {{0, "header", 4, 2, 1, 0, 0, 1136902, 5440, 0, 0, 0, 0},
      {5577, "body", 4, 2, 1, 5577, 0, 1136902, 0, 0, 0, 0, 1},
      {1136902, "footer", 4, 2, 1, 1136902, 5577, 1136902, 5440, 397, 2, 0, 0}},
     {{0, 0}, {1, 5577}, {0, 1136902}}},
    {"bmx_op1a_dv25_625_singlepass.mxf",
     {{0, "header", 1, 3, 1, 0, 0, 0, 22019, 0, 0, 0, 0},
      {22175, "body", 3, 3, 1, 22175, 0, 0, 0, 130, 1, 0, 0},
      {22461, "body", 3, 3, 1, 22461, 22175, 0, 0, 0, 0, 0, 2},
      {933057, "footer", 4, 3, 1, 933057, 22461, 933057, 22085, 0, 0, 0, 0}},
     {{0, 0}, {0, 22175}, {2, 22461}, {0, 933057}}},
    {"bmx_op1a_dv25_625_bodypart_part4.mxf",
     {{0, "header", 4, 3, 1, 0, 0, 933057, 22019, 130, 1, 0, 0},
      {22305, "body", 4, 3, 1, 22305, 0, 933057, 0, 0, 0, 0, 2},
      {629421, "body", 4, 3, 1, 629421, 22305, 933057, 0, 0, 0, 606960, 2},
      {933057, "footer", 4, 3, 1, 933057, 629421, 933057, 0, 0, 0, 0, 0}},
     {{0, 0}, {2, 22305}, {2, 629421}, {0, 933057}}},
    {"bmx_d10_50m_625_8ch24.mxf",
     {{0, "header", 4, 2, 512, 0, 0, 1587200, 22016, 512, 1, 0, 2},
      {1587200, "footer", 4, 2, 512, 1587200, 0, 1587200, 0, 0, 0, 0, 0}},
     {{2, 0}, {0, 1587200}}},
    {"damaged_no_rip.mxf",
     {{0, "header", 4, 3, 512, 0, 0, 858624, 5632, 512, 2, 0, 1},
      {858624, "footer", 4, 3, 512, 858624, 0, 858624, 0, 0, 0, 0, 0}},
     {}}};

// The number after "name": in a JSON object of zelta-info.
long long field(const std::string& object, const std::string& name) {
  const std::string label = "\"" + name + "\": ";
  std::string::size_type at = object.find(label);
  if (at == std::string::npos) return -12345;
  return std::stoll(object.substr(at + label.size()));
}

std::vector<std::string> partitionObjects(const std::string& json) {
  std::vector<std::string> objects;
  std::string::size_type at = 0;
  while ((at = json.find("{\"offset\": ", at)) != std::string::npos) {
    std::string::size_type end = json.find("}}}", at);
    objects.push_back(json.substr(at, end - at + 3));
    at = end;
  }
  return objects;
}

void expectPartitions(const ExpectedFile& file, const std::string& json) {
  std::vector<std::string> objects = partitionObjects(json);
  ASSERT_EQ(objects.size(), file.partitions.size()) << json;
  for (std::size_t i = 0; i < objects.size(); ++i) {
    const ExpectedPartition& e = file.partitions[i];
    const std::string& o = objects[i];
    SCOPED_TRACE(o);
    EXPECT_EQ(field(o, "offset"), e.offset);
    EXPECT_NE(o.find(std::string("\"kind\": \"") + e.kind + "\""), std::string::npos);
    EXPECT_NE(o.find(std::string("\"status\": \"") + statusNames[e.status] + "\""), std::string::npos);
    EXPECT_EQ(field(o, "majorVersion"), 1);
    EXPECT_EQ(field(o, "minorVersion"), e.minorVersion);
    EXPECT_EQ(field(o, "kagSize"), e.kagSize);
    EXPECT_EQ(field(o, "thisPartition"), e.thisPartition);
    EXPECT_EQ(field(o, "previousPartition"), e.previousPartition);
    EXPECT_EQ(field(o, "footerPartition"), e.footerPartition);
    EXPECT_EQ(field(o, "headerByteCount"), e.headerByteCount);
    EXPECT_EQ(field(o, "indexByteCount"), e.indexByteCount);
    EXPECT_EQ(field(o, "indexSID"), e.indexSID);
    EXPECT_EQ(field(o, "bodyOffset"), e.bodyOffset);
    EXPECT_EQ(field(o, "bodySID"), e.bodySID);
    // The sections take exactly the octets that the pack promises them.
    EXPECT_EQ(field(o.substr(o.find("\"metadata\": ")), "bytes"), e.headerByteCount);
    EXPECT_EQ(field(o.substr(o.find("\"index\": ")), "bytes"), e.indexByteCount);
  }
}

void expectRandomIndex(const ExpectedFile& file, const std::string& json) {
  std::string expected = "\"randomIndex\": [";
  for (std::size_t i = 0; i < file.randomIndex.size(); ++i)
    expected += (i ? ", " : "") + std::string("{\"bodySID\": ") + std::to_string(file.randomIndex[i].bodySID) +
                ", \"byteOffset\": " + std::to_string(file.randomIndex[i].byteOffset) + "}";
  expected += "]";
  EXPECT_NE(json.find(expected), std::string::npos) << expected << "\n" << json;
}

class ZeltaInfoOnInteropFile : public ::testing::TestWithParam<ExpectedFile> {};

TEST_P(ZeltaInfoOnInteropFile, ReadsToTheEndWithThePartitionsOfAnIndependentWalk) {
  const ExpectedFile& file = GetParam();
  zelta_test::ProgramRun run = zelta_test::runZeltaInfo("--json " + zelta_test::dataPath(file.name));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("\"result\": \"ok\""), std::string::npos);
  EXPECT_EQ(run.out.find("\"severity\": \"fatal\""), std::string::npos) << run.err;
  EXPECT_EQ(run.err.find("fatal: "), std::string::npos) << run.err;
  expectPartitions(file, run.out);
  expectRandomIndex(file, run.out);
}

std::string nameOf(const ::testing::TestParamInfo<ExpectedFile>& info) {
  std::string name = info.param.name;
  name = name.substr(0, name.find('.'));
  for (char& c : name)
    if (!std::isalnum(static_cast<unsigned char>(c))) c = '_';
  return name;
}

INSTANTIATE_TEST_SUITE_P(Files, ZeltaInfoOnInteropFile, ::testing::ValuesIn(expectedFiles), nameOf);

}  // namespace
