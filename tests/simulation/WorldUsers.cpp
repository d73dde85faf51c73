#include "tests/simulation/World.h"

#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"
#include "tests/simulation/machine/Machine.h"

#include <algorithm>
#include <fcntl.h>
#include <unistd.h>

namespace simulation {

using namespace platform;

std::string World::freshContent() {
    std::string content = "content " + std::to_string(++lastContent_);
    content.append(luck_.below(40), '.');
    wanted_.insert(content);
    return content;
}

std::string World::somePath() {
    static const std::vector<std::string> names{"a", "b", "c", "d.txt"};
    std::string path = luck_.of(names);
    while (luck_.percent(35))
        path = luck_.of(names) + '/' + path;
    return path;
}

void World::release(const std::string& content) {
    wanted_.erase(content);
}

void World::act() {
    if (luck_.percent(15))
        fetchOne();
    else if (luck_.percent(50))
        actHere();
    else
        actThere();
    Machine::shared().time().creep(std::chrono::milliseconds(luck_.below(1500)));
}

void World::actMeanwhile() {
    if (luck_.percent(50))
        actHere();
    else
        actThere();
}

bool World::holdsPromise(const std::string& path) const {
    bool folder = false;
    if (!FileManager::exists(path, &folder) || !folder)
        return false;
    const auto entries = FileManager::entries(path);
    return !entries || std::any_of(entries->begin(), entries->end(), [&](const auto& entry) {
        return hasSidecarForm(entry.name) || holdsPromise(path + '/' + entry.name);
    });
}

namespace {

std::string contentAt(const std::string& path) {
    const Result<Bytes> bytes = FileManager::contents(Url::file(path), 1U << 20U);
    return bytes ? std::string(reinterpret_cast<const char*>(bytes->data()), bytes->size())
                 : std::string();
}

} // namespace

void World::writeHere(const std::string& path) {
    bool folder = false;
    const bool there = FileManager::exists(path, &folder);
    if (folder || FileManager::createDirectory(Url::file(folderOf(path), true), true))
        return;
    if (there)
        release(contentAt(path));
    tell("write here " + path);
    const std::string content = freshContent();
    if (luck_.percent(50)) {
        if (FileManager::writeAtomically(Url::file(path), content))
            release(content);
        return;
    }
    const int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    if (file < 0 || ::write(file, content.data(), content.size()) < 0)
        release(content);
    ::close(file);
}

void World::actHere() {
    if (!store_)
        return;
    const std::string path = layout_.root() + '/' + somePath();
    const std::string other = layout_.root() + '/' + somePath();
    switch (luck_.below(6)) {
    case 0:
    case 1:
    case 2:
        writeHere(path);
        break;
    case 3:
        if (!FileManager::moveItem(Url::file(path), Url::file(other)))
            tell("move here " + path + " to " + other);
        break;
    case 4:
        // What a promise stands for at this very moment only the engine knows.
        if (busyUsers_ && holdsPromise(path))
            break;
        if (FileManager::exists(path) && path != layout_.root() + "/Documents") {
            tell("delete here " + path);
            releaseTreeHere(path);
            const Failure ignored = FileManager::removeItem(Url::file(path));
        }
        break;
    default:
        if (!FileManager::createDirectory(Url::file(path, true), true))
            tell("make folder here " + path);
    }
    disk_->syncAll(); // what users did is on the disk; the rest is the engine's to see to
}

void World::releaseTreeHere(const std::string& path) {
    bool folder = false;
    FileManager::exists(path, &folder);
    if (!folder) {
        release(contentAt(path));
        return;
    }
    const auto entries = FileManager::entries(path);
    if (!entries)
        return;
    for (const DirectoryEntry& entry : *entries) {
        const std::string inner = path + '/' + entry.name;
        if (const auto mark = readMark(inner, store_->mark)) {
            // A promise: what the account had under it when somebody last looked.
            const std::string shown =
                path.substr(layout_.root().size() + 1) + '/' + promisedName(entry.name, *mark);
            if (const auto found = lastThere_.find(shown); found != lastThere_.end())
                release(found->second);
            else // it was moved since; whichever it is
                for (const auto& [unused, content] : lastThere_)
                    release(content);
        } else {
            releaseTreeHere(inner);
        }
    }
}

void World::actThere() {
    const std::string path = somePath();
    const std::string other = somePath();
    const FarItem* const item = far_->find(path);
    switch (luck_.below(6)) {
    case 0:
    case 1:
    case 2: {
        if (item && item->folder)
            break;
        for (std::size_t slash = path.find('/'); slash != std::string::npos;
             slash = path.find('/', slash + 1))
            far_->makeFolder(path.substr(0, slash), Actor::user);
        const std::string before = item ? item->content : std::string();
        const std::string content = freshContent();
        if (far_->write(path, content, Machine::shared().wall(), "", Actor::user) !=
            FarSide::Obstacle::none) {
            release(content);
            break;
        }
        release(before);
        tell("write there " + path);
        break;
    }
    case 3:
        if (far_->move(path, other, Actor::user) == FarSide::Obstacle::none)
            tell("move there " + path + " to " + other);
        break;
    case 4:
        if (item) {
            tell("delete there " + path);
            releaseTreeThere(path);
        }
        break;
    default:
        if (far_->makeFolder(path, Actor::user) == FarSide::Obstacle::none)
            tell("make folder there " + path);
    }
}

void World::releaseTreeThere(const std::string& path) {
    const FarItem* const item = far_->find(path);
    if (item->folder) {
        std::vector<std::string> names;
        for (const FarItem* child : far_->children(*item))
            names.push_back(child->name);
        for (const std::string& name : names)
            releaseTreeThere(path + '/' + name);
    } else {
        release(item->content);
    }
    far_->remove(path, Actor::user);
}

} // namespace simulation
