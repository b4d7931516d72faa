// Files from and to other hosts, by way of libcurl.
#include "cimple/guard.h"
#include "cimple/thread.h"
#include "foundation/file_handle.h"
#include "foundation/host_paths.h"
#include "operations/curl_library.h"
#include "operations/operation_frame.h"

#include <algorithm>
#include <cctype>
#include <climits>
#include <cstring>
#include <string>
#include <sys/stat.h>

namespace cimple {

namespace {

// Codes of libcurl, which an operation also answers where it fails by itself.
constexpr int CURL_OK = 0;
constexpr int CURL_FAILED_INIT = 2;
constexpr int CURL_BAD_URL = 3;
constexpr int CURL_NOT_BUILT_IN = 4;
constexpr int CURL_WRITE_ERROR = 23;
constexpr int CURL_OUT_OF_MEMORY = 27;

constexpr long CURL_GLOBAL_ALL = 3;
constexpr long CURL_BASIC_AUTHENTICATION = 1;
constexpr std::size_t ERROR_TEXT_SIZE = 512; // libcurl writes 256

// A server that has nothing to say for so long is given up, since the whole provider waits for it.
constexpr std::int64_t STALL_SECONDS = 120;
constexpr std::int64_t UPLOAD_SECONDS = 100;

constexpr int OBJECT_OPTIONS = 10000; // the first number of options whose value is a pointer,
constexpr int OFFSET_OPTIONS = 30000; // and of 64 bits; those before are a long

struct Curl_Option {
    const char* name;
    int number;
    std::int64_t value = 0;
    const void* pointer = nullptr;
};

Curl_Option pointer_option(const char* name, int number, const void* pointer) {
    return {name, number, 0, pointer};
}

// libcurl ends the transfer when less is written than it has.
std::size_t write_to_file(const void* data, std::size_t size, std::size_t count, void* file) {
    return size * std::fwrite(data, size, count, static_cast<std::FILE*>(file));
}

// One transfer, from the initialisation of the library to its end.
class Curl_Session {
public:
    explicit Curl_Session(const Curl_Functions& functions) : m_functions(functions) {
        m_initialised = m_functions.global_init(CURL_GLOBAL_ALL);
        m_handle = m_functions.easy_init();
    }
    ~Curl_Session() {
        if (m_handle)
            m_functions.easy_cleanup(m_handle);
        m_functions.global_cleanup();
    }
    Curl_Session(const Curl_Session&) = delete;
    Curl_Session& operator=(const Curl_Session&) = delete;

    int initialised() const { return m_initialised; } // libcurl's code
    bool has_handle() const { return m_handle != nullptr; }

    // Sets all, whichever of them fail; the code of the last failure, or 0.
    template <std::size_t N>
    int set(const Curl_Option (&options)[N]) {
        int failure = CURL_OK;
        for (const Curl_Option& option : options) {
            const int code = set(option);
            if (code == CURL_OK)
                continue;
            VLN_LOG(VLN_ERR, "Error Setting %s, errorcode = %d", option.name, code);
            failure = code;
        }
        return failure;
    }

    int perform() { return m_functions.easy_perform(m_handle); }

private:
    int set(const Curl_Option& option) {
        if (option.number < OBJECT_OPTIONS)
            return m_functions.easy_setopt(m_handle, option.number,
                                           static_cast<long>(option.value));
        if (option.number < OFFSET_OPTIONS)
            return m_functions.easy_setopt(m_handle, option.number, option.pointer);
        return m_functions.easy_setopt(m_handle, option.number, option.value);
    }

    const Curl_Functions& m_functions;
    void* m_handle = nullptr;
    int m_initialised = CURL_OK;
};

bool exists(const std::string& path) {
    struct stat status {};
    return stat(path.c_str(), &status) == 0;
}

// The path of a file URI keeps its leading slash; the scheme may stand anywhere.
std::string path_of(const std::string& uri) {
    constexpr const char* SCHEMES[] = {"file://", "file://localhost"};
    for (const char* scheme : SCHEMES) {
        const std::size_t start = uri.find(std::string(scheme) + "/");
        if (start != std::string::npos)
            return uri.substr(start + std::strlen(scheme));
    }
    return uri;
}

// libcurl asks about once a second, also while nothing comes. Anything but 0 ends the transfer.
int is_to_stop(const void* stop, std::int64_t, std::int64_t, std::int64_t, std::int64_t) {
    return load_flag(*static_cast<const bool*>(stop)) ? 1 : 0;
}

int run_fetch(Curl_Session& curl, const std::string& uri, std::FILE* file, const bool& stop) {
    char error[ERROR_TEXT_SIZE] = "";
    // Certificates are not verified: what protects an adapter is its own check of the image.
    const Curl_Option options[] = {
        pointer_option("CURLOPT_URL", 10002, uri.c_str()),
        pointer_option("CURLOPT_WRITEFUNCTION", 20011,
                       reinterpret_cast<const void*>(&write_to_file)),
        pointer_option("CURLOPT_FILE", 10001, file),
        pointer_option("CURLOPT_ERRORBUFFER", 10010, error),
        {"CURLOPT_SSL_VERIFYPEER", 64, 0},
        {"CURLOPT_SSL_VERIFYHOST", 81, 0},
        {"CURLOPT_LOW_SPEED_LIMIT", 19, 1},
        {"CURLOPT_LOW_SPEED_TIME", 20, STALL_SECONDS},
    };
    // An option that is not set may be the one that keeps the bytes off the standard output.
    if (const int failure = curl.set(options))
        return failure;
    // A libcurl that is too old for these fetches as well.
    curl.set({pointer_option("CURLOPT_XFERINFOFUNCTION", 20219,
                             reinterpret_cast<const void*>(&is_to_stop)),
              pointer_option("CURLOPT_XFERINFODATA", 10057, &stop),
              {"CURLOPT_NOPROGRESS", 43, 0}});
    const int code = curl.perform();
    if (code != CURL_OK)
        VLN_LOG(VLN_DBG, "curl: %s", error);
    return code;
}

int fetch_into(const Curl_Library& library, const std::string& uri, std::FILE* file,
               const bool& stop) {
    Curl_Functions functions;
    if (!library.bind(functions))
        return CURL_NOT_BUILT_IN;
    Curl_Session curl(functions);
    if (curl.initialised() != CURL_OK)
        VLN_LOG(VLN_ERR, "unable to initalize curl");
    if (!curl.has_handle()) {
        VLN_LOG(VLN_ERR, "ERROR: Could not initialise the curl");
        return curl.initialised() != CURL_OK ? curl.initialised() : CURL_FAILED_INIT;
    }
    const int code = run_fetch(curl, uri, file, stop);
    if (code != CURL_OK)
        VLN_LOG(VLN_ERR, "download failed %d", code);
    return code != CURL_OK ? code : curl.initialised();
}

void close_after_fetch(Curl_Library& library) {
    if (library.close())
        VLN_LOG(VLN_DBG, "Successfully closed curl so");
    else
        VLN_LOG(VLN_ERR, "UNABLE TO CLOSE DYNAMIC LIB");
}

// Opens the file of that URI in the working folder; null after a line of the log. Without a name
// the code stays 0, and the caller finds that there is no such file.
File_Handle open_for_fetch(const std::string& uri, std::string& local, int& code) {
    const std::size_t slash = uri.rfind('/');
    if (slash == std::string::npos) {
        VLN_LOG(VLN_ERR, "ERROR: Could not parse the URI to get the firmware file name");
        return nullptr;
    }
    local = working_file(uri.substr(slash + 1));
    File_Handle file(std::fopen(local.c_str(), "wbe"));
    if (!file) {
        VLN_LOG(VLN_ERR, "ERROR: Could not open the file for writing");
        code = CURL_WRITE_ERROR;
    }
    return file;
}

void fetch(const std::string& uri, const bool& stop, std::string& local_path, int& code,
           bool& fetched) {
    VLN_LOG(VLN_INFO, "File not found on local file system. Trying libcURL...");
    Curl_Library library(Curl_Library::FETCH);
    if (!library.is_open()) {
        VLN_LOG(VLN_ERR, "ERROR: Could not load the curl library to download from internet");
        return;
    }
    std::string local;
    File_Handle file = open_for_fetch(uri, local, code);
    if (file) {
        code = fetch_into(library, uri, file.get(), stop);
        fetched = true;
        local_path = code == CURL_BAD_URL ? uri : local;
    }
    close_after_fetch(library);
    // What the system has kept back may find the disk full only now.
    if (file && std::fclose(file.release()) != 0 && code == CURL_OK) {
        code = CURL_WRITE_ERROR;
        VLN_LOG(VLN_ERR, "download failed %d", code);
    }
}

// ---- Upload ----

std::string percent_decoded(const std::string& text) {
    const auto is_digit = [&](std::size_t at) {
        return at < text.size() && std::isxdigit(static_cast<unsigned char>(text[at]));
    };
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '%' || !is_digit(i + 1) || !is_digit(i + 2)) {
            result += text[i];
            continue;
        }
        result += static_cast<char>(std::stoi(text.substr(i + 1, 2), nullptr, 16));
        i += 2;
    }
    return result;
}

// "user:password" of a URI, empty if it has none.
std::string login_of(const std::string& uri) {
    const std::size_t scheme = uri.find("://");
    if (scheme == std::string::npos)
        return {};
    const std::size_t start = scheme + 3;
    const std::string authority = uri.substr(start, uri.find_first_of("/?#", start) - start);
    const std::size_t end = authority.rfind('@');
    if (end == std::string::npos)
        return {};
    const std::string login = authority.substr(0, end);
    const std::size_t colon = std::min(login.find(':'), login.size());
    return percent_decoded(login.substr(0, colon)) + ":" +
           percent_decoded(colon < login.size() ? login.substr(colon + 1) : std::string());
}

int run_upload(Curl_Session& curl, const char* uri, std::FILE* file, std::int64_t size) {
    const Curl_Option options[] = {
        {"CURLOPT_UPLOAD", 46, 1},
        {"CURLOPT_PUT", 54, 1},
        pointer_option("CURLOPT_URL", 10002, uri),
        pointer_option("CURLOPT_READDATA", 10009, file),
        pointer_option("CURLOPT_INFILE", 10009, file),
        {"CURLOPT_TIMEOUT", 13, UPLOAD_SECONDS},
        {"CURLOPT_INFILESIZE", 14, std::min<std::int64_t>(size, LONG_MAX)},
        {"CURLOPT_INFILESIZE_LARGE", 30115, size},
        {"CURLOPT_SSL_VERIFYPEER", 64, 0},
        {"CURLOPT_SSL_VERIFYHOST", 81, 0},
        {"CURLOPT_HTTPAUTH", 107, CURL_BASIC_AUTHENTICATION},
    };
    if (curl.set(options) != CURL_OK)
        return -1;
    const std::string login = login_of(uri);
    const Curl_Option credentials[] = {pointer_option("CURLOPT_USERPWD", 10005, login.c_str())};
    if (!login.empty() && curl.set(credentials) != CURL_OK)
        return -1;
    const int code = curl.perform();
    if (code != CURL_OK)
        VLN_LOG(VLN_ERR, "curl upload file failed, errorcode %d", code);
    return code == CURL_OK ? 0 : -1;
}

int upload(const char* uri, const char* name) {
    struct stat status {};
    if (stat(name, &status) != 0) {
        VLN_LOG(VLN_ERR, "couldnot locate the file %s, to be uploaded", name);
        return -1;
    }
    Curl_Library library(Curl_Library::SEND);
    Curl_Functions functions;
    if (!library.is_open() || !library.bind(functions)) {
        VLN_LOG(VLN_ERR, "couldnot initialize curl library");
        return -1;
    }
    Curl_Session curl(functions);
    if (curl.initialised() != CURL_OK || !curl.has_handle()) {
        VLN_LOG(VLN_ERR, "couldnot initialize curl library");
        return -1;
    }
    const File_Handle file(std::fopen(name, "rbe"));
    if (!file || fstat(fileno(file.get()), &status) != 0) {
        VLN_LOG(VLN_ERR, "couldnot open the file %s, to be uploaded", name);
        return -1;
    }
    return run_upload(curl, uri, file.get(), status.st_size);
}

} // namespace

void VLN_MethodWrapper::downloadFileUsingCurl(const char* uri, const bool& stop,
                                              std::string& local_path, int& return_code,
                                              bool& fetched) {
    Operation_Frame frame("VLN_MethodWrapper::downloadFileUsingCurl");
    return_code = CURL_OK;
    fetched = false;
    const No_Cancellation in_the_library;
    const bool complete = run_guarded([&] {
        local_path = path_of(uri);
        VLN_LOG(VLN_DBG, "VLN_MethodWrapper::Firmware file path: %s", local_path.c_str());
        if (exists(local_path))
            VLN_LOG(VLN_DBG, "File found in local file system.");
        else
            fetch(uri, stop, local_path, return_code, fetched);
    });
    if (complete)
        return;
    VLN_LOG(VLN_ERR, "ERROR: error caught in accessing Curl Library");
    if (return_code == CURL_OK)
        return_code = CURL_OUT_OF_MEMORY;
}

int VLN_MethodWrapper::uploadFileUsingCurl(const char* uri, const char* file) {
    Operation_Frame frame("VLN_MethodWrapper::uploadFileUsingCurl");
    int result = -1;
    const No_Cancellation in_the_library;
    if (!run_guarded([&] { result = upload(uri, file); }))
        VLN_LOG(VLN_ERR, "ERROR: error caught in accessing Curl Library");
    return result;
}

} // namespace cimple
