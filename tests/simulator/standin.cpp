// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Stands in for the service and its client where only the phone itself is under test.
//
//   (no argument)  listens on a socket in /dev/socket/hidl; runs each line that it receives as a
//                  shell command and answers with the peer's user, "same" or "other", a blank, and
//                  what the command prints
//   LINE           sends the line there and prints the answer

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <string>

namespace {

std::string receive(int fd) {
    std::string text;
    char buffer[256];
    for (ssize_t n; (n = read(fd, buffer, sizeof buffer)) > 0;) text.append(buffer, n);
    return text;
}

void send(int fd, const std::string& text) {
    if (write(fd, text.data(), text.size()) != static_cast<ssize_t>(text.size())) perror("write");
    shutdown(fd, SHUT_WR);
}

int serve(int listener) {
    fprintf(stderr, "standin: serving\n");
    for (;;) {
        const int peer = accept(listener, nullptr, nullptr);
        ucred user{};
        socklen_t size = sizeof user;
        getsockopt(peer, SOL_SOCKET, SO_PEERCRED, &user, &size);
        const std::string line = receive(peer);
        FILE* shell = popen(line.c_str(), "r");
        const std::string output = receive(fileno(shell));
        pclose(shell);
        send(peer, (user.uid == geteuid() ? "same " : "other ") + output);
        close(peer);
    }
}

} // namespace

int main(int argc, char** argv) {
    constexpr char kPath[] = "/dev/socket/hidl/standin@1.0::IStandIn.default";
    const int fd = socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (argc == 1) {
        // Bound under a hidden name until it listens: what the launcher sees can be connected to.
        sockaddr_un hidden{AF_UNIX, "/dev/socket/hidl/.standin"};
        if (bind(fd, reinterpret_cast<sockaddr*>(&hidden), sizeof hidden) != 0 ||
            listen(fd, 5) != 0 || rename(hidden.sun_path, kPath) != 0) {
            perror("standin");
            return 1;
        }
        return serve(fd);
    }
    sockaddr_un address{AF_UNIX, {}};
    memcpy(address.sun_path, kPath, sizeof kPath);
    if (connect(fd, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0) {
        perror("standin");
        return 1;
    }
    send(fd, argv[1]);
    fputs(receive(fd).c_str(), stdout);
    return 0;
}
