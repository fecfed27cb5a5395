#include "tests/preferences/DesktopSession.h"

#include <csignal>
#include <stdexcept>

namespace quorl::preferences::testing {

namespace {

/// How the peer begins a line about what it was told.
constexpr std::string_view toldPrefix = "told ";

constexpr auto schemaID = "org.quorl.Velora.AssetSync";
constexpr std::string_view folder = "/org/quorl/velora/asset-sync/";

void throwOn(GError* failure) {
    const ErrorPointer error(failure);
    if (error) {
        throw std::runtime_error(error->message);
    }
}

std::vector<const char*> cStrings(const std::vector<std::string>& strings) {
    std::vector<const char*> result;
    result.reserve(strings.size() + 1);
    for (const auto& string : strings) {
        result.push_back(string.c_str());
    }
    result.push_back(nullptr);
    return result;
}

ObjectPointer<GSubprocess> spawn(const std::vector<std::string>& command, GSubprocessFlags flags,
                                 const Environment& environment) {
    const ObjectPointer<GSubprocessLauncher> launcher(g_subprocess_launcher_new(flags));
    for (const auto& [name, value] : environment) {
        g_subprocess_launcher_setenv(launcher.get(), name.c_str(), value.c_str(), TRUE);
    }
    GError* failure = nullptr;
    ObjectPointer<GSubprocess> process(
        g_subprocess_launcher_spawnv(launcher.get(), cStrings(command).data(), &failure));
    throwOn(failure);
    return process;
}

/// Calls a method of the session bus itself. Gives back null where the bus answers with an error.
VariantPointer callBus(const char* method, const std::string& argument) {
    GError* failure = nullptr;
    const ObjectPointer<GDBusConnection> bus(g_bus_get_sync(G_BUS_TYPE_SESSION, nullptr, &failure));
    throwOn(failure);
    return VariantPointer(g_dbus_connection_call_sync(
        bus.get(), "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus", method,
        g_variant_new("(s)", argument.c_str()), nullptr, G_DBUS_CALL_FLAGS_NONE, -1, nullptr,
        nullptr));
}

/// The name of the dconf service's connection to the bus; empty where it does not run.
std::string settingsServiceOwner() {
    const auto owner = callBus("GetNameOwner", "ca.desrt.dconf");
    if (!owner) {
        return {};
    }
    const char* name = nullptr;
    g_variant_get(owner.get(), "(&s)", &name);
    return name;
}

std::optional<pid_t> processOf(const std::string& owner) {
    const auto process = callBus("GetConnectionUnixProcessID", owner);
    if (!process) {
        return std::nullopt;
    }
    guint32 number = 0;
    g_variant_get(process.get(), "(u)", &number);
    return static_cast<pid_t>(number);
}

} // namespace

DesktopSessionTest::DesktopSessionTest() {
    if (g_getenv("QUORL_TEST_BUS_CONFIG") == nullptr) {
        throw std::runtime_error("start this test with tests/session-run");
    }
    gsettings("reset-recursively");
}

Program::Program(const std::vector<std::string>& command, const Environment& environment)
    : process_(spawn(command,
                     static_cast<GSubprocessFlags>(G_SUBPROCESS_FLAGS_STDIN_PIPE |
                                                   G_SUBPROCESS_FLAGS_STDOUT_PIPE),
                     environment)),
      output_(g_data_input_stream_new(g_subprocess_get_stdout_pipe(process_.get()))) {}

Program::~Program() {
    kill();
    wait();
}

void Program::say(const std::string& line) {
    const auto whole = line + "\n";
    GError* failure = nullptr;
    g_output_stream_write_all(g_subprocess_get_stdin_pipe(process_.get()), whole.data(),
                              whole.size(), nullptr, nullptr, &failure);
    throwOn(failure);
}

std::string Program::nextLine() {
    GError* failure = nullptr;
    const std::unique_ptr<char, FreedWith<g_free>> line(
        g_data_input_stream_read_line(output_.get(), nullptr, nullptr, &failure));
    throwOn(failure);
    return line ? line.get() : "";
}

void Program::kill() { g_subprocess_force_exit(process_.get()); }

bool Program::wait() {
    g_subprocess_wait(process_.get(), nullptr, nullptr);
    return g_subprocess_get_successful(process_.get()) != FALSE;
}

Peer::Peer(const Environment& environment, const std::filesystem::path& program,
           base::Purpose purpose)
    : program_(purpose == base::Purpose::Trial ? std::vector<std::string>{program.string(), "trial"}
                                               : std::vector<std::string>{program.string()},
               environment),
      greeting_(reply()) {}

std::string Peer::reply() {
    for (;;) {
        auto line = program_.nextLine();
        if (!line.starts_with(toldPrefix)) {
            return line;
        }
        told_.push_back(line.substr(toldPrefix.size()));
    }
}

std::string Peer::ask(const std::string& line) {
    say(line);
    return reply();
}

std::string Peer::nextTold() {
    if (told_.empty()) {
        const auto line = program_.nextLine();
        if (!line.starts_with(toldPrefix)) {
            throw std::runtime_error("the peer said '" + line + "' instead of what it was told");
        }
        return line.substr(toldPrefix.size());
    }
    auto keys = std::move(told_.front());
    told_.pop_front();
    return keys;
}

std::string run(const std::vector<std::string>& command) {
    const auto process = spawn(command, G_SUBPROCESS_FLAGS_STDOUT_PIPE,
                               {{"GSETTINGS_SCHEMA_DIR", SCHEMA_DIRECTORY}});
    char* text = nullptr;
    GError* failure = nullptr;
    g_subprocess_communicate_utf8(process.get(), nullptr, nullptr, &text, nullptr, &failure);
    const std::unique_ptr<char, FreedWith<g_free>> output(text);
    throwOn(failure);
    if (!g_subprocess_get_successful(process.get())) {
        throw std::runtime_error(command.front() + " failed");
    }
    std::string result = output.get();
    if (result.ends_with('\n')) {
        result.pop_back();
    }
    return result;
}

std::string gsettings(const std::string& command, const std::vector<std::string>& arguments) {
    std::vector<std::string> whole{"gsettings", command, schemaID};
    whole.insert(whole.end(), arguments.begin(), arguments.end());
    return run(whole);
}

SharedPreferences::Changed Told::callback() {
    return [this](SharedPreferences& /*preferences*/, const KeySet& keys) {
        const std::scoped_lock lock(mutex_);
        all_.push_back(keys);
        more_.notify_one();
    };
}

KeySet Told::next() {
    std::unique_lock lock(mutex_);
    more_.wait(lock, [this] { return !all_.empty(); });
    auto keys = std::move(all_.front());
    all_.pop_front();
    return keys;
}

std::unique_ptr<SharedPreferences> openShared(SharedPreferences::Changed changed) {
    auto opened = SharedPreferences::open(std::move(changed));
    if (!opened.problem.empty()) {
        throw std::runtime_error(opened.problem);
    }
    return std::move(opened.preferences);
}

Bystander::Bystander() {
    // Signals are delivered in the context that is the thread's default when they are asked for.
    g_main_context_push_thread_default(context_.get());
    GError* failure = nullptr;
    bus_.reset(g_dbus_connection_new_for_address_sync(
        g_getenv("DBUS_SESSION_BUS_ADDRESS"),
        static_cast<GDBusConnectionFlags>(G_DBUS_CONNECTION_FLAGS_AUTHENTICATION_CLIENT |
                                          G_DBUS_CONNECTION_FLAGS_MESSAGE_BUS_CONNECTION),
        nullptr, nullptr, &failure));
    throwOn(failure);
    subscription_ = g_dbus_connection_signal_subscribe(
        bus_.get(), nullptr, "ca.desrt.dconf.Writer", "Notify", nullptr, nullptr,
        G_DBUS_SIGNAL_FLAGS_NONE, onSignal, this, nullptr);
    // The answer to a call comes after the subscription has taken effect.
    const VariantPointer answer(g_dbus_connection_call_sync(
        bus_.get(), "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus",
        "GetId", nullptr, nullptr, G_DBUS_CALL_FLAGS_NONE, -1, nullptr, &failure));
    throwOn(failure);
    g_main_context_pop_thread_default(context_.get());
}

Bystander::~Bystander() {
    g_dbus_connection_signal_unsubscribe(bus_.get(), subscription_);
    g_dbus_connection_close_sync(bus_.get(), nullptr, nullptr);
    while (g_main_context_iteration(context_.get(), FALSE)) {
    }
}

std::string Bystander::next() {
    while (seen_.empty()) {
        g_main_context_iteration(context_.get(), TRUE);
    }
    auto keys = std::move(seen_.front());
    seen_.pop_front();
    return keys;
}

void Bystander::onSignal(GDBusConnection* /*connection*/, const char* /*sender*/,
                         const char* /*path*/, const char* /*interface*/, const char* /*member*/,
                         GVariant* parameters, void* bystander) {
    const char* prefix = nullptr;
    const char* tag = nullptr;
    const char** suffixes = nullptr;
    g_variant_get(parameters, "(&s^a&s&s)", &prefix, &suffixes, &tag);
    const std::unique_ptr<const char*, FreedWith<g_free>> owner(suffixes);
    std::string keys;
    for (; *suffixes != nullptr; ++suffixes) {
        const auto whole = std::string(prefix) + *suffixes;
        keys += (keys.empty() ? "" : " ") +
                (whole.starts_with(folder) ? whole.substr(folder.size()) : whole);
    }
    static_cast<Bystander*>(bystander)->seen_.push_back(keys);
}

bool stopSettingsService() {
    const auto process = processOf(settingsServiceOwner());
    return process && ::kill(*process, SIGSTOP) == 0;
}

bool killSettingsService() {
    const auto owner = settingsServiceOwner();
    const auto process = processOf(owner);
    if (!process || ::kill(*process, SIGKILL) != 0) {
        return false;
    }
    while (callBus("GetNameOwner", owner)) {
    }
    return true;
}

SecondBus::SecondBus()
    : address_(std::string("unix:path=") + g_get_user_runtime_dir() + "/second-bus") {
    start();
}

void SecondBus::start() {
    daemon_ = std::make_unique<Program>(std::vector<std::string>{
        "dbus-daemon", std::string("--config-file=") + g_getenv("QUORL_TEST_BUS_CONFIG"),
        "--nofork", "--print-address", "--address=" + address_});
    // It prints its address when it can be reached.
    (void)daemon_->nextLine();
}

void SecondBus::kill() {
    daemon_->kill();
    daemon_->wait();
}

} // namespace quorl::preferences::testing
