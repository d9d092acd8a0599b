#pragma once

#include <cstdint>
#include <string_view>

/// The messages between the telephony service and its clients. A request and its reply are dictionaries,
/// written as property lists, one per frame: {"Command": "CreateLogChannel", "PortName": local port of the
/// client} {"Error": integer, "PortName": port on which the service takes commands; absent when there is
/// none} The service makes a log channel only for a client that holds the rights "spi" and "internal". It
/// grants them by the client's user, whom it learns from the socket. When the service has no room for a
/// connection, or grants it no rights, it sends a reply without a request and closes the connection.
namespace varnel::telephonyProtocol {

inline constexpr std::string_view socketName = "com.orvane.TelephonyServer";

inline constexpr std::string_view commandKey = "Command";
inline constexpr std::string_view portNameKey = "PortName";
inline constexpr std::string_view errorKey = "Error";

inline constexpr std::string_view createLogChannel = "CreateLogChannel";

/// The message identifier of reports about the stream. Messages of the stream itself have 0.
///   {"Note": text, "Dropped": integer, "TooLong": integer}
inline constexpr std::int32_t streamReportIdentifier = 1;
inline constexpr std::string_view noteKey = "Note";
inline constexpr std::string_view droppedKey = "Dropped";
inline constexpr std::string_view tooLongKey = "TooLong";

/// Errors of the service; 0 is none.
inline constexpr std::int64_t malformedRequest = 1;
inline constexpr std::int64_t unknownCommand = 2;
inline constexpr std::int64_t missingRights = 3;
/// Errors that the client finds: no reply in time, or a reply that cannot be understood.
inline constexpr std::int64_t noReply = 4;
inline constexpr std::int64_t malformedReply = 5;
/// More errors of the service.
inline constexpr std::int64_t viewerPortMissing = 6;  ///< no port of that name answers
inline constexpr std::int64_t commandPortNotMade = 7;
inline constexpr std::int64_t tooManyChannels = 8;
inline constexpr std::int64_t portOfTheService = 9;  ///< the name belongs to one of the service's own ports
inline constexpr std::int64_t tooManyConnections = 10;

}  // namespace varnel::telephonyProtocol
