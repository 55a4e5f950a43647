#ifndef QV_PLATFORM_TSTATUS_H
#define QV_PLATFORM_TSTATUS_H

#include <cstdint>

// The status record that every operation of the protocol layers takes by reference as its
// last argument. The protocol layers never throw: they record the first failure here and
// turn every later operation into a no-op, so a caller chains operations and tests once.
struct tStatus {
    static constexpr std::uint32_t kFullSize = 208;
    static constexpr std::uint32_t kComponentSize = 10;
    static constexpr std::uint32_t kFileSize = 101;
    static constexpr std::uint32_t kExtensionWords = 10;

    // Size of the record as known to its creator; the detail fields below exist only when it
    // is at least kFullSize. Every creator in this system stores kFullSize.
    std::uint32_t structSize = kFullSize;
    std::int32_t code = 0;  // 0 success, negative error, positive warning
    char component[kComponentSize] = {};
    char file[kFileSize] = {};
    std::uint32_t line = 0;
    std::uint64_t extension[kExtensionWords] = {};

    bool failed() const { return code < 0; }
    bool succeeded() const { return code >= 0; }

    // Records `newCode` when it may replace the current one: anything replaces success, an
    // error replaces a warning, nothing else replaces anything. Returns whether it did.
    bool set(std::int32_t newCode, const char* componentName, const char* fileName,
             std::uint32_t lineNumber);

    // Forgives whatever was recorded: back to success with empty details.
    void reset();

    // Records another record's code and details by the rule of `set`; when recorded and both
    // records are full-size, the extension words come along.
    void merge(const tStatus& other);
};

static_assert(sizeof(tStatus) == tStatus::kFullSize, "tStatus must keep its 208-octet layout");

// Status codes recorded by this system.
enum : std::int32_t {
    kStatusNoMemory = -52000,        // object, array or text cannot be allocated
    kStatusBadContent = -52002,      // received protocol content not acceptable
    kStatusSocketError = -52003,     // a socket option, bind, send or receive failed
    kStatusUnsupported = -52005,     // unsupported type or id, or a text too long
    kStatusOsObjectError = -52008,   // an OS object cannot be created or waited on
    kStatusAborted = -52009,         // a blocking receive was abandoned on shutdown
    kStatusNoTlvList = -52010,       // a management message has no TLV list
    kStatusNoData = -52012,          // data ran out, buffer too small, no valid answer
    kStatusLockError = -52015,       // a lock or event operation failed
    kStatusAlreadyRunning = -52016,  // a thread was started while already running
};

// Component names that the layers record.
inline constexpr const char* kComponentCodec = "qvptp3u";
inline constexpr const char* kComponentMgmt = "qvptpmgmt3u";

// The source file name without its directories, so that records name the file, not the
// build machine's tree.
constexpr const char* sourceBaseName(const char* path) {
    const char* base = path;
    for (const char* p = path; *p != '\0'; ++p) {
        if (*p == '/' || *p == '\\') {
            base = p + 1;
        }
    }
    return base;
}

// Records a code with the calling source file and line.
#define QV_STATUS_SET(status, code, component) \
    (status).set((code), (component), sourceBaseName(__FILE__), __LINE__)

#endif
