// Helpers for the tests of the structural metadata classes: keys spelled as
// the class tables give them, one factory's parse and code with its reports
// kept, and a composite of the structural classes for whole models.
#ifndef ZELTA_TESTS_SUPPORT_METADATA_STRUCTURAL_H
#define ZELTA_TESTS_SUPPORT_METADATA_STRUCTURAL_H

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "metadata.h"
#include "support/recording.h"

namespace zelta_test {

// "02: 07 02 01 10 02 04 00 00": 06 0E 2B 34 01 01 01, the version octet,
// then the eight octets.
KLVKey propertyKeyOf(const std::string& tableKey);

// A set primer from table rows, behind the entries that every structural
// class has: the instance identifier and the generation identifier.
typedef std::vector<std::pair<std::string, std::uint16_t>> PrimerRows;
MXFKeyToTagMap structuralPrimer(const PrimerRows& rows);

// One factory's parse of one set, reporting to its own handler.
struct FactoryParse {
  MXFParsedObject parse(MXFMetadataFactory& factory, const MXFPrimedSet& set);
  // One line per report: severity, the identifier's octet 3 in hexadecimal,
  // the message ("error 02 missing Sequence.components"); the other octets
  // are expected to be those of the model family.
  std::vector<std::string> reports() const;

  std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
};

// The properties that a factory codes for an object; the objects that it
// lists as owned go to referenced.
MXFPropertyMap codeWith(MetadataRootFactory& factory, const std::shared_ptr<const MetadataRoot>& object,
                        MXFReferencedObjects& referenced);
MXFPropertyMap codeWith(MetadataRootFactory& factory, const std::shared_ptr<const MetadataRoot>& object);

// Every registrable structural class, and the generic descriptor for the
// descriptors of source packages.
class StructuralModelFactory : public MXFMetadataModelFactory {
public:
  StructuralModelFactory();
  const Factories& getFactories() override { return factories_; }

private:
  Factories factories_;
};

// The set keys of a model coded through the structural composite, in the
// order of the sets.
std::vector<KLVKey> codedSetKeys(const std::shared_ptr<MetadataRoot>& root);

// Sets through a model parser over the structural composite.
struct ModelParse {
  MXFMetadataModel parse(const std::vector<MXFPrimedSet>& sets);
  std::vector<std::string> reports() const;

  std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
};

}  // namespace zelta_test

#endif
