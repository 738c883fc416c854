// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/certificate_panel.h"

#include <QtCore/QCryptographicHash>
#include <QtCore/QLocale>
#include <QtGui/QTextOption>
#include <QtWidgets/QDialogButtonBox>
#include <QtWidgets/QHeaderView>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPlainTextEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QTreeWidget>
#include <QtWidgets/QVBoxLayout>
#include <QtWidgets/QWhatsThis>

namespace kavell {

namespace {

constexpr int kPanelWidth = 520;
constexpr int kVisibleCertificates = 4;
constexpr int kVisibleDetails = 8;

QLabel *wrappedLabel(const QString &text)
{
    auto *label = new QLabel(text);
    label->setTextFormat(Qt::PlainText);  // host names and titles come from outside
    label->setWordWrap(true);
    return label;
}

QString titleOf(const QSslCertificate &certificate)
{
    const QString name = certificate.subjectDisplayName();
    return name.isEmpty() ? QString::fromLatin1(certificate.serialNumber()) : name;
}

}  // namespace

CertificatePanel::CertificatePanel(const CertificatePanelTexts &texts, const QList<QSslCertificate> &chain)
    : m_texts(texts), m_chain(chain)
{
    setWindowTitle(texts.message);
    setModal(true);
    new QVBoxLayout(this);
    addMessages();
    addChain();
    addButtons();
    resize(kPanelWidth, sizeHint().height());
}

CertificatePanel::~CertificatePanel() = default;

void CertificatePanel::addMessages()
{
    QLabel *message = wrappedLabel(m_texts.message);
    QFont bold = message->font();
    bold.setBold(true);
    message->setFont(bold);
    message->setObjectName("message");
    layout()->addWidget(message);
    QLabel *informative = wrappedLabel(m_texts.informative);
    informative->setObjectName("informative");
    informative->setVisible(!m_texts.informative.isEmpty());
    layout()->addWidget(informative);
}

void CertificatePanel::addChain()
{
    m_tree = new QTreeWidget;
    m_tree->setAccessibleName(m_texts.chainName);
    m_tree->setHeaderHidden(true);
    m_tree->setTextElideMode(Qt::ElideMiddle);
    m_details = new QPlainTextEdit;
    m_details->setReadOnly(true);
    m_details->setWordWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    m_details->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    m_details->setTabChangesFocus(true);
    m_details->setAccessibleName(m_texts.detailsName);

    const int line = fontMetrics().lineSpacing();
    m_tree->setFixedHeight(line * kVisibleCertificates + 2 * line);
    m_details->setMinimumHeight(line * kVisibleDetails);
    // The server's own certificate comes first; each further one vouches for the one before it and stands above it.
    QTreeWidgetItem *parent = m_tree->invisibleRootItem();
    for (qsizetype index = m_chain.size(); index-- > 0;) {
        auto *item = new QTreeWidgetItem(parent, {titleOf(m_chain[index])});
        item->setData(0, Qt::UserRole, index);
        parent = item;
    }
    m_tree->expandAll();
    connect(m_tree, &QTreeWidget::currentItemChanged, this, [this](const QTreeWidgetItem *item) {
        if (item)
            showDetails(m_chain[item->data(0, Qt::UserRole).toLongLong()]);
    });
    m_tree->setCurrentItem(parent);
    layout()->addWidget(m_tree);
    layout()->addWidget(m_details);
}

void CertificatePanel::addButtons()
{
    auto *buttons = new QDialogButtonBox;
    QPushButton *go = buttons->addButton(m_texts.continueButton, QDialogButtonBox::AcceptRole);
    QPushButton *cancel = buttons->addButton(m_texts.cancelButton, QDialogButtonBox::RejectRole);
    QPushButton *help = buttons->addButton(m_texts.helpButton, QDialogButtonBox::HelpRole);
    go->setObjectName("continue");
    cancel->setObjectName("cancel");
    help->setObjectName("help");
    go->setDefault(true);
    cancel->setAutoDefault(false);
    help->setAutoDefault(false);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    connect(buttons, &QDialogButtonBox::helpRequested, this,
            [this, help] { QWhatsThis::showText(help->mapToGlobal(QPoint(0, 0)), m_texts.help, help); });
    layout()->addWidget(buttons);
}

void CertificatePanel::showDetails(const QSslCertificate &certificate)
{
    const QLocale locale;
    const auto date = [&](const QDateTime &time) {
        return locale.toString(time, QLocale::LongFormat);
    };
    const QString digest = QString::fromLatin1(certificate.digest(QCryptographicHash::Sha256).toHex(':')).toUpper();
    const std::pair<QString, QString> rows[] = {
        {m_texts.subject, certificate.subjectDisplayName()},
        {m_texts.issuer, certificate.issuerDisplayName()},
        {m_texts.validFrom, date(certificate.effectiveDate())},
        {m_texts.validUntil, date(certificate.expiryDate())},
        {m_texts.names, certificate.subjectAlternativeNames().values().join(QLatin1String(", "))},
        {m_texts.fingerprint, digest},
    };
    QStringList lines;
    for (const auto &[label, value] : rows)
        if (!value.isEmpty())
            lines.append(label + QLatin1Char(' ') + value);
    m_details->setPlainText(lines.join(QLatin1Char('\n')));
}

}  // namespace kavell
