#include "programs/varnel/RowCopies.h"

#include "app/TreeText.h"
#include "programs/shared/TreeJson.h"

namespace varnel {

namespace {

const VarnelModelNode& sectionOf(const VarnelModelNode& root, NamePath names) {
  const VarnelModelNode* node = nodeUnderNames(root, names);
  if (node && node->value() && !names.empty()) {
    names.pop_back();
    node = nodeUnderNames(root, names);
  }
  return node ? *node : root;
}

}  // namespace

std::string copyOfValue(const VarnelModelNode& root, const NamePath& names) {
  const VarnelModelNode* const node = nodeUnderNames(root, names);
  return node && node->value() ? *node->value() : copyOfSectionAsText(root, names);
}

std::string copyOfRow(const VarnelModelNode& root, const NamePath& names) {
  const VarnelModelNode* const node = nodeUnderNames(root, names);
  if (!node) return {};
  return node->value() ? node->displayName() + '\t' + *node->value() : node->displayName();
}

std::string copyOfSectionAsText(const VarnelModelNode& root, const NamePath& names) {
  return treeAsText(sectionOf(root, names));
}

std::string copyOfSectionAsJson(const VarnelModelNode& root, const NamePath& names) {
  return treeAsJson(sectionOf(root, names));
}

}  // namespace varnel
