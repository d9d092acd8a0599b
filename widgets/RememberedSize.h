#pragma once

#include <QSize>
#include <filesystem>
#include <optional>

namespace varnel {

/// The size that the window had at the end of the last run, in its own file ("480 800", logical pixels).
class RememberedSize final {
 public:
  /// The folder is made when a size is kept. Without a folder nothing is remembered.
  explicit RememberedSize(std::optional<std::filesystem::path> folder = std::nullopt);

  /// Nothing when no size is kept, or when the file holds no possible size of a window.
  std::optional<QSize> size() const;
  /// Replaces the kept size. A failure writes a log line.
  void keep(const QSize& size) const;

 private:
  std::optional<std::filesystem::path> _file;
};

}  // namespace varnel
