// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "benchmarks/PingPong.h"

namespace vendor::korvan::bex::wifi::benchmarks {

/**
 * A file tree for the service, in which it finds the properties of a phone and puts its socket, and
 * its clients find both. Only calls that run no command line may be made: this is no phone.
 */
class ServiceTree {
  public:
    /** Makes the tree, and makes it the root of this process and its children. */
    ServiceTree();
    ~ServiceTree();

    /** Starts the service's program; IWifiService::getService() waits until it has registered. */
    static Child startService();

  private:
    std::string mRoot;
};

/** Starts the floor of the service's program, which answers at its end of a socket. */
Child startEmptyProgram(int socket);

} // namespace vendor::korvan::bex::wifi::benchmarks
