// A file that brings a report for every four octets: the library keeps
// nothing per report, so what it holds does not grow with their number.
#include <gtest/gtest.h>

#include <malloc.h>

#include <algorithm>
#include <memory>

#include "metadata.h"
#include "mxf.h"
#include "support/mxf_streams.h"

using namespace zelta_test;

namespace {

constexpr std::uint64_t zeroOctets = std::uint64_t(4) << 20;
constexpr std::uint64_t floodReports = zeroOctets / 4;

// Counts the reports, and notes every so often how much the process has
// allocated.
class SamplingErrorHandler : public ErrorHandler {
public:
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID&, const std::string&) override { note(); }
  void error(const MXFUID&, const std::string&) override { note(); }
  void fatalError(const MXFUID&, const std::string& message) override { fatal = message; }

  std::uint64_t reports = 0;
  std::size_t firstAllocated = 0;
  std::size_t mostAllocated = 0;
  std::string fatal;

private:
  void note() {
    if (reports++ % 65536 != 0) return;
    const std::size_t allocated = mallinfo2().uordblks;
    if (reports == 1) firstAllocated = allocated;
    mostAllocated = std::max(mostAllocated, allocated);
  }
};

class ModelSink : public MXFMetadataModelHandler {
public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel&) override {}
};

class IndexSink : public MXFIndexHandler {
public:
  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment&) override {}
};

// Every parser of the header metadata and the index, with one error handler.
void readFlood(const ByteVector& bytes, SamplingErrorHandler& errors) {
  ModelSink models;
  MXFMetadataModelParser model(&models, std::make_shared<MXFFormatMetadataModelFactory>());
  model.setErrorHandler(&errors);
  MXFMetadataParser metadata(&model);
  metadata.setErrorHandler(&errors);
  IndexSink segments;
  MXFIndexParser index(&segments);
  index.setErrorHandler(&errors);
  MXFReader reader;
  reader.setMetadataHandler(&metadata);
  reader.setIndexHandler(&index);
  reader.setErrorHandler(&errors);
  util::vector_istream in(bytes);
  EXPECT_THROW(reader.read(in), std::exception);
}

}  // namespace

TEST(ReportFlood, HeaderMetadataSetOfEndlessLengthReportsEveryItemAndHoldsNothingPerReport) {
  SamplingErrorHandler errors;
  readFlood(metadataFlood(zeroOctets), errors);
  // And one of the set's length form, which header metadata does not use.
  EXPECT_EQ(errors.reports, floodReports + 1);
  EXPECT_EQ(errors.fatal, "unsuccessful read()");
  EXPECT_LT(errors.mostAllocated - errors.firstAllocated, std::size_t(1) << 20);
}

TEST(ReportFlood, IndexSegmentOfEndlessLengthReportsEveryItemAndHoldsNothingPerReport) {
  SamplingErrorHandler errors;
  readFlood(indexFlood(zeroOctets), errors);
  EXPECT_EQ(errors.reports, floodReports);
  EXPECT_EQ(errors.fatal, "unsuccessful read()");
  EXPECT_LT(errors.mostAllocated - errors.firstAllocated, std::size_t(1) << 20);
}
