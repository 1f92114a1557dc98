// zelta-info on a hostile file that brings one report for every four
// octets: its memory and output stay small, whatever the number of reports.

#include <gtest/gtest.h>

#include <sys/resource.h>

#include <cstdio>
#include <fstream>
#include <string>

#include "support/mxf_streams.h"
#include "support/recording.h"
#include "support/run_program.h"

namespace {

using namespace zelta_test;

// Four octets a report: a tag of 00.00, which no primer holds, and a length
// of 0, again and again.
constexpr std::uint64_t zeroOctets = std::uint64_t(4) << 20;
constexpr std::uint64_t floodReports = zeroOctets / 4;

const std::string floodMessage = "tag missing in primer - 00.00";
// The reports of one identifier and text that zelta-info keeps.
constexpr std::uint64_t keptPerText = 100;

struct FloodRun {
  ProgramRun run;
  long peakKiB = 0;  // the largest resident size of any child so far
};

FloodRun runOn(const ByteVector& bytes) {
  const std::string path = ::testing::TempDir() + "zelta-flood-" + std::to_string(::getpid()) + ".mxf";
  {
    std::ofstream out(path, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  }
  FloodRun flood;
  flood.run = runZeltaInfo("--json --model --index " + path);
  std::remove(path.c_str());
  rusage usage{};
  getrusage(RUSAGE_CHILDREN, &usage);
  flood.peakKiB = usage.ru_maxrss;
  return flood;
}

void expectBounded(const FloodRun& flood) {
  EXPECT_EQ(flood.run.status, 1);
  EXPECT_LT(flood.run.out.size() + flood.run.err.size(), std::size_t(1) << 20);
#ifndef ZELTA_SANITIZED
  // The sanitizers keep freed memory in quarantine, so only a plain build
  // shows what the program holds.
  EXPECT_LT(flood.peakKiB, 64L << 10);
#endif
  EXPECT_EQ(occurrences(flood.run.out, "\"message\": \"" + floodMessage + "\""), keptPerText);
  EXPECT_NE(flood.run.out.find("\"message\": \"unsuccessful read()\"}], \"suppressed\": " +
                               std::to_string(floodReports - keptPerText) + "}"),
            std::string::npos);
  EXPECT_EQ(occurrences(flood.run.err, "error: " + floodMessage + "\n"), keptPerText);
  EXPECT_NE(flood.run.err.find("fatal: unsuccessful read()\nsuppressed: " +
                               std::to_string(floodReports - keptPerText) + " further reports\n"),
            std::string::npos);
}

}  // namespace

TEST(ZeltaInfoOnFlood, HeaderMetadataSetWithEndlessLengthKeepsTheFirstHundredReportsAndCountsTheRest) {
  expectBounded(runOn(metadataFlood(zeroOctets)));
}

TEST(ZeltaInfoOnFlood, IndexSegmentWithEndlessLengthKeepsTheFirstHundredReportsAndCountsTheRest) {
  expectBounded(runOn(indexFlood(zeroOctets)));
}
