#include "klv/stream_input.h"
#include "mxf.h"

namespace {

// The longest run-in that a file may have.
constexpr std::uint32_t largestRunIn = 65535;

// On a stream that cannot tell where it is, positions are counted from where
// the read began, behind the run-in. This filter hands the splitter positions
// counted from the start of the file, as a seekable stream gives them.
class RunInPositionFilter : public DullKLVFilter {
public:
  RunInPositionFilter(KLVHandler* handler, std::uint32_t runIn) : DullKLVFilter(handler), locator_(runIn) {}

  void setLocator(Locator* locator) override {
    locator_.counted = locator;
    DullKLVFilter::setLocator(locator ? &locator_ : nullptr);
  }

private:
  class FileLocator : public Locator {
  public:
    explicit FileLocator(std::uint32_t runIn) : runIn_(runIn) {}
    const std::streampos& getPosition() override {
      const std::streamoff counted = countedPosition();
      position_ = counted < 0 ? counted : counted + runIn_;
      return position_;
    }
    Locator* counted = nullptr;

  private:
    std::streamoff countedPosition() { return counted ? std::streamoff(counted->getPosition()) : -1; }
    std::streamoff runIn_;
    std::streampos position_ = -1;
  };

  FileLocator locator_;
};

}  // namespace

MXFReader::MXFReader() = default;

MXFReader::~MXFReader() = default;

void MXFReader::setSkipRunIn(bool skipRunIn) { skipRunIn_ = skipRunIn; }
void MXFReader::setStructureHandler(MXFStructureHandler* handler) { structureHandler_ = handler; }
void MXFReader::setMetadataHandler(KLVHandler* handler) { metadataHandler_ = handler; }
void MXFReader::setIndexHandler(KLVHandler* handler) { indexHandler_ = handler; }
void MXFReader::setEssenceHandler(KLVHandler* handler) { essenceHandler_ = handler; }
void MXFReader::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

// The chain lives for this call only, so that a reader can be read with
// again; ports left open get handlers that ignore everything.
void MXFReader::read(std::istream& stream) {
  DullMXFStructureHandler dullStructure;
  DullKLVHandler dullMetadata;
  DullKLVHandler dullIndex;
  DullKLVHandler dullEssence;
  MXFSplitter splitter(structureHandler_ ? structureHandler_ : &dullStructure,
                       metadataHandler_ ? metadataHandler_ : &dullMetadata,
                       indexHandler_ ? indexHandler_ : &dullIndex, essenceHandler_ ? essenceHandler_ : &dullEssence,
                       true);
  if (errorHandler_) splitter.setErrorHandler(errorHandler_);
  std::uint32_t runIn = 0;
  if (skipRunIn_) {
    MXFRunInSkipper skipper;
    skipper.setErrorHandler(errorHandler_);
    runIn = skipper.skip(stream, largestRunIn);
    if (runIn != 0) splitter.setRunIn(runIn);
  }
  RunInPositionFilter filePositions(&splitter, runIn);
  GenericKLVReader reader;
  const bool countedPositions = runIn != 0 && !zelta::klv::isSeekable(stream);
  reader.setHandler(countedPositions ? static_cast<KLVHandler*>(&filePositions) : &splitter);
  if (errorHandler_) reader.setErrorHandler(errorHandler_);
  reader.read(stream);
}
