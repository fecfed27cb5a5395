#include "quorl-syncd/transfer/device/Device.h"

#include <algorithm>
#include <span>
#include <system_error>
#include <utility>

namespace quorl::syncd {

namespace {

using Directory = Volume::Directory;

// With a number of three digits between them, a name that FAT has no second name for.
constexpr std::string_view unfinishedBeginning = "QUORL";
constexpr std::string_view unfinishedEnding = ".TMP";

std::string unfinishedName(int number) {
    constexpr std::size_t digits = 3;
    auto text = std::to_string(number);
    text.insert(0, digits - std::min(digits, text.size()), '0');
    return std::string(unfinishedBeginning).append(text).append(unfinishedEnding);
}

char upperCase(char letter) {
    return letter >= 'a' && letter <= 'z' ? static_cast<char>(letter - 'a' + 'A') : letter;
}

std::string readToEnd(std::unique_ptr<base::Reader> reader) {
    constexpr std::size_t pieceSize = 65536;
    std::string text;
    const auto memory = std::make_unique_for_overwrite<char[]>(pieceSize);
    const std::span piece(memory.get(), pieceSize);
    while (const auto count = reader->read(std::as_writable_bytes(piece))) {
        text.append(piece.data(), count);
    }
    return text;
}

/// While another failure is under way, which says more.
template <class Act>
void tryTo(Act act) {
    try {
        act();
    } catch (const std::system_error&) {
        return;
    }
}

} // namespace

Device::Device(std::unique_ptr<Volume> volume) : volume_(std::move(volume)) { makeDirectories(); }

void Device::makeDirectories() {
    std::vector<Directory> made;
    if (volume_->makeDirectory(Directory::Music)) {
        made.push_back(Directory::Music);
    }
    if (makeOwn()) {
        made.push_back(Directory::Own);
    }
    if (!made.empty()) {
        syncTop(made);
    }
}

/// One that is empty was perhaps never made durable, and could not be removed then.
bool Device::makeOwn() {
    if (volume_->makeDirectory(Directory::Own)) {
        return true;
    }
    if (!volume_->names(Directory::Own).empty()) {
        return false;
    }
    volume_->removeDirectory(Directory::Own);
    return volume_->makeDirectory(Directory::Own);
}

void Device::syncTop(const std::vector<Directory>& made) {
    try {
        volume_->syncDirectory(Directory::Top);
    } catch (const std::system_error&) {
        // The next sync would take them for durable, as the system does.
        std::ranges::for_each(made, [this](Directory directory) {
            tryTo([&] { volume_->removeDirectory(directory); });
        });
        throw;
    }
}

/// Null where there is none.
std::unique_ptr<base::Reader> Device::openOwn(const std::string& name) {
    const auto names = volume_->names(Directory::Own);
    if (std::ranges::find(names, name) == names.end()) {
        return nullptr;
    }
    const auto file = volume_->find(Directory::Own, name);
    wearable::requireReadable(file.has_value(), file ? file->size : 0);
    return volume_->open(Directory::Own, name);
}

wearable::Manifest Device::loadManifest() {
    auto stored = wearable::newestManifest([this](const char* name) { return openOwn(name); });
    generation_ = stored.number;
    nextFile_ = stored.next;
    return std::move(stored.manifest);
}

/// Of what an earlier sync has left there, the name may be lost, though the system does not know.
/// So the file is made anew, and its name durable while nobody believes what is in it.
std::unique_ptr<VolumeFile> Device::openGeneration(std::size_t index) {
    const std::string name = wearable::generationFiles.at(index);
    if (isOurs_.at(index)) {
        return volume_->overwrite(Directory::Own, name);
    }
    removeIfThere(Directory::Own, name);
    auto file = volume_->create(Directory::Own, name);
    file->sync();
    volume_->syncDirectory(Directory::Own);
    isOurs_.at(index) = true;
    return file;
}

void Device::writeGeneration(std::size_t index, const wearable::Manifest& manifest) {
    const std::string name = wearable::generationFiles.at(index);
    try {
        const auto file = openGeneration(index);
        const auto old = volume_->find(Directory::Own, name).value_or(base::FileState());
        wearable::writeGeneration(generation_ + 1, manifest, old.size, [&](std::string_view piece) {
            file->write(std::as_bytes(std::span(piece)));
        });
        file->sync();
        volume_->syncDirectory(Directory::Own);
    } catch (const std::system_error&) {
        // What could not be made durable must not be taken for it by the next sync either.
        isUnsure_ = true;
        isOurs_.at(index) = false;
        tryTo([&] { removeIfThere(Directory::Own, name); });
        throw;
    }
}

/// Who wrote it was perhaps killed before it was durable. Byte for byte over what is there, so that
/// it is as it was whatever becomes of that; its name was durable before.
void Device::writeNewestAgain() {
    const std::string name = wearable::generationFiles.at(1 - nextFile_);
    if (auto newest = openOwn(name)) {
        const auto text = readToEnd(std::move(newest));
        const auto file = volume_->overwrite(Directory::Own, name);
        file->write(std::as_bytes(std::span(text)));
        file->sync();
    }
}

void Device::saveManifest(const wearable::Manifest& manifest) {
    if (!isPastDurable_) {
        settle();
    }
    writeGeneration(nextFile_, manifest);
    nextFile_ = 1 - nextFile_;
    ++generation_;
    if (generation_ == wearable::generationFiles.size()) {
        removeIfThere(Directory::Own, wearable::formerManifestFile);
    }
}

std::vector<std::string> Device::musicNames() { return volume_->names(Directory::Music); }

std::optional<base::FileState> Device::find(const std::string& name) {
    return volume_->find(Directory::Music, name);
}

std::unique_ptr<base::Reader> Device::openMusic(const std::string& name) {
    return volume_->open(Directory::Music, name);
}

void Device::removeIfThere(Directory directory, const std::string& name) {
    try {
        volume_->remove(directory, name);
    } catch (const std::system_error& error) {
        if (error.code() != std::errc::no_such_file_or_directory) {
            throw;
        }
    }
}

void Device::removeMusic(const std::string& name) {
    removed_.insert(name);
    removeIfThere(Directory::Music, name);
}

/// The system may believe that a name is gone for good that is not. Where one comes and goes again,
/// it writes that it is gone.
void Device::removeOnceMore(const std::string& name) {
    try {
        static_cast<void>(volume_->create(Directory::Music, name));
    } catch (const std::system_error& error) {
        if (error.code() == std::errc::file_exists) {
            return; // it is somebody else's by now
        }
        throw;
    }
    volume_->remove(Directory::Music, name);
}

bool Device::isUnfinished(std::string_view name) {
    std::string upper(name);
    std::ranges::transform(upper, upper.begin(), upperCase);
    if (!upper.starts_with(unfinishedBeginning) || !upper.ends_with(unfinishedEnding)) {
        return false;
    }
    const auto size = upper.size() - unfinishedBeginning.size() - unfinishedEnding.size();
    const auto digits = upper.substr(unfinishedBeginning.size(), size);
    return !digits.empty() && digits.find_first_not_of("0123456789") == std::string::npos;
}

UnfinishedFile Device::createUnfinished() {
    for (;;) {
        auto name = unfinishedName(number_++);
        try {
            auto file = volume_->create(Directory::Music, name);
            unsettled_.insert(name);
            return {std::move(name), std::move(file)};
        } catch (const std::system_error& error) {
            if (error.code() != std::errc::file_exists) {
                throw;
            }
        }
    }
}

bool Device::finish(const UnfinishedFile& file, const std::string& name) {
    try {
        volume_->rename(Directory::Music, file.name(), name);
    } catch (const std::system_error& error) {
        if (error.code() != std::errc::file_exists) {
            throw;
        }
        return false;
    }
    unsettled_.erase(file.name());
    removed_.insert(file.name());
    unsettled_.insert(name);
    removed_.erase(name);
    return true;
}

void Device::mayBeUnsettled(const std::vector<std::string>& given,
                            const std::vector<std::string>& taken) {
    unsettled_.insert(given.begin(), given.end());
    removed_.insert(taken.begin(), taken.end());
}

void Device::settle() {
    try {
        volume_->sync();
        volume_->syncDirectory(Directory::Music);
    } catch (const std::system_error&) {
        isUnsure_ = true;
        isPastLost_ = isPastLost_ || !isPastDurable_;
        throw;
    }
    isPastDurable_ = !isPastLost_;
    removed_.clear();
    std::erase_if(unsettled_, [](const std::string& name) { return !isUnfinished(name); });
    number_ = unsettled_.empty() ? 1 : number_;
}

void Device::discard(const UnfinishedFile& file) {
    removeMusic(file.name());
    unsettled_.erase(file.name());
}

void Device::discardUnsettled() {
    const auto removed = removed_;
    for (; !unsettled_.empty(); unsettled_.erase(unsettled_.begin())) {
        removeMusic(*unsettled_.begin());
    }
    if (isUnsure_) {
        std::ranges::for_each(removed, [this](const auto& name) { removeOnceMore(name); });
        settle();
        if (!isPastDurable_) {
            writeNewestAgain();
            isPastDurable_ = true;
        }
        isUnsure_ = false;
    }
}

} // namespace quorl::syncd
