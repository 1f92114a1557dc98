// What zelta-info learns from a file, and the handlers that learn it.
#ifndef ZELTA_INFO_SUMMARY_H
#define ZELTA_INFO_SUMMARY_H

#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "essence.h"
#include "klv.h"
#include "master.h"
#include "model.h"
#include "mxf.h"

namespace zelta_info {

struct Report {
  std::string severity;
  MXFUID identifier;
  std::string message;
};

struct Section {
  std::uint64_t elements = 0;
  std::uint64_t bytes = 0;
};

enum SectionIndex { metadataSection, indexSection, essenceSection };

// The header metadata of one partition as primer and primed sets.
struct Metadata {
  std::uint64_t partition = 0;  // the partition's offset
  MXFPrimerEntries primer;
  std::vector<MXFPrimedSet> sets;
};

// The index table segments of one partition.
struct Index {
  std::uint64_t partition = 0;  // the partition's offset
  std::vector<MXFIndexTableSegment> segments;
};

struct Partition {
  std::uint64_t offset = 0;
  KLVKey key;
  MXFPartitionPack pack;
  std::uint64_t packLength = 0;
  Section sections[3];
};

struct Summary {
  std::uint32_t runIn = 0;
  std::vector<Partition> partitions;
  std::vector<MXFRandomIndexEntry> randomIndex;
  std::vector<Metadata> metadata;
  std::vector<Index> index;
  Essence essence;
  SystemItems system;
  Model model;
  Master master;
  std::vector<Report> reports;
  std::uint64_t suppressed = 0;  // reports neither kept nor echoed
};

// Keeps the reports and echoes them to stderr. A damaged file can bring a
// report for every few octets, so memory and output must not follow their
// number: of each identifier and text only the first reportsPerText are
// kept, and no more than keptReports in all; the others are counted. Fatal
// reports, one to a read, are always kept.
class Reporter : public ErrorHandler {
public:
  static constexpr std::uint32_t reportsPerText = 100;
  static constexpr std::size_t keptReports = 10000;

  explicit Reporter(Summary& summary) : summary_(summary) {}
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID& id, const std::string& message) override { add("warning", id, message); }
  void error(const MXFUID& id, const std::string& message) override { add("error", id, message); }
  void fatalError(const MXFUID& id, const std::string& message) override { add("fatal", id, message); }

private:
  void add(const char* severity, const MXFUID& id, const std::string& message);
  bool keeps(const char* severity, const MXFUID& id, const std::string& message);
  Summary& summary_;
  std::map<std::pair<MXFUID, std::string>, std::uint32_t> kept_;
};

// Counts the top-level elements and octets of one section of each partition,
// and passes the events on.
class SectionCounter : public DullKLVFilter {
public:
  SectionCounter(Summary& summary, SectionIndex index, KLVHandler* next);

  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;

private:
  void count(std::uint64_t octets);
  Summary& summary_;
  SectionIndex index_;
  unsigned depth_ = 0;
  unsigned lengthOctets_ = 1;
};

// Partitions with their offsets, which follow from the run-in and the octets
// of everything before them.
class StructureCollector : public DullMXFStructureHandler {
public:
  explicit StructureCollector(Summary& summary) : summary_(summary) {}
  void setRunIn(std::uint32_t runIn) override { summary_.runIn = runIn; }
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override { summary_.randomIndex = entries; }

private:
  Summary& summary_;
};

// The primer and every primed set of each header metadata section.
class SetCollector : public MXFMetadataHandler {
public:
  explicit SetCollector(Summary& summary) : summary_(summary) {}
  void start() override;
  void end() override {}
  void primer(const MXFPrimerEntries& entries) override { summary_.metadata.back().primer = entries; }
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet& set) override { summary_.metadata.back().sets.push_back(set); }

private:
  Summary& summary_;
};

// The index table segments of each index section.
class IndexCollector : public MXFIndexHandler {
public:
  explicit IndexCollector(Summary& summary) : summary_(summary) {}
  void startIndex() override;
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override {
    summary_.index.back().segments.push_back(segment);
  }

private:
  Summary& summary_;
};

// What to print beside the partitions.
struct Details {
  bool sets = false;
  bool index = false;
  bool essence = false;
  bool md5 = false;
  bool system = false;
  bool model = false;
  bool master = false;
  bool validate = false;
};

// Text forms shared by the printers.
std::string label(const KLVKey& key);
std::string jsonString(const std::string& text);

void printText(std::ostream& out, const Summary& summary, const Details& details);
void printJson(std::ostream& out, const std::string& file, bool fatal, const Summary& summary,
               const Details& details);

}  // namespace zelta_info

#endif
