#include "essence/avc_parameter_sets.h"

#include <utility>

#include "klv.h"

namespace zelta {

namespace {

constexpr std::uint32_t extendedSampleAspectRatio = 255;
constexpr std::uint32_t largestLog2Minus4 = 12;
constexpr std::uint32_t largestSliceGroupMapType = 6;
constexpr std::uint32_t resetAllOperation = 5;
constexpr std::uint32_t largestOperation = 6;

// slice_type modulo 5; any slice_type from 10 on is read as an I slice.
enum SliceKind { pSlice, bSlice, iSlice, spSlice, siSlice };

SliceKind kindOf(std::uint32_t sliceType) { return sliceType < 10 ? SliceKind(sliceType % 5) : iSlice; }

// Profiles whose sequence parameter sets carry the chroma format, bit depths
// and scaling lists.
bool hasChromaFields(std::uint32_t profileIdc) {
  switch (profileIdc) {
    case 44:
    case 83:
    case 86:
    case 100:
    case 110:
    case 118:
    case 122:
    case 128:
    case 244:
      return true;
    default:
      return false;
  }
}

// Only whether a scale becomes 0 decides what is read, and every way of
// taking the modulo agrees on that.
void skipScalingList(AVCBitReader& reader, unsigned size) {
  std::int64_t last = 8;
  std::int64_t next = 8;
  for (unsigned j = 0; j < size; ++j) {
    if (next != 0) next = (last + reader.signedCode()) % 256;
    if (next != 0) last = next;
  }
}

void skipScalingLists(AVCBitReader& reader, unsigned count) {
  for (unsigned i = 0; i < count; ++i)
    if (reader.flag()) skipScalingList(reader, i < 6 ? 16 : 64);
}

void skipHRDParameters(AVCBitReader& reader) {
  const std::uint32_t cpbCountMinus1 = reader.unsignedCode();
  reader.bits(8);  // bit_rate_scale, cpb_size_scale
  for (std::uint64_t i = 0; i <= cpbCountMinus1; ++i) {
    reader.unsignedCode();  // bit_rate_value_minus1
    reader.unsignedCode();  // cpb_size_value_minus1
    reader.flag();          // cbr_flag
  }
  reader.bits(20);  // four delay and offset lengths of 5 bits
}

void skipVUIParameters(AVCBitReader& reader) {
  if (reader.flag() && reader.bits(8) == extendedSampleAspectRatio) reader.bits(32);
  if (reader.flag()) reader.flag();  // overscan_appropriate_flag
  if (reader.flag()) {
    reader.bits(4);                      // video_format, video_full_range_flag
    if (reader.flag()) reader.bits(24);  // colour primaries, transfer, matrix
  }
  if (reader.flag()) {
    reader.unsignedCode();  // chroma_sample_loc_type_top_field
    reader.unsignedCode();  // chroma_sample_loc_type_bottom_field
  }
  if (reader.flag()) {
    reader.bits(32);  // num_units_in_tick
    reader.bits(32);  // time_scale
    reader.flag();    // fixed_frame_rate_flag
  }
  const bool nalHRD = reader.flag();
  if (nalHRD) skipHRDParameters(reader);
  const bool vclHRD = reader.flag();
  if (vclHRD) skipHRDParameters(reader);
  if (nalHRD || vclHRD) reader.flag();  // low_delay_hrd_flag
  reader.flag();                         // pic_struct_present_flag
  if (reader.flag()) {
    reader.flag();  // motion_vectors_over_pic_boundaries_flag
    // Byte and bit limits, motion vector lengths, reordering and buffering.
    for (int i = 0; i < 6; ++i) reader.unsignedCode();
  }
}

unsigned ceilLog2(std::uint64_t value) {
  unsigned bits = 0;
  while ((std::uint64_t(1) << bits) < value) ++bits;
  return bits;
}

void skipSliceGroups(AVCBitReader& reader, std::uint32_t groupsMinus1) {
  const std::uint32_t mapType = reader.unsignedCode();
  check(mapType <= largestSliceGroupMapType, "supported slice_group_map_type");
  switch (mapType) {
    case 0:
      for (std::uint64_t group = 0; group <= groupsMinus1; ++group) reader.unsignedCode();  // run_length_minus1
      break;
    case 2:
      for (std::uint64_t group = 0; group < groupsMinus1; ++group) {
        reader.unsignedCode();  // top_left
        reader.unsignedCode();  // bottom_right
      }
      break;
    case 3:
    case 4:
    case 5:
      check(groupsMinus1 == 1, "valid num_slice_groups_minus1");
      reader.flag();          // slice_group_change_direction_flag
      reader.unsignedCode();  // slice_group_change_rate_minus1
      break;
    case 6: {
      const std::uint32_t mapUnitsMinus1 = reader.unsignedCode();
      const unsigned idBits = ceilLog2(std::uint64_t(groupsMinus1) + 1);
      for (std::uint64_t unit = 0; unit <= mapUnitsMinus1; ++unit) reader.bits(idBits);  // slice_group_id
      break;
    }
    default:
      break;
  }
}

void skipModifications(AVCBitReader& reader) {
  if (!reader.flag()) return;  // ref_pic_list_modification_flag
  for (;;) {
    const std::uint32_t idc = reader.unsignedCode();
    if (idc == 3) return;
    if (idc <= 2) reader.unsignedCode();  // abs_diff_pic_num_minus1 or long_term_pic_num
  }
}

void skipWeights(AVCBitReader& reader, std::uint32_t refsMinus1, bool chroma) {
  for (std::uint64_t i = 0; i <= refsMinus1; ++i) {
    if (reader.flag()) {
      reader.signedCode();  // luma weight
      reader.signedCode();  // luma offset
    }
    if (chroma && reader.flag())
      for (int component = 0; component < 4; ++component) reader.signedCode();  // weights and offsets of Cb, Cr
  }
}

void skipPredWeightTable(AVCBitReader& reader, const AVCSequenceParameterSet& sequence, SliceKind kind,
                         std::uint32_t refsL0Minus1, std::uint32_t refsL1Minus1) {
  reader.unsignedCode();  // luma_log2_weight_denom
  const bool chroma = !sequence.separateColourPlane && sequence.chromaFormatIdc != 0;
  if (chroma) reader.unsignedCode();  // chroma_log2_weight_denom
  skipWeights(reader, refsL0Minus1, chroma);
  if (kind == bSlice) skipWeights(reader, refsL1Minus1, chroma);
}

// Whether the picture resets all reference pictures.
bool readDecRefPicMarking(AVCBitReader& reader, bool idr) {
  if (idr) {
    reader.flag();  // no_output_of_prior_pics_flag
    reader.flag();  // long_term_reference_flag
    return false;
  }
  if (!reader.flag()) return false;  // adaptive_ref_pic_marking_mode_flag
  bool resets = false;
  for (;;) {
    const std::uint32_t operation = reader.unsignedCode();
    check(operation <= largestOperation, "valid memory_management_control_operation");
    if (operation == 0) return resets;
    if (operation == resetAllOperation) resets = true;
    if (operation == 1 || operation == 3) reader.unsignedCode();  // difference_of_pic_nums_minus1
    if (operation == 2) reader.unsignedCode();                     // long_term_pic_num
    if (operation == 3 || operation == 6) reader.unsignedCode();  // long_term_frame_idx
    if (operation == 4) reader.unsignedCode();                     // max_long_term_frame_idx_plus1
  }
}

}  // namespace

void AVCParameterSets::readSequenceParameterSet(AVCBitReader& reader) {
  AVCSequenceParameterSet set;
  const std::uint32_t profileIdc = reader.bits(8);
  reader.bits(16);  // constraint flags, level_idc
  set.id = reader.unsignedCode();
  if (hasChromaFields(profileIdc)) {
    set.chromaFormatIdc = reader.unsignedCode();
    if (set.chromaFormatIdc == 3) set.separateColourPlane = reader.flag();
    reader.unsignedCode();  // bit_depth_luma_minus8
    reader.unsignedCode();  // bit_depth_chroma_minus8
    reader.flag();          // qpprime_y_zero_transform_bypass_flag
    if (reader.flag()) skipScalingLists(reader, set.chromaFormatIdc != 3 ? 8 : 12);
  }
  // Frame numbers and count lsbs of up to 16 bits.
  const std::uint32_t log2MaxFrameNumMinus4 = reader.unsignedCode();
  check(log2MaxFrameNumMinus4 <= largestLog2Minus4, "valid log2_max_frame_num_minus4");
  set.log2MaxFrameNum = log2MaxFrameNumMinus4 + 4;
  set.picOrderCntType = reader.unsignedCode();
  if (set.picOrderCntType == 0) {
    const std::uint32_t log2MaxLsbMinus4 = reader.unsignedCode();
    check(log2MaxLsbMinus4 <= largestLog2Minus4, "valid log2_max_pic_order_cnt_lsb_minus4");
    set.log2MaxPicOrderCntLsb = log2MaxLsbMinus4 + 4;
  } else if (set.picOrderCntType == 1) {
    set.deltaPicOrderAlwaysZero = reader.flag();
    set.offsetForNonRefPic = reader.signedCode();
    set.offsetForTopToBottomField = reader.signedCode();
    const std::uint32_t cycleLength = reader.unsignedCode();
    for (std::uint64_t i = 0; i < cycleLength; ++i) set.offsetForRefFrame.push_back(reader.signedCode());
  }
  reader.unsignedCode();  // max_num_ref_frames
  reader.flag();          // gaps_in_frame_num_value_allowed_flag
  reader.unsignedCode();  // pic_width_in_mbs_minus1
  reader.unsignedCode();  // pic_height_in_map_units_minus1
  set.frameMbsOnly = reader.flag();
  if (!set.frameMbsOnly) reader.flag();  // mb_adaptive_frame_field_flag
  reader.flag();                          // direct_8x8_inference_flag
  if (reader.flag())
    for (int side = 0; side < 4; ++side) reader.unsignedCode();  // frame crop offsets
  if (reader.flag()) skipVUIParameters(reader);
  sequenceSets_[set.id] = std::move(set);
}

// The 8x8 scaling lists depend on the chroma format of the sequence set;
// without one, the format of profiles that don't say it.
void AVCParameterSets::readPictureParameterSet(AVCBitReader& reader) {
  AVCPictureParameterSet set;
  set.id = reader.unsignedCode();
  set.sequenceParameterSetId = reader.unsignedCode();
  reader.flag();  // entropy_coding_mode_flag
  set.bottomFieldPicOrderInFramePresent = reader.flag();
  const std::uint32_t sliceGroupsMinus1 = reader.unsignedCode();
  if (sliceGroupsMinus1 > 0) skipSliceGroups(reader, sliceGroupsMinus1);
  set.numRefIdxL0DefaultActiveMinus1 = reader.unsignedCode();
  set.numRefIdxL1DefaultActiveMinus1 = reader.unsignedCode();
  set.weightedPred = reader.flag();
  set.weightedBipredIdc = reader.bits(2);
  reader.signedCode();  // pic_init_qp_minus26
  reader.signedCode();  // pic_init_qs_minus26
  reader.signedCode();  // chroma_qp_index_offset
  reader.flag();        // deblocking_filter_control_present_flag
  reader.flag();        // constrained_intra_pred_flag
  set.redundantPicCntPresent = reader.flag();
  if (reader.moreRBSPData()) {
    const bool transform8x8 = reader.flag();
    if (reader.flag()) {
      const auto sequence = sequenceSets_.find(set.sequenceParameterSetId);
      const std::uint32_t chromaFormatIdc = sequence != sequenceSets_.end() ? sequence->second.chromaFormatIdc : 1;
      skipScalingLists(reader, 6 + (transform8x8 ? (chromaFormatIdc != 3 ? 2 : 6) : 0));
    }
    reader.signedCode();  // second_chroma_qp_index_offset
  }
  pictureSets_[set.id] = set;
}

AVCSliceHeader AVCParameterSets::readSliceHeader(AVCBitReader& reader, bool idr, bool reference) const {
  AVCSliceHeader header;
  reader.unsignedCode();  // first_mb_in_slice
  header.sliceType = reader.unsignedCode();
  const auto pictureSet = pictureSets_.find(reader.unsignedCode());
  check(pictureSet != pictureSets_.end(), "found picture parameter set for slice");
  const AVCPictureParameterSet& picture = pictureSet->second;
  const auto sequenceSet = sequenceSets_.find(picture.sequenceParameterSetId);
  check(sequenceSet != sequenceSets_.end(), "found sequence parameter set for slice");
  const AVCSequenceParameterSet& sequence = sequenceSet->second;
  header.sequenceSet = &sequence;

  if (sequence.separateColourPlane) reader.bits(2);  // colour_plane_id
  header.frameNum = reader.bits(sequence.log2MaxFrameNum);
  if (!sequence.frameMbsOnly) {
    header.fieldPic = reader.flag();
    if (header.fieldPic) header.bottomField = reader.flag();
  }
  if (idr) reader.unsignedCode();  // idr_pic_id
  const bool bottomDelta = picture.bottomFieldPicOrderInFramePresent && !header.fieldPic;
  if (sequence.picOrderCntType == 0) {
    header.picOrderCntLsb = reader.bits(sequence.log2MaxPicOrderCntLsb);
    if (bottomDelta) header.deltaPicOrderCntBottom = reader.signedCode();
  }
  if (sequence.picOrderCntType == 1 && !sequence.deltaPicOrderAlwaysZero) {
    header.deltaPicOrderCnt[0] = reader.signedCode();
    if (bottomDelta) header.deltaPicOrderCnt[1] = reader.signedCode();
  }
  if (picture.redundantPicCntPresent) reader.unsignedCode();  // redundant_pic_cnt
  // What follows matters only for the memory management of a reference.
  if (!reference) return header;

  const SliceKind kind = kindOf(header.sliceType);
  const bool predicted = kind == pSlice || kind == spSlice;
  if (kind == bSlice) reader.flag();  // direct_spatial_mv_pred_flag
  std::uint32_t refsL0Minus1 = picture.numRefIdxL0DefaultActiveMinus1;
  std::uint32_t refsL1Minus1 = picture.numRefIdxL1DefaultActiveMinus1;
  if ((predicted || kind == bSlice) && reader.flag()) {  // num_ref_idx_active_override_flag
    refsL0Minus1 = reader.unsignedCode();
    if (kind == bSlice) refsL1Minus1 = reader.unsignedCode();
  }
  if (kind != iSlice && kind != siSlice) skipModifications(reader);
  if (kind == bSlice) skipModifications(reader);
  if ((picture.weightedPred && predicted) || (picture.weightedBipredIdc == 1 && kind == bSlice))
    skipPredWeightTable(reader, sequence, kind, refsL0Minus1, refsL1Minus1);
  if (reference) header.resetsMemory = readDecRefPicMarking(reader, idr);
  return header;
}

}  // namespace zelta
