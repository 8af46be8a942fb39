// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The modal editors for text, bytes and lists of texts, each run for one value at a time.
#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

class QAbstractItemModel;
class QPersistentModelIndex;

// Each shows the value's name and its data and returns when it is closed. Ok writes the new data to `data_index` of
// `model` with setData and Qt::DisplayRole; anything else writes nothing. False when the model refused it. A datum
// that the user left alone is written back exactly as it was given, also where its characters do not survive the
// editing widget; only a list without strings goes back as one empty string, which stands for the same.
bool edit_string(QAbstractItemModel& model, const QString& value_name, const QString& data,
                 const QPersistentModelIndex& data_index);
bool edit_binary(QAbstractItemModel& model, const QString& value_name, const QByteArray& data,
                 const QPersistentModelIndex& data_index);
bool edit_multi_string(QAbstractItemModel& model, const QString& value_name, const QStringList& data,
                       const QPersistentModelIndex& data_index);
