// A plug-in of qemu's user emulation: counts the instructions that a program executes, and writes
// the number to qemu's log when the program ends.

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdio>

// What qemu 7.2 has for its plug-ins. No package brings the header.
extern "C" {

struct qemu_plugin_tb; // a piece of code without jumps, translated as a whole

void qemu_plugin_register_vcpu_tb_trans_cb(std::uint64_t plugin,
                                           void (*call)(std::uint64_t, qemu_plugin_tb*));
void qemu_plugin_register_vcpu_tb_exec_inline(qemu_plugin_tb* piece, int operation, void* number,
                                              std::uint64_t value);
void qemu_plugin_register_atexit_cb(std::uint64_t plugin, void (*call)(std::uint64_t, void*),
                                    void* context);
std::size_t qemu_plugin_tb_n_insns(const qemu_plugin_tb* piece);
void qemu_plugin_outs(const char* text);

extern const int qemu_plugin_version;
int qemu_plugin_install(std::uint64_t plugin, const void* machine, int count, char** arguments);
}

namespace {

constexpr int add = 0; // of what may be done in line, the only one that qemu has

std::uint64_t executed = 0;

} // namespace

const int qemu_plugin_version = 1;

int qemu_plugin_install(std::uint64_t plugin, const void* /*machine*/, int /*count*/,
                        char** /*arguments*/) {
    qemu_plugin_register_vcpu_tb_trans_cb(plugin, [](std::uint64_t, qemu_plugin_tb* piece) {
        qemu_plugin_register_vcpu_tb_exec_inline(piece, add, &executed,
                                                 qemu_plugin_tb_n_insns(piece));
    });
    qemu_plugin_register_atexit_cb(
        plugin,
        [](std::uint64_t, void*) {
            std::array<char, 32> text{};
            (void)std::snprintf(text.data(), text.size(), "%ju\n", std::uintmax_t{executed});
            qemu_plugin_outs(text.data());
        },
        nullptr);
    return 0;
}
