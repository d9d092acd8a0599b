#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "fuzz/Require.h"
#include "host/FilePreferences.h"
#include "host/WholeFile.h"

using namespace varnel;

namespace {

namespace fs = std::filesystem;

constexpr const char* domain = "com.orvane.dockhall";
constexpr const char* key = "DHShowGSMRSSI";

// A device's files, for as long as the process runs. They are in memory if /dev/shm exists: with a disk,
// most of the time would go into writing.
class Device {
 public:
  Device() {
    const fs::path memory = "/dev/shm";
    const fs::path parent = fs::is_directory(memory) ? memory : fs::temp_directory_path();
    std::string name = (parent / "varnel-preferences-XXXXXX").string();
    require(mkdtemp(name.data()) != nullptr, "there is a folder for temporary files");
    _root = name;
    fs::create_directories(list().parent_path());
  }
  Device(const Device&) = delete;
  Device& operator=(const Device&) = delete;
  ~Device() {
    std::error_code failure;
    fs::remove_all(_root, failure);
  }

  const fs::path& root() const { return _root; }
  fs::path list() const {
    return _root / "var/mobile/Library/Preferences" / (std::string(domain) + ".plist");
  }

 private:
  fs::path _root;
};

}  // namespace

// The input is the preferences file of the home-screen application. If it is a dictionary that has an XML
// form, it gets its entry and keeps all others. Otherwise it does not change.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const Device device;
  std::ofstream(device.list(), std::ios::binary)
      .write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
  FilePreferences preferences(device.root());
  preferences.set(domain, key, Value::ofBoolean(false));
  preferences.synchronise(domain);

  const auto written = readWholeFile(device.list());
  require(written.has_value(), "the file is there");
  auto expected = readPropertyList({data, size}, fileLimits);
  if (expected && expected->dictionary()) expected->dictionary()->set(key, Value::ofBoolean(false));
  const auto xml = expected && expected->dictionary() ? writeXmlPropertyList(*expected) : std::nullopt;
  require(*written == (xml ? *xml : Bytes(data, data + size)), "other keys and other files stay");
  return 0;
}
