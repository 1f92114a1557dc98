#include <algorithm>
#include <utility>
#include <vector>

#include "metadata.h"
#include "metadata/model_support.h"
#include "metadata/primer_building.h"

namespace {

typedef std::vector<std::pair<MXFUID, MXFPrimedSet>> OutputSets;

// A class's static tags for the keys that its set holds; the last class to
// run decides a key's tag.
void mergeStaticTags(const MXFKeyToTagMap& setPrimer, const MXFPrimedSet& set, MXFKeyToTagMap& primer) {
  for (const MXFKeyToTagMap::value_type& entry : setPrimer) {
    if (zelta::isPrivateProperty(entry.first) || set.properties.count(entry.first) == 0) continue;
    std::uint16_t& tag = primer[entry.first];
    if (tag == 0)
      tag = entry.second;
    else
      check(entry.second == 0 || entry.second == tag, "consistent primer entry");
  }
}

// Dark keys get dynamic tags; the primed set order is read, not written.
void mergeDarkProperties(const MetadataRoot& object, MXFKeyToTagMap& primer, std::vector<MXFUID>& order) {
  for (const MetadataRoot::DarkProperties::value_type& dark : object.getDarkProperties()) {
    if (dark.first == MXFPrimedSetOrderKey) {
      check(order.empty(), "single primed set order");
      internalize(object.getDarkProperty(dark.first), order);
    } else if (!zelta::isPrivateProperty(dark.first)) {
      primer[dark.first] = 0;
    }
  }
}

// The listed sets move to the end in the listed order; the others keep
// their places among themselves.
void applyOrder(const std::vector<MXFUID>& order, OutputSets& output) {
  const auto place = [&order](const MXFUID& identifier) -> std::ptrdiff_t {
    const auto found = std::find(order.begin(), order.end(), identifier);
    return found == order.end() ? 0 : found - order.begin() + 1;
  };
  std::stable_sort(output.begin(), output.end(),
                   [&place](const OutputSets::value_type& a, const OutputSets::value_type& b) {
                     return place(a.first) < place(b.first);
                   });
}

}  // namespace

MXFMetadataModelCoder::MXFMetadataModelCoder(MXFMetadataHandler* handler,
                                             const std::shared_ptr<MXFMetadataFactory>& factory)
    : handler_(handler), factory_(factory) {}

void MXFMetadataModelCoder::start() { handler_->start(); }

void MXFMetadataModelCoder::end() { handler_->end(); }

// Depth-first: an object, then its first child's whole subtree, then the
// next child's. Nothing goes out before the walk is through, so a refusal
// leaves the next handler untouched.
void MXFMetadataModelCoder::model(const MXFMetadataModel& objects) {
  check(objects.size() == 1 && objects.front() != nullptr && !zelta::hasLiveOwner(objects.front()), "valid model");
  MXFReferencedObjects work{objects.front()};
  MXFKeyToTagMap primer;
  std::vector<MXFUID> order;
  OutputSets output;
  while (!work.empty()) {
    const std::shared_ptr<const MetadataRoot> object = work.front();
    work.pop_front();
    check(object != nullptr, "can handle object");
    const MetadataRoot& root = *object;
    const std::type_info& type = typeid(root);
    check(factory_->canCode(type), "can handle object");
    MXFCodedObject coded = factory_->code(object);
    mergeStaticTags(factory_->getSetPrimer(type), coded.set, primer);
    mergeDarkProperties(*object, primer, order);
    output.emplace_back(object->getInstanceUID(), std::move(coded.set));
    work.splice(work.begin(), coded.referenced);
  }
  if (!order.empty()) applyOrder(order, output);
  handler_->primer(zelta::buildPrimerEntries(primer));
  for (const OutputSets::value_type& set : output) handler_->primedSet(set.second);
}
