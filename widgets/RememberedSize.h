#pragma once

#include <QSize>
#include <filesystem>
#include <optional>

namespace varnel {

/// The size that the window had at the end of the last run, kept in a file of its own ("480 800", logical
/// pixels).
class RememberedSize final {
 public:
  /// The folder is made when something is kept. Without one nothing is remembered.
  explicit RememberedSize(std::optional<std::filesystem::path> folder = std::nullopt);

  /// Nothing when none is kept, or when what is there is no window's size.
  std::optional<QSize> size() const;
  /// Keeps that size in place of the former. A failure is logged.
  void keep(const QSize& size) const;

 private:
  std::optional<std::filesystem::path> _file;
};

}  // namespace varnel
