// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Manifest.h"

#include <glob.h>
#include <log/log.h>
#include <tinyxml2.h>

#include <cstdlib>
#include <optional>
#include <regex>
#include <set>
#include <vector>

#include "host/src/HostRoot.h"
#include "host/src/RegularFile.h"

namespace android::hardware::host {
namespace {

using tinyxml2::XMLElement;

using Instances = std::set<std::string>;

/** A fully qualified name in its parts. */
struct Wanted {
    std::string package;
    int major;
    int minor;
    std::string interface;
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

/** Adds the instance of "@1.0::IWifiService/default". */
void addFqname(const std::string& fqname, const Wanted& wanted, Instances* found) {
    const size_t colons = fqname.find("::");
    const size_t slash = fqname.find('/');
    if (colons == std::string::npos || slash == std::string::npos || fqname[0] != '@') return;
    // No version has a slash, so from here on the slash comes after the colons.
    if (!covers(fqname.substr(1, colons - 1), wanted)) return;
    if (fqname.substr(colons + 2, slash - colons - 2) != wanted.interface) return;
    found->insert(fqname.substr(slash + 1));
}

void addHal(const XMLElement* hal, const Wanted& wanted, Instances* found) {
    const char* format = hal->Attribute("format");
    if (format != nullptr && std::string(format) != "hidl") return;
    if (textOf(hal->FirstChildElement("name")) != wanted.package) return;
    for (auto* fqname : children(hal, "fqname")) addFqname(textOf(fqname), wanted, found);
    bool versionFits = false;
    for (auto* version : children(hal, "version")) {
        versionFits = versionFits || covers(textOf(version), wanted);
    }
    if (!versionFits) return;
    for (auto* interface : children(hal, "interface")) {
        if (textOf(interface->FirstChildElement("name")) != wanted.interface) continue;
        for (auto* instance : children(interface, "instance")) found->insert(textOf(instance));
    }
}

void addFile(const std::string& path, const Wanted& wanted, Instances* found) {
    const std::optional<std::string> content = readRegularFile(path);
    if (!content) return;
    tinyxml2::XMLDocument document;
    const tinyxml2::XMLError error = document.Parse(content->data(), content->size());
    const XMLElement* manifest = document.FirstChildElement("manifest");
    if (error != tinyxml2::XML_SUCCESS || manifest == nullptr) {
        ALOGE("%s is not a manifest and is ignored", path.c_str());
        return;
    }
    for (auto* hal : children(manifest, "hal")) addHal(hal, wanted, found);
}

} // namespace

std::set<std::string> instancesInManifest(const std::string& descriptor) {
    static const std::regex kDescriptor(R"(([^@]+)@(\d{1,5})\.(\d{1,5})::(\w+))");
    std::smatch part;
    if (!std::regex_match(descriptor, part, kDescriptor)) return {};
    const Wanted wanted = {part[1], std::stoi(part[2]), std::stoi(part[3]), part[4]};

    Instances found;
    const std::string folder = hostRoot() + "/vendor/etc/vintf/";
    addFile(folder + "manifest.xml", wanted, &found);
    glob_t fragments = {};
    if (glob((folder + "manifest/*.xml").c_str(), 0, nullptr, &fragments) == 0) {
        for (size_t i = 0; i < fragments.gl_pathc; ++i) {
            addFile(fragments.gl_pathv[i], wanted, &found);
        }
    }
    globfree(&fragments);
    found.erase(""); // an instance without a name is none
    return found;
}

bool isDeclaredInManifest(const std::string& descriptor, const std::string& instance) {
    return instancesInManifest(descriptor).count(instance) != 0;
}

} // namespace android::hardware::host
