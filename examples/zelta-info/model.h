// zelta-info --model: the object model of the header metadata, each object
// with its class, instance identifier, properties and dark properties.
#ifndef ZELTA_INFO_MODEL_H
#define ZELTA_INFO_MODEL_H

#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "klv.h"
#include "metadata.h"

namespace zelta_info {

struct Metadata;
struct ModelObject;

// A property's value as zelta-info shows it: a literal (a number, true or
// false), a text, a list of values, or an owned object.
struct ModelValue {
  enum Kind { literal, text, list, object };

  Kind kind = literal;
  std::string scalar;
  std::vector<ModelValue> items;
  std::shared_ptr<ModelObject> nested;
};

typedef std::vector<std::pair<std::string, ModelValue>> NamedValues;

struct ModelObject {
  std::string className;
  std::string instanceUID;
  NamedValues properties;  // by full name ("Track.trackID"), in name order
  NamedValues dark;        // by key label: octets in hexadecimal, or an owned object
  std::string failure;     // why the class could not code the object; empty when it could
};

// The model of one header metadata section: its root first, then the
// objects that nothing owns.
struct Model {
  bool present = false;
  std::uint64_t partition = 0;  // the offset of the partition that held it
  std::vector<ModelObject> objects;
  std::shared_ptr<const Preface> preface;  // the root, when it is a Preface
};

// Text forms of values, shared by the model's printers and its tests.
std::string identifierText(const MXFUID& id);  // 8-4-4-4-12 lower-case digits
std::string hexText(const ByteVector& octets);  // lower-case digits, no separator
std::string keyText(const KLVKey& key);
std::string timestampText(const MXFTimestamp& t);  // 2026-11-24 10:00:00.000
std::string versionText(const MXFProductVersion& v);  // major.minor.tertiary.patch.release
std::string utf8Text(const std::wstring& text);  // what is no scalar value becomes U+FFFD
ModelValue literalValue(const std::string& text);
ModelValue textValue(const std::string& text);

// Named values, as the model's objects print them.
void printNamedText(std::ostream& out, const NamedValues& values, const std::string& indent);
void printNamedJson(std::ostream& out, const NamedValues& values);

// Shows one object and everything that it owns, through the class factories
// of the composite.
ModelObject renderObject(MXFMetadataModelFactory& factory, const std::shared_ptr<const MetadataRoot>& object);

// Replays the primer and the sets of one section into the model parser of
// the format's classes; its reports go to the handler.
Model buildModel(const Metadata& metadata, ErrorHandler& reports);

void printModelText(std::ostream& out, const Model& model);
void printModelJson(std::ostream& out, const Model& model);

}  // namespace zelta_info

#endif
