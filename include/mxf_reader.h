// Zelta: structure coding and validation, and the sequential reader. Part of
// mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_READER_H
#define ZELTA_INCLUDE_MXF_READER_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "mxf_primer.h"

// ---------------------------------------------------------------------------
// Structure coding and validation

// Writes partition packs and the random index, and fills in the offsets that
// only the place in the file decides. What the validator reports, the coder
// refuses by assertion.
class ZELTA_EXPORT MXFStructureCoder : public MXFStructureHandler {
public:
  // The padders are shared with the writers of header metadata and index
  // tables: each partition arms them with its byte counts, so that what
  // passes through them fills exactly the space that the pack promised.
  MXFStructureCoder(KLVHandler* handler, Locator* locator, KLVStreamPadder* headerPadder,
                    KLVStreamPadder* indexPadder);
  MXFStructureCoder(const MXFStructureCoder&) = delete;
  MXFStructureCoder& operator=(const MXFStructureCoder&) = delete;

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  // packLength is what the pack and its fill are to take; 0 aligns them on
  // the KAG.
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  // Writes the coder's own list of partitions; the entries given are ignored.
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  // A partition that is already in the file joins the list without being
  // written.
  virtual void addPartition(const MXFPartitionPack& pack);

private:
  KLVFiller filler_;
  Locator* locator_;
  KLVStreamPadder* headerPadder_;
  KLVStreamPadder* indexPadder_;
  std::vector<MXFRandomIndexEntry> partitions_;
};

// Reports what is wrong with the partition structure of a file being read,
// and passes every event on.
class ZELTA_EXPORT MXFStructureValidator : public MXFStructureHandler {
public:
  explicit MXFStructureValidator(MXFStructureHandler* handler);
  ~MXFStructureValidator() override;
  MXFStructureValidator(const MXFStructureValidator&) = delete;
  MXFStructureValidator& operator=(const MXFStructureValidator&) = delete;

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  // Both optional: without a locator the offset checks are skipped.
  virtual void setErrorHandler(ErrorHandler* errorHandler);
  virtual void setLocator(Locator* locator);

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

// ---------------------------------------------------------------------------
// Sequential reader

// Reads a file from start to end into the four ports, with the structure
// validated. Every handler is optional and none is owned.
class ZELTA_EXPORT MXFReader {
public:
  MXFReader();
  virtual ~MXFReader();

  virtual void setSkipRunIn(bool skipRunIn);
  virtual void setStructureHandler(MXFStructureHandler* handler);
  virtual void setMetadataHandler(KLVHandler* handler);
  virtual void setIndexHandler(KLVHandler* handler);
  virtual void setEssenceHandler(KLVHandler* handler);
  virtual void setErrorHandler(ErrorHandler* errorHandler);
  virtual void read(std::istream& stream);

private:
  bool skipRunIn_ = false;
  MXFStructureHandler* structureHandler_ = nullptr;
  KLVHandler* metadataHandler_ = nullptr;
  KLVHandler* indexHandler_ = nullptr;
  KLVHandler* essenceHandler_ = nullptr;
  ErrorHandler* errorHandler_ = nullptr;
};

// Moves a stream to the first partition pack key behind a run-in.
class ZELTA_EXPORT MXFRunInSkipper {
public:
  MXFRunInSkipper();
  virtual ~MXFRunInSkipper();

  virtual void setErrorHandler(ErrorHandler* errorHandler);
  // The run-in's length; a run-in longer than maximum is "invalid run-in".
  virtual std::uint32_t skip(std::istream& stream, std::uint32_t maximum);

private:
  ErrorHandler* errorHandler_ = nullptr;
};

// Ends a read early, by exception: before the first element at or behind a
// stop position (StopPosition), or at the next partition pack
// (EndPartition). The handler behind it sees a clean end of stream.
class ZELTA_EXPORT MXFPartitionFilter : public DullKLVFilter {
public:
  class exception {};
  class StopPosition : public exception {};
  class EndPartition : public exception {};

  // A stop position of -1 is none.
  MXFPartitionFilter(KLVHandler* handler, std::streamoff stopPosition);

  // Where the last element ended, or the stream started.
  std::streamoff getLastPosition() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;

private:
  void stopIfReached();
  void refresh();

  Locator* locator_ = nullptr;
  std::streamoff stopPosition_;
  std::streamoff lastPosition_ = -1;
  bool started_ = false;
};

#endif
