// The generic container splitter of the kit's reader: it also knows the
// kit's private element keys and asks the client's classifier last.
#ifndef ZELTA_KIT_ESSENCE_SPLITTER_H
#define ZELTA_KIT_ESSENCE_SPLITTER_H

#include "kit.h"

class ZeltaEssenceSplitter : public MXFGCSplitter {
 public:
  // The classifier may be empty.
  explicit ZeltaEssenceSplitter(const ZeltaKeyClassifier* classifier);

  bool isEssenceKey(const KLVKey& key) const override;
  bool isPictureKey(const KLVKey& key) const override;
  bool isSoundKey(const KLVKey& key) const override;
  bool isDataKey(const KLVKey& key) const override;
  bool isCompoundKey(const KLVKey& key) const override;

 private:
  const ZeltaKeyClassifier* classifier_;
};

#endif
