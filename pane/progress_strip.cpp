// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/progress_strip.h"

#include <chrono>

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QProgressBar>
#include <QtWidgets/QPushButton>

#include "pane/undertakings.h"

namespace kavell::pane {

namespace {

// What is over sooner would only flicker.
constexpr std::chrono::milliseconds kPatience{400};
// Nothing but a lock that somebody else holds, or a prompt, takes longer.
constexpr std::chrono::seconds kLongWait{5};
constexpr int kBarWidth = 120;

}  // namespace

ProgressStrip::ProgressStrip(Undertakings &undertakings, QWidget *parent)
    : QFrame(parent), m_undertakings(undertakings), m_sentence(new QLabel)
{
    auto *const bar = new QProgressBar;
    bar->setRange(0, 0);
    bar->setMaximumWidth(kBarWidth);
    bar->setTextVisible(false);
    bar->setAccessibleName(qtTrId("PROGRESS"));
    auto *const cancel = new QPushButton(qtTrId("STOP_WAITING"));
    cancel->setObjectName(QStringLiteral("stopWaiting"));
    connect(cancel, &QPushButton::clicked, &m_undertakings, &Undertakings::cancelAll);
    m_sentence->setObjectName(QStringLiteral("progressSentence"));
    m_sentence->setWordWrap(true);
    m_sentence->setTextFormat(Qt::PlainText);  // it can hold a login name
    auto *const layout = new QHBoxLayout(this);
    layout->addWidget(bar);
    layout->addWidget(m_sentence, 1);
    layout->addWidget(cancel);

    m_patience.setSingleShot(true);
    m_patience.setInterval(kPatience);
    connect(&m_patience, &QTimer::timeout, this, [this] {
        m_sentence->setText(m_undertakings.sentence());
        m_longWait.start();
        show();
    });
    m_longWait.setSingleShot(true);
    m_longWait.setInterval(kLongWait);
    connect(&m_longWait, &QTimer::timeout, this,
            [this] { m_sentence->setText(qtTrId("LONG_WAIT").arg(m_undertakings.sentence())); });
    connect(&m_undertakings, &Undertakings::changed, this, &ProgressStrip::update);
    hide();
}

void ProgressStrip::update()
{
    if (m_undertakings.sentence().isNull()) {
        m_patience.stop();
        m_longWait.stop();
        hide();
    } else if (isHidden()) {
        if (!m_patience.isActive())
            m_patience.start();
    } else if (m_longWait.isActive()) {
        m_sentence->setText(m_undertakings.sentence());
    }
}

}  // namespace kavell::pane
