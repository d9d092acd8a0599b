#pragma once

#include <ostream>

#include "LogGenerator/Services.h"
#include "platform/Dictionary.h"
#include "platform/Value.h"

namespace varnel {

/// A host for generators under measurement: the LTE template's serving cell, a clock that stands still.
class BenchmarkServices final : public Resources, public Clock {
 public:
  Value propertyList(std::string_view /*name*/) const override {
    Value list = Value::ofDictionary();
    list.dictionary()->set("Serving Cell Info", Value::ofDictionary());
    return list;
  }
  std::vector<std::string> propertyListPaths() const override { return {"LTE.plist"}; }
  Time now() const override { return {}; }
  TimeZone zoneAt(Time /*time*/) const override { return {}; }

  Services services() { return {*this, *this, _application, _standardOutput}; }

 private:
  ApplicationInfo _application;
  std::ostream _standardOutput{nullptr};
};

}  // namespace varnel
