#pragma once

#include "platform/files/FileManager.h"
#include "platform/launch/ApplicationDatabase.h"
#include "platform/launch/MimeAppsList.h"

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace platform {

/// One place of the search: a configuration folder, or a folder of applications with its lists.
struct ApplicationLevel {
    /// Those of the running desktop's names; they only choose defaults.
    std::vector<MimeAppsList> desktopLists;
    MimeAppsList list;
    std::map<std::string, std::shared_ptr<const DesktopEntry>> entries; // by identifier
};

/// A file that belongs to the places, and what tells whether it changed.
struct ApplicationFile {
    std::string path;
    /// The name below its applications folder without ".desktop"; "" for a list of associations.
    std::string id;
    std::size_t level = 0;
    /// Which list of the level it is: those of the desktops first, then the plain one.
    std::size_t list = 0;
    Date modified;
    Date changed;
    std::uint64_t size = 0;
    FileIdentity identity;

    bool operator==(const ApplicationFile&) const = default;
};

/// All files of the places as they are now; reads folders and dates only.
std::vector<ApplicationFile> applicationFiles(const ApplicationPlaces& places);
/// Reads them. What cannot be read, or is no application, counts as absent.
std::vector<ApplicationLevel> readLevels(const ApplicationPlaces& places,
                                         const std::vector<ApplicationFile>& files);

} // namespace platform
