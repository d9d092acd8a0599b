#pragma once

#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "base/Log.h"

namespace varnel {

inline void logUnknownCode(std::uint32_t logCode) {
  logError("Received an unknown log message: %d", logCode);
}

/// The common steps of a decoder: trace line, log code, length, and showing what the handler says.
class SectionDecoder : public Base {
 public:
  /// What a decoder does with a log code that it does not have.
  enum class UnknownCodes { Logged, Ignored };

  std::string_view getSectionName() const final { return _sectionName; }
  std::vector<std::uint32_t> getLogCodeArray() const final;
  std::span<const PacketHandler> handlers() const final { return _handlers; }
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final;
  void decode(const Packet& packet, const PacketHandler& handler) final;
  /// Adds the formats of all tables of the handlers.
  void listNumberFormats(SectionFormats& formats) const override;

 protected:
  /// The handlers are all log codes of the decoder, in the order in which it subscribes to them. They must
  /// live as long as the program.
  SectionDecoder(std::string_view sectionName, std::string_view traceLine,
                 std::span<const PacketHandler> handlers, UnknownCodes unknownCodes = UnknownCodes::Logged,
                 int tracePriority = logWarningPriority)
      : _sectionName(sectionName),
        _traceLine(traceLine),
        _handlers(handlers),
        _unknownCodes(unknownCodes),
        _tracePriority(tracePriority) {}

  /// Lets a handler call a member function.
  template <auto method>
  static void calling(SectionDecoder& decoder, const Packet& packet) {
    call(decoder, method, packet);
  }

 private:
  template <class Decoder>
  static void call(SectionDecoder& decoder, void (Decoder::*method)(const Packet&), const Packet& packet) {
    (static_cast<Decoder&>(decoder).*method)(packet);
  }

  const std::string_view _sectionName, _traceLine;
  const std::span<const PacketHandler> _handlers;
  const UnknownCodes _unknownCodes;
  const int _tracePriority;
};

}  // namespace varnel
