#include <signal.h>
#include <stdlib.h>
#include <sys/resource.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <exception>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/Failure.h"
#include "host/Health.h"
#include "host/ListenSocket.h"
#include "host/Metrics.h"
#include "host/Options.h"
#include "host/Origin.h"
#include "host/OriginPolicy.h"
#include "host/Page.h"
#include "host/Plugin.h"
#include "host/Server.h"
#include "host/SimulatedDriver.h"
#include "host/SimulatorPanel.h"
#include "host/Site.h"
#include "host/StaticFiles.h"

namespace {

using host::Failure;
using host::Options;

// How often overdue connections are looked for.
constexpr timespec tick = {1, 0};

// `what` names the file in the failure, `option` says where its path came from.
std::string readFile(const std::string& path, const std::string& what, const std::string& option) {
    const std::unique_ptr<FILE, decltype(&std::fclose)> file(std::fopen(path.c_str(), "rb"),
                                                             std::fclose);
    std::string text;
    char piece[4096];
    while (file && !std::feof(file.get()) && !std::ferror(file.get())) {
        text.append(piece, std::fread(piece, 1, sizeof piece, file.get()));
    }
    if (!file || std::ferror(file.get())) {
        throw Failure("The " + what + " " + path + " cannot be read: " + std::strerror(errno) +
                      ". Name a readable file with " + option + ".");
    }
    return text;
}

void setEnvironment(const char* name, const std::string& value) {
    if (!value.empty()) {
        setenv(name, value.c_str(), 1);
    }
}

// The simulated driver, which the plug-in loads, reads these.
void configureDriver(const Options& options) {
    if (!options.chassis.empty()) {
        readFile(options.chassis, "chassis file", "--chassis");
    }
    setEnvironment("QITRMC_SIM_CHASSIS", options.chassis);
    setEnvironment("QITRMC_SIM_STATE", options.state);
    setEnvironment("QITRMC_SIM_FAULTS", options.faults);
    setEnvironment("QITRMC_SIM_TRACE", options.trace);
    setEnvironment("QITRMC_SIM_SEED", options.seed);
    setEnvironment("QITRMC_SIM_TIME_SCALE", options.timeScale);
}

host::ServerSettings settingsOf(const Options& options) {
    host::ServerSettings settings;
    settings.threads = options.threads;
    settings.connections = options.connections;
    settings.maxBody = options.maxBody;
    settings.timeout = options.timeout;
    settings.tls = !options.tlsKey.empty();
    settings.passTransport = options.passTransport;
    if (settings.tls) {
        settings.tlsCertificate = readFile(options.tlsCertificate, "certificate", "--tls-cert");
        settings.tlsKey = readFile(options.tlsKey, "private key", "--tls-key");
    }
    return settings;
}

host::OriginPolicy policyOf(const Options& options) {
    std::vector<std::string> names = options.hostNames;
    if (const std::optional<std::string> name = host::canonicalHost(options.address)) {
        names.push_back(*name);
    }
    return {options.tlsKey.empty() ? "http" : "https", names, options.allowedOrigins};
}

host::StaticFiles filesOf(const Options& options) {
    const std::string folder = options.web.empty() ? host::findPage() : options.web;
    return folder.empty() ? host::StaticFiles() : host::StaticFiles(folder);
}

host::Site siteOf(const Options& options, host::StaticFiles files, const host::Plugin& plugin,
                  host::Metrics& metrics) {
    std::vector<std::unique_ptr<host::SitePart>> parts;
    if (!options.noHealth) {
        parts.push_back(std::make_unique<host::Health>(plugin));
    }
    if (!options.noMetrics) {
        parts.push_back(std::make_unique<host::MetricsPage>(metrics));
    }
    std::unique_ptr<host::SitePart> panel =
        options.noPanel ? nullptr : host::SimulatorPanel::find();
    if (panel) {
        parts.push_back(std::move(panel));
    }
    parts.push_back(std::make_unique<host::Page>(std::move(files)));
    return host::Site(std::move(parts), options.noMetrics ? nullptr : &metrics);
}

sigset_t endSignals() {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGTERM);
    sigaddset(&signals, SIGINT);
    return signals;
}

// The threads that are started later inherit the mask: the signals that end the host wait until it
// looks for them.
void takeChargeOfSignals() {
    const sigset_t signals = endSignals();
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    // A shell starts its background jobs with SIGINT ignored.
    signal(SIGINT, SIG_DFL);
    signal(SIGTERM, SIG_DFL);
    signal(SIGPIPE, SIG_IGN);
}

// A connection takes up to two descriptors, and many systems let a process have 1024 unless it
// asks.
void raiseDescriptorLimit() {
    rlimit limit = {};
    getrlimit(RLIMIT_NOFILE, &limit);
    limit.rlim_cur = limit.rlim_max;
    setrlimit(RLIMIT_NOFILE, &limit);
}

void serveUntilSignal(host::Server& server) {
    const sigset_t signals = endSignals();
    while (sigtimedwait(&signals, nullptr, &tick) < 0) {
        server.shutOverdueConnections();
    }
}

// From here on a signal has its default effect: it ends the process.
void finishRequests(host::Server& server) {
    const sigset_t signals = endSignals();
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
    server.stopAccepting();
    while (!server.waitForRequests(std::chrono::seconds(tick.tv_sec))) {
        server.shutOverdueConnections();
    }
}

void serve(const host::Plugin& plugin, host::ListenSocket& socket,
           const host::ServerSettings& settings, const host::OriginPolicy& policy,
           const host::Site& site, const std::string& chassis) {
    host::Server server(plugin, socket, settings, policy, site);
    const std::string url =
        std::string(settings.tls ? "https" : "http") + "://" + socket.authority();
    std::printf("Listening on %s/qitrmc/Call\n%s", url.c_str(), chassis.c_str());
    if (site.has("/")) {
        std::printf("Open %s/ in a browser.\n", url.c_str());
    }
    std::fflush(stdout);
    serveUntilSignal(server);
    finishRequests(server);
}

void reportThingsNotGivenBack() {
    const std::string things = host::thingsNotGivenBack();
    if (!things.empty()) {
        std::fprintf(stderr, "qitrmc-host: The plug-in has not given back to the driver: %s.\n",
                     things.c_str());
    }
}

void runHost(const Options& options) {
    takeChargeOfSignals();
    raiseDescriptorLimit();
    configureDriver(options);
    const host::ServerSettings settings = settingsOf(options);
    host::StaticFiles files = filesOf(options);
    host::ListenSocket socket(options.address, options.port);
    const host::Plugin plugin(options.plugin.empty() ? host::findPlugin() : options.plugin);
    const std::string chassis = host::startSimulatedDriver();
    host::Metrics metrics(host::countDriverCalls);
    const host::Site site = siteOf(options, std::move(files), plugin, metrics);
    plugin.initialize();
    try {
        serve(plugin, socket, settings, policyOf(options), site, chassis);
    } catch (...) {
        plugin.finalize();
        throw;
    }
    plugin.finalize();
    reportThingsNotGivenBack();
}

void perform(const Options& options) {
    if (options.notice.empty()) {
        runHost(options);
    } else {
        std::fputs(options.notice.c_str(), stdout);
    }
}

}  // namespace

int main(int argc, char** argv) {
    try {
        perform(host::parseOptions({argv + 1, argv + argc}));
        return 0;
    } catch (const host::UsageError& error) {
        std::fprintf(stderr, "qitrmc-host: %s\n", error.what());
        return 2;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "qitrmc-host: %s\n", error.what());
        return 1;
    }
}
