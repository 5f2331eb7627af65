#pragma once
// Message dictionaries on the bus: an a{sv} read from or appended to an
// sd-bus message, with the types of Message.h.
#include <systemd/sd-bus.h>

#include "service/Message.h"

namespace bw {

// Reads an a{sv} at the message's read position. Values of a type that
// Message.h does not carry are skipped, so a request reads them as missing.
// Returns a negative errno when the message is not well formed.
int readDictionary(sd_bus_message* message, MessageDictionary& dictionary);

// Appends `dictionary` as an a{sv}. Returns a negative errno on failure.
int appendDictionary(sd_bus_message* message, const MessageDictionary& dictionary);

}  // namespace bw
