#include "support/recording.h"

#include <cctype>
#include <fstream>
#include <iterator>
#include <sstream>

namespace zelta_test {

void RecordingErrorHandler::add(const char* severity, const MXFUID& id, const std::string& message) {
  reports.push_back(Report{severity, id, message});
  positions.push_back(locator_ ? static_cast<std::streamoff>(locator_->getPosition()) : -1);
}

std::string toString(const KLVKey& key) {
  std::ostringstream out;
  out << key;
  return out.str();
}

KLVKey keyOf(const std::string& dotted) {
  ByteVector b = bytesOf(dotted);
  check(b.size() == 16, "key of 16 octets");
  return KLVKey(b.data());
}

ByteVector bytesOf(const std::string& hex) {
  ByteVector out;
  std::string digits;
  for (char c : hex)
    if (std::isxdigit(static_cast<unsigned char>(c))) digits += c;
  check(digits.size() % 2 == 0, "whole octets");
  for (std::size_t i = 0; i < digits.size(); i += 2)
    out.push_back(static_cast<std::uint8_t>(std::stoul(digits.substr(i, 2), nullptr, 16)));
  return out;
}

ByteVector readFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  check(in.good(), "readable file " + path);
  return ByteVector(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

std::string dataPath(const std::string& name) { return std::string(ZELTA_TEST_DATA) + "/" + name; }

void RecordingKLVHandler::add(const std::string& event) { events.push_back(event); }

bool RecordingKLVHandler::start(const std::string& event, std::uint64_t length, std::uint8_t** buffer) {
  add(event);
  if (policy_ == skip) return false;
  if (policy_ == takeIntoBuffer && buffer) {
    buffer_.resize(length);
    *buffer = buffer_.data();
  }
  return true;
}

void RecordingKLVHandler::setLocator(Locator* l) {
  locator = l;
  add("setLocator");
}
void RecordingKLVHandler::startStream(bool accurate) { add(std::string("startStream ") + (accurate ? "1" : "0")); }
void RecordingKLVHandler::endStream(bool aborted) { add(std::string("endStream ") + (aborted ? "1" : "0")); }
void RecordingKLVHandler::setLengthForm(std::uint8_t form) { add("setLengthForm " + std::to_string(form)); }
bool RecordingKLVHandler::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return start("startIndividualItem " + toString(key) + " " + std::to_string(length), length, &buffer);
}
void RecordingKLVHandler::endIndividualItem(const KLVKey& key) { add("endIndividualItem " + toString(key)); }
bool RecordingKLVHandler::startLabel(const KLVKey& key) { return start("startLabel " + toString(key), 0, nullptr); }
void RecordingKLVHandler::endLabel(const KLVKey& key) { add("endLabel " + toString(key)); }
bool RecordingKLVHandler::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return start("startUniversalSet " + toString(key) + " " + std::to_string(length), length, nullptr);
}
void RecordingKLVHandler::endUniversalSet(const KLVKey& key) { add("endUniversalSet " + toString(key)); }
bool RecordingKLVHandler::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                        KLVLengthType lengthType) {
  return start("startLocalSet " + toString(key) + " " + std::to_string(length) + " " + std::to_string(tagType) + " " +
                   std::to_string(lengthType),
               length, nullptr);
}
void RecordingKLVHandler::endLocalSet(const KLVKey& key) { add("endLocalSet " + toString(key)); }
bool RecordingKLVHandler::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  return start("startLocalItem " + std::to_string(tag) + " " + std::to_string(length), length, &buffer);
}
void RecordingKLVHandler::endLocalItem(std::uint32_t tag) { add("endLocalItem " + std::to_string(tag)); }
bool RecordingKLVHandler::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return start("startFixedLengthPack " + toString(key) + " " + std::to_string(length), length, &buffer);
}
void RecordingKLVHandler::endFixedLengthPack(const KLVKey& key) { add("endFixedLengthPack " + toString(key)); }
bool RecordingKLVHandler::startVariableLengthPack(const KLVKey& key, std::uint64_t length,
                                                  KLVLengthType lengthType) {
  return start("startVariableLengthPack " + toString(key) + " " + std::to_string(length) + " " +
                   std::to_string(lengthType),
               length, nullptr);
}
void RecordingKLVHandler::endVariableLengthPack(const KLVKey& key) { add("endVariableLengthPack " + toString(key)); }
bool RecordingKLVHandler::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  return start("startVariableLengthItem " + std::to_string(length), length, &buffer);
}
void RecordingKLVHandler::endVariableLengthItem() { add("endVariableLengthItem"); }
bool RecordingKLVHandler::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper,
                                       std::uint8_t*& buffer) {
  return start("startWrapper " + toString(key) + " " + std::to_string(length) + " " + (isWrapper ? "1" : "0"),
               length, &buffer);
}
void RecordingKLVHandler::endWrapper(const KLVKey& key) { add("endWrapper " + toString(key)); }
void RecordingKLVHandler::value(const std::uint8_t* data, std::streamsize size) {
  add("value " + std::to_string(size));
  values.insert(values.end(), data, data + size);
}

void RecordingStructureHandler::setRunIn(std::uint32_t runIn) { events.push_back("setRunIn " + std::to_string(runIn)); }
void RecordingStructureHandler::startStream() { events.push_back("startStream"); }
void RecordingStructureHandler::endStream(bool aborted) {
  events.push_back(std::string("endStream ") + (aborted ? "1" : "0"));
}
void RecordingStructureHandler::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                               std::uint64_t packLength) {
  events.push_back("startPartition " + toString(key) + " " + std::to_string(packLength));
  packs.push_back(pack);
}
void RecordingStructureHandler::endPartition(const KLVKey& key) { events.push_back("endPartition " + toString(key)); }
void RecordingStructureHandler::randomIndex(const std::vector<MXFRandomIndexEntry>& e) {
  events.push_back("randomIndex " + std::to_string(e.size()));
  entries = e;
}

}  // namespace zelta_test
