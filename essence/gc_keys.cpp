#include "mxf.h"

namespace {

// Octet 12 of each kind: the current value and the older one, where there is
// one.
struct KindOctets {
  std::uint8_t current;
  std::uint8_t older;
};

constexpr KindOctets systemOctets{0x14, 0x04};
constexpr KindOctets pictureOctets{0x15, 0x05};
constexpr KindOctets soundOctets{0x16, 0x06};
constexpr KindOctets dataOctets{0x17, 0x07};
constexpr KindOctets compoundOctets{0x18, 0x18};

bool isOfKind(const KLVKeyPattern& pattern, const KindOctets& kind, const KLVKey& key) {
  return pattern.matches(key) && (key[12] == kind.current || key[12] == kind.older);
}

}  // namespace

bool isMXFGCSystemKey(const KLVKey& key) { return isOfKind(MXFGCSystemElementPattern, systemOctets, key); }
bool isMXFGCEssenceKey(const KLVKey& key) { return MXFGCEssenceElementPattern.matches(key); }
bool isMXFGCPictureKey(const KLVKey& key) { return isOfKind(MXFGCEssenceElementPattern, pictureOctets, key); }
bool isMXFGCSoundKey(const KLVKey& key) { return isOfKind(MXFGCEssenceElementPattern, soundOctets, key); }
bool isMXFGCDataKey(const KLVKey& key) { return isOfKind(MXFGCEssenceElementPattern, dataOctets, key); }
bool isMXFGCCompoundKey(const KLVKey& key) { return isOfKind(MXFGCEssenceElementPattern, compoundOctets, key); }

bool MXFGCSplitter::isSystemKey(const KLVKey& key) const { return isMXFGCSystemKey(key); }
bool MXFGCSplitter::isEssenceKey(const KLVKey& key) const { return isMXFGCEssenceKey(key); }
bool MXFGCSplitter::isPictureKey(const KLVKey& key) const { return isMXFGCPictureKey(key); }
bool MXFGCSplitter::isSoundKey(const KLVKey& key) const { return isMXFGCSoundKey(key); }
bool MXFGCSplitter::isDataKey(const KLVKey& key) const { return isMXFGCDataKey(key); }
bool MXFGCSplitter::isCompoundKey(const KLVKey& key) const { return isMXFGCCompoundKey(key); }
