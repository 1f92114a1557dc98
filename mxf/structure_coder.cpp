#include "mxf.h"

MXFStructureCoder::MXFStructureCoder(KLVHandler* handler, Locator* locator, KLVStreamPadder* headerPadder,
                                     KLVStreamPadder* indexPadder)
    : filler_(handler), locator_(locator), headerPadder_(headerPadder), indexPadder_(indexPadder) {
  check(locator_ != nullptr, "locator is present");
  check(headerPadder_ != nullptr, "header padder is present");
  check(indexPadder_ != nullptr, "index padder is present");
}

// This system writes no run-in.
void MXFStructureCoder::setRunIn(std::uint32_t) {}

void MXFStructureCoder::startStream() {
  filler_.setLocator(locator_);
  filler_.startStream(true);
}

void MXFStructureCoder::endStream(bool aborted) { filler_.endStream(aborted); }

// Offsets come from where the pack lands; the byte counts are promises that
// the padders then keep.
void MXFStructureCoder::startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) {
  MXFPartitionPack written = pack;
  if (written.kagSize != 0) {
    check(written.headerByteCount % written.kagSize == 0, "header byte count is a multiple of KAG size");
    check(written.indexByteCount % written.kagSize == 0, "index byte count is a multiple of KAG size");
  }
  written.previousPartition = partitions_.empty() ? 0 : partitions_.back().byteOffset;
  written.thisPartition = static_cast<std::uint64_t>(std::streamoff(locator_->getPosition()));
  check(isMXFPartitionKey(key), "valid partition key");
  if (getMXFPartitionKind(key) == MXFFooterPartition) {
    check(written.footerPartition == 0 || written.footerPartition == written.thisPartition,
          "valid footer partition offset");
    written.footerPartition = written.thisPartition;
  } else {
    check(written.footerPartition == 0 || written.thisPartition < written.footerPartition,
          "valid footer partition offset");
  }
  partitions_.push_back(MXFRandomIndexEntry{written.bodySID, written.thisPartition});

  const int packFillMode = packLength != 0 ? KLVFiller::exactLengthMode : KLVFiller::alignmentMode;
  filler_.setFillMode(packFillMode, written.kagSize, packLength);
  headerPadder_->setLocator(locator_);
  headerPadder_->setFillMode(KLVFiller::exactLengthMode, written.kagSize, written.headerByteCount);
  indexPadder_->setLocator(locator_);
  indexPadder_->setFillMode(KLVFiller::exactLengthMode, written.kagSize, written.indexByteCount);

  ByteVector value;
  externalize(value, written, true);
  filler_.startFilledItem();
  // Packs are written with four-octet lengths, so that a rewrite of a pack
  // never has to change the size of its length.
  filler_.setLengthForm(KLVFourOctetLengthForm);
  writeFixedLengthPack(filler_, key, value);
  filler_.endFilledItem();
}

void MXFStructureCoder::endPartition(const KLVKey&) {}

void MXFStructureCoder::randomIndex(const std::vector<MXFRandomIndexEntry>&) {
  ByteVector value;
  externalize(value, partitions_, KLVFourOctetLengthForm);
  filler_.setLengthForm(KLVFourOctetLengthForm);
  writeFixedLengthPack(filler_, MXFRandomIndexPackKey, value);
}

void MXFStructureCoder::addPartition(const MXFPartitionPack& pack) {
  partitions_.push_back(MXFRandomIndexEntry{pack.bodySID, pack.thisPartition});
}
