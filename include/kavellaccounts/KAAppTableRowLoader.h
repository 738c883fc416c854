// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Reads a row of the application table from an interface file of the library, and does nothing else. User-interface
// thread only.

#ifndef KAVELLACCOUNTS_KAAPPTABLEROWLOADER_H
#define KAVELLACCOUNTS_KAAPPTABLEROWLOADER_H

#include <memory>

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAAppTableRow;

class KAVELL_ACCOUNTS_EXPORT KAAppTableRowLoader : public KAObject {
public:
    KAAppTableRowLoader();
    ~KAAppTableRowLoader() override;

    /// Reads NAME.ui, whose outermost widget is a KAAppTableRow, among the library's resources, and makes it the row.
    /// False, with a line in the log, when there is no such file or a control is missing in it; the row is null then.
    bool loadNib(const QString &name);

    /// The row that was read, or set; null when there is none.
    [[nodiscard]] std::shared_ptr<KAAppTableRow> rowView() const;
    void setRowView(std::shared_ptr<KAAppTableRow> rowView);

    void describeFields(KAFieldList &fields) const override;

private:
    std::shared_ptr<KAAppTableRow> _rowView;
};

#endif
