// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What fifty plug-ins cost: finding the one that a settings dictionary belongs to, asking all of them about a domain
// that none of them serves, and loading them. Each stands beside the bare system calls that it cannot do without.
//
// The bundles are copies of one, each with an identifier and 200 domains of its own, half of them labels. They are
// copied and not linked, since the dynamic loader takes two names of one file for one library.

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <dirent.h>
#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <vector>

#include <benchmark/benchmark.h>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>

namespace {

constexpr int kBundles = 50;
constexpr int kDomainsEach = 200;
constexpr char kSystemDirectory[] = "/System/Library/KavellAccounts";
const std::string kOriginal = KAVELL_BENCH_BUNDLE;

/// A domain of a plug-in's file. Labels and whole domains are served alike: "mail." before it belongs to the plug-in.
std::string domainEntry(int bundle, int number)
{
    const std::string label = "zorbo" + std::to_string(bundle) + "-" + std::to_string(number);
    return bundle % 2 ? label + ".example" : label;
}

std::string propertyList(const std::string &entries)
{
    return R"(<?xml version="1.0" encoding="UTF-8"?><plist version="1.0"><dict>)" + entries + "</dict></plist>";
}

void addBundle(const std::string &directory, int number)
{
    const std::string name = "org.zorbo.number" + std::to_string(number) + ".kaplugin";
    const std::string contents = directory + "/" + name + "/Contents";
    std::filesystem::copy(kOriginal, directory + "/" + name, std::filesystem::copy_options::recursive);
    std::ofstream(contents + "/Info.plist")
        << propertyList("<key>KABundleIdentifier</key><string>" + name + "</string>" +
                        "<key>KABundleExecutable</key><string>libBenchList.so</string>" +
                        "<key>KABundlePrincipalClass</key><string>BenchListPlugin</string>" +
                        "<key>KAPluginVersion</key><integer>1</integer>");
    std::string domains;
    for (int index = 0; index < kDomainsEach; ++index)
        domains += "<string>" + domainEntry(number, index) + "</string>";
    std::ofstream(contents + "/Resources/domains.plist")
        << propertyList(std::string("<key>match</key><string>") + (number % 2 ? "exact" : "labels") + "</string>" +
                        "<key>exceptions</key><array><string>*.corp.zorbo.example</string></array>" +
                        "<key>domains</key><array>" + domains + "</array>");
}

/// The search directory with the bundles, made once below the scratch home and named by the environment, in which the
/// processes that this program starts find it.
const std::string &searchDirectory()
{
    static const std::string directory = [] {
        if (const char *made = std::getenv("VESK_FRAMEWORK_PATH"))
            return std::string(made);
        std::string path = std::filesystem::temp_directory_path() / "plugin-bench-XXXXXX";
        if (!mkdtemp(path.data()))
            throw std::runtime_error("cannot make " + path);
        for (int number = 0; number < kBundles; ++number)
            addBundle(path, number);
        setenv("VESK_FRAMEWORK_PATH", path.c_str(), 1);
        return path;
    }();
    return directory;
}

/// Lists the search directories and takes the status of each bundle's information dictionary.
int listBare()
{
    int found = 0;
    std::string information;
    for (const char *path : {searchDirectory().c_str(), kSystemDirectory}) {
        DIR *const directory = opendir(path);
        if (!directory)
            continue;
        while (const dirent *entry = readdir(directory)) {
            struct stat status;
            information.assign(entry->d_name).append("/Contents/Info.plist");
            if (entry->d_name[0] != '.' && fstatat(dirfd(directory), information.c_str(), &status, 0) == 0)
                ++found;
        }
        closedir(directory);
    }
    return found;
}

void bareListing(benchmark::State &state)
{
    if (listBare() != kBundles)
        state.SkipWithError("the bundles are not there");
    for (auto _ : state)
        benchmark::DoNotOptimize(listBare());
}

/// Addresses of all plug-ins in turn, since the order in which they are asked differs from process to process.
void identifySettings(benchmark::State &state)
{
    searchDirectory();
    std::vector<QVariantMap> questions;
    for (int number = 0; number < kBundles; ++number) {
        const std::string domain = "mail." + domainEntry(number, number) + ".example";
        questions.push_back({{KAMailEmailAddressKey, QString::fromStdString("anna@" + domain)}});
        if (KAAccount::aListPluginIDForSettings(questions.back()).isNull())
            state.SkipWithError("no plug-in claims its own domain");
    }
    size_t next = 0;
    for (auto _ : state)
        benchmark::DoNotOptimize(KAAccount::aListPluginIDForSettings(questions[next++ % questions.size()]));
}

void askAllForAMiss(benchmark::State &state)
{
    searchDirectory();
    const QList<KAAListPlugin *> plugins = KAPluginManager::shared()->allAListPlugins();
    const QString domain = QStringLiteral("Mail.Host.Unclaimed.example");
    const auto claims = [&] {
        int count = 0;
        for (KAAListPlugin *plugin : plugins)
            count += plugin->supportsDomain(domain);
        return count;
    };
    if (plugins.size() != kBundles || claims() != 0)
        state.SkipWithError("fifty plug-ins and a domain of nobody were expected");
    for (auto _ : state)
        benchmark::DoNotOptimize(claims());
}

/// @name What a fresh process measures: how many nanoseconds loading takes; a negative number when it failed
/// @{
using Clock = std::chrono::steady_clock;

int64_t loadPluginsHere()
{
    const auto start = Clock::now();
    const qsizetype count = KAPluginManager::shared()->allPlugins().size();
    const auto taken = Clock::now() - start;
    return count == kBundles ? std::chrono::nanoseconds(taken).count() : -1;
}

int64_t dlopenHere()
{
    std::vector<std::string> files;
    for (const auto &bundle : std::filesystem::directory_iterator(searchDirectory()))
        files.push_back(bundle.path() / KAVELL_BENCH_CODE);
    size_t loaded = 0;
    const auto start = Clock::now();
    for (const std::string &file : files)
        loaded += dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL) != nullptr;
    const auto taken = Clock::now() - start;
    return loaded == kBundles ? std::chrono::nanoseconds(taken).count() : -1;
}
/// @}

constexpr char kLoadPlugins[] = "--load-plugins";
constexpr char kDlopen[] = "--dlopen";

/// Runs this program anew, which has loaded none of the bundles and all that they are linked with, for each round.
void measureInFreshProcesses(benchmark::State &state, const char *what)
{
    searchDirectory();
    const std::string command = std::filesystem::read_symlink("/proc/self/exe").string() + " " + what;
    for (auto _ : state) {
        FILE *const program = popen(command.c_str(), "r");
        long long nanoseconds = -1;
        const bool answered = program && fscanf(program, "%lld", &nanoseconds) == 1;
        if (program)
            pclose(program);
        if (!answered || nanoseconds < 0) {
            state.SkipWithError("not everything was loaded");
            return;
        }
        state.SetIterationTime(static_cast<double>(nanoseconds) * 1e-9);
    }
}

BENCHMARK(bareListing)->Unit(benchmark::kMicrosecond);
BENCHMARK(identifySettings)->Unit(benchmark::kMicrosecond);
BENCHMARK(askAllForAMiss)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(measureInFreshProcesses, loadPlugins, kLoadPlugins)->UseManualTime()->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(measureInFreshProcesses, bareDlopen, kDlopen)->UseManualTime()->Unit(benchmark::kMicrosecond);

}  // namespace

int main(int argc, char *argv[])
{
    if (argc == 2 && argv[1] == std::string_view(kLoadPlugins))
        return printf("%lld\n", static_cast<long long>(loadPluginsHere())) < 0;
    if (argc == 2 && argv[1] == std::string_view(kDlopen))
        return printf("%lld\n", static_cast<long long>(dlopenHere())) < 0;
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    std::filesystem::remove_all(searchDirectory());
}
