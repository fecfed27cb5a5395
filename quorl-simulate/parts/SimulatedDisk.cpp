#include "quorl-simulate/parts/SimulatedDisk.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cerrno>
#include <set>
#include <system_error>
#include <utility>

namespace quorl::simulation {

namespace {

constexpr std::size_t sectorSize = 8;
constexpr std::int64_t oneSecond = 1'000'000'000;
constexpr char garbage = '\x5A';

[[noreturn]] void fail(int error, std::string_view what) {
    throw std::system_error(error, std::generic_category(), std::string(what));
}

char folded(char letter) {
    return static_cast<char>(std::toupper(static_cast<unsigned char>(letter)));
}

bool isSameFolded(std::string_view first, std::string_view second) {
    return std::ranges::equal(first, second, {}, folded, folded);
}

bool fitsShortName(std::string_view name) {
    const auto dot = name.rfind('.');
    const auto base = name.substr(0, dot);
    const auto ending = dot == std::string_view::npos ? std::string_view() : name.substr(dot + 1);
    return !base.empty() && base.size() <= 8 && ending.size() <= 3 &&
           name.find(' ') == std::string_view::npos && base.find('.') == std::string_view::npos;
}

/// What FAT calls a long name besides: "SOMEVE~1.MP3". All long names of a directory that begin
/// alike would be numbered; here the first is as good as any.
std::string shortName(std::string_view name) {
    const auto dot = name.rfind('.');
    std::string base;
    for (const char byte : name.substr(0, dot)) {
        if (byte != ' ' && byte != '.' && base.size() < 6) {
            base += byte;
        }
    }
    const auto ending = dot == std::string_view::npos ? std::string_view() : name.substr(dot, 4);
    return base + "~1" + std::string(ending);
}

bool isSameName(std::string_view stored, std::string_view asked) {
    const bool mayBeShort = asked.find('~') != std::string_view::npos;
    return isSameFolded(stored, asked) ||
           (mayBeShort && !fitsShortName(stored) && isSameFolded(shortName(stored), asked));
}

} // namespace

SimulatedDisk::SimulatedDisk(DiskRules rules, std::uint64_t capacity, std::uint64_t largestFile)
    : rules_(rules), capacity_(capacity), largestFile_(largestFile) {
    files_.push_back({.isDirectory = true, .now = {}, .durable = {}});
    entries_[top];
    durableEntries_[top];
}

void SimulatedDisk::begin(std::string_view operation, std::string_view name) const {
    if (before_) {
        before_(operation, name);
    }
}

void SimulatedDisk::beginWriting(std::string_view operation, std::string_view name) const {
    begin(operation, name);
    if (isReadOnly_) {
        fail(EROFS, name);
    }
}

std::uint64_t SimulatedDisk::available() const {
    std::uint64_t taken = spaceOfOthers_;
    for (const auto& [directory, entries] : entries_) {
        for (const auto& [name, entry] : entries) {
            taken += files_[entry.node].now.bytes.size();
        }
    }
    return taken < capacity_ ? capacity_ - taken : 0;
}

std::vector<std::string> SimulatedDisk::names(Node directory) const {
    std::vector<std::string> names;
    for (const auto& [name, entry] : entries_.at(directory)) {
        names.push_back(name);
    }
    return names;
}

SimulatedDisk::Entries::const_iterator SimulatedDisk::entry(Node directory,
                                                            std::string_view name) const {
    const Entries& entries = entries_.at(directory);
    const auto exact = entries.find(name);
    if (exact != entries.end() || rules_ == DiskRules::Posix) {
        return exact;
    }
    return std::ranges::find_if(entries,
                                [name](const auto& each) { return isSameName(each.first, name); });
}

SimulatedDisk::Entries::const_iterator SimulatedDisk::existing(Node directory,
                                                               std::string_view name) const {
    const auto found = entry(directory, name);
    if (found == entries_.at(directory).end()) {
        fail(ENOENT, name);
    }
    return found;
}

void SimulatedDisk::requireFree(Node directory, std::string_view name) const {
    if (entry(directory, name) != entries_.at(directory).end()) {
        fail(EEXIST, name);
    }
}

std::optional<SimulatedDisk::Node> SimulatedDisk::find(Node directory,
                                                       std::string_view name) const {
    const auto found = entry(directory, name);
    return found == entries_.at(directory).end() ? std::nullopt : std::optional(found->second.node);
}

std::optional<SimulatedDisk::Node> SimulatedDisk::findExactly(Node directory,
                                                              std::string_view name) const {
    const Entries& entries = entries_.at(directory);
    const auto found = entries.find(name);
    return found == entries.end() ? std::nullopt : std::optional(found->second.node);
}

SimulatedDisk::Status SimulatedDisk::status(Node node) const {
    const File& file = files_.at(node);
    return {file.now.bytes.size(), file.now.modified, file.isDirectory};
}

bool SimulatedDisk::isShared(Node directory, std::string_view name) const {
    const auto node = existing(directory, name)->second.node;
    std::ptrdiff_t count = 0;
    for (const auto& [each, entries] : entries_) {
        count += std::ranges::count_if(
            entries, [node](const auto& entry) { return entry.second.node == node; });
    }
    return count > 1;
}

bool SimulatedDisk::isDurable(Node directory, std::string_view name) const {
    const auto found = entry(directory, name);
    if (found == entries_.at(directory).end()) {
        return false;
    }
    const Entries& names = durableEntries_.at(directory);
    const auto durable = names.find(found->first);
    const File& file = files_.at(found->second.node);
    return durable != names.end() && durable->second.node == found->second.node &&
           durable->second.isRecorded && file.isWhole() &&
           std::ranges::none_of(changes_, [&](const Change& change) {
               return change.directory == directory && change.name == found->first;
           });
}

const std::string& SimulatedDisk::read(Node file) const {
    begin("read", {});
    return files_.at(file).now.bytes;
}

std::set<std::string> SimulatedDisk::possibleContents(Node directory, std::string_view name) const {
    std::set<std::string> contents;
    const auto add = [&](const Entry& entry) {
        const File& file = files_.at(entry.node);
        contents.insert(file.now.bytes);
        contents.insert(file.durable.bytes);
    };
    for (const auto* names : {&entries_.at(directory), &durableEntries_.at(directory)}) {
        if (const auto found = names->find(name); found != names->end()) {
            add(found->second);
        }
    }
    for (const Change& change : changes_) {
        if (change.directory == directory && change.name == name && change.entry) {
            add(*change.entry);
        }
    }
    return contents;
}

/// Sets a name, or takes it away, here and now.
void SimulatedDisk::note(Node directory, const std::string& name, std::optional<Entry> entry) {
    if (entry) {
        entries_[directory][name] = *entry;
    } else {
        entries_[directory].erase(name);
    }
    std::erase_if(changes_, [&](const Change& change) { // written again with this one
        return change.isLost && change.directory == directory && change.name == name;
    });
    changes_.push_back({directory, name, entry, step_});
    ++revision_;
}

/// The contents of a file, to be changed.
SimulatedDisk::Content& SimulatedDisk::change(Node file) {
    ++revision_;
    files_.at(file).isDirty = true;
    return files_[file].now;
}

SimulatedDisk::Node SimulatedDisk::add(Node directory, const std::string& name, bool isDirectory) {
    requireFree(directory, name);
    ++step_;
    const auto node = static_cast<Node>(files_.size());
    files_.push_back({.isDirectory = isDirectory, .now = {}, .durable = {}});
    note(directory, name, Entry{node, isDirectory || rules_ == DiskRules::Posix});
    return node;
}

SimulatedDisk::Node SimulatedDisk::makeDirectory(Node directory, const std::string& name) {
    beginWriting("mkdir", name);
    const Node node = add(directory, name, true);
    entries_[node];
    durableEntries_[node];
    return node;
}

SimulatedDisk::Node SimulatedDisk::create(Node directory, const std::string& name) {
    beginWriting("create", name);
    return add(directory, name, false);
}

void SimulatedDisk::append(Node file, std::string_view bytes) {
    write(file, files_.at(file).now.bytes.size(), bytes);
}

void SimulatedDisk::write(Node file, std::size_t offset, std::string_view bytes) {
    beginWriting("write", {});
    const std::size_t size = files_.at(file).now.bytes.size();
    const std::size_t end = std::max(size, offset + bytes.size());
    if (end > largestFile_) {
        fail(EFBIG, "write");
    }
    if (end - size > available()) {
        fail(ENOSPC, "write");
    }
    Content& content = change(file);
    content.bytes.replace(offset, bytes.size(), bytes);
    content.modified = kept(static_cast<std::int64_t>(revision_) * oneSecond / 2);
    files_[file].isLost = files_[file].isLost && offset > 0; // else it is there to be written again
}

/// A time as the disk keeps it.
std::int64_t SimulatedDisk::kept(std::int64_t nanoseconds) const {
    return rules_ == DiskRules::Fat ? nanoseconds - nanoseconds % (2 * oneSecond) : nanoseconds;
}

void SimulatedDisk::truncate(Node file) {
    beginWriting("truncate", {});
    change(file).bytes.clear();
    files_[file].isLost = false;
}

void SimulatedDisk::setModified(Node file, std::int64_t nanoseconds) {
    beginWriting("utimens", {});
    change(file).modified = kept(nanoseconds);
}

void SimulatedDisk::rename(Node directory, const std::string& name, Node newDirectory,
                           const std::string& newName) {
    beginWriting("rename", newName);
    const auto found = existing(directory, name);
    requireFree(newDirectory, newName);
    const Node node = found->second.node;
    const std::string stored = found->first;
    ++step_;
    note(directory, stored, std::nullopt);
    note(newDirectory, newName, Entry{node, rules_ == DiskRules::Posix});
}

void SimulatedDisk::remove(Node directory, const std::string& name) {
    beginWriting("unlink", name);
    const auto found = existing(directory, name);
    const Node node = found->second.node;
    const bool wasShared = isShared(directory, name);
    ++step_;
    note(directory, std::string(found->first), std::nullopt);
    if (wasShared) { // the clusters are somebody else's now
        std::ranges::fill(change(node).bytes, garbage);
        files_[node].durable.bytes = files_[node].now.bytes;
    }
}

void SimulatedDisk::bringToMedium(Node file) {
    if (files_[file].isDirty) {
        files_[file].durable = files_[file].now;
        files_[file].isDirty = false;
    }
}

/// The names of a file tell its size and place from now on, wherever they are durable already.
void SimulatedDisk::record(Node node) {
    for (auto& [directory, entries] : entries_) {
        for (auto& [name, entry] : entries) {
            if (entry.node == node) {
                recordName(directory, name, entry);
            }
        }
    }
}

/// Of all files that are durable now.
void SimulatedDisk::recordAll() {
    for (auto& [directory, entries] : entries_) {
        for (auto& [name, entry] : entries) {
            if (!files_[entry.node].isLost) {
                recordName(directory, name, entry);
            }
        }
    }
}

void SimulatedDisk::recordName(Node directory, const std::string& name, Entry& entry) {
    if (std::exchange(entry.isRecorded, true)) {
        return;
    }
    auto& durableNames = durableEntries_[directory];
    const auto durable = durableNames.find(name);
    if (durable != durableNames.end() && durable->second.node == entry.node) {
        durable->second.isRecorded = true;
    }
    for (Change& change : changes_) {
        if (change.directory == directory && change.name == name && change.entry &&
            change.entry->node == entry.node) {
            change.entry->isRecorded = true;
        }
    }
}

void SimulatedDisk::keep(const Change& change) {
    Entries& entries = durableEntries_[change.directory];
    if (change.entry) {
        entries.insert_or_assign(change.name, *change.entry);
    } else {
        entries.erase(change.name);
    }
}

/// Makes the chosen changes of names durable, in their order, and forgets them.
template <class Chosen>
void SimulatedDisk::keepNames(Chosen chosen) {
    std::erase_if(changes_, [&](const Change& change) {
        const bool isKept = !change.isLost && chosen(change);
        if (isKept) {
            keep(change);
        }
        return isKept;
    });
}

void SimulatedDisk::sync(Node node) {
    begin("fsync", {});
    ++revision_;
    const File& file = files_.at(node);
    if (!file.isDirectory) {
        if (!file.isLost) {
            bringToMedium(node);
            record(node);
        }
        return;
    }
    std::set<std::uint32_t> steps;
    for (const Change& change : changes_) {
        if (change.directory == node) {
            steps.insert(change.step);
        }
    }
    keepNames([&](const Change& change) {
        return change.directory == node ||
               (rules_ == DiskRules::Posix && steps.contains(change.step));
    });
}

void SimulatedDisk::syncAll() {
    begin("syncfs", {});
    ++revision_;
    for (Node node = 0; node < files_.size(); ++node) {
        if (!files_[node].isLost) {
            bringToMedium(node);
        }
    }
    recordAll();
    keepNames([](const Change&) { return true; });
}

void SimulatedDisk::failSync(Node node) {
    ++revision_;
    files_.at(node).isLost = !files_[node].isDirectory;
    for (Change& change : changes_) {
        change.isLost = change.isLost || change.directory == node;
    }
    fail(EIO, "fsync");
}

void SimulatedDisk::failSyncAll() {
    ++revision_;
    for (File& file : files_) {
        file.isLost = !file.isDirectory && (file.isLost || !file.isWhole());
    }
    for (const auto& [directory, entries] : entries_) {
        for (const auto& [name, entry] : entries) {
            files_[entry.node].isLost = files_[entry.node].isLost || !entry.isRecorded;
        }
    }
    for (Change& change : changes_) {
        change.isLost = true;
    }
    fail(EIO, "syncfs");
}

/// What is left of a file that was not durable: of its sizes and of each sector, old or new, or
/// nothing.
SimulatedDisk::Content SimulatedDisk::remains(const File& file, Random& random) {
    Content left;
    left.modified = random.onceIn(2) ? file.now.modified : file.durable.modified;
    const std::size_t was = file.durable.bytes.size();
    const std::size_t is = file.now.bytes.size();
    const std::size_t between =
        std::min(was, is) + random.indexBelow(std::max(was, is) - std::min(was, is) + 1);
    const std::size_t size = std::array{was, is, between}[random.indexBelow(3)];
    left.bytes.assign(size, '\0');
    for (std::size_t begin = 0; begin < size; begin += sectorSize) {
        const std::string* const drawn = std::array<const std::string*, 3>{
            &file.durable.bytes, &file.now.bytes, nullptr}[random.indexBelow(3)];
        // The same over the same changes nothing.
        const bool isSame =
            begin < std::min(was, is) &&
            file.durable.bytes.compare(begin, sectorSize, file.now.bytes, begin, sectorSize) == 0;
        const std::string* const source = isSame ? &file.now.bytes : drawn;
        for (std::size_t at = begin; at < std::min(begin + sectorSize, size); ++at) {
            if (source != nullptr && at < source->size()) {
                left.bytes[at] = (*source)[at];
            }
        }
    }
    return left;
}

void SimulatedDisk::chooseNames(Random& random) {
    // All of them, none, those up to a moment, or any.
    enum class Manner { All, None, UpToAMoment, Any };
    const auto manner = static_cast<Manner>(random.below(4));
    const std::uint64_t moment = changes_.empty() ? 0 : random.below(changes_.size() + 1);
    std::map<std::uint32_t, bool> kept; // by step
    std::uint64_t place = 0;
    keepNames([&](const Change& change) {
        const bool isChosen = manner == Manner::All ||
                              (manner == Manner::UpToAMoment && place < moment) ||
                              (manner == Manner::Any && random.onceIn(2));
        ++place;
        return rules_ == DiskRules::Fat ? isChosen
                                        : kept.try_emplace(change.step, isChosen).first->second;
    });
    changes_.clear();
}

/// A name that does not know its file yet has an empty one of its own, unless the system was quick.
void SimulatedDisk::chooseRecords(Random& random) {
    for (auto& [directory, entries] : durableEntries_) {
        for (auto& [name, entry] : entries) {
            if (!entry.isRecorded && random.onceIn(2)) {
                entry.node = static_cast<Node>(files_.size());
                files_.push_back({});
            }
            entry.isRecorded = true;
        }
    }
}

void SimulatedDisk::losePower(Random& random) {
    ++revision_;
    chooseNames(random);
    chooseRecords(random);
    for (File& file : files_) {
        if (!file.isWhole()) {
            file.now = remains(file, random);
            file.durable = file.now;
        }
        file.isDirty = file.isLost = false;
    }
    entries_ = durableEntries_;
}

} // namespace quorl::simulation
