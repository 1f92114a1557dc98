#include <algorithm>
#include <cstdio>
#include <map>
#include <sstream>
#include <type_traits>
#include <typeinfo>
#include <variant>

#include "kit.h"
#include "model.h"
#include "summary.h"

namespace zelta_info {

namespace {

typedef std::map<MXFUID, std::shared_ptr<const MetadataRoot>> OwnedObjects;

// Hands the model's objects over to zelta-info.
class ModelKeeper : public MXFMetadataModelHandler {
public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override { objects_ = objects; }
  const MXFMetadataModel& objects() const { return objects_; }

private:
  MXFMetadataModel objects_;
};

// The class factory that codes objects of this type, searched through
// nested composites too.
MetadataRootFactory* classFactory(MXFMetadataModelFactory& composite, const std::type_info& type) {
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories()) {
    if (MXFMetadataModelFactory* nested = dynamic_cast<MXFMetadataModelFactory*>(factory.get())) {
      if (MetadataRootFactory* found = classFactory(*nested, type)) return found;
    } else if (MetadataRootFactory* single = dynamic_cast<MetadataRootFactory*>(factory.get())) {
      if (single->canCode(type)) return single;
    }
  }
  return nullptr;
}


template <typename T>
T decoded(const ByteVector& octets) {
  T value{};
  internalize(octets, value);
  return value;
}

template <typename T>
ModelValue numberValue(const ByteVector& octets) {
  // Widened, so that octets print as numbers and not as characters.
  if (std::is_signed<T>::value) return literalValue(std::to_string(static_cast<long long>(decoded<T>(octets))));
  return literalValue(std::to_string(static_cast<unsigned long long>(decoded<T>(octets))));
}

template <typename T>
ModelValue numberList(const ByteVector& octets) {
  ModelValue list{ModelValue::list, std::string(), {}, nullptr};
  for (const T& item : decoded<std::vector<T>>(octets)) list.items.push_back(literalValue(std::to_string(item)));
  return list;
}





ModelValue referenceValue(MXFMetadataModelFactory& factory, const MXFUID& target, const OwnedObjects& owned) {
  const OwnedObjects::const_iterator found = owned.find(target);
  if (found == owned.end()) return textValue(identifierText(target));
  ModelValue value{ModelValue::object, std::string(), {}, nullptr};
  value.nested = std::make_shared<ModelObject>(renderObject(factory, found->second));
  return value;
}

ModelValue referencesValue(MXFMetadataModelFactory& factory, const ByteVector& octets, const OwnedObjects& owned) {
  ModelValue list{ModelValue::list, std::string(), {}, nullptr};
  for (const MXFUID& target : decoded<std::vector<MXFUID>>(octets))
    list.items.push_back(referenceValue(factory, target, owned));
  return list;
}

ModelValue keysValue(const ByteVector& octets) {
  ModelValue list{ModelValue::list, std::string(), {}, nullptr};
  for (const KLVKey& key : decoded<std::vector<KLVKey>>(octets)) list.items.push_back(textValue(keyText(key)));
  return list;
}

ModelValue propertyValue(MXFMetadataModelFactory& factory, MXFPropertyKind kind, const ByteVector& octets,
                         const OwnedObjects& owned) {
  switch (kind) {
    case MXFPropertyKind::uint8: return numberValue<std::uint8_t>(octets);
    case MXFPropertyKind::uint16: return numberValue<std::uint16_t>(octets);
    case MXFPropertyKind::uint32: return numberValue<std::uint32_t>(octets);
    case MXFPropertyKind::uint64: return numberValue<std::uint64_t>(octets);
    case MXFPropertyKind::int8: return numberValue<std::int8_t>(octets);
    case MXFPropertyKind::int16: return numberValue<std::int16_t>(octets);
    case MXFPropertyKind::int32: return numberValue<std::int32_t>(octets);
    case MXFPropertyKind::int64: return numberValue<std::int64_t>(octets);
    case MXFPropertyKind::boolean: return literalValue(decoded<bool>(octets) ? "true" : "false");
    case MXFPropertyKind::rational: {
      const MXFRational r = decoded<MXFRational>(octets);
      return textValue(std::to_string(r.numerator) + "/" + std::to_string(r.denominator));
    }
    case MXFPropertyKind::timestamp: return textValue(timestampText(decoded<MXFTimestamp>(octets)));
    case MXFPropertyKind::productVersion: return textValue(versionText(decoded<MXFProductVersion>(octets)));
    case MXFPropertyKind::key: return textValue(keyText(decoded<KLVKey>(octets)));
    case MXFPropertyKind::uid: return textValue(identifierText(decoded<MXFUID>(octets)));
    case MXFPropertyKind::umid: return textValue(hexText(decoded<UMID>(octets).octets));
    case MXFPropertyKind::wideString: return textValue(utf8Text(decoded<std::wstring>(octets)));
    case MXFPropertyKind::narrowString: return textValue(decoded<std::string>(octets));
    case MXFPropertyKind::bytes: return textValue(hexText(decoded<ByteVector>(octets)));
    case MXFPropertyKind::uint32Batch: return numberList<std::uint32_t>(octets);
    case MXFPropertyKind::int32Batch: return numberList<std::int32_t>(octets);
    case MXFPropertyKind::keyBatch: return keysValue(octets);
    case MXFPropertyKind::strongReference: return referenceValue(factory, decoded<MXFUID>(octets), owned);
    case MXFPropertyKind::weakReference: return textValue(identifierText(decoded<MXFUID>(octets)));
    case MXFPropertyKind::strongReferenceVector: return referencesValue(factory, octets, owned);
    case MXFPropertyKind::rgbaLayout:
    case MXFPropertyKind::opaque: break;
  }
  return textValue(hexText(octets));
}

// Octets that don't decode as their kind says are shown as they stand.
ModelValue shownValue(MXFMetadataModelFactory& factory, MXFPropertyKind kind, const ByteVector& octets,
                      const OwnedObjects& owned) {
  try {
    return propertyValue(factory, kind, octets, owned);
  } catch (const util::assertion_failure&) {
    return textValue(hexText(octets));
  }
}

void renderDark(MXFMetadataModelFactory& factory, const MetadataRoot& object, ModelObject& shown) {
  for (const MetadataRoot::DarkProperties::value_type& dark : object.getDarkProperties()) {
    if (const ByteVector* octets = std::get_if<ByteVector>(&dark.second)) {
      shown.dark.emplace_back(keyText(dark.first), textValue(hexText(*octets)));
      continue;
    }
    ModelValue value{ModelValue::object, std::string(), {}, nullptr};
    value.nested = std::make_shared<ModelObject>(
        renderObject(factory, std::get<std::shared_ptr<MetadataRoot>>(dark.second)));
    shown.dark.emplace_back(keyText(dark.first), value);
  }
}

}  // namespace

std::string identifierText(const MXFUID& id) {
  std::string text;
  char digits[3];
  for (std::size_t i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += '-';
    std::snprintf(digits, sizeof digits, "%02x", unsigned(id[i]));
    text += digits;
  }
  return text;
}

std::string hexText(const ByteVector& octets) {
  std::string text;
  char digits[3];
  for (std::uint8_t octet : octets) {
    std::snprintf(digits, sizeof digits, "%02x", unsigned(octet));
    text += digits;
  }
  return text;
}

// The class codes the object into its properties and the objects that it
// owns; the descriptions of the class's factory say how to show each.
ModelObject renderObject(MXFMetadataModelFactory& factory, const std::shared_ptr<const MetadataRoot>& object) {
  const MetadataRoot& typed = *object;
  ModelObject shown;
  shown.instanceUID = identifierText(typed.getInstanceUID());
  MetadataRootFactory* single = classFactory(factory, typeid(typed));
  if (single == nullptr) {
    shown.className = typeid(typed).name();
    shown.failure = "no class factory";
  } else {
    shown.className = single->getClassName();
    try {
      const MXFCodedObject coded = single->code(object);
      OwnedObjects owned;
      for (const std::shared_ptr<const MetadataRoot>& child : coded.referenced) owned[child->getInstanceUID()] = child;
      const MXFPropertyDescriptions& descriptions = single->getPropertyDescriptions();
      for (const MXFPropertyMap::value_type& property : coded.set.properties) {
        const MXFPropertyDescriptions::const_iterator found = descriptions.find(property.first);
        if (found == descriptions.end() || property.first == MXFInstanceUIDKey) continue;
        shown.properties.emplace_back(found->second.name,
                                      shownValue(factory, found->second.kind, property.second, owned));
      }
    } catch (const util::assertion_failure& failure) {
      shown.properties.clear();
      shown.failure = failure.what();
    }
    std::stable_sort(shown.properties.begin(), shown.properties.end(),
                     [](const NamedValues::value_type& a, const NamedValues::value_type& b) {
                       return a.first < b.first;
                     });
  }
  renderDark(factory, typed, shown);
  return shown;
}

Model buildModel(const Metadata& metadata, ErrorHandler& reports) {
  // The factory keeps its handler weakly; this one lives as long as the parse.
  const std::shared_ptr<ErrorHandler> handler(&reports, [](ErrorHandler*) {});
  const std::shared_ptr<MXFMetadataModelFactory> factory = createZeltaDefaultMetadataFactory();
  factory->setErrorHandler(handler);
  ModelKeeper keeper;
  MXFMetadataModelParser parser(&keeper, factory);
  parser.setErrorHandler(&reports);
  parser.start();
  parser.primer(metadata.primer);
  for (const MXFPrimedSet& set : metadata.sets)
    if (parser.acceptSet(set.key)) parser.primedSet(set);
  parser.end();
  Model model;
  model.present = true;
  model.partition = metadata.partition;
  for (const std::shared_ptr<MetadataRoot>& object : keeper.objects())
    model.objects.push_back(renderObject(*factory, object));
  if (!keeper.objects().empty()) model.preface = std::dynamic_pointer_cast<const Preface>(keeper.objects().front());
  return model;
}

ModelValue literalValue(const std::string& text) { return ModelValue{ModelValue::literal, text, {}, nullptr}; }

ModelValue textValue(const std::string& text) { return ModelValue{ModelValue::text, text, {}, nullptr}; }

std::string keyText(const KLVKey& key) {
  std::ostringstream out;
  out << key;
  return out.str();
}

std::string timestampText(const MXFTimestamp& t) {
  char text[32];
  std::snprintf(text, sizeof text, "%04u-%02u-%02u %02u:%02u:%02u.%03u", unsigned(t.year), unsigned(t.month),
                unsigned(t.day), unsigned(t.hour), unsigned(t.minute), unsigned(t.second),
                unsigned(t.quarterMillisecond) * 4);
  return text;
}

std::string versionText(const MXFProductVersion& v) {
  return std::to_string(v.major) + "." + std::to_string(v.minor) + "." + std::to_string(v.tertiary) + "." +
         std::to_string(v.patch) + "." + std::to_string(v.release);
}

// Code points to UTF-8; what is no scalar value becomes U+FFFD.
std::string utf8Text(const std::wstring& text) {
  std::string out;
  for (wchar_t c : text) {
    std::uint32_t p = static_cast<std::uint32_t>(c);
    if (p > 0x10FFFF || (p >= 0xD800 && p < 0xE000)) p = 0xFFFD;
    if (p < 0x80) {
      out += static_cast<char>(p);
    } else if (p < 0x800) {
      out += static_cast<char>(0xC0 | (p >> 6));
      out += static_cast<char>(0x80 | (p & 0x3F));
    } else if (p < 0x10000) {
      out += static_cast<char>(0xE0 | (p >> 12));
      out += static_cast<char>(0x80 | ((p >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (p & 0x3F));
    } else {
      out += static_cast<char>(0xF0 | (p >> 18));
      out += static_cast<char>(0x80 | ((p >> 12) & 0x3F));
      out += static_cast<char>(0x80 | ((p >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (p & 0x3F));
    }
  }
  return out;
}

}  // namespace zelta_info
