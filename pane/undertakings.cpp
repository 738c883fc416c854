// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/undertakings.h"

#include <algorithm>

namespace kavell::pane {

Undertakings::Undertakings(QObject *parent) : QObject(parent)
{
}

Undertakings::~Undertakings()
{
    for (const Undertaking &undertaking : m_underWay)
        *undertaking.isCancelled = true;
}

QString Undertakings::sentence() const
{
    return m_underWay.empty() ? QString() : m_underWay.front().sentence;
}

void Undertakings::cancelAll()
{
    const std::vector<Undertaking> cancelled = std::exchange(m_underWay, {});
    for (const Undertaking &undertaking : cancelled)
        *undertaking.isCancelled = true;
    emit changed();
    for (const Undertaking &undertaking : cancelled)
        undertaking.tellCancelled();
}

void Undertakings::add(Undertaking undertaking)
{
    m_underWay.push_back(std::move(undertaking));
    emit changed();
}

bool Undertakings::remove(const CancelFlag &flag)
{
    const auto found = std::find_if(m_underWay.begin(), m_underWay.end(),
                                    [&](const Undertaking &undertaking) { return undertaking.isCancelled == flag; });
    if (found == m_underWay.end())
        return false;
    m_underWay.erase(found);
    emit changed();
    return true;
}

}  // namespace kavell::pane
