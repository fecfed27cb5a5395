#include "quorl-syncd/transfer/device/UnfinishedFile.h"

#include <utility>

namespace quorl::syncd {

namespace {

/// So that little is left to wait for at the end, and progress is not far ahead of the device.
constexpr std::uint64_t mostHeldBack = 16 << 20;

/// Less is better begun with others.
constexpr std::uint64_t worthBeginning = 1 << 20;

} // namespace

UnfinishedFile::UnfinishedFile(std::string name, std::unique_ptr<VolumeFile> file)
    : name_(std::move(name)), file_(std::move(file)) {}

void UnfinishedFile::write(std::span<const std::byte> bytes) {
    file_->write(bytes);
    heldBack_ += bytes.size();
    if (heldBack_ >= mostHeldBack) {
        file_->flush();
        heldBack_ = 0;
    }
}

void UnfinishedFile::complete(std::int64_t modified) {
    file_->setModified(modified);
    if (heldBack_ >= worthBeginning) {
        file_->flush();
    }
    file_.reset();
}

} // namespace quorl::syncd
