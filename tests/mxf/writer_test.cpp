// MXFWriter on an output stream, and output diverted from it.
#include <gtest/gtest.h>

#include <sstream>

#include "mxf.h"
#include "support/mxf_reports.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

void writePartition(MXFWriter& writer, MXFPartitionKind kind) {
  MXFPartitionPack pack;
  pack.kagSize = 1;
  const KLVKey key = MXFPartitionPackKey(kind, MXFClosedComplete);
  writer.getStructureHandler()->startPartition(key, pack, 0);
  writer.getStructureHandler()->endPartition(key);
}

}  // namespace

TEST(MXFWriter, WritesAFileThatReadsBackClean) {
  std::ostringstream out;
  MXFWriter writer(out);
  writer.getStructureHandler()->startStream();
  writePartition(writer, MXFHeaderPartition);
  writePartition(writer, MXFFooterPartition);
  writer.getStructureHandler()->randomIndex({});
  writer.getStructureHandler()->endStream(false);
  const std::string text = out.str();
  ReaderRun run;
  readWithMXFReader(ByteVector(text.begin(), text.end()), run);
  EXPECT_EQ(run.failure, "no failure");
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(run.structure.packs.size(), 2u);
  EXPECT_EQ(run.structure.entries.size(), 2u);
}

TEST(MXFWriter, SetHandlerDivertsTheOutputAndResetHandlerBringsItBack) {
  std::ostringstream out;
  MXFWriter writer(out);
  KLVHandler* own = writer.getHandler();
  RecordingKLVHandler recording;
  writer.setHandler(&recording);
  EXPECT_EQ(writer.getHandler(), &recording);
  writer.getStructureHandler()->startStream();
  writePartition(writer, MXFHeaderPartition);
  writer.getStructureHandler()->endStream(false);
  EXPECT_TRUE(out.str().empty());
  EXPECT_FALSE(recording.events.empty());
  writer.resetHandler();
  EXPECT_EQ(writer.getHandler(), own);
}
