#pragma once

#include <QDBusMessage>
#include <QMap>
#include <QString>
#include <QVariantMap>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/live/ModemReadings.h"

namespace varnel {

/// What ModemManager 1.10 and newer says on the bus, as readings. Every function takes what is of the right
/// kind and in its range, and leaves out all else: answers come from another program.
namespace busReading {

using Interfaces = QMap<QString, QVariantMap>;
using Objects = QMap<QString, Interfaces>;

/// The most that are read of one kind.
inline constexpr std::size_t mostObjects = 64, mostCells = 256, mostListed = 16, longestText = 128,
                             longestPath = 4095;

/// A printable text of at most `longestText` bytes; empty for anything else.
std::string text(const QVariantMap& entries, const char* key);
/// The path of a modem's device; empty when the service tells none, or one that no file can have.
std::string deviceOf(const QVariantMap& modemProperties);
std::optional<std::int64_t> number(const QVariantMap& entries, const char* key);
std::optional<double> real(const QVariantMap& entries, const char* key);
std::optional<bool> boolean(const QVariantMap& entries, const char* key);
/// Paths of objects, of at most `longestPath` bytes; a path that is "/" stands for none.
std::string path(const QVariantMap& entries, const char* key);
std::vector<std::string> paths(const QVariantMap& entries, const char* key);
/// A dictionary inside a property.
QVariantMap dictionary(const QVariantMap& entries, const char* key);

/// The only argument of a message, of these types; absent for another one.
std::optional<Objects> objectsOf(const QDBusMessage& answer);
std::optional<QVariantMap> propertiesOf(const QDBusMessage& answer);

/// The answer of GetCellInfo, or absent for one that is none.
std::optional<std::vector<CellReading>> cellsOf(const QDBusMessage& answer);
/// One dictionary of that answer; absent for a kind of cell that is not shown.
std::optional<CellReading> cellOf(const QVariantMap& entries);

/// A location by its sources, as GetLocation returns it and the property "Location" holds it.
struct Location {
  std::optional<NetworkLocation> network;
  std::optional<Position> position;
};
Location locationOf(const QDBusMessage& answer);
Location locationOf(const QVariant& property);
/// Reads "001,01,A1B,1C2D3E4,A1B": country, network, location area, cell, and tracking area. The last one is
/// missing in older services.
std::optional<NetworkLocation> networkLocationOf(const std::string& text);
/// Reads the raw position of a receiver.
std::optional<Position> positionOf(const QVariantMap& entries);

/// The serving cells' levels in the properties of the signal interface, in the order GSM, UMTS, LTE, NR, and
/// CDMA2000. Each is a serving cell that has levels alone.
std::vector<CellReading> signalsOf(const QVariantMap& properties);

/// The names of the technologies in a bit mask.
std::vector<std::string> accessTechnologiesOf(std::int64_t mask);
/// The radio of the cell in which the modem camps, by that bit mask; absent when it does not tell.
std::optional<CellReading::Radio> servingRadioOf(std::int64_t mask);

/// In percent; absent when it is not known, or not newly measured.
std::optional<std::int64_t> signalQualityOf(const QVariantMap& modemProperties);

/// The properties of a bearer and of a SIM card.
BearerReading bearerOf(const QVariantMap& properties);
std::string simIdentifierOf(const QVariantMap& properties);
std::vector<std::string> textsOf(const QVariantMap& entries, const char* key);

}  // namespace busReading

/// The cells of GetCellInfo, completed by the levels of the signal interface and by the location of the
/// serving cell in this radio. What GetCellInfo does not tell is a serving cell of its own.
std::vector<CellReading> joined(std::vector<CellReading> cells, const std::vector<CellReading>& signals,
                                const std::optional<NetworkLocation>& location,
                                std::optional<CellReading::Radio> servingRadio);

}  // namespace varnel
