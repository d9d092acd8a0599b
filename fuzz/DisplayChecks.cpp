#include "fuzz/DisplayChecks.h"

#include <cstddef>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>

#include "base/PropertyList.h"
#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"
#include "model/VarnelModelNode.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

// If nodes share a path, the path leads to the last one.
void checkNode(const VarnelModelNode& node, const std::string& path, const PathDictionary& paths) {
  const auto found = paths.find(path);
  require(found != paths.end(), "every node is recorded under its path");
  require(path == "/" || path.ends_with("/" + found->second->displayName()),
          "a path ends in its node's name");
  require((node.value() != nullptr) != (node.childNodes() != nullptr), "a node has a value or children");
  if (!node.childNodes()) return;
  for (const auto& child : *node.childNodes())
    checkNode(*child, childPath(path, child->displayName()), paths);
}

// Checks as many leaves as are worth the time.
void checkLeaves(const Value& display, const PathDictionary& paths) {
  constexpr std::size_t mostPaths = 64;
  std::size_t count = 0;
  for (const auto& [path, node] : paths) {
    if (++count > mostPaths) return;
    const auto found = leafValueUnderPath(display, path);
    require(found.has_value() == (node->value() != nullptr) && (!found || *found == *node->value()),
            "a leaf is found as in the tree");
  }
}

void checkPropertyList(const Value& display) {
  require(writeBinaryPropertyList(display).has_value(), "every display has a binary form");
  std::string xml;
  try {
    xml = displayAsPropertyList(display);
  } catch (const std::runtime_error&) {
    require(holdsTextStrangeToXml(display), "XML refuses only texts that it cannot hold");
    return;
  }
  const ByteView bytes(reinterpret_cast<const std::uint8_t*>(xml.data()), xml.size());
  require(readPropertyList(bytes, fileLimits).has_value(), "a written display can be read");
}

}  // namespace

void checkTree(const Value& display) {
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  require(root->displayName() == "Varnel", "the root has its name");
  checkNode(*root, "/", paths);
  checkLeaves(display, paths);
}

void checkFormats(const Value& display) {
  static_cast<void>(displayAsText(display));
  require(!displayAsPaths(display).empty(), "a display has paths");
  require(nlohmann::json::accept(displayAsJson(display)), "a display is written as JSON");
  if (!display.isAbsent()) checkPropertyList(display);
}

}  // namespace varnel
