#include "programs/varnel-decode/RadioSummary.h"

#include <string_view>
#include <vector>

#include "app/TreeSearch.h"
#include "host/Printable.h"
#include "model/VarnelModelNode.h"

namespace varnel {

namespace {

// A row of the display, and what stands before its value.
struct Row {
  NamePath path;
  std::string_view label{};
};

struct Radio {
  std::string_view group;
  std::string_view name;
  std::vector<Row> rows;
};

const std::vector<Radio>& radios() {
  static const std::vector<Radio> all{
      {"LTE",
       "LTE",
       {{{"Serving Cell", "Cell Identity"}, "cell "},
        {{"Serving Cell", "Physical Cell ID"}, "PCI "},
        {{"Serving Cell", "EARFCN"}, "EARFCN "},
        {{"Serving Cell", "Band"}, "band "},
        {{"Serving Cell", "PLMN"}, "PLMN "},
        {{"Measurements", "RSRP"}, "RSRP "},
        {{"Measurements", "RSRQ"}, "RSRQ "},
        {{"Registration", "EMM State"}}}},
      {"NR",
       "NR",
       {{{"Serving Cell", "Cell Identity"}, "cell "},
        {{"Serving Cell", "Physical Cell ID"}, "PCI "},
        {{"Serving Cell", "NR-ARFCN"}, "NR-ARFCN "},
        {{"Serving Cell", "Band"}, "band "},
        {{"Serving Cell", "PLMN"}, "PLMN "},
        {{"Cells", "Layers", "0", "RSRP Rx0"}, "RSRP "},
        {{"Registration", "5GMM State"}}}},
      {"UMTS",
       "UMTS",
       {{{"UMTS RR Info", "Cell ID"}, "cell "},
        {{"UMTS RR Info", "Scrambling Code"}, "scrambling code "},
        {{"UMTS RR Info", "UARFCN"}, "UARFCN "},
        {{"Active Set", "0", "RSCP"}, "RSCP "}}},
      {"GSM",
       "GSM",
       {{{"GSM Serving Cell", "Cell ID"}, "cell "},
        {{"GSM Serving Cell", "ARFCN"}, "ARFCN "},
        {{"GSM Serving Cell", "BSIC"}, "BSIC "}}},
      {"Mobility Management",
       "GSM and UMTS",
       {{{"Process CS", "MM State"}, "calls "}, {{"Process PS", "MM State"}, "data "}}},
      {"Modem", "Modem", {{{"Registration", "PLMN"}, "PLMN "}, {{"Registration", "State"}}}},
  };
  return all;
}

std::string rowsOf(const Radio& radio, const VarnelModelNode& group) {
  std::string line;
  for (const Row& row : radio.rows) {
    const VarnelModelNode* const node = nodeUnderNames(group, row.path);
    const std::string* const value = node ? node->value() : nullptr;
    if (!value || value->empty()) continue;
    line.append(line.empty() ? "" : ", ").append(row.label).append(printable(*value));
  }
  return line;
}

// The groups may be those of one SIM card.
void appendRadios(std::string& lines, const VarnelModelNode& groups, const std::string& card) {
  for (const Radio& radio : radios()) {
    const VarnelModelNode* const group = nodeUnderNames(groups, {std::string(radio.group)});
    const std::string rows = group ? rowsOf(radio, *group) : std::string();
    if (!rows.empty()) lines.append(card).append(radio.name).append(": ").append(rows).append("\n");
  }
}

}  // namespace

std::string radioSummary(const Value& display) {
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  std::string lines;
  appendRadios(lines, *root, {});
  if (!root->childNodes()) return lines;
  for (const auto& child : *root->childNodes())
    if (child->displayName().starts_with("SIM ")) appendRadios(lines, *child, child->displayName() + ", ");
  return lines;
}

}  // namespace varnel
