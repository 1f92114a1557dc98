#include <gtest/gtest.h>

#include <memory>

#include "kit.h"
#include "support/kit_masters.h"
#include "support/model_reading.h"

using zelta_test::describe;
using zelta_test::masterDomain;
using zelta_test::masterOf;
using zelta_test::MasterShape;

namespace {

TEST(ModelBuilderDomain, CoversEveryFormatRateVersionSoundAndDataCombination) {
  // D10 and DV: 2 rates, 2 versions, with and without sound; Proxy: 3 rates,
  // 2 versions, always sound; MPEG (3 picture kinds) and AVC (2) at 8 rates
  // and Raw at 10, 2 versions, with and without sound and ancillary data.
  EXPECT_EQ(masterDomain().size(), 8u + 8u + 8 * 2 * 3 * 4u + 6u + 10 * 2 * 4u + 8 * 2 * 2 * 4u);
}

TEST(ModelBuilderDomain, EveryModelOfTheDomainCodesAndParsesBackEqual) {
  const std::shared_ptr<MXFMetadataModelFactory> factory = createZeltaDefaultMetadataFactory();
  for (const MasterShape& shape : masterDomain()) {
    SCOPED_TRACE(describe(shape));
    std::shared_ptr<Preface> preface;
    ASSERT_NO_THROW(preface = createZeltaMetadataModel(masterOf(shape)));
    const MXFMetadataModel model{preface};
    const zelta_test::RewrittenModel back = zelta_test::rewriteModel(model, createZeltaDefaultMetadataFactory);
    EXPECT_TRUE(back.reports.empty());
    EXPECT_EQ(zelta_test::modelDifference(model, back.model, *factory), "");
  }
}

}  // namespace
