#pragma once
// Who may read process usage through the service: the super-user and the
// members of the group "adm". The bus tells who the caller is.
#include <systemd/sd-bus.h>

namespace bw {

// Whether the sender of `message` may have the job report: its user from
// the bus (sd_bus_query_sender_creds), its groups as the bus daemon saw them
// or, where the daemon does not say, the group database's list for the
// user. False when the bus cannot say who sent it (a caller that has left).
bool senderMayReadProcessUsage(sd_bus_message* message);

}  // namespace bw
