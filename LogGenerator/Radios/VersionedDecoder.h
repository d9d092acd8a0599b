#pragma once

#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "LogGenerator/Radios/PacketLayout.h"

namespace varnel {

/// A decoder of packets whose layout depends on a version. It decodes the versions that it lists, and no
/// other: the entry "Version" tells the version of the last packet, and of one that is not listed
/// "37 (not known)", while the other entries stay as they are. A packet that is shorter than its layout's
/// minimum is dropped silently.
///
/// The version is the payload's first byte; of the NR packets (log codes from 0xB800 on) it is a number of
/// 32 bits there.
class VersionedDecoder : public Base {
 public:
  std::string_view getSectionName() const final { return _sectionName; }
  /// Each log code of the layouts once, in their order.
  std::vector<std::uint32_t> getLogCodeArray() const final;
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final;
  MessageFate fateOf(const Packet& packet, std::uint32_t logCode) const final;
  /// Adds the formats of all tables of the layouts.
  void listNumberFormats(SectionFormats& formats) const override;

 protected:
  /// The layouts must live as long as the program. Those of one log code stand together.
  VersionedDecoder(std::string_view sectionName, std::span<const PacketLayout> layouts)
      : _sectionName(sectionName), _layouts(layouts) {}

  /// Packets without a version of the decoder's own, such as those of the telephony server. They are not
  /// among the layouts.
  virtual std::vector<std::uint32_t> otherLogCodes() const { return {}; }
  virtual void updateWithOther(const Packet& /*packet*/, std::uint32_t /*logCode*/) {}

  /// Lets a layout call a member function.
  template <auto method>
  static void calling(VersionedDecoder& decoder, const Packet& body) {
    call(decoder, method, body);
  }

 private:
  template <class Decoder>
  static void call(VersionedDecoder& decoder, void (Decoder::*method)(const Packet&), const Packet& body) {
    (static_cast<Decoder&>(decoder).*method)(body);
  }

  std::span<const PacketLayout> layoutsOf(std::uint32_t logCode) const;
  void decodeAs(const PacketLayout& layout, const Packet& body);

  const std::string_view _sectionName;
  const std::span<const PacketLayout> _layouts;
};

}  // namespace varnel
