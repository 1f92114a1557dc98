// Handlers that write down what they hear, for tests of every layer.
#ifndef ZELTA_TESTS_SUPPORT_RECORDING_H
#define ZELTA_TESTS_SUPPORT_RECORDING_H

#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace zelta_test {

struct Report {
  std::string severity;  // "warning", "error" or "fatal"
  MXFUID identifier;
  std::string message;
};

// Keeps every report, and how often start and end came.
class RecordingErrorHandler : public ErrorHandler {
public:
  void setLocator(Locator* locator) override { locator_ = locator; }
  void start() override { ++starts; }
  void end() override { ++ends; }
  void warning(const MXFUID& id, const std::string& message) override { add("warning", id, message); }
  void error(const MXFUID& id, const std::string& message) override { add("error", id, message); }
  void fatalError(const MXFUID& id, const std::string& message) override { add("fatal", id, message); }

  std::vector<Report> reports;
  std::vector<std::streamoff> positions;  // the locator's position at each report, -1 without one
  int starts = 0;
  int ends = 0;

private:
  void add(const char* severity, const MXFUID& id, const std::string& message);
  Locator* locator_ = nullptr;
};

// Writes each KLV event as one line of text ("startIndividualItem <key> 12",
// "value 12", ...), and takes values by the policy it is given.
class RecordingKLVHandler : public KLVHandler {
public:
  enum Policy { take, takeIntoBuffer, skip };
  explicit RecordingKLVHandler(Policy policy = take) : policy_(policy) {}

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
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
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

  std::vector<std::string> events;
  ByteVector values;  // every value octet, in order
  Locator* locator = nullptr;

private:
  bool start(const std::string& event, std::uint64_t length, std::uint8_t** buffer);
  void add(const std::string& event);
  Policy policy_;
  ByteVector buffer_;
};

// Writes each structure event as one line of text.
class RecordingStructureHandler : public MXFStructureHandler {
public:
  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  std::vector<std::string> events;
  std::vector<MXFPartitionPack> packs;
  std::vector<MXFRandomIndexEntry> entries;
};

std::string toString(const KLVKey& key);
KLVKey keyOf(const std::string& dotted);  // "06.0E.2B.34...."
ByteVector bytesOf(const std::string& hex);  // "06 0e 2b 34 ..." (blanks ignored)
ByteVector readFile(const std::string& path);
std::string dataPath(const std::string& name);  // a file of tests/data

}  // namespace zelta_test

#endif
