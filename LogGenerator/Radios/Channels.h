#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>

/// What the channel numbers of LTE, NR, UMTS and GSM stand for: a frequency and the bands it lies in.
/// Frequencies are those of the carrier's center, in whole kilohertz, which every raster allows. A number
/// that no band has gives an absent result. No function allocates.
namespace varnel::channels {

/// A frequency in MHz.
constexpr double megahertz(std::int32_t frequency_khz) { return frequency_khz / 1000.0; }

/// The numbers of the bands that a channel may belong to, the narrowest first. Bands of equal width come in
/// the order of their numbers. A receiver cannot tell which of them the network means. A display shows them
/// all, unless the modem names the band.
class BandNumbers {
 public:
  static constexpr std::size_t capacity = 8;

  constexpr const std::uint16_t* begin() const { return _numbers.data(); }
  constexpr const std::uint16_t* end() const { return begin() + _size; }
  constexpr std::size_t size() const { return _size; }
  constexpr bool empty() const { return _size == 0; }
  /// The band to show where there is room for one. There must be one.
  constexpr std::uint16_t mostSpecific() const { return _numbers[0]; }
  constexpr bool contains(std::uint16_t number) const {
    for (const std::uint16_t band : *this)
      if (band == number) return true;
    return false;
  }

  /// Adds a band after those that are as wide or narrower. Add bands in the order of their numbers, at most
  /// `capacity`.
  constexpr void add(std::uint16_t number, std::int32_t width_khz) {
    std::size_t at = _size++;
    for (; at > 0 && _widths_khz.at(at - 1) > width_khz; --at) {
      _numbers.at(at) = _numbers.at(at - 1);
      _widths_khz.at(at) = _widths_khz.at(at - 1);
    }
    _numbers.at(at) = number;
    _widths_khz.at(at) = width_khz;
  }

 private:
  std::array<std::uint16_t, capacity> _numbers{};
  std::array<std::int32_t, capacity> _widths_khz{};
  std::size_t _size = 0;
};

/// An LTE channel of one direction. Its number belongs to one band only.
struct LTEChannel {
  std::uint16_t band;
  std::int32_t frequency_khz;

  bool operator==(const LTEChannel&) const = default;
};

/// The channel of a downlink EARFCN, those of time division bands included.
std::optional<LTEChannel> lteDownlink(std::uint32_t earfcn);
/// The channel of an uplink EARFCN, those of time division bands included.
std::optional<LTEChannel> lteUplink(std::uint32_t earfcn);
/// The uplink EARFCN that a downlink EARFCN is paired with unless the network names another one: the same in
/// a time division band. Nothing where there is no uplink: in bands that have none, and in the part of bands
/// 66 and 70 that is wider than their uplink.
std::optional<std::uint32_t> lteUplinkOf(std::uint32_t downlinkEarfcn);

/// The frequency of an NR-ARFCN, which is the same in both directions.
std::optional<std::int32_t> nrFrequency_khz(std::uint32_t nrArfcn);
/// The NR bands whose downlink or uplink holds a frequency, edges included. Empty where there are none. Of
/// bands that share a frequency the number alone does not tell which one is meant.
BandNumbers nrDownlinkBands(std::int32_t frequency_khz);
BandNumbers nrUplinkBands(std::int32_t frequency_khz);

/// A channel of UMTS with frequency division, in one direction.
struct UMTSChannel {
  BandNumbers bands;  ///< one, but for the numbers that bands V and VI share
  std::int32_t frequency_khz;
};

/// The channel of a downlink or an uplink UARFCN, general or additional.
std::optional<UMTSChannel> umtsDownlink(std::uint32_t uarfcn);
std::optional<UMTSChannel> umtsUplink(std::uint32_t uarfcn);
/// The uplink UARFCN that a downlink UARFCN is paired with. Nothing in bands that have no uplink.
std::optional<std::uint32_t> umtsUplinkOf(std::uint32_t downlinkUarfcn);

enum class GSMBand : std::uint8_t {
  GSM450,
  GSM480,
  GSM750,
  GSM850,
  PrimaryGSM900,
  ExtendedGSM900,
  RailwayGSM900,
  ExtendedRailwayGSM900,
  DCS1800,
  PCS1900,
};

/// The band's name as TS 45.005 writes it, as "P-GSM 900".
std::string_view nameOf(GSMBand band);

/// What a cell's BAND_INDICATOR says: which band the numbers 512 to 810 stand for.
enum class GSMBandIndicator : std::uint8_t { Unknown, DCS1800, PCS1900 };

/// A GSM channel, which is a pair of carriers.
struct GSMChannel {
  GSMBand band;  ///< the most specific: an ARFCN of P-GSM 900 is one of E-GSM 900 and R-GSM 900 too
  std::int32_t downlink_khz, uplink_khz;

  bool operator==(const GSMChannel&) const = default;
};

/// The channel of an ARFCN. Absent for a number that two bands have, while the indicator is not known.
std::optional<GSMChannel> gsmChannel(std::uint32_t arfcn, GSMBandIndicator indicator);

}  // namespace varnel::channels
