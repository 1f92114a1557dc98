#include <algorithm>

#include "core/reports.h"
#include "metadata.h"
#include "metadata/model_support.h"

using zelta::detailed;
using zelta::hasLiveOwner;
using zelta::identifierText;

MXFMetadataModelHandler::~MXFMetadataModelHandler() = default;

dangling_ref_base::~dangling_ref_base() = default;

MXFMetadataModelParser::MXFMetadataModelParser(MXFMetadataModelHandler* handler,
                                               const std::shared_ptr<MXFMetadataFactory>& factory)
    : handler_(handler), factory_(factory) {}

void MXFMetadataModelParser::start() {
  roots_.clear();
  pending_.clear();
  instances_.clear();
  handler_->start();
}

void MXFMetadataModelParser::primer(const MXFPrimerEntries&) {}

// An unknown set is not kept in any form: only properties can be dark.
bool MXFMetadataModelParser::acceptSet(const KLVKey& key) {
  if (factory_->canParse(key)) return true;
  zelta::Reports(errorHandler_)
      .warning(unrecognizedMetadataId, detailed("unrecognized (dark) metadata", zelta::keyText(key)));
  return false;
}

void MXFMetadataModelParser::primedSet(const MXFPrimedSet& set) {
  MXFParsedObject parsed = factory_->parse(set);
  check(parsed.object != nullptr, "factory has created object");
  const std::shared_ptr<MetadataRoot>& object = parsed.object;
  const MXFUID& identifier = object->getInstanceUID();
  if (!instances_.emplace(identifier, object).second) {
    zelta::Reports(errorHandler_)
        .error(duplicateInstanceUIDId, detailed("duplicate MetadataRoot.instanceUID", identifierText(identifier)));
    roots_.push_back(object);
  } else {
    const auto waiting = pending_.equal_range(identifier);
    for (auto it = waiting.first; it != waiting.second;)
      it = connect(it->second, identifier, false) ? pending_.erase(it) : std::next(it);
    if (!hasLiveOwner(object)) roots_.push_back(object);
  }
  for (const MXFPendingReferences::value_type& reference : parsed.references) {
    const auto entered = pending_.insert(reference);
    const auto target = instances_.find(reference.first);
    if (target != instances_.end() && connect(reference.second, reference.first, true)) pending_.erase(entered);
  }
}

void MXFMetadataModelParser::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

// A strong reference is expected to point forward in the file; one that
// points back still connects.
bool MXFMetadataModelParser::connect(const std::shared_ptr<dangling_ref_base>& reference, const MXFUID& target,
                                     bool backward) {
  const zelta::Reports reports(errorHandler_);
  const std::shared_ptr<MetadataRoot>& object = instances_.at(target);
  if (reference->isStrong() && hasLiveOwner(object)) {
    reports.error(objectAlreadyOwnedId, detailed("referenced object is already owned", identifierText(target)));
    return false;
  }
  if (backward && reference->isStrong())
    reports.warning(backwardStrongReferenceId, detailed("backward strong reference", identifierText(target)));
  try {
    reference->resolve(object);
  } catch (const util::assertion_failure& exception) {
    reports.error(invalidReferenceId,
                  detailed(detailed("invalid reference", identifierText(target)), exception.what()));
    return false;
  }
  return true;
}

// The model goes out with what there is: the root first, then whatever
// nothing owns.
void MXFMetadataModelParser::end() {
  const zelta::Reports reports(errorHandler_);
  if (!pending_.empty())
    reports.warning(danglingReferencesId,
                    detailed("model has dangling references", identifierText(pending_.begin()->first)));
  if (!roots_.empty() && hasLiveOwner(roots_.front()))
    reports.error(firstObjectNotRootId, "first object is not model root");
  roots_.erase(std::remove_if(roots_.begin(), roots_.end(), hasLiveOwner), roots_.end());
  if (roots_.size() >= 2)
    reports.warning(unreferencedObjectsId,
                    detailed("unreferenced objects", identifierText(roots_[1]->getInstanceUID())));
  if (!roots_.empty()) handler_->model(roots_);
  handler_->end();
}
