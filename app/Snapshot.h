#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "base/Value.h"
#include "platform/Clock.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// A file that exists on devices that allow snapshots.
inline constexpr std::string_view internalDeviceMarker =
    "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

/// The device's folder of diagnostic logs, in which snapshots are saved.
inline constexpr std::string_view snapshotFolder = "/var/mobile/Library/Logs/CrashReporter";

/// The contents of a snapshot file: a dictionary with "Timestamp", "Data", and "Description". Without save
/// contents "Data" is an empty array. Without a description there is no "Description".
Value snapshotContents(Time created, const Value& saveContents,
                       const std::optional<std::string>& description);

/// Writes the snapshot file of this moment into the snapshot folder, and replaces a file of the same second.
/// A failure also writes a log line.
FileWriting writeSnapshot(DeviceFiles& files, const Clock& clock, const Value& contents);

/// Writes these save contents at once with an empty description, if the device allows snapshots. Otherwise
/// returns nothing, and a log line says why.
std::optional<FileWriting> saveSnapshotWithoutDescription(DeviceFiles& files, const Clock& clock,
                                                          const Value& saveContents);

}  // namespace varnel
