// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the mail-host lookup costs: a domain that was asked about before, and one that was not, which a name server of
// this program answers on a loopback port. Beside it stand the same question and answer through a bare socket.

#include <arpa/inet.h>
#include <array>
#include <netinet/in.h>
#include <string>
#include <sys/socket.h>
#include <unistd.h>

#include <benchmark/benchmark.h>
#include <kavellaccounts/KADNSService.h>

#include "tests/support/dns_server.h"

using kavell::test::DnsServer;

namespace {

constexpr char kDomain[] = "custom.example";
constexpr int kExchangers = 5;

void addExchangers(DnsServer &server)
{
    for (int number = 1; number <= kExchangers; ++number)
        server.addMailExchanger(kDomain, static_cast<uint16_t>(number), "alt" + std::to_string(number) + ".mx.example");
}

/// Asks anew each time: the object that asks is made, and the answer is looked for in it.
void lookUp(benchmark::State &state, bool useCache)
{
    DnsServer server;
    addExchangers(server);
    const QString domain = QString::fromLatin1(kDomain);
    const QString host = QStringLiteral("mx.example");
    const auto ask = [&] {
        const auto service = KADNSService::initWithServerAddress(domain);
        service->setUseCache(useCache);
        service->beginQuerySync();
        return service->mailServers().size() == kExchangers && service->hasMailHost(host);
    };
    if (!ask())
        state.SkipWithError("the exchangers were not found");
    bool found = true;
    for (auto _ : state)
        found &= ask();
    if (!found)
        state.SkipWithError("a lookup found other exchangers");
}

void lookUpCached(benchmark::State &state)
{
    lookUp(state, true);
}

void lookUpUncached(benchmark::State &state)
{
    lookUp(state, false);
}

/// A question for the domain's MX records, as the resolver library sends it.
std::string question()
{
    return std::string("\0\1\1\0\0\1\0\0\0\0\0\0", 12) + DnsServer::wireName(kDomain) + std::string("\0\17\0\1", 4);
}

/// A socket for each question, as a resolver that keeps none open has.
void bareQuestion(benchmark::State &state)
{
    DnsServer server;
    addExchangers(server);
    const std::string address = server.address();
    sockaddr_in to{};
    to.sin_family = AF_INET;
    to.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    to.sin_port = htons(static_cast<uint16_t>(std::stoi(address.substr(address.find(':') + 1))));
    const std::string bytes = question();
    bool answered = true;
    for (auto _ : state) {
        const int descriptor = socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
        std::array<char, 512> reply{};
        const bool asked = connect(descriptor, reinterpret_cast<const sockaddr *>(&to), sizeof to) == 0 &&
                           send(descriptor, bytes.data(), bytes.size(), 0) > 0 &&
                           recv(descriptor, reply.data(), reply.size(), 0) > 0;
        close(descriptor);
        answered &= asked && reply[7] == kExchangers;
    }
    if (!answered)
        state.SkipWithError("the name server did not answer with all exchangers");
}

BENCHMARK(lookUpCached)->Unit(benchmark::kMicrosecond)->UseRealTime();
BENCHMARK(lookUpUncached)->Unit(benchmark::kMicrosecond)->UseRealTime();
BENCHMARK(bareQuestion)->Unit(benchmark::kMicrosecond)->UseRealTime();

}  // namespace

BENCHMARK_MAIN();
