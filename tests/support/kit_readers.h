// A file read through createZeltaReader with every handler set, or through
// the chain of the lower layers that the kit's reader assembles, each event
// written down.
#ifndef ZELTA_TESTS_SUPPORT_KIT_READERS_H
#define ZELTA_TESTS_SUPPORT_KIT_READERS_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "kit.h"
#include "support/essence_recording.h"
#include "support/mxf_index_segments.h"
#include "support/recording.h"

namespace zelta_test {

// A handler that the test owns, lent to a reader or writer that wants it
// reference-counted.
template <typename T>
std::shared_ptr<T> borrowed(T& handler) {
  return std::shared_ptr<T>(&handler, [](T*) {});
}

// Lines "start", "end", "model <object count>", "packageItem <size>"; the
// models kept whole.
class RecordingZeltaMetadataHandler : public ZeltaMetadataHandler {
 public:
  void start() override { events.push_back("start"); }
  void end() override { events.push_back("end"); }
  void model(const MXFMetadataModel& objects) override;
  void packageItem(const std::uint8_t* data, std::size_t size) override;

  std::vector<std::string> events;
  std::vector<MXFMetadataModel> models;
  std::vector<ByteVector> items;
};

// Lines "proxySystem <frame count> <timecode count>".
class RecordingProxyHandler : public MXFQMProxySystemHandler {
 public:
  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) override;

  std::vector<std::string> events;
};

struct ReadRecord {
  RecordingStructureHandler structure;
  RecordingZeltaMetadataHandler metadata;
  RecordingIndexHandler index;
  RecordingGCHandler gc;
  RecordingSDTICPHandler sdticp;
  RecordingProxyHandler proxy;
  RecordingErrorHandler errors;
  std::string failure;  // what() of what ended the read; empty when it ended normally
};

// MXFReader with a run-in skipped, MXFMetadataParser into
// MXFMetadataModelParser with the kit's factory, MXFIndexParser, and
// MXFGCSplitter with the SDTI-CP and proxy parsers, every one with the
// error handler.
void readThroughLowerLayers(const std::string& path, ReadRecord& record);
// createZeltaReader with every handler set, the error handler only when
// asked for.
void readThroughZeltaReader(const std::string& path, ReadRecord& record, bool withErrorHandler);
void readThroughZeltaReader(const std::shared_ptr<std::istream>& input, ReadRecord& record, bool withErrorHandler);

// "severity identifier message" per report.
std::vector<std::string> reportLines(const std::vector<Report>& reports);
// The reports of the kit's own validators (identifiers 4c50xxxx) left out.
std::vector<Report> withoutKitReports(const std::vector<Report>& reports);
// Only those.
std::vector<Report> kitReports(const std::vector<Report>& reports);
// Those as "severity NN text", NN the fourth octet of the identifier.
std::vector<std::string> kitFindings(const std::vector<Report>& reports);

}  // namespace zelta_test

#endif
