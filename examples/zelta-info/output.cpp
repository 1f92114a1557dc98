#include <cstdio>
#include <iomanip>
#include <ostream>
#include <sstream>

#include "summary.h"

namespace zelta_info {

namespace {

const char* kindName(const KLVKey& key) {
  switch (getMXFPartitionKind(key)) {
    case MXFHeaderPartition: return "header";
    case MXFBodyPartition: return "body";
    case MXFFooterPartition: return "footer";
  }
  return "unknown";
}

const char* statusName(const KLVKey& key) {
  switch (getMXFPartitionStatus(key)) {
    case MXFOpenIncomplete: return "open incomplete";
    case MXFClosedIncomplete: return "closed incomplete";
    case MXFOpenComplete: return "open complete";
    case MXFClosedComplete: return "closed complete";
  }
  return "unknown";
}

const char* const sectionNames[3] = {"metadata", "index", "essence"};

std::string identifier(const MXFUID& id) {
  std::ostringstream out;
  out << std::hex << std::setfill('0');
  for (std::size_t i = 0; i < 16; ++i) out << std::setw(2) << static_cast<unsigned>(id[i]);
  return out.str();
}

std::string tagText(std::uint16_t tag) {
  std::ostringstream out;
  out << std::hex << std::uppercase << std::setfill('0') << std::setw(4) << tag;
  return out.str();
}


void printPartitionText(std::ostream& out, const Partition& p) {
  const MXFPartitionPack& k = p.pack;
  out << "partition at " << p.offset << ": " << kindName(p.key) << ", " << statusName(p.key) << "\n"
      << "  version " << k.majorVersion << "." << k.minorVersion << ", KAG " << k.kagSize << "\n"
      << "  thisPartition " << k.thisPartition << ", previousPartition " << k.previousPartition
      << ", footerPartition " << k.footerPartition << "\n"
      << "  headerByteCount " << k.headerByteCount << ", indexByteCount " << k.indexByteCount << "\n"
      << "  indexSID " << k.indexSID << ", bodySID " << k.bodySID << ", bodyOffset " << k.bodyOffset << "\n"
      << "  operational pattern " << label(k.operationalPattern) << "\n";
  for (const KLVKey& ec : k.essenceContainers) out << "  essence container " << label(ec) << "\n";
  for (int i = 0; i < 3; ++i)
    out << "  " << sectionNames[i] << ": " << p.sections[i].elements << " elements, " << p.sections[i].bytes
        << " bytes\n";
}

void printMetadataText(std::ostream& out, const Metadata& m) {
  out << "header metadata of partition at " << m.partition << ": " << m.primer.size() << " primer entries, "
      << m.sets.size() << " sets\n";
  for (const MXFPrimerEntry& e : m.primer) out << "  tag " << tagText(e.tag) << " " << label(e.key) << "\n";
  for (const MXFPrimedSet& set : m.sets) {
    out << "  set " << label(set.key) << "\n";
    for (const auto& property : set.properties)
      out << "    " << label(property.first) << " " << property.second.size() << " bytes\n";
  }
}

void printPartitionJson(std::ostream& out, const Partition& p) {
  const MXFPartitionPack& k = p.pack;
  out << "{\"offset\": " << p.offset << ", \"kind\": \"" << kindName(p.key) << "\", \"status\": \""
      << statusName(p.key) << "\", \"packLength\": " << p.packLength << ", \"majorVersion\": " << k.majorVersion
      << ", \"minorVersion\": " << k.minorVersion << ", \"kagSize\": " << k.kagSize
      << ", \"thisPartition\": " << k.thisPartition << ", \"previousPartition\": " << k.previousPartition
      << ", \"footerPartition\": " << k.footerPartition << ", \"headerByteCount\": " << k.headerByteCount
      << ", \"indexByteCount\": " << k.indexByteCount << ", \"indexSID\": " << k.indexSID
      << ", \"bodyOffset\": " << k.bodyOffset << ", \"bodySID\": " << k.bodySID
      << ", \"operationalPattern\": " << jsonString(label(k.operationalPattern)) << ", \"essenceContainers\": [";
  for (std::size_t i = 0; i < k.essenceContainers.size(); ++i)
    out << (i ? ", " : "") << jsonString(label(k.essenceContainers[i]));
  out << "], \"sections\": {";
  for (int i = 0; i < 3; ++i)
    out << (i ? ", " : "") << "\"" << sectionNames[i] << "\": {\"elements\": " << p.sections[i].elements
        << ", \"bytes\": " << p.sections[i].bytes << "}";
  out << "}}";
}

void printMetadataJson(std::ostream& out, const Metadata& m) {
  out << "{\"partition\": " << m.partition << ", \"primer\": [";
  for (std::size_t i = 0; i < m.primer.size(); ++i)
    out << (i ? ", " : "") << "{\"tag\": " << m.primer[i].tag << ", \"key\": " << jsonString(label(m.primer[i].key))
        << "}";
  out << "], \"sets\": [";
  for (std::size_t i = 0; i < m.sets.size(); ++i) {
    out << (i ? ", " : "") << "{\"key\": " << jsonString(label(m.sets[i].key)) << ", \"properties\": [";
    bool first = true;
    for (const auto& property : m.sets[i].properties) {
      out << (first ? "" : ", ") << "{\"key\": " << jsonString(label(property.first))
          << ", \"size\": " << property.second.size() << "}";
      first = false;
    }
    out << "]}";
  }
  out << "]}";
}

std::string rational(const MXFRational& r) {
  return std::to_string(r.numerator) + "/" + std::to_string(r.denominator);
}

void printSegmentText(std::ostream& out, const MXFIndexTableSegment& g) {
  out << "  segment " << identifier(g.instanceUID) << ": edit rate " << rational(g.indexEditRate) << ", start "
      << g.indexStartPosition << ", duration " << g.indexDuration << ", editUnitByteCount " << g.editUnitByteCount
      << ", indexSID " << g.indexSID << ", bodySID " << g.bodySID << ", sliceCount "
      << static_cast<unsigned>(g.sliceCount) << ", posTableCount " << static_cast<unsigned>(g.posTableCount) << "\n";
  for (const MXFDeltaEntry& d : g.deltaEntryArray)
    out << "    delta: posTableIndex " << static_cast<int>(d.posTableIndex) << ", slice "
        << static_cast<unsigned>(d.slice) << ", elementDelta " << d.elementDelta << "\n";
  for (const MXFIndexEntry& e : g.indexEntryArray) {
    out << "    entry: temporalOffset " << static_cast<int>(e.temporalOffset) << ", keyFrameOffset "
        << static_cast<int>(e.keyFrameOffset) << ", flags 0x" << std::hex << std::setw(2) << std::setfill('0')
        << static_cast<unsigned>(e.flags) << std::dec << std::setfill(' ') << ", streamOffset " << e.streamOffset;
    for (std::uint32_t offset : e.sliceOffsets) out << ", slice " << offset;
    for (const MXFRational& p : e.posTable) out << ", pos " << rational(p);
    out << "\n";
  }
}

void printIndexText(std::ostream& out, const Index& index) {
  out << "index of partition at " << index.partition << ": " << index.segments.size() << " segments\n";
  for (const MXFIndexTableSegment& g : index.segments) printSegmentText(out, g);
}

void printEntryJson(std::ostream& out, const MXFIndexEntry& e) {
  out << "{\"temporalOffset\": " << static_cast<int>(e.temporalOffset)
      << ", \"keyFrameOffset\": " << static_cast<int>(e.keyFrameOffset)
      << ", \"flags\": " << static_cast<unsigned>(e.flags) << ", \"streamOffset\": " << e.streamOffset
      << ", \"sliceOffsets\": [";
  for (std::size_t i = 0; i < e.sliceOffsets.size(); ++i) out << (i ? ", " : "") << e.sliceOffsets[i];
  out << "], \"posTable\": [";
  for (std::size_t i = 0; i < e.posTable.size(); ++i) out << (i ? ", " : "") << jsonString(rational(e.posTable[i]));
  out << "]}";
}

void printSegmentJson(std::ostream& out, std::uint64_t partition, const MXFIndexTableSegment& g) {
  out << "{\"partition\": " << partition << ", \"instanceUID\": \"" << identifier(g.instanceUID)
      << "\", \"indexEditRate\": " << jsonString(rational(g.indexEditRate))
      << ", \"indexStartPosition\": " << g.indexStartPosition << ", \"indexDuration\": " << g.indexDuration
      << ", \"editUnitByteCount\": " << g.editUnitByteCount << ", \"indexSID\": " << g.indexSID
      << ", \"bodySID\": " << g.bodySID << ", \"sliceCount\": " << static_cast<unsigned>(g.sliceCount)
      << ", \"posTableCount\": " << static_cast<unsigned>(g.posTableCount) << ", \"deltaEntryArray\": [";
  for (std::size_t i = 0; i < g.deltaEntryArray.size(); ++i) {
    const MXFDeltaEntry& d = g.deltaEntryArray[i];
    out << (i ? ", " : "") << "{\"posTableIndex\": " << static_cast<int>(d.posTableIndex)
        << ", \"slice\": " << static_cast<unsigned>(d.slice) << ", \"elementDelta\": " << d.elementDelta << "}";
  }
  out << "], \"indexEntryArray\": [";
  for (std::size_t i = 0; i < g.indexEntryArray.size(); ++i) {
    out << (i ? ", " : "");
    printEntryJson(out, g.indexEntryArray[i]);
  }
  out << "]}";
}

}  // namespace

std::string label(const KLVKey& key) {
  std::ostringstream out;
  out << key;
  return out.str();
}

std::string jsonString(const std::string& text) {
  std::string out = "\"";
  for (unsigned char c : text) {
    if (c == '"' || c == '\\') {
      out += '\\';
      out += static_cast<char>(c);
    } else if (c < 0x20) {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\u%04x", c);
      out += escaped;
    } else {
      out += static_cast<char>(c);
    }
  }
  return out + "\"";
}

void printText(std::ostream& out, const Summary& s, const Details& details) {
  if (s.runIn != 0) out << "run-in: " << s.runIn << " bytes\n";
  for (const Partition& p : s.partitions) printPartitionText(out, p);
  out << "random index: " << s.randomIndex.size() << " entries\n";
  for (const MXFRandomIndexEntry& e : s.randomIndex)
    out << "  bodySID " << e.bodySID << " at " << e.byteOffset << "\n";
  if (details.sets)
    for (const Metadata& m : s.metadata) printMetadataText(out, m);
  if (details.index)
    for (const Index& index : s.index) printIndexText(out, index);
  if (details.essence) printEssenceText(out, s.essence);
  if (details.system) printSystemText(out, s.system);
  if (details.model) printModelText(out, s.model);
  if (details.master) printMasterText(out, s.master);
}

void printJson(std::ostream& out, const std::string& file, bool fatal, const Summary& s, const Details& details) {
  out << "{\"file\": " << jsonString(file) << ", \"result\": \"" << (fatal ? "fatal" : "ok")
      << "\", \"runIn\": " << s.runIn << ", \"partitions\": [";
  for (std::size_t i = 0; i < s.partitions.size(); ++i) {
    out << (i ? ", " : "");
    printPartitionJson(out, s.partitions[i]);
  }
  out << "], \"randomIndex\": [";
  for (std::size_t i = 0; i < s.randomIndex.size(); ++i)
    out << (i ? ", " : "") << "{\"bodySID\": " << s.randomIndex[i].bodySID
        << ", \"byteOffset\": " << s.randomIndex[i].byteOffset << "}";
  out << "]";
  if (details.index) {
    out << ", \"index\": [";
    bool first = true;
    for (const Index& index : s.index)
      for (const MXFIndexTableSegment& g : index.segments) {
        out << (first ? "" : ", ");
        printSegmentJson(out, index.partition, g);
        first = false;
      }
    out << "]";
  }
  if (details.sets) {
    out << ", \"metadata\": [";
    for (std::size_t i = 0; i < s.metadata.size(); ++i) {
      out << (i ? ", " : "");
      printMetadataJson(out, s.metadata[i]);
    }
    out << "]";
  }
  if (details.essence) {
    out << ", \"essence\": ";
    printEssenceJson(out, s.essence);
  }
  if (details.system) {
    out << ", \"system\": ";
    printSystemJson(out, s.system);
  }
  if (details.model) {
    out << ", \"model\": ";
    printModelJson(out, s.model);
  }
  if (details.master) {
    out << ", \"master\": ";
    printMasterJson(out, s.master);
  }
  out << ", \"reports\": [";
  for (std::size_t i = 0; i < s.reports.size(); ++i)
    out << (i ? ", " : "") << "{\"severity\": \"" << s.reports[i].severity << "\", \"identifier\": \""
        << identifier(s.reports[i].identifier) << "\", \"message\": " << jsonString(s.reports[i].message) << "}";
  out << "], \"suppressed\": " << s.suppressed << "}\n";
}

}  // namespace zelta_info
