// The state and the algorithms of MXFGCSplitter.
#ifndef ZELTA_ESSENCE_GC_SPLITTER_IMPL_H
#define ZELTA_ESSENCE_GC_SPLITTER_IMPL_H

#include <cstdint>
#include <string>

#include "core/reports.h"
#include "essence/gc_own_buffer.h"
#include "mxf.h"

class ZELTA_LOCAL MXFGCSplitter::Impl {
public:
  // The key tests are asked of the owner, so that its subclasses decide.
  Impl(const MXFGCSplitter& owner, MXFGCStructureHandler* structureHandler,
                    MXFGCSystemHandler* systemHandler, MXFGCEssenceHandler* essenceHandler);

  MXFGCStructureHandler* structureHandler = nullptr;
  MXFGCSystemHandler* systemHandler = nullptr;
  MXFGCEssenceHandler* essenceHandler = nullptr;
  zelta::Reports reports;

  void startStream(bool hasAccurateLengths);
  void endStream();
  void setLengthForm(std::uint8_t form);

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer);
  void endEssenceElement(const KLVKey& key);
  void essenceValue(const std::uint8_t* data, std::streamsize size);

  // expected is the text of the event's state check.
  bool startSystemElement(const KLVKey& key, const char* expected);
  bool startFixedPack(const KLVKey& key, std::uint64_t length);
  void startVariableItem(std::uint64_t length);
  void startLocalItem(std::uint32_t tag, std::uint64_t length);
  void requireSystem(const char* expected) const;
  void endLocalSet(const KLVKey& key);
  void endFixedPack(const KLVKey& key);
  void endVariablePack(const KLVKey& key);

  void value(const std::uint8_t* data, std::streamsize size);
  bool invalidElement(const KLVKey& key);

private:
  enum State { idle, started, system, essenceOnly, essenceAfterSystem };
  enum Kind { picture, sound, data, compound, noKind };

  bool inEditUnit() const;
  bool inEssence() const;
  void editUnitBoundary(const KLVKey& key);
  Kind kindOf(const KLVKey& key) const;
  void enterEssence(const KLVKey& key);
  bool offerEssence(const KLVKey& key, std::uint64_t length);
  void deliver(const KLVKey& key, const std::uint8_t* data, std::uint64_t length);
  void enterSystem(const KLVKey& key);
  // In the system item: whether the end of an element is to be delivered.
  bool endsSystemElement(const char* expected) const;

  void reportKey(const MXFUID& identifier, const char* text, const KLVKey& key);

  const MXFGCSplitter& owner_;
  KLVKey firstKey_;
  State state_ = idle;
  std::uint8_t form_ = KLVNoLengthForm;
  std::uint8_t reportedForm_ = KLVNoLengthForm;
  bool kinds_[noKind] = {};
  MXFGCLocalItems localItems_;
  ByteVector fixedPack_;
  MXFGCVariableItems variableItems_;
  ByteVector* filling_ = nullptr;
  std::uint8_t* handlerBuffer_ = nullptr;
  std::uint64_t handlerCapacity_ = 0;
  std::uint64_t handlerFill_ = 0;
  MXFGCOwnBuffer ownBuffer_;
  bool wanted_ = false;
};

#endif
