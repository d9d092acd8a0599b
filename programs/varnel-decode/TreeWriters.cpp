#include "programs/varnel-decode/TreeWriters.h"

#include <memory>
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

}  // namespace

std::string displayAsText(const Value& display) { return treeAsText(*treeOf(display)); }

std::string displayAsPaths(const Value& display) {
  std::string lines;
  appendPaths(lines, *treeOf(display), "/");
  return lines;
}

std::string treeAsJson(const Value& display) { return treeAsJson(*treeOf(display)); }

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
