#include "programs/varnel/trends/TrendStretch.h"

#include <algorithm>

namespace varnel {

namespace {

ValueHistory::Duration lengthOf(const ValueHistory::Stretch& stretch) { return stretch.end - stretch.begin; }

ValueHistory::Duration scaled(ValueHistory::Duration length, double factor) {
  return ValueHistory::Duration(static_cast<std::int64_t>(static_cast<double>(length.count()) * factor));
}

ValueHistory::Stretch wholeAsShown(const ValueHistory::Stretch& whole) {
  return {std::min(whole.begin, whole.end - TrendStretch::leastWhole), whole.end};
}

}  // namespace

void TrendStretch::showLast(Duration length) {
  _kind = Kind::Last;
  _length = std::max(length, shortest);
}

void TrendStretch::showWhole() { _kind = Kind::Whole; }

void TrendStretch::show(const Stretch& stretch) {
  _kind = Kind::Fixed;
  _fixed = {stretch.begin, std::max(stretch.end, stretch.begin + shortest)};
}

TrendStretch::Stretch TrendStretch::of(const Stretch& whole) const {
  switch (_kind) {
    case Kind::Last:
      return {whole.end - _length, whole.end};
    case Kind::Whole:
      return wholeAsShown(whole);
    case Kind::Fixed:
      break;
  }
  return _fixed;
}

void TrendStretch::settle(Stretch stretch, const Stretch& whole) {
  const Stretch shown = wholeAsShown(whole);
  const Duration length = lengthOf(stretch);
  if (length >= lengthOf(shown)) return showWhole();
  if (stretch.end >= whole.end) return showLast(length);
  if (stretch.begin < shown.begin) stretch = {shown.begin, shown.begin + length};
  show(stretch);
}

void TrendStretch::zoom(double factor, double share, const Stretch& whole) {
  const Stretch now = of(whole);
  share = std::clamp(share, 0.0, 1.0);
  const Duration point = now.begin + scaled(lengthOf(now), share);
  const Duration length = std::max(scaled(lengthOf(now), factor), shortest);
  const Duration begin = point - scaled(length, share);
  settle({begin, begin + length}, whole);
}

void TrendStretch::zoom(double factor, const Stretch& whole) {
  zoom(factor, _kind == Kind::Fixed ? 0.5 : 1.0, whole);
}

void TrendStretch::pan(double share, const Stretch& whole) {
  const Stretch now = of(whole);
  const Duration length = lengthOf(now);
  const Duration step = scaled(length, share);
  // A stretch that is longer than the history shows all of it already.
  if (length >= lengthOf(wholeAsShown(whole))) return;
  settle({now.begin + step, now.end + step}, whole);
}

void TrendStretch::goToBegin(const Stretch& whole) {
  const Duration length = lengthOf(of(whole));
  const Stretch shown = wholeAsShown(whole);
  settle({shown.begin, shown.begin + length}, whole);
}

void TrendStretch::goToEnd(const Stretch& whole) {
  if (_kind == Kind::Fixed) showLast(lengthOf(of(whole)));
}

}  // namespace varnel
