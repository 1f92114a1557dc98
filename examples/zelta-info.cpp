// zelta-info: the partitions, sections and random index of an MXF file.
//
// Reads through GenericKLVReader and MXFSplitter and prints what the
// structure events say; every report of the read goes to stderr.

#include <cstdio>
#include <cstring>
#include <fstream>
#include <iomanip>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace {

const char* const usage =
    "usage: zelta-info [--json] FILE\n"
    "       zelta-info --copy OUT FILE\n"
    "\n"
    "Reads the MXF file FILE and prints each partition (kind, status and pack\n"
    "fields), the elements and bytes of its header metadata, index and essence\n"
    "sections, and the random index. Reports of the read go to stderr as\n"
    "'warning: ', 'error: ' or 'fatal: ' and the message.\n"
    "\n"
    "  --json   print one JSON object instead (file, result, partitions,\n"
    "           randomIndex, reports)\n"
    "  --copy OUT\n"
    "           copy FILE to OUT element by element, through the KLV reader\n"
    "           and writer\n"
    "  --help   print this text\n"
    "\n"
    "Exit status: 0 when the read ended normally, 1 when a fatal error stopped\n"
    "it, 2 on a usage error (no file, unreadable file).\n";

struct Report {
  std::string severity;
  MXFUID identifier;
  std::string message;
};

struct Section {
  std::uint64_t elements = 0;
  std::uint64_t bytes = 0;
};

struct Partition {
  std::int64_t offset = -1;
  KLVKey key;
  MXFPartitionPack pack;
  std::uint64_t packLength = 0;
  Section sections[3];
};

struct Summary {
  std::vector<Partition> partitions;
  std::vector<MXFRandomIndexEntry> randomIndex;
  std::vector<Report> reports;
};

// Keeps the reports and echoes them to stderr.
class Reporter : public ErrorHandler {
public:
  explicit Reporter(Summary& summary) : summary_(summary) {}
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID& id, const std::string& message) override { add("warning", id, message); }
  void error(const MXFUID& id, const std::string& message) override { add("error", id, message); }
  void fatalError(const MXFUID& id, const std::string& message) override { add("fatal", id, message); }

private:
  void add(const char* severity, const MXFUID& id, const std::string& message) {
    summary_.reports.push_back(Report{severity, id, message});
    std::cerr << severity << ": " << message << "\n";
  }
  Summary& summary_;
};

// Counts the top-level elements and octets of one section, skipping values.
class SectionCounter : public DullKLVHandler {
public:
  explicit SectionCounter(Summary& summary, int index) : summary_(summary), index_(index) {}

  void setLengthForm(std::uint8_t form) override { lengthOctets_ = lengthFormOctets(form); }
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*&) override { return count(length); }
  bool startLabel(const KLVKey&) override {
    section().elements += 1;
    section().bytes += KLVKey::size();
    return false;
  }
  bool startUniversalSet(const KLVKey&, std::uint64_t length) override { return count(length); }
  bool startLocalSet(const KLVKey&, std::uint64_t length, KLVTagType, KLVLengthType) override {
    return count(length);
  }
  bool startFixedLengthPack(const KLVKey&, std::uint64_t length, std::uint8_t*&) override { return count(length); }
  bool startVariableLengthPack(const KLVKey&, std::uint64_t length, KLVLengthType) override {
    return count(length);
  }
  bool startWrapper(const KLVKey&, std::uint64_t length, bool, std::uint8_t*&) override { return count(length); }

private:
  Section& section() { return summary_.partitions.back().sections[index_]; }
  bool count(std::uint64_t length) {
    section().elements += 1;
    section().bytes += KLVKey::size() + lengthOctets_ + length;
    return false;
  }
  Summary& summary_;
  int index_;
  unsigned lengthOctets_ = 1;
};

// Notes where each partition pack starts, in front of the splitter.
class PackLocator : public DullKLVFilter {
public:
  explicit PackLocator(KLVHandler* next) : DullKLVFilter(next) {}

  void setLocator(Locator* locator) override {
    locator_ = locator;
    DullKLVFilter::setLocator(locator);
  }
  void setLengthForm(std::uint8_t form) override {
    form_ = form;
    DullKLVFilter::setLengthForm(form);
  }
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    if (isMXFPartitionKey(key) && locator_ != nullptr) {
      std::streamoff valueStart = locator_->getPosition();
      lastPackOffset = valueStart - static_cast<std::streamoff>(KLVKey::size() + lengthFormOctets(form_));
    }
    return DullKLVFilter::startFixedLengthPack(key, length, buffer);
  }

  std::int64_t lastPackOffset = -1;

private:
  Locator* locator_ = nullptr;
  std::uint8_t form_ = 1;
};

class StructureCollector : public DullMXFStructureHandler {
public:
  StructureCollector(Summary& summary, const PackLocator& packs) : summary_(summary), packs_(packs) {}

  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override {
    Partition p;
    p.offset = packs_.lastPackOffset;
    p.key = key;
    p.pack = pack;
    p.packLength = packLength;
    summary_.partitions.push_back(p);
  }
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override { summary_.randomIndex = entries; }

private:
  Summary& summary_;
  const PackLocator& packs_;
};

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

std::string label(const KLVKey& key) {
  std::ostringstream out;
  out << key;
  return out.str();
}

std::string identifier(const MXFUID& id) {
  std::ostringstream out;
  out << std::hex << std::setfill('0');
  for (std::size_t i = 0; i < 16; ++i) out << std::setw(2) << static_cast<unsigned>(id[i]);
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

const char* const sectionNames[3] = {"metadata", "index", "essence"};

void printText(std::ostream& out, const Summary& s) {
  for (const Partition& p : s.partitions) {
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
  out << "random index: " << s.randomIndex.size() << " entries\n";
  for (const MXFRandomIndexEntry& e : s.randomIndex)
    out << "  bodySID " << e.bodySID << " at " << e.byteOffset << "\n";
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

void printJson(std::ostream& out, const std::string& file, bool fatal, const Summary& s) {
  out << "{\"file\": " << jsonString(file) << ", \"result\": \"" << (fatal ? "fatal" : "ok")
      << "\", \"partitions\": [";
  for (std::size_t i = 0; i < s.partitions.size(); ++i) {
    out << (i ? ", " : "");
    printPartitionJson(out, s.partitions[i]);
  }
  out << "], \"randomIndex\": [";
  for (std::size_t i = 0; i < s.randomIndex.size(); ++i)
    out << (i ? ", " : "") << "{\"bodySID\": " << s.randomIndex[i].bodySID
        << ", \"byteOffset\": " << s.randomIndex[i].byteOffset << "}";
  out << "], \"reports\": [";
  for (std::size_t i = 0; i < s.reports.size(); ++i)
    out << (i ? ", " : "") << "{\"severity\": \"" << s.reports[i].severity << "\", \"identifier\": \""
        << identifier(s.reports[i].identifier) << "\", \"message\": " << jsonString(s.reports[i].message) << "}";
  out << "]}\n";
}

// Reads the whole file; false when a fatal error stopped the read.
bool readFile(std::istream& in, Summary& summary) {
  Reporter reporter(summary);
  SectionCounter metadata(summary, 0), index(summary, 1), essence(summary, 2);
  PackLocator packs(nullptr);
  StructureCollector collector(summary, packs);
  MXFSplitter splitter(&collector, &metadata, &index, &essence, false);
  splitter.setErrorHandler(&reporter);
  packs.setHandler(&splitter);
  GenericKLVReader reader;
  reader.setHandler(&packs);
  reader.setErrorHandler(&reporter);
  try {
    reader.read(in);
    return true;
  } catch (const KLVElement::parse_error&) {
    return false;  // reported through the error handler already
  } catch (const std::exception& e) {
    if (summary.reports.empty() || summary.reports.back().severity != "fatal" ||
        summary.reports.back().message != e.what())
      reporter.fatalError(MXFUID(), e.what());
    return false;
  }
}

// Copies element by element; false when a fatal error stopped the read.
bool copyFile(std::istream& in, const std::string& outName) {
  std::ofstream out(outName, std::ios::binary | std::ios::trunc);
  if (!out) {
    std::cerr << "zelta-info: cannot write " << outName << "\n";
    return false;
  }
  Summary summary;
  Reporter reporter(summary);
  GenericKLVWriter writer(out);
  GenericKLVReader reader;
  reader.setHandler(&writer);
  reader.setErrorHandler(&reporter);
  try {
    reader.read(in);
  } catch (const std::exception& e) {
    if (summary.reports.empty()) std::cerr << "fatal: " << e.what() << "\n";
    return false;
  }
  out.close();
  if (!out) {
    std::cerr << "zelta-info: cannot write " << outName << "\n";
    return false;
  }
  return true;
}

}  // namespace

int main(int argc, char** argv) {
  bool json = false;
  std::string file;
  std::string copyTo;
  for (int i = 1; i < argc; ++i) {
    if (std::strcmp(argv[i], "--help") == 0) {
      std::cout << usage;
      return 0;
    }
    if (std::strcmp(argv[i], "--json") == 0) {
      json = true;
    } else if (std::strcmp(argv[i], "--copy") == 0 && i + 1 < argc) {
      copyTo = argv[++i];
    } else if (argv[i][0] == '-' || !file.empty()) {
      std::cerr << usage;
      return 2;
    } else {
      file = argv[i];
    }
  }
  if (file.empty()) {
    std::cerr << usage;
    return 2;
  }
  std::ifstream in(file, std::ios::binary);
  if (!in) {
    std::cerr << "zelta-info: cannot open " << file << "\n";
    return 2;
  }
  if (!copyTo.empty()) return copyFile(in, copyTo) ? 0 : 1;
  Summary summary;
  bool ok = readFile(in, summary);
  if (json)
    printJson(std::cout, file, !ok, summary);
  else
    printText(std::cout, summary);
  return ok ? 0 : 1;
}
