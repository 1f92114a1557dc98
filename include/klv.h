// Zelta: the KLV layer: events, reading, writing and filters; with the core
// values, timecode and the file device in sub-headers that it includes.
#ifndef ZELTA_KLV_H
#define ZELTA_KLV_H

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <exception>
#include <ios>
#include <iosfwd>
#include <istream>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "klv_values.h"

// ---------------------------------------------------------------------------
// KLV events

// Tag types: octets 1, 2, 4. Length types: BER, fixed 1, 2, 4 octets.
typedef std::uint8_t KLVTagType;
typedef std::uint8_t KLVLengthType;
inline constexpr KLVTagType KLVTagType1 = 0;
inline constexpr KLVTagType KLVTagType2 = 1;
inline constexpr KLVTagType KLVTagType4 = 2;
inline constexpr KLVLengthType KLVLengthTypeBER = 0;
inline constexpr KLVLengthType KLVLengthType1 = 1;
inline constexpr KLVLengthType KLVLengthType2 = 2;
inline constexpr KLVLengthType KLVLengthType4 = 3;

// Octets of a tag type ("valid tag type") and of a fixed length type ("valid
// length type"); the label of a length type for messages.
ZELTA_EXPORT unsigned KLVTagTypeOctets(KLVTagType tagType);
ZELTA_EXPORT unsigned KLVFixedLengthTypeOctets(KLVLengthType lengthType);
ZELTA_EXPORT const char* KLVLengthTypeLabel(KLVLengthType lengthType);

// The BER form value that no stream ever has: the start of every current form.
inline constexpr std::uint8_t KLVNoLengthForm = 0x80;
// The long forms of four and of eight length octets after the first: the
// format's lengths of structure, metadata and index, and of essence that
// four octets cannot hold.
inline constexpr std::uint8_t KLVFourOctetLengthForm = 0x83;
inline constexpr std::uint8_t KLVEightOctetLengthForm = 0x87;

// Octets of a BER length of a form: 1 for short form, (form & 127) + 1 for
// long form ("valid BER length form").
ZELTA_EXPORT unsigned lengthFormOctets(std::uint8_t form);
// The same for length type BER, the fixed size otherwise.
ZELTA_EXPORT unsigned lengthTypeOctets(KLVLengthType lengthType, std::uint8_t form);

// Coding of a key by its octet 5. Each checks the key's family first ("valid
// local set key", "valid variable length pack key", "valid wrapper key") and
// answers false for an octet 5 that the coding does not allow.
ZELTA_EXPORT bool KLVLocalSetCoding(const KLVKey& key, KLVTagType& tagType, KLVLengthType& lengthType);
ZELTA_EXPORT bool KLVVariableLengthPackCoding(const KLVKey& key, KLVLengthType& lengthType);
ZELTA_EXPORT bool KLVWrapperCoding(const KLVKey& key, bool& isWrapper);

inline constexpr KLVKey KLVFillItemKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x01, 0x03, 0x01, 0x02, 0x10, 0x01, 0x00,
                                 0x00, 0x00}};

// The fill item key version, a stream attribute; 0 is unset.
ZELTA_EXPORT void setFillItemKeyVersion(std::ios_base& stream, std::uint8_t version);
ZELTA_EXPORT std::uint8_t getFillItemKeyVersion(std::ios_base& stream);

class ZELTA_EXPORT KLVHandler {
public:
  virtual ~KLVHandler();
  virtual void setLocator(Locator* locator) = 0;
  virtual void startStream(bool hasAccurateLengths) = 0;
  virtual void endStream(bool aborted) = 0;
  virtual void setLengthForm(std::uint8_t form) = 0;
  virtual bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endIndividualItem(const KLVKey& key) = 0;
  virtual bool startLabel(const KLVKey& key) = 0;
  virtual void endLabel(const KLVKey& key) = 0;
  virtual bool startUniversalSet(const KLVKey& key, std::uint64_t length) = 0;
  virtual void endUniversalSet(const KLVKey& key) = 0;
  virtual bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                             KLVLengthType lengthType) = 0;
  virtual void endLocalSet(const KLVKey& key) = 0;
  virtual bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endLocalItem(std::uint32_t tag) = 0;
  virtual bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endFixedLengthPack(const KLVKey& key) = 0;
  virtual bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) = 0;
  virtual void endVariableLengthPack(const KLVKey& key) = 0;
  virtual bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endVariableLengthItem() = 0;
  virtual bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) = 0;
  virtual void endWrapper(const KLVKey& key) = 0;
  virtual void value(const std::uint8_t* data, std::streamsize size) = 0;
};

// Ignores every event and declines every value.
class ZELTA_EXPORT DullKLVHandler : public KLVHandler {
public:
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;
};

class ZELTA_EXPORT KLVFilter : public KLVHandler {
public:
  virtual void setHandler(KLVHandler* handler) = 0;
  virtual KLVHandler* getHandler() const = 0;
};

// Passes every event on unchanged to the next handler ("handler is present").
class ZELTA_EXPORT DullKLVFilter : public KLVFilter {
public:
  DullKLVFilter();
  explicit DullKLVFilter(KLVHandler* handler);

  void setHandler(KLVHandler* handler) override;
  // The handler that it holds: every event of every filter asks for it, so
  // it is answered here, and no subclass answers otherwise.
  KLVHandler* getHandler() const final {
    check(handler_ != nullptr, "handler is present");
    return handler_;
  }

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  KLVHandler* handler_;
};

// ---------------------------------------------------------------------------
// Locators

// A position that stays at zero.
class ZELTA_EXPORT NullLocator : public Locator {
public:
  const std::streampos& getPosition() override;

private:
  std::streampos position_ = 0;
};

// A position that its owner refreshes from a stream.
class ZELTA_EXPORT InputLocator : public Locator {
public:
  const std::streampos& getPosition() override;
  void setPosition(const std::streampos& position) { position_ = position; }

private:
  std::streampos position_ = -1;
};

// ---------------------------------------------------------------------------
// Position filters and the fill item key check

// What counting a position needs of the coding, for KLVCountingFilter: the
// octets of the key and length before a value, of the tag and length before
// an item, and the length of a value that the handler declined, which the
// position passes at the element's end.
class ZELTA_EXPORT KLVPrefixCount {
public:
  static constexpr std::streamoff keyOctets = 16;

  void setLengthForm(std::uint8_t form);
  // Items of a local set or variable length pack follow, until endItems.
  void startItems(unsigned tagOctets, KLVLengthType lengthType);
  void endItems() { itemLengthIsBER_ = false; }
  // Key and BER length.
  std::streamoff elementPrefix() const { return keyOctets + lengthOctets_; }
  // Tag and length of an item.
  std::streamoff itemPrefix() const { return tagOctets_ + itemLengthOctets_; }
  // The prefix that the length last read closes.
  std::streamoff currentPrefix() const { return itemLengthIsBER_ ? itemPrefix() : elementPrefix(); }
  unsigned lengthOctets() const { return lengthOctets_; }
  // Passes taken on, and keeps the length of a declined value.
  bool noteStart(bool taken, std::uint64_t length) {
    skipped_ = taken ? 0 : length;
    return taken;
  }
  // The declined length, once.
  std::streamoff takeSkipped() {
    const auto skipped = static_cast<std::streamoff>(skipped_);
    skipped_ = 0;
    return skipped;
  }
  void reset();

private:
  unsigned lengthOctets_ = 0;
  unsigned tagOctets_ = 0;
  unsigned itemLengthOctets_ = 0;
  bool itemLengthIsBER_ = false;
  std::uint64_t skipped_ = 0;
};

// The events of KLVTeller and KLVMonitor: each start moves the position past
// the key and length or the tag and length, each value past its octets, and
// each end past a value that the handler declined; how a move is made is the
// subclass's.
class ZELTA_EXPORT KLVCountingFilter : public DullKLVFilter {
public:
  explicit KLVCountingFilter(KLVHandler* handler) : DullKLVFilter(handler) {}

  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

protected:
  virtual void advance(std::streamoff octets) = 0;
  // Moves past a declined value.
  void endElement() { advance(count_.takeSkipped()); }

  KLVPrefixCount count_;
};

// Takes the position from the input stream at the ends of a stream and counts
// it from the coding at the events between; the position at a start event is
// the first octet of the value.
class ZELTA_EXPORT KLVTeller : public KLVCountingFilter {
public:
  KLVTeller(std::istream& stream, KLVHandler* handler = nullptr);
  Locator* getLocator();

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

protected:
  void advance(std::streamoff octets) override;

private:
  void refresh();
  std::istream* stream_;
  InputLocator locator_;
  // A position of -1 is told instead.
  std::streamoff position_ = -1;
};

// Computes the position from the events alone, for pipes and output chains.
class ZELTA_EXPORT KLVMonitor : public KLVCountingFilter {
public:
  class MonitoredLocator : public Locator {
  public:
    const std::streampos& getPosition() override;
    void reset() { position_ = 0; }
    void advance(std::streamoff octets) { position_ += octets; }

  private:
    std::streampos position_ = 0;
  };

  explicit KLVMonitor(KLVHandler* handler = nullptr);
  Locator* getLocator();
  MonitoredLocator& getMonitoredLocator() { return locator_; }
  // Octets of the current BER length ("BER length form has been reported").
  unsigned getLengthOctets() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

protected:
  void advance(std::streamoff octets) override;

private:
  MonitoredLocator locator_;
};

// Warns once per stream of a fill item key whose version octet is not the
// stream's, or not 1 or 2 when the stream has none.
class ZELTA_EXPORT KLVFillItemKeyFilter : public DullKLVFilter {
public:
  KLVFillItemKeyFilter(KLVHandler* handler, std::uint8_t fillItemKeyVersion, ErrorHandler* errorHandler);

  void startStream(bool hasAccurateLengths) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;

private:
  void inspect(const KLVKey& key);
  std::uint8_t version_;
  ErrorHandler* errorHandler_;
  bool warned_ = false;
};

// ---------------------------------------------------------------------------
// Reading

class ZELTA_EXPORT KLVElement {
public:
  // A fault of the data or the stream, with its identifier.
  class parse_error : public std::runtime_error {
  public:
    parse_error(const MXFUID& identifier, const std::string& message);
    const MXFUID& getIdentifier() const { return identifier_; }

  private:
    MXFUID identifier_;
  };

  // The element for a key by its octets 4 and 5; throws parse_error for a
  // key the coding does not allow.
  static std::unique_ptr<KLVElement> create(const KLVKey& key, std::istream& stream, KLVHandler& handler,
                                            std::uint8_t& currentForm, Locator& locator, bool seekable);

  // The element kinds are the library's own; the class is abstract.
  KLVElement(const KLVKey& key, std::istream& stream, KLVHandler& handler, std::uint8_t& currentForm,
             Locator& locator, bool seekable);
  virtual ~KLVElement();
  virtual void parse() = 0;

  const KLVKey& getKey() const { return key_; }

protected:
  KLVKey key_;
  std::istream* stream_;
  KLVHandler* handler_;
  std::uint8_t* currentForm_;
  Locator* locator_;
  bool seekable_;
};

class ZELTA_EXPORT KLVReader {
public:
  virtual ~KLVReader();
  virtual void setHandler(KLVHandler* handler) = 0;
  virtual KLVHandler* getHandler() const = 0;
  virtual void setErrorHandler(ErrorHandler* errorHandler) = 0;
  virtual ErrorHandler* getErrorHandler() const = 0;
  virtual void read(std::istream& stream) = 0;
  // Stops after the first top-level element that ends at or beyond stop; -1
  // reads to the end.
  virtual void read(std::istream& stream, std::streampos stop) = 0;
};

// Reads a file stream (a std::filebuf, whatever its buffer) from the file
// by position: while read runs, the stream reads through a buffer of the
// reader's, which is what rdbuf() answers then; when read returns, the
// stream has its own buffer back and stands where the read stopped.
class ZELTA_EXPORT GenericKLVReader : public KLVReader {
public:
  GenericKLVReader();
  void setHandler(KLVHandler* handler) override;
  KLVHandler* getHandler() const override;
  void setErrorHandler(ErrorHandler* errorHandler) override;
  ErrorHandler* getErrorHandler() const override;
  void read(std::istream& stream) override;
  void read(std::istream& stream, std::streampos stop) override;

private:
  KLVHandler* handler_;
  ErrorHandler* errorHandler_;
};

// ---------------------------------------------------------------------------
// Writing

// Turns KLV events back into octets. Its start events take every value by
// `value` events; the producer chooses the BER form by setLengthForm.
class ZELTA_EXPORT GenericKLVWriter : public KLVHandler {
public:
  explicit GenericKLVWriter(std::ostream& stream);

  std::uint8_t getLengthForm() const;
  unsigned getLongFormOctets() const;  // "long form"
  void setTagType(KLVTagType tagType);
  KLVTagType getTagType() const;
  void setLengthType(KLVLengthType lengthType);
  KLVLengthType getLengthType() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  void writeKey(const KLVKey& key);
  void writeBERLength(std::uint64_t length);
  void writeItemLength(std::uint64_t length);

  std::ostream* stream_;
  std::uint8_t fillItemKeyVersion_ = 255;
  bool started_ = false;
  bool buffered_ = false;
  std::uint8_t currentForm_ = KLVNoLengthForm;
  KLVTagType tagType_ = KLVTagType1;
  KLVLengthType lengthType_ = KLVLengthTypeBER;
};

// Calls beforeEvent, the next handler and afterEvent around every event.
class ZELTA_EXPORT ActionKLVFilter : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  virtual void beforeEvent() = 0;
  virtual void afterEvent() = 0;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;
};

// Forwards every event to what getHandler answers at that moment.
class ZELTA_EXPORT KLVForwarder : public KLVHandler {
public:
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

  virtual KLVHandler* getHandler() = 0;
};

// Producers' helpers that drive any handler.
ZELTA_EXPORT void writeIndividualItem(KLVHandler& handler, const KLVKey& key, const std::uint8_t* data,
                                      std::uint64_t length);
ZELTA_EXPORT void writeFixedLengthPack(KLVHandler& handler, const KLVKey& key, const ByteVector& bytes);
typedef std::vector<std::pair<std::uint32_t, ByteVector>> KLVLocalItems;
ZELTA_EXPORT void writeLocalSet(KLVHandler& handler, const KLVKey& key, const KLVLocalItems& items, std::uint8_t form);
// A fill item of value length `length` under the form.
ZELTA_EXPORT void writeFillItem(KLVHandler& handler, std::uint64_t length, std::uint8_t form);

// ---------------------------------------------------------------------------
// Padding, stream joining and verification

// Pads what passes between startFilledItem and endFilledItem to alignment
// (mode 0) or to an exact length (mode 1) with one fill item.
class ZELTA_EXPORT KLVFiller : public DullKLVFilter {
public:
  enum FillMode { alignmentMode = 0, exactLengthMode = 1 };

  explicit KLVFiller(KLVHandler* handler = nullptr);

  virtual Locator* getLocator();  // "locator is present"
  virtual void setFillMode(int mode, std::uint64_t alignment, std::uint64_t paddedLength);
  virtual int getFillMode() const;
  virtual std::uint64_t getAlignment() const;
  virtual std::uint64_t getPaddedLength() const;
  virtual void startFilledItem();
  virtual void endFilledItem();

  void setLocator(Locator* locator) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

private:
  Locator* locator_ = nullptr;
  std::uint8_t currentForm_ = KLVNoLengthForm;
  int mode_ = alignmentMode;
  std::uint64_t alignment_ = 0;
  std::uint64_t paddedLength_ = 0;
  std::streampos start_ = 0;
  bool inFilledItem_ = false;
};

// Pads a whole stream: the fill comes last in it.
class ZELTA_EXPORT KLVStreamPadder : public KLVFiller {
public:
  using KLVFiller::KLVFiller;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
};

// Hides stream boundaries, so that producers can write in turn into one
// continuing stream.
class ZELTA_EXPORT KLVStreamFilter : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
};

// Compares the keys and lengths of a producer's events with a stream that
// already holds them; throws VerifyingKLVHandler::exception at the first
// difference.
class ZELTA_EXPORT VerifyingKLVHandler : public KLVHandler {
public:
  class exception : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
  };

  explicit VerifyingKLVHandler(std::istream& stream, KLVHandler* handler = nullptr);

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  bool verify(const KLVKey& key, std::uint64_t length, bool hasLength);

  std::istream* stream_;
  KLVHandler* handler_;
  std::uint8_t currentForm_ = KLVNoLengthForm;
};

// Moves the stream to the next 06 0E 2B 34 within limit octets (-1: no
// limit); false at the end of the stream or past the limit.
ZELTA_EXPORT bool findKey(std::istream& stream, std::streamoff limit);


#include "klv_file_device.h"
#include "klv_timecode.h"

#endif
