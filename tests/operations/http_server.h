// Starts the HTTP server of the tests for the length of a scope.
#ifndef TESTS_OPERATIONS_HTTP_SERVER_H
#define TESTS_OPERATIONS_HTTP_SERVER_H

#include <csignal>
#include <cstdio>
#include <dlfcn.h>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

class Http_Server {
public:
    explicit Http_Server(const std::string& folder) {
        keep_libraries();
        int input[2];
        int output[2];
        if (pipe2(input, O_CLOEXEC) != 0 || pipe2(output, O_CLOEXEC) != 0)
            return;
        m_process = fork();
        if (m_process == 0) {
            dup2(input[0], STDIN_FILENO);
            dup2(output[1], STDOUT_FILENO);
            execl(VLN_HTTP_SERVER, VLN_HTTP_SERVER, folder.c_str(), nullptr);
            _exit(127);
        }
        close(input[0]);
        close(output[1]);
        m_input = input[1];
        std::FILE* ports = fdopen(output[0], "r");
        int plain = 0;
        int secure = 0;
        if (std::fscanf(ports, "%d %d", &plain, &secure) != 2)
            ADD_FAILURE() << "the server does not start: " << VLN_HTTP_SERVER;
        std::fclose(ports);
        m_plain = "http://127.0.0.1:" + std::to_string(plain);
        m_secure = "https://127.0.0.1:" + std::to_string(secure);
    }
    ~Http_Server() {
        close(m_input);
        waitpid(m_process, nullptr, 0);
    }
    Http_Server(const Http_Server&) = delete;
    Http_Server& operator=(const Http_Server&) = delete;

    const std::string& plain() const { return m_plain; } // "http://127.0.0.1:PORT"
    const std::string& secure() const { return m_secure; }

private:
    // The libraries below libcurl keep memory for as long as the process lives. Where libcurl is
    // closed and unmapped after each use, the address sanitizer no longer finds who has it.
    static void keep_libraries() {
#ifdef __SANITIZE_ADDRESS__
        static void* const curl = dlopen("libcurl.so.4", RTLD_LAZY);
        EXPECT_TRUE(curl);
#endif
    }

    pid_t m_process = -1;
    int m_input = -1;
    std::string m_plain;
    std::string m_secure;
};

#endif // TESTS_OPERATIONS_HTTP_SERVER_H
