// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Manifest.h"

#include <glob.h>
#include <log/log.h>
#include <regex.h>
#include <tinyxml2.h>

#include <cstdlib>
#include <optional>
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

/**
 * The parts in parentheses of a text that fits an extended regular expression, see regex(7); empty
 * when it does not. The compiler needs seconds for std::regex.
 */
std::vector<std::string> partsOf(const std::string& text, const char* pattern) {
    std::vector<std::string> parts;
    regex_t expression;
    if (regcomp(&expression, pattern, REG_EXTENDED) != 0) return parts;
    std::vector<regmatch_t> matches(expression.re_nsub + 1);
    matches[0] = {0, static_cast<regoff_t>(text.size())}; // a NUL does not end it
    if (regexec(&expression, text.data(), matches.size(), matches.data(), REG_STARTEND) == 0) {
        for (size_t i = 1; i < matches.size(); ++i) {
            const auto [begin, end] = matches[i];
            parts.push_back(begin < 0 ? "" : text.substr(begin, end - begin));
        }
    }
    regfree(&expression);
    return parts;
}

bool covers(const std::string& version, const Wanted& wanted) {
    const auto part = partsOf(version, "^([0-9]{1,5})\\.([0-9]{1,5})(-([0-9]{1,5}))?$");
    if (part.empty()) return false;
    const std::string& newest = part[3].empty() ? part[1] : part[3];
    return std::stoi(part[0]) == wanted.major && std::stoi(newest) >= wanted.minor;
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
    const auto part = partsOf(descriptor, "^([^@]+)@([0-9]{1,5})\\.([0-9]{1,5})::([[:alnum:]_]+)$");
    if (part.empty()) return {};
    const Wanted wanted = {part[0], std::stoi(part[1]), std::stoi(part[2]), part[3]};

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
