#pragma once

#include <map>
#include <ostream>
#include <string>
#include <vector>

#include "LogGenerator/Services.h"
#include "base/Log.h"
#include "fuzz/Require.h"
#include "host/FileResources.h"

namespace varnel {

/// The resources that ship with the application, read once.
class ShippedResources final : public Resources {
 public:
  ShippedResources() {
    const FileResources files(resourceFolder());
    for (const std::string& path : files.propertyListPaths()) {
      const std::string name = path.substr(0, path.rfind('.'));
      _lists[name] = files.propertyList(name);
    }
    require(!_lists.empty(), "the resources are there (VARNEL_RESOURCES names another folder)");
  }
  Value propertyList(std::string_view name) const override {
    const auto found = _lists.find(name);
    return found == _lists.end() ? Value() : found->second;
  }
  std::vector<std::string> propertyListPaths() const override {
    std::vector<std::string> paths;
    for (const auto& [name, list] : _lists) paths.push_back(name + ".plist");
    return paths;
  }

 private:
  std::map<std::string, Value, std::less<>> _lists;
};

/// A clock that stands still.
class StandingClock final : public Clock {
 public:
  Time now() const override { return {1700000000, 0}; }
  TimeZone zoneAt(Time /*time*/) const override { return {3600, false}; }
};

/// A sink that makes the log format every line.
class FormattedLog final : public LogSink {
 public:
  FormattedLog() { setLogSink(this, logExportFailurePriority); }
  ~FormattedLog() override { setLogSink(nullptr, -1); }
  FormattedLog(const FormattedLog&) = delete;
  FormattedLog& operator=(const FormattedLog&) = delete;
  void write(int /*priority*/, std::string_view /*text*/) override {}
};

/// The host of every generator under test.
struct FuzzHost {
  FormattedLog log;
  ShippedResources shipped;
  StandingClock clock;
  ApplicationInfo application{"1.0", "Jan  1 2024 00:00:00"};
  std::ostream nowhere{nullptr};

  Services services(const Resources& resources) { return {resources, clock, application, nowhere}; }
};

}  // namespace varnel
