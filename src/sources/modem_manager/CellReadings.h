// Cells and places as ModemManager describes them, into plain values.
#pragma once

#include <optional>
#include <string_view>

#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// One dictionary of GetCellInfo. Nothing for a technology that no metric is for.
std::optional<CellReading> cellReading(const BusProperties& cell);

// "26201" or "310410".
std::optional<NetworkCode> networkCode(std::string_view digits);

// "MCC,MNC,LAC,CI,TAC", the last three in hexadecimal: where the serving cell of the technology is.
std::optional<CellReading> placeReading(std::string_view text, Technology technology);

// The value when it lies in the range, which NaN does not.
std::optional<double> within(std::optional<double> value, double least, double most);

// What a level can be; what a modem says beyond is a way to say that it does not know.
std::optional<double> validRsrp(std::optional<double> dbm);  // 36.133, clause 9.1.4
std::optional<double> validRsrq(std::optional<double> db);   // 36.133, clause 9.1.7
std::optional<double> validRscp(std::optional<double> dbm);  // 25.133, clause 9.1.1
std::optional<double> validEcno(std::optional<double> db);   // 25.133, clause 9.1.2
std::optional<double> validRssi(std::optional<double> dbm);  // -125 is how modems say none
std::optional<double> validSnr(std::optional<double> db);

}  // namespace qel::sources
