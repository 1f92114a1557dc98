#include "kit/metadata_coder.h"

#include <memory>

#include "kit/package_item.h"

// Between the primer coder and the writer's sink: what the coder writes it
// passes on, and the package item it writes itself. The sink pads the
// metadata by the position it is told, which is the coder's own count; the
// octets of the item are added to it.
class ZeltaMetadataCoder::ItemSink : public DullKLVFilter {
 public:
  explicit ItemSink(KLVHandler* sink) : DullKLVFilter(sink), locator_(*this) {}

  void setLocator(Locator* locator) override {
    counted_ = locator;
    DullKLVFilter::setLocator(locator ? &locator_ : nullptr);
  }
  void startStream(bool hasAccurateLengths) override {
    itemOctets_ = 0;
    DullKLVFilter::startStream(hasAccurateLengths);
  }

  void writeItem(const std::uint8_t* data, std::size_t size) {
    KLVHandler& sink = *getHandler();
    sink.setLengthForm(KLVFourOctetLengthForm);
    writeIndividualItem(sink, zelta::packageItemKey, data, size);
    itemOctets_ += KLVKey::size() + lengthFormOctets(KLVFourOctetLengthForm) + size;
  }

 private:
  class ItemLocator : public Locator {
   public:
    explicit ItemLocator(ItemSink& sink) : sink_(sink) {}
    const std::streampos& getPosition() override {
      position_ = sink_.counted_ ? std::streampos(std::streamoff(sink_.counted_->getPosition()) +
                                                  static_cast<std::streamoff>(sink_.itemOctets_))
                                 : std::streampos(-1);
      return position_;
    }

   private:
    ItemSink& sink_;
    std::streampos position_ = -1;
  };

  Locator* counted_ = nullptr;
  std::uint64_t itemOctets_ = 0;
  ItemLocator locator_;
};

ZeltaMetadataCoder::ZeltaMetadataCoder(KLVHandler* sink, const std::shared_ptr<MXFMetadataModelFactory>& factory)
    : sink_(std::make_unique<ItemSink>(sink)), primerCoder_(sink_.get()) {
  setMetadataFactory(factory);
}

ZeltaMetadataCoder::~ZeltaMetadataCoder() = default;

void ZeltaMetadataCoder::start() { modelCoder_->start(); }
void ZeltaMetadataCoder::end() { modelCoder_->end(); }
void ZeltaMetadataCoder::model(const MXFMetadataModel& objects) { modelCoder_->model(objects); }

void ZeltaMetadataCoder::packageItem(const std::uint8_t* data, std::size_t size) { sink_->writeItem(data, size); }

void ZeltaMetadataCoder::setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) {
  modelCoder_ = std::make_unique<MXFMetadataModelCoder>(&primerCoder_, factory);
}
