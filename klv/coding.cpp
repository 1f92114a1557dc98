#include <array>

#include "klv.h"

namespace {

constexpr std::array<unsigned, 3> tagTypeOctets{1, 2, 4};
// Indexed by length type; type 0 is BER and has no fixed size.
constexpr std::array<unsigned, 4> lengthTypeOctetsTable{0, 1, 2, 4};
constexpr std::array<const char*, 4> lengthTypeLabels{"BER", "Fixed 1 byte", "Fixed 2 byte", "Fixed 4 byte"};

struct LocalSetCoding {
  std::uint8_t octet5;
  KLVTagType tagType;
  KLVLengthType lengthType;
};

// The only octet 5 values of a local set key; BER-coded tags are not among
// them.
constexpr std::array<LocalSetCoding, 12> localSetCodings{{
    {0x03, KLVTagType1, KLVLengthTypeBER},
    {0x13, KLVTagType2, KLVLengthTypeBER},
    {0x1B, KLVTagType4, KLVLengthTypeBER},
    {0x23, KLVTagType1, KLVLengthType1},
    {0x33, KLVTagType2, KLVLengthType1},
    {0x3B, KLVTagType4, KLVLengthType1},
    {0x43, KLVTagType1, KLVLengthType2},
    {0x53, KLVTagType2, KLVLengthType2},
    {0x5B, KLVTagType4, KLVLengthType2},
    {0x63, KLVTagType1, KLVLengthType4},
    {0x73, KLVTagType2, KLVLengthType4},
    {0x7B, KLVTagType4, KLVLengthType4},
}};

struct PackCoding {
  std::uint8_t octet5;
  KLVLengthType lengthType;
};

constexpr std::array<PackCoding, 4> variableLengthPackCodings{{
    {0x04, KLVLengthTypeBER},
    {0x24, KLVLengthType1},
    {0x44, KLVLengthType2},
    {0x64, KLVLengthType4},
}};

constexpr KLVKeyPattern groupPattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0, 0, 0, 0, 0, 0, 0, 0,
                                                                  0, 0, 0});
constexpr KLVKeyPattern wrapperPattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x03, 0, 0, 0, 0, 0, 0, 0,
                                                                    0, 0, 0, 0});

}  // namespace

unsigned KLVTagTypeOctets(KLVTagType tagType) {
  check(tagType < tagTypeOctets.size(), "valid tag type");
  return tagTypeOctets[tagType];
}

unsigned KLVFixedLengthTypeOctets(KLVLengthType lengthType) {
  check(lengthType != KLVLengthTypeBER && lengthType < lengthTypeOctetsTable.size(), "valid length type");
  return lengthTypeOctetsTable[lengthType];
}

const char* KLVLengthTypeLabel(KLVLengthType lengthType) {
  check(lengthType < lengthTypeLabels.size(), "valid length type");
  return lengthTypeLabels[lengthType];
}

unsigned lengthFormOctets(std::uint8_t form) {
  check(form == 1 || form > KLVNoLengthForm, "valid BER length form");
  return form == 1 ? 1 : (form & 0x7F) + 1;
}

unsigned lengthTypeOctets(KLVLengthType lengthType, std::uint8_t form) {
  return lengthType == KLVLengthTypeBER ? lengthFormOctets(form) : KLVFixedLengthTypeOctets(lengthType);
}

bool KLVLocalSetCoding(const KLVKey& key, KLVTagType& tagType, KLVLengthType& lengthType) {
  check(groupPattern.matches(key), "valid local set key");
  for (const LocalSetCoding& coding : localSetCodings) {
    if (coding.octet5 == key[5]) {
      tagType = coding.tagType;
      lengthType = coding.lengthType;
      return true;
    }
  }
  return false;
}

bool KLVVariableLengthPackCoding(const KLVKey& key, KLVLengthType& lengthType) {
  check(groupPattern.matches(key), "valid variable length pack key");
  for (const PackCoding& coding : variableLengthPackCodings) {
    if (coding.octet5 == key[5]) {
      lengthType = coding.lengthType;
      return true;
    }
  }
  return false;
}

bool KLVWrapperCoding(const KLVKey& key, bool& isWrapper) {
  check(wrapperPattern.matches(key), "valid wrapper key");
  if (key[5] != 1 && key[5] != 2) return false;
  isWrapper = key[5] == 1;
  return true;
}
