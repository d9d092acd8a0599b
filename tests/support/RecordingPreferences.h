#pragma once

#include <string>
#include <vector>

#include "platform/Preferences.h"
#include "tests/support/Describe.h"

namespace varnel {

/// Preferences that remember the calls, the oldest first.
class RecordingPreferences final : public Preferences {
 public:
  void set(std::string_view domain, std::string_view key, Value value) override {
    events.push_back("set " + std::string(domain) + " " + std::string(key) + " " + described(value));
  }
  void synchronise(std::string_view domain) override {
    events.push_back("synchronise " + std::string(domain));
  }
  void notifyChanged(std::string_view domain, std::string_view key) override {
    events.push_back("notify " + std::string(domain) + " " + std::string(key));
  }

  std::vector<std::string> events;
};

}  // namespace varnel
