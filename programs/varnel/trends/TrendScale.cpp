#include "programs/varnel/trends/TrendScale.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

namespace varnel {

namespace {

constexpr double mantissas[] = {1, 2, 5, 10};

double roundStep(double least) {
  const double power = std::pow(10.0, std::floor(std::log10(least)));
  for (const double mantissa : mantissas)
    if (mantissa * power >= least * (1 - 1e-9)) return mantissa * power;
  return 10 * power;
}

// Where the room is the same on both sides, the value stands in the middle.
double roomAround(double value) { return value == 0 ? 1 : std::max(std::abs(value) * 0.01, 1.0); }

}  // namespace

TrendScale scaleFor(double lowest, double highest, int mostSteps) {
  if (!(lowest <= highest) || !std::isfinite(highest - lowest)) return {};
  if (highest - lowest <= std::abs(highest) * 1e-12) {
    const double room = roomAround(lowest);
    lowest -= room;
    highest += room;
  }
  TrendScale scale;
  double least = (highest - lowest) / std::max(mostSteps, 1);
  // Rounding the ends may add steps.
  for (int i = 0; i < 4; ++i) {
    scale.step = roundStep(least);
    scale.lowest = std::floor(lowest / scale.step + 1e-9) * scale.step;
    scale.highest = std::ceil(highest / scale.step - 1e-9) * scale.step;
    if ((scale.highest - scale.lowest) / scale.step <= mostSteps + 1e-6) break;
    least = scale.step * 1.01;
  }
  scale.decimals = static_cast<unsigned>(std::max(0.0, -std::floor(std::log10(scale.step) + 1e-9)));
  return scale;
}

std::string numberText(double number, unsigned decimals) {
  char text[400];
  std::snprintf(text, sizeof text, "%.*f", static_cast<int>(std::min(decimals, 15U)), number);
  // No "-0".
  const std::string_view digits(text);
  const bool isZero = digits.find_first_not_of("-0.") == std::string_view::npos;
  return std::string(isZero && digits.starts_with('-') ? digits.substr(1) : digits);
}

TrendStatistics statisticsOf(const ValueHistory::Summary& summary) {
  if (summary.count == 0) return {};
  return {numberText(summary.lowest, summary.decimals), numberText(summary.mean, summary.decimals),
          numberText(summary.highest, summary.decimals), numberText(summary.last, summary.decimals)};
}

std::string lengthText(ValueHistory::Duration length) {
  const auto seconds = std::chrono::round<std::chrono::seconds>(length).count();
  const auto part = [](std::int64_t count, const char* unit) {
    return count == 0 ? std::string() : std::to_string(count) + unit;
  };
  const auto joined = [](std::string one, const std::string& other) {
    if (!one.empty() && !other.empty()) one += ' ';
    return one + other;
  };
  if (seconds < 60) return std::to_string(seconds) + " s";
  if (seconds < 3600) return joined(part(seconds / 60, " min"), part(seconds % 60, " s"));
  return joined(part(seconds / 3600, " h"), part(seconds / 60 % 60, " min"));
}

}  // namespace varnel
