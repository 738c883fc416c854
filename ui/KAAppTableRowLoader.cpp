// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAppTableRowLoader.h>

#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>

#include "platform/qt/interface_file.h"
#include "platform/qt/log.h"
#include "ui/progress_spinner.h"
#include "ui/row_label.h"

namespace {

const QString kInterfaceType = QStringLiteral("ui");

}  // namespace

KAAppTableRowLoader::KAAppTableRowLoader() = default;

KAAppTableRowLoader::~KAAppTableRowLoader() = default;

bool KAAppTableRowLoader::loadNib(const QString &name)
{
    static const kavell::InterfaceFile::WidgetMakers makers{
        {QStringLiteral("KAAppTableRow"),
         [](QWidget *parent) -> QWidget * {
             return new KAAppTableRow(parent);
         }},
        {QStringLiteral("RowLabel"),
         [](QWidget *parent) -> QWidget * {
             return new kavell::RowLabel(parent);
         }},
        {QStringLiteral("ProgressSpinner"),
         [](QWidget *parent) -> QWidget * {
             return new kavell::ProgressSpinner(parent);
         }},
    };
    _rowView.reset();
    const QString path = KABundle::libraryBundle()->pathForResource(name, kInterfaceType);
    std::unique_ptr<kavell::InterfaceFile> interface = kavell::InterfaceFile::load(path, nullptr, makers);
    if (!interface)
        return false;
    auto *const row = qobject_cast<KAAppTableRow *>(interface->root());
    if (!row || !row->connectOutlets(*interface)) {
        kavell::log(QStringLiteral("*** The interface file %1 has no row, or one that lacks a control").arg(path));
        return false;
    }
    (void)interface->takeRoot().release();
    _rowView = std::shared_ptr<KAAppTableRow>(row, KAAppTableRow::letGo);
    return true;
}

std::shared_ptr<KAAppTableRow> KAAppTableRowLoader::rowView() const
{
    return _rowView;
}

void KAAppTableRowLoader::setRowView(std::shared_ptr<KAAppTableRow> rowView)
{
    _rowView = std::move(rowView);
}

void KAAppTableRowLoader::describeFields(KAFieldList &fields) const
{
    fields.add("_rowView", _rowView);
    KAObject::describeFields(fields);
}
