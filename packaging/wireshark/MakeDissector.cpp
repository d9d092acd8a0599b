#include <cstdint>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <ostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "host/FileResources.h"
#include "host/SystemClock.h"
#include "platform/TelephonyService.h"

// make-dissector RESOURCES TEMPLATE DISSECTOR: writes the dissector, which is the template with the log codes
// that the decoders know.

namespace varnel {

namespace {

namespace fs = std::filesystem;

struct Technology {
  std::string_view identifier;
  std::string_view name;
};
// Those whose messages are packets.
constexpr Technology technologies[] = {
    {technology::kalviLTE, "LTE"},         {technology::kalviGSMUMTS, "GSM and UMTS"},
    {technology::kalviUTRAN2, "UTRAN"},    {technology::kalviCDMA, "CDMA2000"},
    {technology::allRadios, "All radios"},
};

constexpr std::string_view tableMark = "@SECTIONS_OF_CODE@";

// By log code: rows of a technology's name and its sections.
using SectionsOfCode = std::map<std::uint32_t, std::vector<std::vector<std::string>>>;

void addSections(const Technology& technology, const Services& services, SectionsOfCode& table) {
  const auto generator = LogGenerator::generatorFromTechnology(technology.identifier, services);
  const auto list = generator ? generator->codeSections() : std::vector<CodeSections>();
  if (list.empty()) throw std::runtime_error("no log codes for " + std::string(technology.identifier));
  for (const auto& [logCode, sections] : list) {
    if (sections.empty())
      throw std::runtime_error("no section for log code " + std::to_string(logCode) + " of " +
                               std::string(technology.identifier) + ": are its templates there?");
    std::vector<std::string>& row = table[logCode].emplace_back();
    row.emplace_back(technology.name);
    row.insert(row.end(), sections.begin(), sections.end());
  }
}

std::string luaString(std::string_view text) {
  std::string result = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') result += '\\';
    result += c;
  }
  return result + '"';
}

// The elements between braces, each as the function writes it.
template <class Elements, class Write>
std::string luaList(const Elements& elements, const Write& write) {
  std::string list, separator;
  for (const auto& element : elements) {
    list += separator + write(element);
    separator = ", ";
  }
  return "{" + list + "}";
}

std::string luaTable(const SectionsOfCode& table) {
  std::string lines;
  for (const auto& [logCode, technologyRows] : table) {
    char key[16];
    std::snprintf(key, sizeof key, "[0x%04X]", static_cast<unsigned>(logCode));
    const auto writeRow = [](const std::vector<std::string>& row) { return luaList(row, luaString); };
    lines += "  " + std::string(key) + " = " + luaList(technologyRows, writeRow) + ",\n";
  }
  return lines;
}

std::string readText(const fs::path& path) {
  std::ifstream file(path, std::ios::binary);
  std::string text(std::istreambuf_iterator<char>(file), {});
  if (!file || text.empty()) throw std::runtime_error("cannot read " + path.string());
  return text;
}

void writeText(const fs::path& path, const std::string& text) {
  std::ofstream file(path, std::ios::binary);
  if (!(file << text).flush()) throw std::runtime_error("cannot write " + path.string());
}

void makeDissector(const fs::path& resourceFolder, const fs::path& templatePath,
                   const fs::path& dissectorPath) {
  const FileResources resources(resourceFolder);
  const SystemClock clock;
  const ApplicationInfo application;
  std::ostream nowhere(nullptr);
  const Services services{resources, clock, application, nowhere};
  SectionsOfCode table;
  for (const Technology& technology : technologies) addSections(technology, services, table);

  std::string dissector = readText(templatePath);
  const std::size_t mark = dissector.find(tableMark);
  if (mark == std::string::npos)
    throw std::runtime_error(templatePath.string() + " lacks " + std::string(tableMark));
  dissector.replace(mark, tableMark.size(), luaTable(table));
  writeText(dissectorPath, dissector);
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  if (argumentCount != 4) {
    std::fprintf(stderr, "usage: make-dissector RESOURCES TEMPLATE DISSECTOR\n");
    return 2;
  }
  try {
    varnel::makeDissector(arguments[1], arguments[2], arguments[3]);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "make-dissector: %s\n", error.what());
    return 1;
  }
  return 0;
}
