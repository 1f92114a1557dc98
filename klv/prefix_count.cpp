#include "klv.h"

// Any short form counts one octet, as the reader reports it; a long form
// counts its octets after the first.
void KLVPrefixCount::setLengthForm(std::uint8_t form) {
  lengthOctets_ = (form & 0x80) ? (form & 0x7F) + 1u : 1u;
  if (itemLengthIsBER_) itemLengthOctets_ = lengthOctets_;
}

void KLVPrefixCount::startItems(unsigned tagOctets, KLVLengthType lengthType) {
  tagOctets_ = tagOctets;
  itemLengthIsBER_ = lengthType == KLVLengthTypeBER;
  itemLengthOctets_ = itemLengthIsBER_ ? lengthOctets_ : KLVFixedLengthTypeOctets(lengthType);
}

void KLVPrefixCount::reset() {
  itemLengthIsBER_ = false;
  skipped_ = 0;
}
