#include "programs/varnel-decode/TreeWriters.h"

#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <stdexcept>

#include "app/TreeText.h"
#include "base/PropertyList.h"
#include "host/Printable.h"
#include "model/VarnelModelNode.h"

namespace varnel {

namespace {

std::shared_ptr<const VarnelModelNode> treeOf(const Value& display) {
  PathDictionary paths;
  return VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
}

std::string escaped(std::string_view text) {
  std::string escaped;
  for (const char character : text) {
    switch (character) {
      case '\\':
        escaped += "\\\\";
        break;
      case '\t':
        escaped += "\\t";
        break;
      case '\n':
        escaped += "\\n";
        break;
      case '\r':
        escaped += "\\r";
        break;
      default:
        escaped += character;
    }
  }
  return printable(escaped);
}

void appendPaths(std::string& lines, const VarnelModelNode& node, const std::string& path) {
  lines += escaped(path);
  if (const std::string* value = node.value()) lines += '\t' + escaped(*value);
  lines += '\n';
  if (!node.childNodes()) return;
  for (const auto& child : *node.childNodes())
    appendPaths(lines, *child, childPath(path, child->displayName()));
}

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

std::string displayAsText(const Value& display) { return treeAsText(*treeOf(display)); }

std::string displayAsPaths(const Value& display) {
  std::string lines;
  appendPaths(lines, *treeOf(display), "/");
  return lines;
}

std::string jsonString(const std::string& text) {
  using Json = nlohmann::json;
  // The library escapes all control characters except DEL and C1.
  return printable(Json(text).dump(-1, ' ', false, Json::error_handler_t::replace));
}

std::string treeAsJson(const Value& display) {
  std::string json;
  appendJson(json, *treeOf(display));
  return json;
}

std::string displayAsJson(const Value& display) { return treeAsJson(display) + '\n'; }

std::string displayAsPropertyList(const Value& display) {
  if (display.isAbsent()) return {};
  const auto list = writeXmlPropertyList(display);
  if (!list)
    throw std::runtime_error("the display holds what an XML property list cannot; try another --format");
  return {list->begin(), list->end()};
}

std::string displayAsNothing(const Value& /*display*/) { return {}; }

}  // namespace varnel
