#pragma once

#include <QString>

/// The names on the bus of ModemManager's interfaces that are asked.
namespace varnel::modemInterfaces {

inline const QString modem = QStringLiteral("org.freedesktop.ModemManager1.Modem");
inline const QString network = QStringLiteral("org.freedesktop.ModemManager1.Modem.Modem3gpp");
inline const QString location = QStringLiteral("org.freedesktop.ModemManager1.Modem.Location");
inline const QString signal = QStringLiteral("org.freedesktop.ModemManager1.Modem.Signal");
inline const QString sim = QStringLiteral("org.freedesktop.ModemManager1.Sim");
inline const QString bearer = QStringLiteral("org.freedesktop.ModemManager1.Bearer");

}  // namespace varnel::modemInterfaces
