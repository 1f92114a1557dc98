#include "mxf.h"

namespace {

// The longest run-in that a file may have.
constexpr std::uint32_t largestRunIn = 65535;

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
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  if (errorHandler_) reader.setErrorHandler(errorHandler_);
  if (skipRunIn_) {
    MXFRunInSkipper skipper;
    skipper.setErrorHandler(errorHandler_);
    const std::uint32_t runIn = skipper.skip(stream, largestRunIn);
    if (runIn != 0) splitter.setRunIn(runIn);
  }
  reader.read(stream);
}
