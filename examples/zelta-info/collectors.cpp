#include <iostream>

#include "summary.h"

namespace zelta_info {

void Reporter::add(const char* severity, const MXFUID& id, const std::string& message) {
  if (!keeps(severity, id, message)) {
    ++summary_.suppressed;
    return;
  }
  summary_.reports.push_back(Report{severity, id, message});
  std::cerr << severity << ": " << message << "\n";
}

bool Reporter::keeps(const char* severity, const MXFUID& id, const std::string& message) {
  if (std::string(severity) == "fatal") return true;
  if (summary_.reports.size() >= keptReports) return false;
  return ++kept_[{id, message}] <= reportsPerText;
}

SectionCounter::SectionCounter(Summary& summary, SectionIndex index, KLVHandler* next)
    : DullKLVFilter(next), summary_(summary), index_(index) {}

void SectionCounter::count(std::uint64_t octets) {
  if (depth_++ != 0) return;
  Section& section = summary_.partitions.back().sections[index_];
  section.elements += 1;
  section.bytes += octets;
}

void SectionCounter::setLengthForm(std::uint8_t form) {
  lengthOctets_ = lengthFormOctets(form);
  DullKLVFilter::setLengthForm(form);
}

bool SectionCounter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startIndividualItem(key, length, buffer);
}

void SectionCounter::endIndividualItem(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endIndividualItem(key);
}

bool SectionCounter::startLabel(const KLVKey& key) {
  count(KLVKey::size());
  return DullKLVFilter::startLabel(key);
}

void SectionCounter::endLabel(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endLabel(key);
}

bool SectionCounter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startUniversalSet(key, length);
}

void SectionCounter::endUniversalSet(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endUniversalSet(key);
}

bool SectionCounter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                   KLVLengthType lengthType) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
}

void SectionCounter::endLocalSet(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endLocalSet(key);
}

bool SectionCounter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startFixedLengthPack(key, length, buffer);
}

void SectionCounter::endFixedLengthPack(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endFixedLengthPack(key);
}

bool SectionCounter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
}

void SectionCounter::endVariableLengthPack(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endVariableLengthPack(key);
}

bool SectionCounter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  count(KLVKey::size() + lengthOctets_ + length);
  return DullKLVFilter::startWrapper(key, length, isWrapper, buffer);
}

void SectionCounter::endWrapper(const KLVKey& key) {
  --depth_;
  DullKLVFilter::endWrapper(key);
}

void StructureCollector::startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) {
  Partition p;
  p.offset = summary_.runIn;
  if (!summary_.partitions.empty()) {
    const Partition& last = summary_.partitions.back();
    p.offset = last.offset + last.packLength;
    for (const Section& section : last.sections) p.offset += section.bytes;
  }
  p.key = key;
  p.pack = pack;
  p.packLength = packLength;
  summary_.partitions.push_back(p);
}

void SetCollector::start() {
  Metadata metadata;
  metadata.partition = summary_.partitions.back().offset;
  summary_.metadata.push_back(metadata);
}

void IndexCollector::startIndex() {
  Index index;
  index.partition = summary_.partitions.back().offset;
  summary_.index.push_back(index);
}

}  // namespace zelta_info
