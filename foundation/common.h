// Common text forms and host queries of the provider.
//
// All functions are re-entrant except where they say otherwise. Statuses: 0 for success, 32769 for
// a bad argument or a failure. A null destination of a text form is no error: nothing is written.
#ifndef FOUNDATION_COMMON_H
#define FOUNDATION_COMMON_H

#include "cimple/array.h"
#include "cimple/types.h"

#include <string>

struct hba_AdapterAttributes; // HBA_ADAPTERATTRIBUTES of the SNIA HBA API
struct statvfs;

namespace cimple {

struct Instance;

inline constexpr sint32 VLN_GENERAL_ERROR = 32769;

// A firmware version of the form d.ddXd. The two digits behind the point are separate numbers.
struct VLN_FirmwareVersion {
    uint16 major = 0;
    uint16 minor = 0;
    uint16 revision = 0;
    uint16 build = 0;
    std::string releaseType;
    std::string testRevision;
};

class VLN_Common {
public:
    // World Wide Names: 8 or 16 bytes, upper-case digits without separators.
    static sint32 wwnToString(std::string* dst, const uint8* wwn);
    static sint32 wwn16ToString(std::string* dst, const uint8* bytes);
    static std::string wwnText(const uint8* wwn); // the text of wwnToString

    // 16 digits to 8 bytes; a null or malformed text is logged.
    static sint32 stringToWwn(uint8* bytes, const char* text);
    // The same, but 1 for success and 0 for failure, which leaves `out` alone.
    static sint32 stringToWwnWord(uint8* out, const char* text);

    // MAC addresses: 6 bytes to "xx-xx-xx-xx-xx-xx".
    static sint32 formatMacWithDashes(std::string* dst, const uint8* mac); // null dst: 32769
    static sint32 macToText(const uint8* mac, std::string* dst);
    // "xx-xx-xx-xx-xx-xx" to "xx:xx:xx:xx:xx:xx:00:00".
    static sint32 macToNaa(std::string* dst, const char* mac);

    // "%d" of each byte. `dst` has room for max + 1 characters; 1 if they do not all fit.
    static sint32 bytesToSeparatedText(const sint8* bytes, char* dst, const char* separator,
                                       uint32 count, uint32 max);
    // A SCSI identification descriptor of 16, 12 or 8 bytes; others give an empty text and a log
    // line.
    static sint32 descriptorToString(std::string* dst, const uint8* bytes, uint32 length);
    // Appends the digits of bytes [from, to).
    static void hexRangeToString(std::string* dst, const uint8* record, uint32 from, uint32 to);
    static void byteSwapCopy(const void* src, void* dst, std::size_t n);
    static sint32 adapterAttributesText(const hba_AdapterAttributes* attributes, std::string* dst);

    // "a.b.c.d"; numbers that the text lacks are 0.
    static sint32 versionFourNumbers(const char* text, uint16 (&out)[4]);
    static sint32 parseVersion(const char* text, VLN_FirmwareVersion& out);

    // Cuts the next token out of `text`, or, when that is null, out of what *save points at. Null
    // at the end. Both must be writable; *save may start null.
    static char* nextToken(char* text, const char* delimiters, char** save);

    // Debug lines.
    static void traceInt(const char* name, sint32 value);
    static void traceString(const char* name, const char* value);
    static void traceUint16Array(const char* name, const Array<uint16>& array);
    static void traceInstance(const char* name, const Instance* instance);

    // Whether the root file system is read-only; asked until the host answers once.
    static bool IsReadOnlyFS();
    // The kernel's version line and the text of /etc/issue, "Unknown" where unreadable.
    static sint32 getOSInformation(std::string& name, std::string& distribution);

    // Tests put a host of their own in place; null: the real one. Forgets what IsReadOnlyFS
    // learned.
    using Statvfs = int (*)(const char* path, struct statvfs* out);
    static void replace_statvfs(Statvfs query);
};

} // namespace cimple

#endif // FOUNDATION_COMMON_H
