// Fill items in the key form of the kind of file being written: the header
// partition decides for the whole file. When the file ends, what the stream
// holds back is sent on.
#ifndef ZELTA_KIT_FILL_ITEM_KEY_MODE_H
#define ZELTA_KIT_FILL_ITEM_KEY_MODE_H

#include <ostream>

#include "mxf.h"

class FillItemKeyModeStructureFilter : public MXFStructureHandler {
 public:
  // Neither is owned.
  FillItemKeyModeStructureFilter(MXFStructureHandler* handler, std::ostream& stream);

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

 private:
  MXFStructureHandler* handler_;
  std::ostream& stream_;
};

#endif
