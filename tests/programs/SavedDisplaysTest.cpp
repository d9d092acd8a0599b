#include "programs/varnel/SavedDisplays.h"

#include <gtest/gtest.h>

#include "app/TreeSearch.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

std::string_view unit(const Value& display, const NamePath& path) {
  TestServices host;
  // Units are texts of the formats, which live as long as the program.
  return formatsOfSaved(display, host.services).unit(path);
}

TEST(FormatsOfSaved, AreThoseOfTheTechnologyThatKnowsMostNumbers) {
  const Value lte =
      dictionaryOf({{"Serving Cell Measurements", dictionaryOf({{"Measured RSRP", "-93.25 dBm"}})}});
  EXPECT_EQ(unit(lte, {"Serving Cell Measurements", "Measured RSRP"}), "dBm");
  const Value radios = dictionaryOf(
      {{"SIM 1", dictionaryOf({{"3;GSM", dictionaryOf({{"GSM Serving Cell",
                                                        dictionaryOf({{"RSSI", "-71 dBm"}})}})}})}});
  EXPECT_EQ(unit(radios, {"SIM 1", "GSM", "GSM Serving Cell", "RSSI"}), "dBm");
}

TEST(FormatsOfSaved, AreNoneWhereNoTechnologyKnowsANumber) {
  const Value display = dictionaryOf({{"Cell", dictionaryOf({{"Level", "-93.25 dBm"}})}});
  EXPECT_EQ(unit(display, {"Cell", "Level"}), "");
  EXPECT_EQ(unit(Value::ofDictionary(), {"Serving Cell Measurements", "Measured RSRP"}), "");
}

}  // namespace
}  // namespace varnel
