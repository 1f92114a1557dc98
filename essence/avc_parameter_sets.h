// The AVC parameter sets and slice header fields that picture order counts
// need, read in full so that the octets behind them are found.
#ifndef ZELTA_ESSENCE_AVC_PARAMETER_SETS_H
#define ZELTA_ESSENCE_AVC_PARAMETER_SETS_H

#include <cstdint>
#include <map>
#include <vector>

#include "essence/avc_bit_reader.h"

namespace zelta {

struct AVCSequenceParameterSet {
  std::uint32_t id = 0;
  std::uint32_t chromaFormatIdc = 1;
  bool separateColourPlane = false;
  unsigned log2MaxFrameNum = 4;
  std::uint32_t picOrderCntType = 0;
  unsigned log2MaxPicOrderCntLsb = 4;
  bool deltaPicOrderAlwaysZero = false;
  std::int32_t offsetForNonRefPic = 0;
  std::int32_t offsetForTopToBottomField = 0;
  std::vector<std::int32_t> offsetForRefFrame;
  bool frameMbsOnly = true;
};

struct AVCPictureParameterSet {
  std::uint32_t id = 0;
  std::uint32_t sequenceParameterSetId = 0;
  bool bottomFieldPicOrderInFramePresent = false;
  std::uint32_t numRefIdxL0DefaultActiveMinus1 = 0;
  std::uint32_t numRefIdxL1DefaultActiveMinus1 = 0;
  bool weightedPred = false;
  std::uint32_t weightedBipredIdc = 0;
  bool redundantPicCntPresent = false;
};

// Of a slice header up to dec_ref_pic_marking, what the picture order count
// takes; the sequence parameter set is the one in force for the slice.
struct AVCSliceHeader {
  std::uint32_t sliceType = 0;
  std::uint32_t frameNum = 0;
  bool fieldPic = false;
  bool bottomField = false;
  std::uint32_t picOrderCntLsb = 0;
  std::int32_t deltaPicOrderCntBottom = 0;
  std::int32_t deltaPicOrderCnt[2] = {0, 0};
  // memory_management_control_operation 5.
  bool resetsMemory = false;
  const AVCSequenceParameterSet* sequenceSet = nullptr;
};

// The parameter sets of a stream by their ids; a later set replaces an
// earlier one of the same id.
class AVCParameterSets {
public:
  // The readers stand behind the NAL unit header.
  void readSequenceParameterSet(AVCBitReader& reader);
  // "valid num_slice_groups_minus1", "supported slice_group_map_type"
  void readPictureParameterSet(AVCBitReader& reader);
  // "found picture parameter set for slice", "found sequence parameter set
  // for slice", "valid memory_management_control_operation". The header
  // refers to a set of this object. A reference is read up to and with its
  // dec_ref_pic_marking, any other slice only up to its redundant_pic_cnt.
  AVCSliceHeader readSliceHeader(AVCBitReader& reader, bool idr, bool reference) const;

private:
  std::map<std::uint32_t, AVCSequenceParameterSet> sequenceSets_;
  std::map<std::uint32_t, AVCPictureParameterSet> pictureSets_;
};

}  // namespace zelta

#endif
