// zelta-info: the partitions, sections, header metadata and random index of
// an MXF file, as the library's readers see them.

#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>

#include "summary.h"
#include "validate.h"

namespace {

using namespace zelta_info;

const char* const usage =
    "usage: zelta-info [--json] [--sets] [--index] [--essence [--md5]] [--system] [--model] [--master]\n"
    "                  [--validate] FILE\n"
    "       zelta-info --copy OUT FILE\n"
    "\n"
    "Reads the MXF file FILE (a run-in is skipped) and prints each partition\n"
    "(kind, status and pack fields), the elements and bytes of its header\n"
    "metadata, index and essence sections, and the random index. Reports of\n"
    "the read, the structure checks among them, go to stderr as 'warning: ',\n"
    "'error: ' or 'fatal: ' and the message.\n"
    "\n"
    "  --json   print one JSON object instead (file, result, runIn, partitions,\n"
    "           randomIndex, metadata with --sets, index with --index,\n"
    "           essence with --essence, system with --system, model with\n"
    "           --model, master with --master, reports)\n"
    "  --sets   also print the primer and the primed sets (set key, property\n"
    "           keys and sizes) of each partition's header metadata\n"
    "  --index  also print every index table segment with its fields, delta\n"
    "           entries and index entries\n"
    "  --essence\n"
    "           also print the edit units of the generic container with their\n"
    "           system and essence elements (kind, key, length), and the count\n"
    "           and bytes of the elements of each key\n"
    "  --md5    with --essence, also the MD5 of the concatenated values of\n"
    "           the essence elements of each key\n"
    "  --system also print the system item of each edit unit through the\n"
    "           SDTI-CP and proxy system parsers: the system metadata pack\n"
    "           (bitmap, rate, type, channel handle, continuity count, label,\n"
    "           creation and user stamps as octets) and the items of each\n"
    "           metadata set and of the control data, or the proxy element's\n"
    "           frameCount and timecodes; the parsers' reports join the others\n"
    "  --model  also print the object model of the header metadata of the\n"
    "           first partition that holds any, the header partition in a\n"
    "           well-formed file, also when the header is open and the footer\n"
    "           repeats the metadata: each object's class and instanceUID,\n"
    "           each property with its value, strong references as the owned\n"
    "           objects, weak ones as identifiers, and dark properties by key;\n"
    "           objects that nothing owns follow the root; the model parser's\n"
    "           reports join the others\n"
    "  --master also print the forty-one values of the clip's master metadata\n"
    "           collapsed from that model, or the condition that the model\n"
    "           breaks\n"
    "  --validate\n"
    "           also read the file through the kit's reader with its\n"
    "           validators, whose findings (identifiers 4c50xxxx) join the\n"
    "           other reports\n"
    "  --copy OUT\n"
    "           copy FILE to OUT element by element, through the KLV reader\n"
    "           and writer\n"
    "  --help   print this text\n"
    "\n"
    "Of the reports of each identifier and text only the first 100 are shown\n"
    "and kept, and 10000 in all; fatal reports always. The others are counted:\n"
    "a last line 'suppressed: N further reports' on stderr, and 'suppressed'\n"
    "in JSON.\n"
    "\n"
    "Exit status: 0 when the read ended normally, 1 when a fatal error stopped\n"
    "it or --master found no master, 2 on a usage error (no file, unreadable\n"
    "file).\n";

struct Options {
  bool json = false;
  Details details;
  std::string file;
  std::string copyTo;
};

// The model of the first header metadata that the read met, however far
// it went.
void collectModel(Summary& summary, const Details& details, ErrorHandler& reports) {
  if ((details.model || details.master) && !summary.metadata.empty())
    summary.model = buildModel(summary.metadata.front(), reports);
  if (details.master) summary.master = extractMaster(summary.model);
}

// A value that runs past the end of a file that can seek ends the read as
// the end of the file would: the octets that the last partition's elements
// claim beyond the file's end tell that it was cut.
void reportMissingOctets(const Summary& summary, const std::string& path, ErrorHandler& reports) {
  if (summary.partitions.empty()) return;
  std::error_code failure;
  const std::uintmax_t size = std::filesystem::file_size(path, failure);
  if (failure) return;
  const Partition& last = summary.partitions.back();
  std::uint64_t end = last.offset + last.packLength;
  for (const Section& section : last.sections) end += section.bytes;
  if (end > size)
    reports.warning(MXFUID(), "last element runs past the end of the file - " + std::to_string(end - size) +
                                  " octets missing");
}

// Reads the whole file; false when a fatal error stopped the read.
bool readFile(std::istream& in, const std::string& path, Summary& summary, const Details& details) {
  Reporter reporter(summary);
  SetCollector setCollector(summary);
  MXFMetadataParser setParser(&setCollector);
  setParser.setErrorHandler(&reporter);
  DullKLVHandler skipper;
  IndexCollector indexCollector(summary);
  MXFIndexParser indexParser(&indexCollector);
  indexParser.setErrorHandler(&reporter);
  SectionCounter metadata(summary, metadataSection,
                          details.sets || details.model || details.master ? static_cast<KLVHandler*>(&setParser) : &skipper);
  SectionCounter index(summary, indexSection, details.index ? static_cast<KLVHandler*>(&indexParser) : &skipper);
  SystemCollector systemCollector(summary.system, &reporter);
  EssenceCollector essenceCollector(details.essence ? &summary.essence : nullptr, details.md5,
                                    details.system ? &systemCollector : nullptr, &reporter);
  SectionCounter essence(summary, essenceSection,
                         details.essence || details.system ? static_cast<KLVHandler*>(&essenceCollector) : &skipper);
  StructureCollector structure(summary);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&structure);
  reader.setMetadataHandler(&metadata);
  reader.setIndexHandler(&index);
  reader.setEssenceHandler(&essence);
  reader.setErrorHandler(&reporter);
  try {
    reader.read(in);
    essenceCollector.finish();
    reportMissingOctets(summary, path, reporter);
    collectModel(summary, details, reporter);
    if (details.validate) validateFile(path, reporter);
    return true;
  } catch (const std::exception& e) {
    essenceCollector.finish();
    // Fatal reports reach the error handler before they are thrown; anything
    // else is a fault that no report has named yet.
    if (summary.reports.empty() || summary.reports.back().severity != "fatal" ||
        summary.reports.back().message != e.what())
      reporter.fatalError(MXFUID(), e.what());
    reportMissingOctets(summary, path, reporter);
    collectModel(summary, details, reporter);
    if (details.validate) validateFile(path, reporter);
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

// False on a usage error.
bool parseOptions(int argc, char** argv, Options& options) {
  for (int i = 1; i < argc; ++i) {
    if (std::strcmp(argv[i], "--json") == 0) {
      options.json = true;
    } else if (std::strcmp(argv[i], "--sets") == 0) {
      options.details.sets = true;
    } else if (std::strcmp(argv[i], "--index") == 0) {
      options.details.index = true;
    } else if (std::strcmp(argv[i], "--essence") == 0) {
      options.details.essence = true;
    } else if (std::strcmp(argv[i], "--md5") == 0) {
      options.details.md5 = true;
    } else if (std::strcmp(argv[i], "--system") == 0) {
      options.details.system = true;
    } else if (std::strcmp(argv[i], "--model") == 0) {
      options.details.model = true;
    } else if (std::strcmp(argv[i], "--master") == 0) {
      options.details.master = true;
    } else if (std::strcmp(argv[i], "--validate") == 0) {
      options.details.validate = true;
    } else if (std::strcmp(argv[i], "--copy") == 0 && i + 1 < argc) {
      options.copyTo = argv[++i];
    } else if (argv[i][0] == '-' || !options.file.empty()) {
      return false;
    } else {
      options.file = argv[i];
    }
  }
  return !options.file.empty() && (options.details.essence || !options.details.md5);
}

}  // namespace

int main(int argc, char** argv) {
  for (int i = 1; i < argc; ++i)
    if (std::strcmp(argv[i], "--help") == 0) {
      std::cout << usage;
      return 0;
    }
  Options options;
  if (!parseOptions(argc, argv, options)) {
    std::cerr << usage;
    return 2;
  }
  std::ifstream in(options.file, std::ios::binary);
  if (!in) {
    std::cerr << "zelta-info: cannot open " << options.file << "\n";
    return 2;
  }
  if (!options.copyTo.empty()) return copyFile(in, options.copyTo) ? 0 : 1;
  Summary summary;
  bool ok = readFile(in, options.file, summary, options.details);
  if (summary.suppressed != 0) std::cerr << "suppressed: " << summary.suppressed << " further reports\n";
  if (options.json)
    printJson(std::cout, options.file, !ok, summary, options.details);
  else
    printText(std::cout, summary, options.details);
  return ok && summary.master.failure.empty() ? 0 : 1;
}
