// The HTTP server of tests that fetch and send files: http_server FOLDER
//
// It serves the folder's files and some that are not as they should be, on ports of the loopback
// interface that the system chooses: "PLAIN TLS" stands in the first line of its output, the TLS
// one with a certificate made on the spot. It ends with its standard input. Being a program of its
// own, it has the machine's word size whatever that of the tests is.
#include <chrono>
#include <cstdio>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <unistd.h>

#include <httplib.h>
#include <openssl/evp.h>
#include <openssl/x509.h>

namespace {

constexpr char TYPE[] = "application/octet-stream";
constexpr auto SLOW_STEP = std::chrono::milliseconds(20);

std::mutex sent_mutex;
std::string sent = "nothing"; // the last file received

void slow(const httplib::Request&, httplib::Response& response) {
    response.set_content_provider(TYPE, [](std::size_t offset, httplib::DataSink& sink) {
        std::this_thread::sleep_for(SLOW_STEP);
        const bool written = sink.write("slow", 4);
        if (offset >= 16)
            sink.done();
        return written;
    });
}

// Announces more than it has.
void cut_off(const httplib::Request&, httplib::Response& response) {
    response.set_content_provider(1000, TYPE,
                                  [](std::size_t offset, std::size_t, httplib::DataSink& sink) {
                                      return offset == 0 && sink.write("the first half", 14);
                                  });
}

void moved(const httplib::Request&, httplib::Response& response) {
    response.set_redirect("/image.vfw");
    response.set_content("elsewhere", TYPE);
}

void receive(const httplib::Request& request, httplib::Response&) {
    const std::lock_guard lock(sent_mutex);
    sent = request.get_header_value("Authorization") + "|" + request.body;
}

void show_received(const httplib::Request&, httplib::Response& response) {
    const std::lock_guard lock(sent_mutex);
    response.set_content(sent, TYPE);
}

int serve(httplib::Server& server, const char* folder) {
    server.set_mount_point("/", folder);
    server.set_keep_alive_max_count(1); // a body that is cut off ends now
    server.Get("/slow.vfw", slow);
    server.Get("/cut.vfw", cut_off);
    server.Get("/moved.vfw", moved);
    server.Put("/up/.*", receive);
    server.Get("/received", show_received);
    server.set_error_handler([](const httplib::Request&, httplib::Response& response) {
        response.set_content("no such file", TYPE);
    });
    const int port = server.bind_to_any_port("127.0.0.1");
    std::thread([&server] { server.listen_after_bind(); }).detach();
    return port;
}

using Key = std::unique_ptr<EVP_PKEY, decltype(&EVP_PKEY_free)>;
using Certificate = std::unique_ptr<X509, decltype(&X509_free)>;

// For a name that nobody asks for, and signed by nobody but itself.
Certificate certificate_of(EVP_PKEY* key) {
    Certificate certificate(X509_new(), X509_free);
    ASN1_INTEGER_set(X509_get_serialNumber(certificate.get()), 1);
    X509_gmtime_adj(X509_getm_notBefore(certificate.get()), 0);
    X509_gmtime_adj(X509_getm_notAfter(certificate.get()), 86400);
    X509_set_pubkey(certificate.get(), key);
    X509_NAME* name = X509_get_subject_name(certificate.get());
    X509_NAME_add_entry_by_txt(name, "CN", MBSTRING_ASC,
                               reinterpret_cast<const unsigned char*>("elsewhere.example"), -1, -1,
                               0);
    X509_set_issuer_name(certificate.get(), name);
    X509_sign(certificate.get(), key, EVP_sha256());
    return certificate;
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 2)
        return 2;
    const Key key(EVP_EC_gen("P-256"), EVP_PKEY_free);
    const Certificate certificate = certificate_of(key.get());
    httplib::Server plain;
    httplib::SSLServer secure(certificate.get(), key.get());
    const int plain_port = serve(plain, argv[1]);
    const int secure_port = serve(secure, argv[1]);
    std::printf("%d %d\n", plain_port, secure_port);
    std::fflush(stdout);
    while (std::getchar() != EOF) {
    }
    _exit(0);
}
