// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The plug-ins of setup_bench: the account-list plug-in of a provider with all services, and data plug-ins that take a
// given time to find an account and measure how long they took.

#include <chrono>
#include <thread>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAProvider.h>

class BenchProviderPlugin : public KAAListPlugin {
public:
    using KAAListPlugin::KAAListPlugin;

    void pluginDidLoad() override
    {
        const std::shared_ptr<KAProvider> provider = KAProvider::initWithProviderType(kKAProviderYahoo);
        provider->setServiceTypesProvided({kKAServiceIMAP, kKAServiceCardDAV, kKAServiceCalDAV, kKAServiceIM});
        setProvider(provider);
    }

    [[nodiscard]] bool supportsDomain(const QString &domain) override
    {
        return domain == QLatin1String("zorbo.example");
    }
};

/// Properties: "delay", the milliseconds that a discovery takes, and "own", the nanoseconds that the plug-in took.
class BenchSetupPlugin : public KADataPlugin {
public:
    using KADataPlugin::KADataPlugin;

    ~BenchSetupPlugin() override { joinReporter(); }

    [[nodiscard]] QStringList accountUIDs() override { return {}; }

    void startAccountSetupWithInput(const std::shared_ptr<KAAccountSetupInput> &input) override
    {
        m_start = Clock::now();
        const std::chrono::milliseconds delay(property("delay").toInt());
        if (delay.count() == 0)
            return report(input);
        joinReporter();
        m_reporter = std::thread([this, input, delay] {
            std::this_thread::sleep_for(delay);
            report(input);
        });
    }

    [[nodiscard]] QString createAccountForInput(const std::shared_ptr<KAAccountSetupInput> &,
                                                const std::shared_ptr<KAAccountSetupResult> &, KAError *) override
    {
        setProperty("own", qlonglong(std::chrono::nanoseconds(m_end - m_start).count()));
        return QStringLiteral("uid");
    }

private:
    using Clock = std::chrono::steady_clock;

    void report(const std::shared_ptr<KAAccountSetupInput> &input)
    {
        const auto result = std::make_shared<KAAccountSetupResult>();
        m_end = Clock::now();
        accountSetupDidFinish(input, result);
    }

    void joinReporter()
    {
        if (m_reporter.joinable())
            m_reporter.join();
    }

    Clock::time_point m_start;
    Clock::time_point m_end;
    std::thread m_reporter;
};

#ifdef KAVELL_BENCH_PROVIDER
KA_EXPORT_PLUGIN(BenchProviderPlugin)
#else
KA_EXPORT_PLUGIN(BenchSetupPlugin)
#endif
