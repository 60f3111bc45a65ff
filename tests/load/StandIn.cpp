// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Stands in for every tool of a phone under load: its answer depends on its arguments alone, so
// that an answer that reaches the wrong client is told from the right one.
//
// The number of a command line is what follows "-a", "essid" or "setMonChan"; of one that ends a
// test ("-t 0"), what follows "-I". An odd number fails. What ends a test prints a count that no
// other run prints: where its line ends in the journal.
//
// The journal has a line for each run: the least slot that was free, and the command line. A slot
// is a file that is locked from before the line is written until the process has ended, thus until
// the service can see the end. So no slot above N is taken while no more than N tools run at once.

#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/file.h>
#include <unistd.h>

#include <string>

namespace {

constexpr char kFolder[] = "/data/local/tmp/";

/** Never closed: the lock lasts as long as the process. */
int takeSlot() {
    for (int slot = 1;; ++slot) {
        const std::string path = kFolder + std::string("slot.") + std::to_string(slot);
        const int file = open(path.c_str(), O_RDWR | O_CREAT, 0600);
        if (file < 0) exit(126);
        if (flock(file, LOCK_EX | LOCK_NB) == 0) return slot;
        close(file);
    }
}

/** Where the line ends in the journal. */
long note(const std::string& line) {
    const int journal =
            open((std::string(kFolder) + "journal").c_str(), O_WRONLY | O_CREAT | O_APPEND, 0600);
    if (journal < 0 || write(journal, line.data(), line.size()) < 0) exit(126);
    return lseek(journal, 0, SEEK_CUR);
}

} // namespace

int main(int argc, char** argv) {
    const char* slash = strrchr(argv[0], '/');
    const std::string tool = slash == nullptr ? argv[0] : slash + 1;
    std::string line = std::to_string(takeSlot()) + ' ' + tool;
    int number = 0;
    int radio = 0;
    bool ends = false;
    for (int i = 1; i < argc; ++i) {
        const std::string word = argv[i];
        line += ' ' + word;
        if (i + 1 == argc) break;
        const int value = atoi(argv[i + 1]);
        if (word == "-a" || word == "essid" || word == "setMonChan") number = value;
        if (word == "-I") radio = value;
        if (word == "-t" && value == 0) ends = true;
    }
    const long position = note(line + '\n');
    if (tool == "cat") puts("5"); // the driver's mode
    if (ends) printf("goodPackets = %ld\n", position);
    return (ends ? radio : number) % 2;
}
