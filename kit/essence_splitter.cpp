#include "kit/essence_splitter.h"

#include <array>

namespace {

constexpr KLVKey elementKey(std::uint8_t a, std::uint8_t b, std::uint8_t c, std::uint8_t d, std::uint8_t e,
                            std::uint8_t f) {
  return KLVKey(
      std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x00, 0x0E, 0x06, a, b, c, d, e, f});
}

// Camera raw pictures, and the proxy's pictures and data; KLVKey equality
// ignores the version.
constexpr KLVKey rawPictureKey = elementKey(0x7F, 0x03, 0x15, 0x01, 0x7F, 0x00);
constexpr KLVKey proxyPictureKey = elementKey(0x03, 0x01, 0x15, 0x01, 0x40, 0x00);
constexpr KLVKey proxyDataKey = elementKey(0x03, 0x01, 0x17, 0x01, 0x40, 0x00);

bool isPrivatePicture(const KLVKey& key) { return key == rawPictureKey || key == proxyPictureKey; }

}  // namespace

ZeltaEssenceSplitter::ZeltaEssenceSplitter(const ZeltaKeyClassifier* classifier) : classifier_(classifier) {}

bool ZeltaEssenceSplitter::isEssenceKey(const KLVKey& key) const {
  return isPrivatePicture(key) || key == proxyDataKey || MXFGCSplitter::isEssenceKey(key) ||
         (classifier_ && classifier_->isEssenceKey(key));
}

bool ZeltaEssenceSplitter::isPictureKey(const KLVKey& key) const {
  return isPrivatePicture(key) || MXFGCSplitter::isPictureKey(key) || (classifier_ && classifier_->isPictureKey(key));
}

bool ZeltaEssenceSplitter::isSoundKey(const KLVKey& key) const {
  return MXFGCSplitter::isSoundKey(key) || (classifier_ && classifier_->isSoundKey(key));
}

bool ZeltaEssenceSplitter::isDataKey(const KLVKey& key) const {
  return key == proxyDataKey || MXFGCSplitter::isDataKey(key) || (classifier_ && classifier_->isDataKey(key));
}

bool ZeltaEssenceSplitter::isCompoundKey(const KLVKey& key) const {
  return MXFGCSplitter::isCompoundKey(key) || (classifier_ && classifier_->isCompoundKey(key));
}
