// How a log's file is opened: with the rights of the object manager, often root's, under a name
// that a client or a file of settings has given.
#ifndef FOUNDATION_LOG_FILE_H
#define FOUNDATION_LOG_FILE_H

#include "foundation/file_handle.h"

namespace cimple {

// For appending and reading; made if it is missing, and not left to child processes. Null for what
// is no place of a log: a device, a folder, a pipe, and a symbolic link of another owner, who could
// lead the log into any file of the host and turn it elsewhere at any time. Never waits.
File_Handle open_log_file(const char* path);

} // namespace cimple

#endif // FOUNDATION_LOG_FILE_H
