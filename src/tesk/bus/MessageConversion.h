// Messages as D-Bus dictionaries a{sv} and back.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <map>
#include <string>

#include "tesk/Message.h"

namespace tesk::bus {

using VariantMap = std::map<std::string, sdbus::Variant>;

// Integers become x, data ay, booleans b, text s. A null, and values of other kinds, are left out.
VariantMap toVariants(const Message& message);

// Every D-Bus integer becomes an integer; b, s and ay as above. Other types become nulls, so that
// whoever reads the key sees that it is of a wrong type.
Message fromVariants(const VariantMap& variants);

}  // namespace tesk::bus
