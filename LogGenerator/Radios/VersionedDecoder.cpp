#include "LogGenerator/Radios/VersionedDecoder.h"

#include <algorithm>
#include <optional>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/PacketVersion.h"
#include "LogGenerator/Radios/Subpackets.h"

namespace varnel {

namespace {

constexpr std::uint32_t firstNRCode = 0xB800;

// Absent in a payload that ends before it.
std::optional<std::uint32_t> versionIn(const Packet& payload, std::uint32_t logCode) {
  const std::size_t size = logCode >= firstNRCode ? 4 : 1;
  if (payload.size() < size) return std::nullopt;
  return size == 1 ? payload.u8(0) : payload.u32(0);
}

// Calls `take` with each part of the payload that a layout may describe: (version, the layout or null, body).
// These are the payload itself, or its subpackets whose ids the layouts list. Returns whether there was a
// part or another subpacket.
template <class Take>
bool forEachPart(std::span<const PacketLayout> layouts, const Packet& payload, std::uint32_t version,
                 Take take) {
  const auto known = std::ranges::find(layouts, version, &PacketLayout::version);
  if (known == layouts.end() || known->subpacket == 0) {
    take(PacketVersion{version}, known == layouts.end() ? nullptr : &*known, payload);
    return true;
  }
  bool hasSubpackets = false;
  forEachSubpacket(payload, [&](const Subpacket& subpacket) {
    hasSubpackets = true;
    const auto hasItsId = [&](const PacketLayout& layout) {
      return layout.version == version && layout.subpacket == subpacket.id;
    };
    if (std::ranges::none_of(layouts, hasItsId)) return;
    const auto layout = std::ranges::find_if(layouts, [&](const PacketLayout& candidate) {
      return hasItsId(candidate) && candidate.subpacketVersion == subpacket.version;
    });
    take(PacketVersion{version, subpacket.id, subpacket.version},
         layout == layouts.end() ? nullptr : &*layout, subpacket.bytes);
  });
  return hasSubpackets;
}

}  // namespace

std::vector<std::uint32_t> VersionedDecoder::getLogCodeArray() const {
  std::vector<std::uint32_t> codes;
  for (const PacketLayout& layout : _layouts) {
    if (std::ranges::find(codes, layout.logCode) == codes.end()) codes.push_back(layout.logCode);
  }
  for (const std::uint32_t code : otherLogCodes()) codes.push_back(code);
  return codes;
}

std::span<const PacketLayout> VersionedDecoder::layoutsOf(std::uint32_t logCode) const {
  const auto first = std::ranges::find(_layouts, logCode, &PacketLayout::logCode);
  const auto last = std::find_if(first, _layouts.end(),
                                 [&](const PacketLayout& layout) { return layout.logCode != logCode; });
  return {first, last};
}

void VersionedDecoder::updateWithData_logCode(const Packet& packet, std::uint32_t logCode) {
  const auto layouts = layoutsOf(logCode);
  if (layouts.empty()) return updateWithOther(packet, logCode);
  const Packet payload = packet.from(Packet::headerSize);
  const auto version = versionIn(payload, logCode);
  if (!version) return;
  forEachPart(layouts, payload, *version,
              [&](const PacketVersion& partVersion, const PacketLayout* layout, const Packet& body) {
                if (!layout) return sectionRef.setText(versionEntry, partVersion.unknownText());
                if (body.size() < layout->minimumLength) return;
                sectionRef.setText(versionEntry, partVersion.text());
                decodeAs(*layout, body);
              });
}

void VersionedDecoder::decodeAs(const PacketLayout& layout, const Packet& body) {
  if (layout.function) {
    layout.function(sectionRef, body);
  } else if (layout.method) {
    layout.method(*this, body);
  } else {
    sectionRef.show(body, layout.fields);
  }
}

// The best that becomes of any part: a packet is decoded if one part is, or if it has nothing but subpackets
// that no layout is about.
MessageFate VersionedDecoder::fateOf(const Packet& packet, std::uint32_t logCode) const {
  using enum MessageFate::Outcome;
  const auto layouts = layoutsOf(logCode);
  if (layouts.empty()) return {Decoded, logCode};
  const Packet payload = packet.from(Packet::headerSize);
  const auto version = versionIn(payload, logCode);
  if (!version) return {TooShort, logCode};
  std::optional<MessageFate> best;
  const bool isWhole =
      forEachPart(layouts, payload, *version,
                  [&](const PacketVersion& partVersion, const PacketLayout* layout, const Packet& body) {
                    if (layout && body.size() >= layout->minimumLength) {
                      best = {Decoded, logCode};
                    } else if (!layout && (!best || best->outcome == TooShort)) {
                      best = {UnknownVersion, logCode, partVersion};
                    } else if (!best) {
                      best = {TooShort, logCode};
                    }
                  });
  return best.value_or(MessageFate{isWhole ? Decoded : TooShort, logCode});
}

void VersionedDecoder::listNumberFormats(SectionFormats& formats) const {
  for (const PacketLayout& layout : _layouts) formats.add(layout.fields);
}

}  // namespace varnel
