#include "mxf.h"

namespace {

void writeVariableLengthPack(KLVHandler& handler, const KLVKey& key, const MXFGCVariableItems& items,
                             std::uint8_t form) {
  KLVLengthType lengthType = KLVLengthTypeBER;
  check(KLVVariableLengthPackCoding(key, lengthType), "valid variable length pack key");
  const std::uint64_t itemOverhead = lengthTypeOctets(lengthType, form);
  std::uint64_t length = 0;
  for (const ByteVector& item : items) length += itemOverhead + item.size();
  if (handler.startVariableLengthPack(key, length, lengthType)) {
    for (const ByteVector& item : items) {
      std::uint8_t* buffer = nullptr;
      if (handler.startVariableLengthItem(item.size(), buffer) && !item.empty())
        handler.value(item.data(), static_cast<std::streamsize>(item.size()));
      handler.endVariableLengthItem();
    }
  }
  handler.endVariableLengthPack(key);
}

}  // namespace

MXFGCSystemCoder::MXFGCSystemCoder(KLVHandler* handler) : handler_(handler) {}

bool MXFGCSystemCoder::startSystemElement(const KLVKey&) { return true; }

// System elements carry four-octet lengths, so that a rewrite in place never
// has to change the size of a length. System items are small: copying them
// widens their tags to what the KLV helper takes.
void MXFGCSystemCoder::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  const KLVLocalItems wide(items.begin(), items.end());
  handler_->setLengthForm(KLVFourOctetLengthForm);
  writeLocalSet(*handler_, key, wide, KLVFourOctetLengthForm);
}

void MXFGCSystemCoder::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  handler_->setLengthForm(KLVFourOctetLengthForm);
  writeFixedLengthPack(*handler_, key, bytes);
}

void MXFGCSystemCoder::systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) {
  handler_->setLengthForm(KLVFourOctetLengthForm);
  writeVariableLengthPack(*handler_, key, items, KLVFourOctetLengthForm);
}
