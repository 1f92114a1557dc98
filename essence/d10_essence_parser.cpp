#include "essence/d10_forwarders.h"

MXFD10EssenceHandler::~MXFD10EssenceHandler() = default;

void MXFD10StructureForwarder::start(std::uint64_t) { handler_->startD10(); }

void MXFD10StructureForwarder::end() { handler_->endD10(); }

void MXFD10SystemForwarder::systemMetadata(const MXFSDTICPSystemMetadata& pack) {
  system_.continuityCount = pack.continuityCount;
  system_.essenceContainer = pack.label;
  system_.creationStamp = pack.creationStamp;
  system_.userStamp = pack.userStamp;
}

void MXFD10SystemForwarder::packageMetadata(const MXFGCLocalItems& items) { handler_->d10System(system_, items); }

bool MXFD10EssenceForwarder::startEssenceElement(const KLVKey& key, std::uint64_t, std::uint8_t*&) {
  return key == MXFD10PictureElementKey || key == MXFD10SoundElementKey;
}

void MXFD10EssenceForwarder::pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) {
  handler_->d10Picture(data, length);
}

void MXFD10EssenceForwarder::soundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) {
  handler_->d10Sound(data, length);
}

class ZELTA_LOCAL MXFD10EssenceParser::Impl {
public:
  explicit Impl(MXFD10EssenceHandler* handler)
      : structure(handler), system(handler), essence(handler), systemParser(&system),
        splitter(&structure, &systemParser, &essence) {}

  MXFD10StructureForwarder structure;
  MXFD10SystemForwarder system;
  MXFD10EssenceForwarder essence;
  MXFSDTICPSystemParser systemParser;
  MXFGCSplitter splitter;
};

MXFD10EssenceParser::MXFD10EssenceParser(MXFD10EssenceHandler* handler) : impl_(std::make_unique<Impl>(handler)) {}

MXFD10EssenceParser::~MXFD10EssenceParser() = default;

KLVHandler* MXFD10EssenceParser::getHandler() { return &impl_->splitter; }

void MXFD10EssenceParser::setErrorHandler(ErrorHandler* errorHandler) {
  impl_->splitter.setErrorHandler(errorHandler);
  impl_->systemParser.setErrorHandler(errorHandler);
}
