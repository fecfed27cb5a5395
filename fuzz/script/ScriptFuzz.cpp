// Plays whatever comes as a script, line by line. Every reply is a line of valid JSON.

#include <cstdlib>

#include "quorl-script/Interpreter.h"
#include "quorl-script/TraceRecorder.h"

namespace {

using namespace quorl;

/// The plug-in's own objects last as long as the process, so one host serves all scripts.
class Player {
  public:
    Player() {
        Host::install(host_);
        plugin_.emplace(Plugin::load({PLUGINS}));
        interpreter_.emplace(*host_, trace_, *plugin_);
    }

    void play(std::string_view script) {
        while (!script.empty()) {
            const auto length = std::min(script.find('\n'), script.size());
            check(interpreter_->reply(script.substr(0, length)));
            script.remove_prefix(std::min(length + 1, script.size()));
        }
        for (const char* command :
             {R"({"do":"release"})", R"({"do":"usage","reply":null})",
              R"({"do":"library","playlists":[],"media":[]})", R"({"do":"sessions","list":[]})",
              R"({"do":"trace"})", R"({"do":"clock","tick":0})"}) {
            check(interpreter_->reply(command));
        }
    }

  private:
    static void check(const std::string& reply) {
        if (!nlohmann::json::accept(reply) || reply.find('\n') != std::string::npos) {
            std::abort();
        }
    }

    std::shared_ptr<Trace> trace_ = std::make_shared<Trace>();
    std::shared_ptr<HostDouble> host_ =
        std::make_shared<HostDouble>(std::make_shared<TraceRecorder>(trace_));
    std::optional<Plugin> plugin_;
    std::optional<Interpreter> interpreter_;
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static auto* const player = new Player;
    player->play({reinterpret_cast<const char*>(data), size});
    return 0;
}
