#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "base/Value.h"
#include "platform/Clock.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// Present on the devices on which snapshots may be saved.
inline constexpr std::string_view internalDeviceMarker =
    "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

/// The contents of a snapshot file: a dictionary of "Timestamp", "Data" and "Description". Without save
/// contents "Data" is an empty array; without a description there is no "Description".
Value snapshotContents(Time created, const Value& saveContents,
                       const std::optional<std::string>& description);

/// Writes the snapshot file of that moment into the device's folder of diagnostic logs; one of the same
/// second takes its place. A failure is also a line in the log.
FileWriting writeSnapshot(DeviceFiles& files, const Clock& clock, const Value& contents);

/// Writes these save contents at once with an empty description, where the device allows snapshots; elsewhere
/// a line in the log says why not, and nothing is returned.
std::optional<FileWriting> saveSnapshotWithoutDescription(DeviceFiles& files, const Clock& clock,
                                                          const Value& saveContents);

}  // namespace varnel
