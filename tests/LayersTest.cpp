#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <optional>
#include <string>
#include <vector>

namespace varnel {
namespace {

namespace fs = std::filesystem;

struct Layer {
  std::string folder;
  std::vector<std::string> mayInclude;  // folders of the layers whose headers it may include
  bool isCore;                          // may use only the standard library
};

// Longer folders first: a file belongs to the first layer that its path begins with.
const std::vector<Layer> layers = {
    {"base/", {"base/"}, true},
    {"platform/ui/", {"platform/ui/", "platform/", "base/"}, true},
    {"platform/", {"platform/", "base/"}, true},
    {"host/", {"host/", "platform/", "base/"}, false},
    {"widgets/", {"widgets/", "host/", "platform/ui/", "platform/", "base/"}, false},
    {"terminal/", {"terminal/", "platform/ui/", "platform/", "base/"}, false},
    {"LogGenerator/", {"LogGenerator/", "platform/", "base/"}, true},
    {"model/", {"model/", "LogGenerator/", "platform/", "base/"}, true},
    {"app/", {"app/", "model/", "LogGenerator/", "platform/ui/", "platform/", "base/"}, true},
    {"programs/",
     {"programs/", "app/", "model/", "LogGenerator/", "widgets/", "terminal/", "host/", "platform/ui/",
      "platform/", "base/"},
     false},
};

const Layer* layerOf(const std::string& path) {
  const auto found =
      std::ranges::find_if(layers, [&](const Layer& layer) { return path.starts_with(layer.folder); });
  return found == layers.end() ? nullptr : &*found;
}

bool isProjectPath(const std::string& path) { return layerOf(path) != nullptr; }

bool mayInclude(const Layer& layer, const std::string& path) {
  return std::ranges::find(layer.mayInclude, layerOf(path)->folder) != layer.mayInclude.end();
}

bool isStandardHeader(const std::string& header) {
  return std::ranges::all_of(header, [](char c) { return (c >= 'a' && c <= 'z') || c == '_'; });
}

// The file name in an #include, with the opening quote or bracket; empty for any other line.
std::string includedFile(const std::string& line) {
  constexpr std::string_view directive = "#include ";
  if (!line.starts_with(directive)) return {};
  const std::size_t end = line.find_first_of("\">", directive.size() + 1);
  return line.substr(directive.size(), end - directive.size());
}

// What is wrong with a line of a file in the layer; nothing when it is fine.
std::optional<std::string> fault(const Layer& layer, const std::string& line) {
  const std::string included = includedFile(line);
  if (included.empty()) return std::nullopt;
  const std::string header = included.substr(1);
  if (included.front() == '"') {
    if (isProjectPath(header) && !mayInclude(layer, header)) return "points up or sideways: " + line;
    if (layer.isCore && !isProjectPath(header)) return "is no path from the root: " + line;
    return std::nullopt;
  }
  const bool isPropertyListLibrary = layer.folder == "base/" && header == "plist/plist.h";
  if (layer.isCore && !isStandardHeader(header) && !isPropertyListLibrary)
    return "is no standard header: " + line;
  const bool isTerminalLibrary = header == "curses.h" || header == "term.h";
  if (isTerminalLibrary && layer.folder != "terminal/") return "belongs into terminal/: " + line;
  return std::nullopt;
}

TEST(Layers, IncludesPointDownwardAndTheCoreKnowsNoToolkit) {
  const fs::path root = VARNEL_SOURCE_DIR;
  int filesSeen = 0;
  for (const char* top :
       {"base", "platform", "host", "widgets", "terminal", "LogGenerator", "model", "app", "programs"}) {
    for (const auto& entry : fs::recursive_directory_iterator(root / top)) {
      const std::string extension = entry.path().extension();
      if (extension != ".h" && extension != ".cpp") continue;
      ++filesSeen;
      const std::string path = fs::relative(entry.path(), root);
      std::ifstream file(entry.path());
      for (std::string line; std::getline(file, line);) {
        const auto found = fault(*layerOf(path), line);
        EXPECT_FALSE(found) << path << ": " << *found;
      }
    }
  }
  EXPECT_GT(filesSeen, 50);
}

TEST(Layers, TheRuleSeesWhatBreaksIt) {
  const Layer& model = *layerOf("model/VarnelModel.h");
  EXPECT_TRUE(fault(model, "#include \"app/TreeText.h\""));
  EXPECT_TRUE(fault(model, "#include \"host/HostLog.h\""));
  EXPECT_TRUE(fault(model, "#include <QString>"));
  EXPECT_TRUE(fault(model, "#include <plist/plist.h>"));
  EXPECT_FALSE(fault(model, "#include \"LogGenerator/LogGenerator.h\""));
  EXPECT_FALSE(fault(model, "#include <memory>"));
  EXPECT_FALSE(fault(*layerOf("base/PropertyList.cpp"), "#include <plist/plist.h>"));
  const Layer& userInterface = *layerOf("platform/ui/Window.h");
  EXPECT_TRUE(fault(userInterface, "#include <QWidget>"));
  EXPECT_TRUE(fault(userInterface, "#include \"host/HostLog.h\""));
  EXPECT_TRUE(fault(userInterface, "#include \"app/TreeText.h\""));
  EXPECT_FALSE(fault(userInterface, "#include \"base/Value.h\""));
  EXPECT_FALSE(fault(*layerOf("app/TextViewer.h"), "#include \"platform/ui/Window.h\""));
  const Layer& terminal = *layerOf("terminal/CursesScreen.cpp");
  EXPECT_FALSE(fault(terminal, "#include <curses.h>"));
  EXPECT_TRUE(fault(terminal, "#include \"app/VarnelApp.h\""));
  EXPECT_TRUE(fault(terminal, "#include \"widgets/Display.h\""));
  EXPECT_TRUE(fault(*layerOf("programs/varnel/main.cpp"), "#include <curses.h>"));
  EXPECT_TRUE(fault(*layerOf("base/Value.h"), "#include \"platform/ui/Window.h\""))
      << "the user interface is above the rest of the platform";
}

}  // namespace
}  // namespace varnel
