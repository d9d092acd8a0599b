#include "programs/varnel/DeviceRoot.h"

#include <system_error>

#include "app/Snapshot.h"
#include "host/RootedFiles.h"
#include "host/StateFolder.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

void makeFolders(const fs::path& root, std::error_code& failure) {
  // Snapshots tell who the user is, and the state folder of a program is for its user alone.
  if (fs::create_directories(root, failure)) fs::permissions(root, fs::perms::owner_all, failure);
  for (const std::string_view folder : {internalDeviceMarker, snapshotFolder}) {
    if (failure) return;
    fs::create_directories(root / fs::path(folder).relative_path(), failure);
  }
}

}  // namespace

DeviceRoot deviceRoot(const std::optional<std::string>& option, const fs::path& system) {
  if (option) return {*option, {}};
  if (RootedFiles(system).exists(std::string(internalDeviceMarker))) return {system, {}};
  const auto state = stateFolder();
  if (!state) return {system, "the environment names no home, so there is no folder for snapshots"};
  std::error_code failure;
  makeFolders(*state, failure);
  if (!failure) return {*state, {}};
  return {*state, "the folder for snapshots cannot be made in " + state->string() + ": " + failure.message()};
}

}  // namespace varnel
