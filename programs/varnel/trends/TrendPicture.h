#pragma once

#include <QByteArray>
#include <QImage>
#include <string>
#include <vector>

#include "programs/varnel/trends/TrendSource.h"

namespace varnel {

/// A picture of courses for a report: black on white, with a title, the axes, and a legend with the lowest
/// value, the mean, and the highest value of each row.
struct TrendPicture {
  const TrendSource& source;
  std::vector<std::string> keys;
  TrendSource::Stretch stretch;

  QImage image() const;
  QByteArray svg() const;
};

}  // namespace varnel
