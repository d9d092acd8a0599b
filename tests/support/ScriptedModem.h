#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "base/Bytes.h"
#include "host/captures/FrameChecksum.h"
#include "host/captures/FrameEncoding.h"
#include "host/captures/FramedCapture.h"

namespace varnel {

inline Bytes framed(const Bytes& contents) {
  Bytes frame;
  appendFramed(frame, contents);
  return frame;
}

/// The contents of a log frame whose record has a time of zeros.
inline Bytes logContents(std::uint16_t code, const Bytes& payload) {
  const auto length = static_cast<std::uint8_t>(12 + payload.size());
  Bytes contents{0x10,
                 0,
                 length,
                 0,
                 length,
                 0,
                 static_cast<std::uint8_t>(code & 0xFF),
                 static_cast<std::uint8_t>(code >> 8),
                 0,
                 0,
                 0,
                 0,
                 0,
                 0,
                 0,
                 0};
  contents.insert(contents.end(), payload.begin(), payload.end());
  return contents;
}

/// The message of the log channel that such a frame becomes.
inline Bytes logMessage(std::uint16_t code, const Bytes& payload) {
  const Bytes contents = logContents(code, payload);
  Bytes message{0x01};
  message.insert(message.end(), contents.begin() + 4, contents.end());
  return message;
}

/// A modem at its diagnostic port: answers like one, and keeps what it was asked. It shares no layouts with
/// the program.
class ScriptedModem {
 public:
  /// How many log codes it has of each equipment.
  std::array<std::uint16_t, 16> numbers{};
  /// The answers to requests that begin with these bytes, in place of its own. An empty one is silence.
  std::vector<std::pair<Bytes, Bytes>> otherAnswers;
  /// Log frames that it sends before each answer, so that the answer comes between logs.
  Bytes beforeAnswers;
  /// The contents of the requests that have come.
  std::vector<Bytes> requests;

  ScriptedModem() { numbers[0xB] = 0x400; }

  /// Takes bytes and returns those that it sends.
  Bytes take(ByteView bytes) {
    Bytes sent;
    for (const std::uint8_t byte : bytes) {
      if (byte != 0x7E) {
        _segment.push_back(byte);
        continue;
      }
      const auto frame = unescaped(_segment);
      if (frame.size() > 2 && isSound(frame)) answer({frame.begin(), frame.end() - 2}, sent);
      _segment.clear();
    }
    return sent;
  }

  /// Whether the log code is switched on.
  bool isOn(std::uint16_t code) const {
    const Bytes& mask = _masks[code >> 12];
    const std::size_t byte = (code & 0xFFF) / 8;
    return byte < mask.size() && (mask[byte] >> code % 8 & 1) != 0;
  }

 private:
  static bool beginsWith(const Bytes& bytes, const Bytes& part) {
    return bytes.size() >= part.size() && std::equal(part.begin(), part.end(), bytes.begin());
  }

  void answer(const Bytes& request, Bytes& sent) {
    requests.push_back(request);
    Bytes contents = answerTo(request);
    for (const auto& [beginning, other] : otherAnswers)
      if (beginsWith(request, beginning)) contents = other;
    if (contents.empty()) return;
    sent.insert(sent.end(), beforeAnswers.begin(), beforeAnswers.end());
    appendFramed(sent, contents);
  }

  Bytes answerTo(const Bytes& request) {
    if (request == Bytes{0x00}) return versionAnswer();
    if (request == Bytes{0x7C}) return buildAnswer();
    if (request == Bytes{0x60, 0x00}) return {0x60, 0x00};
    if (request == Bytes{0x7D, 0x05, 0, 0, 0, 0, 0, 0}) return {0x7D, 0x05, 0x01, 0, 0, 0, 0, 0};
    if (request == Bytes{0x73, 0, 0, 0, 0, 0, 0, 0}) {
      _masks = {};
      return Bytes{0x73, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0};
    }
    if (request == Bytes{0x73, 0, 0, 0, 1, 0, 0, 0}) return numbersAnswer();
    if (beginsWith(request, {0x73, 0, 0, 0, 3, 0, 0, 0})) return setCodes(request);
    return {0x13};
  }

  static Bytes versionAnswer() {
    const std::string text = "Mar 14 202515:09:26Mar 15 202510:00:00testbuil";
    Bytes contents{0x00};
    contents.insert(contents.end(), text.begin(), text.end());
    contents.resize(55);
    return contents;
  }

  static Bytes buildAnswer() {
    const std::string text = "TEST.1.0-42";
    Bytes contents{0x7C, 1, 0, 0, 1, 0, 0, 0, 2, 0, 0, 0};
    contents.insert(contents.end(), text.begin(), text.end());
    contents.push_back(0);
    return contents;
  }

  Bytes numbersAnswer() const {
    Bytes contents{0x73, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0};
    for (const std::uint16_t number : numbers)
      contents.insert(contents.end(), {static_cast<std::uint8_t>(number & 0xFF),
                                       static_cast<std::uint8_t>(number >> 8), 0, 0});
    return contents;
  }

  // A mask that is longer than the modem's codes is refused.
  Bytes setCodes(const Bytes& request) {
    const std::size_t equipment = request.at(8), count = request.at(12) + request.at(13) * 256U;
    Bytes contents{0x73, 0, 0, 0, 3, 0, 0, 0};
    const bool isWhole = request.size() == 16 + (count + 7) / 8;
    const std::uint8_t status = isWhole && count <= numbers.at(equipment) ? 0 : 1;
    contents.insert(contents.end(), {status, 0, 0, 0});
    contents.insert(contents.end(), request.begin() + 8, request.end());
    if (status == 0) _masks[equipment] = Bytes(request.begin() + 16, request.end());
    return contents;
  }

  Bytes _segment;
  std::array<Bytes, 16> _masks;
};

}  // namespace varnel
