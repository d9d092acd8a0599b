#include "programs/shared/TreeJson.h"

#include <nlohmann/json.hpp>
#include <string_view>

#include "host/Printable.h"

namespace varnel {

namespace {

// Written by hand, since no JSON library holds an object with the same name twice.
void appendJson(std::string& json, const VarnelModelNode& node) {
  const auto* tree = dynamic_cast<const VarnelModelTreeNode*>(&node);
  if (!tree) {
    json += jsonString(*node.value());
    return;
  }
  const bool isArray = tree->origin() == VarnelModelTreeNode::Origin::Array;
  json += isArray ? '[' : '{';
  std::string_view separator;
  for (const auto& child : *tree->childNodes()) {
    json += separator;
    separator = ",";
    if (!isArray) {
      json += jsonString(child->displayName());
      json += ':';
    }
    appendJson(json, *child);
  }
  json += isArray ? ']' : '}';
}

}  // namespace

std::string jsonString(const std::string& text) {
  using Json = nlohmann::json;
  // The library escapes all control characters except DEL and C1.
  return printable(Json(text).dump(-1, ' ', false, Json::error_handler_t::replace));
}

std::string treeAsJson(const VarnelModelNode& root) {
  std::string json;
  appendJson(json, root);
  return json;
}

}  // namespace varnel
