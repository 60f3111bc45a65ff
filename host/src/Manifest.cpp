// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Manifest.h"

#include <glob.h>
#include <log/log.h>
#include <tinyxml2.h>

#include <cstdlib>
#include <regex>
#include <vector>

#include "host/src/HostRoot.h"

namespace android::hardware::host {
namespace {

using tinyxml2::XMLElement;

/** A fully qualified name in its parts. */
struct Wanted {
    std::string package;
    int major;
    int minor;
    std::string interface;
    std::string instance;
};

bool covers(const std::string& version, const Wanted& wanted) {
    static const std::regex kVersion(R"((\d{1,5})\.(\d{1,5})(?:-(\d{1,5}))?)");
    std::smatch part;
    if (!std::regex_match(version, part, kVersion)) return false;
    const std::string newest = part[3].matched ? part[3].str() : part[2].str();
    return std::stoi(part[1]) == wanted.major && std::stoi(newest) >= wanted.minor;
}

std::string textOf(const XMLElement* element) {
    const char* text = element == nullptr ? nullptr : element->GetText();
    return text != nullptr ? text : "";
}

std::vector<const XMLElement*> children(const XMLElement* element, const char* name) {
    std::vector<const XMLElement*> found;
    for (auto* child = element->FirstChildElement(name); child != nullptr;
         child = child->NextSiblingElement(name)) {
        found.push_back(child);
    }
    return found;
}

/** "@1.0::IWifiService/default" */
bool namesInstance(const std::string& fqname, const Wanted& wanted) {
    const size_t colons = fqname.find("::");
    if (colons == std::string::npos || fqname[0] != '@') return false;
    return covers(fqname.substr(1, colons - 1), wanted) &&
           fqname.substr(colons + 2) == wanted.interface + "/" + wanted.instance;
}

bool declares(const XMLElement* hal, const Wanted& wanted) {
    const char* format = hal->Attribute("format");
    if (format != nullptr && std::string(format) != "hidl") return false;
    if (textOf(hal->FirstChildElement("name")) != wanted.package) return false;
    for (auto* fqname : children(hal, "fqname")) {
        if (namesInstance(textOf(fqname), wanted)) return true;
    }
    bool versionFits = false;
    for (auto* version : children(hal, "version")) {
        versionFits = versionFits || covers(textOf(version), wanted);
    }
    if (!versionFits) return false;
    for (auto* interface : children(hal, "interface")) {
        if (textOf(interface->FirstChildElement("name")) != wanted.interface) continue;
        for (auto* instance : children(interface, "instance")) {
            if (textOf(instance) == wanted.instance) return true;
        }
    }
    return false;
}

bool fileDeclares(const char* path, const Wanted& wanted) {
    tinyxml2::XMLDocument document;
    const tinyxml2::XMLError error = document.LoadFile(path);
    if (error == tinyxml2::XML_ERROR_FILE_NOT_FOUND) return false;
    const XMLElement* manifest = document.FirstChildElement("manifest");
    if (error != tinyxml2::XML_SUCCESS || manifest == nullptr) {
        ALOGE("%s is not a manifest and is ignored", path);
        return false;
    }
    for (auto* hal : children(manifest, "hal")) {
        if (declares(hal, wanted)) return true;
    }
    return false;
}

} // namespace

bool isDeclaredInManifest(const std::string& descriptor, const std::string& instance) {
    static const std::regex kDescriptor(R"(([^@]+)@(\d{1,5})\.(\d{1,5})::(\w+))");
    std::smatch part;
    if (!std::regex_match(descriptor, part, kDescriptor)) return false;
    const Wanted wanted = {part[1], std::stoi(part[2]), std::stoi(part[3]), part[4], instance};

    const std::string folder = hostRoot() + "/vendor/etc/vintf/";
    if (fileDeclares((folder + "manifest.xml").c_str(), wanted)) return true;
    glob_t fragments = {};
    bool found = false;
    if (glob((folder + "manifest/*.xml").c_str(), 0, nullptr, &fragments) == 0) {
        for (size_t i = 0; i < fragments.gl_pathc && !found; ++i) {
            found = fileDeclares(fragments.gl_pathv[i], wanted);
        }
    }
    globfree(&fragments);
    return found;
}

} // namespace android::hardware::host
