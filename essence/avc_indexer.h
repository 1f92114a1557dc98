// The pictures of an AVC stream, as the indexer reads them.
#ifndef ZELTA_ESSENCE_AVC_INDEXER_H
#define ZELTA_ESSENCE_AVC_INDEXER_H

#include <cstdint>

#include "essence/avc_parameter_sets.h"
#include "mxf.h"

namespace zelta {

// A picture and its place in display order within its GOP.
struct AVCPicture {
  MPEGIndexer::Picture picture;
  std::int64_t pictureOrderCount = 0;
};

// Reads the access units of one stream in decoding order: the parameter
// sets and the running values of the picture order count go from one to the
// next. An access unit is read up to the header of its first slice ("valid
// AVC access unit", "valid AVC NAL", "supported pic_order_cnt_type"). Any
// octets are safe to give.
class AVCAccessUnitParser {
public:
  AVCPicture parse(const std::uint8_t* data, std::uint64_t length);

private:
  std::int64_t pictureOrderCount(const AVCSliceHeader& slice, bool idr, bool reference);
  std::int64_t frameNumOffset(const AVCSliceHeader& slice, bool idr) const;
  void carryFrameNum(const AVCSliceHeader& slice, std::int64_t offset);

  AVCParameterSets sets_;
  std::int64_t previousMsb_ = 0;
  std::int64_t previousLsb_ = 0;
  std::int64_t previousFrameNum_ = 0;
  std::int64_t previousFrameNumOffset_ = 0;
};

}  // namespace zelta

#endif
