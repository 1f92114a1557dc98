// The model of a file's header metadata, read through the whole chain, and
// the same model written to a metadata stream in memory and read back.
#ifndef ZELTA_TESTS_SUPPORT_MODEL_READING_H
#define ZELTA_TESTS_SUPPORT_MODEL_READING_H

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "metadata.h"
#include "support/recording.h"

namespace zelta_test {

// What the header partition gave, and how the read ended.
struct HeaderModel {
  MXFMetadataModel model;             // empty when no model came
  int modelCount = 0;                 // models the header partition gave
  std::vector<Report> modelReports;   // of the model parser, header partition only
  std::vector<Report> readerReports;  // of the reader's own chain, whole file
  std::string failure;                // what() of the exception that ended the read; empty when none
  int partitions = 0;                 // partitions that began
};

// Reads a file of tests/data with MXFReader; the metadata of the first
// partition goes through MXFMetadataParser and MXFMetadataModelParser on the
// format's composite factory.
HeaderModel readHeaderModel(const std::string& name);

// Makes a fresh composite factory for each parser and coder.
typedef std::function<std::shared_ptr<MXFMetadataModelFactory>()> ModelFactoryMaker;

// The same through another composite.
HeaderModel readHeaderModel(const std::string& name, const ModelFactoryMaker& makeFactory);

// A model written by MXFMetadataModelCoder and MXFMetadataCoder into a KLV
// stream in memory, and read back by MXFMetadataParser and
// MXFMetadataModelParser.
struct RewrittenModel {
  MXFMetadataModel model;
  std::vector<Report> reports;  // of both parsers
  ByteVector bytes;             // the metadata stream
};

RewrittenModel rewriteModel(const MXFMetadataModel& model);
RewrittenModel rewriteModel(const MXFMetadataModel& model, const ModelFactoryMaker& makeFactory);

// Empty when two models are equal object by object: same classes, same coded
// properties (dark ones included, each reference as its identifier), and the
// same owned objects in the same order, recursively. Otherwise where the
// first difference is.
std::string modelDifference(const MXFMetadataModel& expected, const MXFMetadataModel& actual);
std::string modelDifference(const MXFMetadataModel& expected, const MXFMetadataModel& actual,
                            MXFMetadataFactory& factory);

}  // namespace zelta_test

#endif
