#include "runtime/plugins/SharedObjectFile.h"

#include <memory>

#include <fcntl.h>
#include <gelf.h>
#include <unistd.h>

namespace quorl {

namespace {

class FileDescriptor {
  public:
    explicit FileDescriptor(const std::filesystem::path& file)
        : descriptor_(::open(file.c_str(), O_RDONLY | O_CLOEXEC)) {}

    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;

    ~FileDescriptor() {
        if (descriptor_ >= 0) {
            ::close(descriptor_);
        }
    }

    [[nodiscard]] int get() const { return descriptor_; }

  private:
    int descriptor_;
};

using ElfReference = std::unique_ptr<Elf, decltype(&elf_end)>;

ElfReference readElf(const FileDescriptor& file) {
    elf_version(EV_CURRENT);
    return {elf_begin(file.get(), ELF_C_READ, nullptr), &elf_end};
}

/// Whether an object file is for the kind of machine that this process runs on.
bool isForThisMachine(Elf* elf) {
    const FileDescriptor program("/proc/self/exe");
    const ElfReference own = readElf(program);
    GElf_Ehdr header{};
    GElf_Ehdr ownHeader{};
    return own && gelf_getehdr(own.get(), &ownHeader) && gelf_getehdr(elf, &header) &&
           gelf_getclass(elf) == gelf_getclass(own.get()) &&
           header.e_machine == ownHeader.e_machine;
}

bool segmentsAreComplete(Elf* elf, std::uint64_t fileSize) {
    std::size_t count = 0;
    if (elf_getphdrnum(elf, &count) != 0 || count == 0) {
        return false;
    }
    for (std::size_t index = 0; index < count; ++index) {
        GElf_Phdr segment{};
        if (gelf_getphdr(elf, static_cast<int>(index), &segment) == nullptr ||
            segment.p_offset > fileSize || segment.p_filesz > fileSize - segment.p_offset) {
            return false;
        }
    }
    return true;
}

} // namespace

std::optional<std::string> problemOfSharedObject(const std::filesystem::path& file) {
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error)) {
        return "this file is missing; install the plug-in again";
    }
    const auto size = std::filesystem::file_size(file, error);
    const FileDescriptor descriptor(file);
    if (error || descriptor.get() < 0) {
        return "this file cannot be read; check its permissions";
    }
    const ElfReference elf = readElf(descriptor);
    GElf_Ehdr header{};
    if (!elf || elf_kind(elf.get()) != ELF_K_ELF || gelf_getehdr(elf.get(), &header) == nullptr ||
        header.e_type != ET_DYN) {
        return "this file is damaged: it is not a shared object; install the plug-in again";
    }
    if (!isForThisMachine(elf.get())) {
        return "this file was built for another kind of machine; install the plug-in for this one";
    }
    const std::uint64_t sectionsEnd =
        header.e_shoff + std::uint64_t{header.e_shentsize} * header.e_shnum;
    if (sectionsEnd > size || !segmentsAreComplete(elf.get(), size)) {
        return "this file is damaged: its end is missing; install the plug-in again";
    }
    return std::nullopt;
}

} // namespace quorl
