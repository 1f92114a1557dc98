// The seven kinds of KLV element, chosen by KLVElement::create from key
// octets 4 and 5. Each parses itself and its contents into the handler.
#ifndef ZELTA_KLV_ELEMENTS_H
#define ZELTA_KLV_ELEMENTS_H

#include "klv.h"

class KLVIndividualItem : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
};

class KLVUniversalSet : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
};

class KLVLocalSet : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
  KLVTagType getTagType() const;
  KLVLengthType getLengthType() const;

private:
  // Throws parse_error for an octet 5 that is no local set coding.
  void coding(KLVTagType& tagType, KLVLengthType& lengthType) const;
};

class KLVFixedLengthPack : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
};

class KLVVariableLengthPack : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
  KLVLengthType getLengthType() const;
};

class KLVWrapper : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
  bool isWrapper() const;
};

class KLVLabel : public KLVElement {
public:
  using KLVElement::KLVElement;
  void parse() override;
};

namespace zelta::klv {

// Makes the element that the key selects and parses it, as
// KLVElement::create and parse() would, without the heap: a read makes one
// element for every KLV element of a file.
void parseElement(const KLVKey& key, std::istream& stream, KLVHandler& handler, std::uint8_t& currentForm,
                  Locator& locator, bool seekable);

}  // namespace zelta::klv

#endif
