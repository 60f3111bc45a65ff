// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Many clients of the service at once, each a process of its own as on a phone. They begin when all
// have found the service. See usage().

#include <android/log.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <iostream>
#include <iterator>
#include <sstream>
#include <string>
#include <vector>

#include "client/Commands.h"
#include "client/base/Json.h"

namespace {

using ::android::sp;
using namespace ::vendor::korvan::bex::wifi::client;

constexpr int kWrongUsage = 2;

int usage() {
    fprintf(stderr,
            "usage: wifi-load CLIENTS <CALLS: makes the calls, one a line (METHOD ARGUMENT...), by "
            "as many client processes in turn; prints [LINE,ANSWER] or [LINE,null,ERROR] of "
            "each\n");
    return kWrongUsage;
}

bool readCalls(std::vector<Request>* calls) {
    for (std::string line; std::getline(std::cin, line);) {
        std::istringstream stream(line);
        const std::vector<std::string> words{std::istream_iterator<std::string>(stream), {}};
        Request call;
        std::string problem;
        if (!readRequest(words, &call, &problem)) {
            fprintf(stderr, "wifi-load: line %zu: %s\n", calls->size(), problem.c_str());
            return false;
        }
        calls->push_back(call);
    }
    return true;
}

// In one write, which the kernel does not mix with those of the other clients.
bool report(size_t line, const Answer& answer) {
    JsonArray fields;
    fields.add(std::to_string(line)).add(answer.delivered ? jsonString(answer.text) : "null");
    if (!answer.delivered) fields.add(jsonString(answer.transportError));
    const std::string text = fields.str() + "\n";
    return write(STDOUT_FILENO, text.data(), text.size()) == static_cast<ssize_t>(text.size());
}

/** The life of client `turn` of `clients`: its calls are every `clients`th line. */
int runClient(const std::vector<Request>& calls, size_t turn, size_t clients, int ready, int go) {
    sp<IWifiService> service = IWifiService::getService();
    if (service == nullptr) {
        fprintf(stderr, "wifi-load: no service\n");
        return 1;
    }
    char nothing = 0;
    if (write(ready, &nothing, 1) != 1) return 1;
    close(ready);
    if (read(go, &nothing, 1) != 0) return 1;
    for (size_t line = turn; line < calls.size(); line += clients) {
        const Answer answer = calls[line].command->call(*service, calls[line].values);
        if (!report(line, answer)) return 1;
        // A proxy never changes over to a service that is started anew.
        if (!answer.delivered) service = IWifiService::getService();
    }
    return 0;
}

/** Returns when every client has told that it is ready, or has ended. */
void awaitReady(int ready, size_t clients) {
    std::string told(clients, '\0');
    while (clients > 0) {
        const ssize_t count = read(ready, told.data(), clients);
        if (count <= 0) return;
        clients -= count;
    }
}

/** Whether every client made all of its calls. */
bool runClients(const std::vector<Request>& calls, size_t clients) {
    int ready[2];
    int go[2];
    if (pipe(ready) != 0 || pipe(go) != 0) return false;
    for (size_t turn = 0; turn < clients; ++turn) {
        const pid_t client = fork();
        if (client < 0) {
            perror("wifi-load: fork");
            return false;
        }
        if (client == 0) {
            close(ready[0]);
            close(go[1]);
            _exit(runClient(calls, turn, clients, ready[1], go[0]));
        }
    }
    close(ready[1]);
    awaitReady(ready[0], clients);
    close(go[1]);
    bool well = true;
    for (int status = 0; wait(&status) > 0;) well = well && status == 0;
    return well;
}

} // namespace

int main(int argc, char** argv) {
    const int clients = argc == 2 ? atoi(argv[1]) : 0;
    if (clients < 1) return usage();
    std::vector<Request> calls;
    if (!readCalls(&calls)) return kWrongUsage;
    __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
    return runClients(calls, clients) ? 0 : 1;
}
