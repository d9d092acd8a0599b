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
// These are the payload itself, or its subpackets whose ids the layouts list.
template <class Take>
void forEachPart(std::span<const PacketLayout> layouts, const Packet& payload, std::uint32_t version,
                 Take take) {
  const auto known = std::ranges::find(layouts, version, &PacketLayout::version);
  if (known == layouts.end()) return take(PacketVersion{version}, nullptr, payload);
  if (known->subpacket == 0) return take(PacketVersion{version}, &*known, payload);
  forEachSubpacket(payload, [&](const Subpacket& subpacket) {
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

// The best that becomes of any part: a packet is decoded if one part is.
MessageFate VersionedDecoder::fateOf(const Packet& packet, std::uint32_t logCode) const {
  using enum MessageFate::Outcome;
  const auto layouts = layoutsOf(logCode);
  if (layouts.empty()) return {Decoded, logCode};
  const Packet payload = packet.from(Packet::headerSize);
  const auto version = versionIn(payload, logCode);
  MessageFate fate{TooShort, logCode};
  if (!version) return fate;
  forEachPart(layouts, payload, *version,
              [&](const PacketVersion& partVersion, const PacketLayout* layout, const Packet& body) {
                if (fate.outcome == Decoded) return;
                if (layout && body.size() >= layout->minimumLength) {
                  fate = {Decoded, logCode};
                } else if (!layout && !fate.version) {
                  fate = {UnknownVersion, logCode, partVersion};
                }
              });
  return fate;
}

void VersionedDecoder::listNumberFormats(SectionFormats& formats) const {
  for (const PacketLayout& layout : _layouts) formats.add(layout.fields);
}

}  // namespace varnel
