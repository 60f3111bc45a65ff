// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi {

/** How a family's driver is stored on a phone (chips/ModuleFiles.h). */
enum class DriverModules { none, oneOfSeveral, allOfAFolder };

/** A file of the driver that the commands read or write, or that the driver loads. */
struct DriverFile {
    const char* path;
    /** The module whose presence brings the file; empty for a file that is always there. */
    const char* module;
    /** Whether that module is sometimes not loaded, so that both may be missing without a fault. */
    bool comesAndGoes;
};

/** Chips that are driven in one way: how to recognise them, and what their phones must have. */
struct ChipFamily {
    /** Short and unique: "qca639x". Also the name of the simulated phone. */
    const char* name;
    /** The chip's vendor, exactly, and a part of the chip's name. An empty part is in every name.
     */
    const char* vendor;
    const char* partOfName;
    DriverModules modules;
    /** Tools that the command lines call as /vendor/bin/NAME. */
    std::vector<const char*> toolsByPath;
    /** Tools that the command lines call by their bare name, which the shell looks up. */
    std::vector<const char*> toolsByName;
    std::vector<DriverFile> files;
};

/** All families, in the order of recognition. */
const std::vector<ChipFamily>& chipFamilies();

/**
 * The family of a phone's chip: the first of chipFamilies() that fits. Upper and lower case differ.
 *
 * @param vendor The phone's property ro.hardware.wlan.vendor.
 * @param chip The phone's property ro.hardware.wlan.chip.
 * @return Null when the vendor is unknown.
 */
const ChipFamily* findChipFamily(const std::string& vendor, const std::string& chip);

} // namespace vendor::korvan::bex::wifi
