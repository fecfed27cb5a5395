#include "runtime/plugins/SharedObjectFile.h"

#include <cstdio>
#include <memory>

#include <gelf.h>

namespace quorl {

namespace {

using FileReference = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;
using ElfReference = std::unique_ptr<Elf, int (*)(Elf*)>;

FileReference openFile(const std::filesystem::path& file) {
    return {std::fopen(file.c_str(), "rbe"), &std::fclose};
}

/// `file` stays open as long as what is read of it.
ElfReference readElf(std::FILE& file) {
    elf_version(EV_CURRENT);
    return {elf_begin(fileno(&file), ELF_C_READ, nullptr), &elf_end};
}

/// Whether an object file is for the kind of machine that this process runs on.
bool isForThisMachine(Elf* elf) {
    const FileReference program = openFile("/proc/self/exe");
    if (!program) {
        return false;
    }
    const ElfReference own = readElf(*program);
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
    const FileReference opened = openFile(file);
    if (error || !opened) {
        return "this file cannot be read; check its permissions";
    }
    const ElfReference elf = readElf(*opened);
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
