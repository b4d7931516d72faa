// Files of the simulated host below its root: those that its scenario tells, and logs that grow by
// a line at a time.
#ifndef VLNSIM_HOST_LOGS_H
#define VLNSIM_HOST_LOGS_H

#include "simulator/host_model.h"

namespace vlnsim {

inline constexpr const char* system_log = "/var/log/messages";
inline constexpr const char* nima_log = "/tmp/nima2d.log";

// Writes the lines behind what the file has. False if they cannot be written, and without a host
// root: the machine's own logs are no simulated host's.
bool append_lines(const char* file, const std::vector<std::string>& lines);

// What the drivers say at a start of the host, with `first` only if there is no log yet; and those
// of the host's files that are missing.
void write_files(const Host& host, bool first);

} // namespace vlnsim

#endif // VLNSIM_HOST_LOGS_H
