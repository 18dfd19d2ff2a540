#pragma once

#include "Output.h"
#include <SupportDefs.h>
#include <string>

/// Four characters, or eight hexadecimal digits where the code is no printable text.
std::string TypeCodeText(type_code type);

/// The value for people: texts in quotes, numbers as numbers, messages by their size, other bytes in
/// hexadecimal (the first sixteen).
std::string AttributeValueText(type_code type, const std::string& value);

/// Adds "value" to the object: a string, a number, or "value_hex" for what is neither.
void AddAttributeValue(JsonObject& object, type_code type, const std::string& value);
