// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_order.h"

#include <QTest>

#include <algorithm>
#include <numeric>
#include <random>
#include <set>

namespace {

const QString default_name = QStringLiteral("(Default)");

QString deep_copy(const QString& text) { return QString(text.constData(), text.size()); }

// The order as it is told: one comparison of two rows after the other.
std::vector<int> told_order(const std::vector<QString>& names, int unnamed) {
    std::vector<int> rows(names.size());
    std::iota(rows.begin(), rows.end(), 0);
    std::sort(rows.begin(), rows.end(), [&](int a, int b) {
        if (a == unnamed || b == unnamed)
            return a == unnamed && b != unnamed;
        const QString& first = names[static_cast<size_t>(a)];
        const QString& second = names[static_cast<size_t>(b)];
        if (first == default_name || second == default_name)
            return first == default_name && second != default_name;
        return QString::compare(first, second, Qt::CaseInsensitive) < 0;
    });
    return rows;
}

}  // namespace

class ValueOrderTest : public QObject {
    Q_OBJECT

private slots:
    // Whether rows share a text, or have texts of their own that are equal, or differ in case alone.
    void rows_are_in_the_order_of_their_names() {
        const QStringList texts = {default_name,         QStringLiteral("alpha"), QStringLiteral("ALPHA"),
                                   QStringLiteral("_a"), QStringLiteral("beta"),  QString(),
                                   QStringLiteral("b"),  QStringLiteral("Beta"),  QStringLiteral("(default)")};
        std::mt19937 random(1);
        for (int round = 0; round < 200; round++) {
            std::vector<QString> names(random() % 100);
            for (QString& name : names) {
                const QString& text = texts[static_cast<qsizetype>(random() % static_cast<uint32_t>(texts.size()))];
                name = random() % 2 == 0 ? text : deep_copy(text);
            }
            const int unnamed = names.empty() ? -1 : static_cast<int>(random() % (names.size() + 1)) - 1;
            QCOMPARE(rows_by_name(names, default_name, unnamed), told_order(names, unnamed));
        }
    }

    void rows_of_one_name_share_its_text() {
        const QString text = QStringLiteral("a name");
        const auto names = names_of_rows(1000, [&](int row) { return row % 2 == 0 ? deep_copy(text) : QString(); });
        QVERIFY(names.has_value());
        std::set<const QChar*> texts;
        for (size_t row = 0; row < 1000; row++) {
            QCOMPARE((*names)[row], row % 2 == 0 ? text : QString());
            texts.insert((*names)[row].constData());
        }
        QCOMPARE(texts.size(), size_t{2});
    }

    void names_are_not_read_to_the_end_when_the_reader_is_stopped() {
        int asked = 0;
        const auto name_of = [&](int) {
            asked++;
            return QString();
        };
        QVERIFY(!names_of_rows(100000, name_of, [&] { return asked > 1000; }).has_value());
        QVERIFY(asked < 1500);
    }
};

QTEST_GUILESS_MAIN(ValueOrderTest)
#include "value_order_test.moc"
