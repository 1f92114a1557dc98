// Feeds any input to MXFReader with an error handler and, by the input's
// size, either counting KLV handlers on all four ports or the parsers behind
// them: the metadata model of the kit's classes with the master collapsed
// from it, the index table segments and the generic container splitter; or
// to the kit's reader with every handler and an error handler.
// Nothing may crash, leak, hang or touch memory it does not own, whatever
// the input says.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <exception>
#include <streambuf>

#include "kit.h"
#include "klv.h"
#include "metadata.h"
#include "mxf.h"

namespace {

// Inputs of odd size are read as a pipe, so both the seeking and the
// ignoring paths get their share.
class PipeBuffer : public std::streambuf {
public:
  PipeBuffer(const std::uint8_t* data, std::size_t size) {
    char* begin = const_cast<char*>(reinterpret_cast<const char*>(data));
    setg(begin, begin, begin + size);
  }
};

class Reports : public ErrorHandler {
public:
  void setLocator(Locator* locator) override { locator_ = locator; }
  void start() override {}
  void end() override {}
  void warning(const MXFUID&, const std::string& m) override { note(m); }
  void error(const MXFUID&, const std::string& m) override { note(m); }
  void fatalError(const MXFUID&, const std::string& m) override { note(m); }

private:
  void note(const std::string& message) {
    count_ += message.size();
    if (locator_ != nullptr) count_ += static_cast<std::size_t>(std::streamoff(locator_->getPosition()) & 1);
  }
  Locator* locator_ = nullptr;
  std::size_t count_ = 0;
};

class Structure : public DullMXFStructureHandler {
public:
  void startPartition(const KLVKey&, const MXFPartitionPack& pack, std::uint64_t) override {
    count_ += pack.essenceContainers.size();
  }
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override { count_ += entries.size(); }

private:
  std::size_t count_ = 0;
};

// Takes values, into a buffer of its own when they are small, in chunks
// otherwise: a damaged length must not become an allocation.
class Elements : public DullKLVHandler {
public:
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    return offer(length, buffer);
  }
  bool startLocalSet(const KLVKey&, std::uint64_t, KLVTagType, KLVLengthType) override { return true; }
  bool startLocalItem(std::uint32_t, std::uint64_t length, std::uint8_t*& buffer) override {
    return offer(length, buffer);
  }
  bool startFixedLengthPack(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    return offer(length, buffer);
  }
  bool startVariableLengthPack(const KLVKey&, std::uint64_t, KLVLengthType) override { return true; }
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override {
    return offer(length, buffer);
  }
  bool startUniversalSet(const KLVKey&, std::uint64_t) override { return true; }
  void value(const std::uint8_t* data, std::streamsize size) override {
    if (size > 0) sum_ += data[0] + data[size - 1];
  }

private:
  bool offer(std::uint64_t length, std::uint8_t*& buffer) {
    if (length <= sizeof buffer_) buffer = buffer_;
    return true;
  }
  std::uint8_t buffer_[4096];
  std::size_t sum_ = 0;
};

class Model : public ZeltaMetadataHandler {
public:
  void packageItem(const std::uint8_t*, std::size_t size) override { count_ += size; }
  void start() override {}
  void end() override {}
  // A model that lacks what a master needs fails a check; anything else
  // that escapes is a fault, and the read's own handler would hide it.
  void model(const MXFMetadataModel& objects) override {
    count_ += objects.size();
    if (objects.empty()) return;
    const std::shared_ptr<const Preface> preface = std::dynamic_pointer_cast<const Preface>(objects.front());
    if (preface == nullptr) return;
    try {
      count_ += createZeltaMasterMetadata(preface)->getAudioChannelCount();
    } catch (const util::assertion_failure&) {
    } catch (...) {
      std::abort();
    }
  }

private:
  std::size_t count_ = 0;
};

class Segments : public MXFIndexHandler {
public:
  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override { count_ += segment.indexEntryArray.size(); }

private:
  std::size_t count_ = 0;
};

// Wants every element: small ones into a buffer of its own, the others into
// the splitter's, which refuses what no handler buffer takes.
class Essence : public DullMXFGCEssenceHandler {
public:
  bool startEssenceElement(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    if (length <= sizeof buffer_) buffer = buffer_;
    return true;
  }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override { note(data, length); }
  void soundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override { note(data, length); }
  void dataElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override { note(data, length); }
  void compoundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override { note(data, length); }

private:
  void note(const std::uint8_t* data, std::uint64_t length) {
    if (data != nullptr && length > 0) sum_ += data[0] + data[length - 1];
  }
  std::uint8_t buffer_[4096];
  std::size_t sum_ = 0;
};

// The reader with the handlers given on its three KLV ports.
void read(const std::uint8_t* data, std::size_t size, Reports& reports, KLVHandler& metadata, KLVHandler& index,
          KLVHandler& essence) {
  Structure structure;
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&structure);
  reader.setMetadataHandler(&metadata);
  reader.setIndexHandler(&index);
  reader.setEssenceHandler(&essence);
  reader.setErrorHandler(&reports);
  util::vector_istream seekable(data, size);
  PipeBuffer pipeBuffer(data, size);
  std::istream pipe(&pipeBuffer);
  try {
    reader.read(size % 2 == 0 ? static_cast<std::istream&>(seekable) : pipe);
  } catch (const std::exception&) {
    // Damaged input ends a read with an exception; that is its right end.
  }
}

void readAsKLV(const std::uint8_t* data, std::size_t size) {
  Reports reports;
  Elements metadata, index, essence;
  read(data, size, reports, metadata, index, essence);
}

void readThroughParsers(const std::uint8_t* data, std::size_t size) {
  Reports reports;
  Model model;
  MXFMetadataModelParser modelParser(&model, createZeltaDefaultMetadataFactory());
  modelParser.setErrorHandler(&reports);
  MXFMetadataParser metadata(&modelParser);
  metadata.setErrorHandler(&reports);
  Segments segments;
  MXFIndexParser index(&segments);
  index.setErrorHandler(&reports);
  Essence pictures;
  MXFGCSplitter essence(nullptr, nullptr, &pictures);
  essence.setErrorHandler(&reports);
  read(data, size, reports, metadata, index, essence);
}

class SDTICP : public DullMXFSDTICPSystemHandler {
public:
  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override { count_ += pack.continuityCount; }

private:
  std::size_t count_ = 0;
};

class Proxy : public MXFQMProxySystemHandler {
public:
  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>&) override { count_ += frameCount; }

private:
  std::size_t count_ = 0;
};

// A pipe that the reader may share.
class PipeStream : public std::istream {
public:
  PipeStream(const std::uint8_t* data, std::size_t size) : std::istream(nullptr), buffer_(data, size) {
    rdbuf(&buffer_);
  }

private:
  PipeBuffer buffer_;
};

template <typename T>
std::shared_ptr<T> borrowed(T& handler) {
  return std::shared_ptr<T>(&handler, [](T*) {});
}

// The kit's reader with every handler and an error handler, so that every
// parser and validator of the kit runs.
void readThroughKit(const std::uint8_t* data, std::size_t size) {
  Reports reports;
  Structure structure;
  Model model;
  Segments segments;
  DullMXFGCStructureHandler editUnits;
  SDTICP sdticp;
  Proxy proxy;
  Essence essence;
  std::shared_ptr<std::istream> input;
  if (size % 2 == 0)
    input = std::make_shared<util::vector_istream>(data, size);
  else
    input = std::make_shared<PipeStream>(data, size);
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(input);
  reader->setStructureHandler(borrowed<MXFStructureHandler>(structure));
  reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(model));
  reader->setIndexHandler(borrowed<MXFIndexHandler>(segments));
  reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(editUnits));
  reader->setSDTICPHandler(borrowed<MXFSDTICPSystemHandler>(sdticp));
  reader->setProxyHandler(borrowed<MXFQMProxySystemHandler>(proxy));
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(essence));
  reader->setErrorHandler(borrowed<ErrorHandler>(reports));
  try {
    reader->read();
  } catch (const std::exception&) {
    // Damaged input ends a read with an exception; that is its right end.
  }
}

}  // namespace

// Sizes 0 and 1 modulo 6 go to KLV handlers, 2 and 3 to the parsers, 4 and
// 5 to the kit's reader; even sizes are seekable, odd ones a pipe.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size % 6 < 2)
    readAsKLV(data, size);
  else if (size % 6 < 4)
    readThroughParsers(data, size);
  else
    readThroughKit(data, size);
  return 0;
}
