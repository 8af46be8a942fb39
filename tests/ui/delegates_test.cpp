// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The texts of value data, in-place renames and their messages, and what a damaged key does to a paint.

#include "delegates.h"
#include "failure_report.h"
#include "reg_value.h"
#include "ui_test.h"
#include "value_text.h"

#include <QElapsedTimer>
#include <QLineEdit>
#include <QPainter>
#include <QPixmap>
#include <QStandardItemModel>
#include <QTableView>
#include <QTemporaryFile>

#include <cstdio>
#include <memory>
#include <stdexcept>
#include <unistd.h>

namespace {

// Notes what is written to it, and refuses it when told to.
class NotingModel : public QStandardItemModel {
public:
    explicit NotingModel(const QString& text) : QStandardItemModel(1, 1) {
        QStandardItemModel::setData(index(0, 0), text, Qt::EditRole);
    }

    bool setData(const QModelIndex& index, const QVariant& value, int role) override {
        written.append(value);
        roles.append(role);
        if (throws)
            throw std::runtime_error("as asked");
        return !refuses && QStandardItemModel::setData(index, value, role);
    }

    bool refuses = false;
    bool throws = false;
    QVariantList written;
    QList<int> roles;
};

// A table whose every cell is damaged.
class DamagedModel : public QAbstractTableModel {
public:
    int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : 3; }
    int columnCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : 3; }
    QVariant data(const QModelIndex& /*index*/, int role) const override {
        if (role == Qt::DisplayRole)
            throw std::invalid_argument("index");
        return {};
    }
};

class OneDatumModel : public QAbstractTableModel {
public:
    explicit OneDatumModel(QVariant datum) : datum_(std::move(datum)) {}
    int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : 1; }
    int columnCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : 1; }
    QVariant data(const QModelIndex& /*index*/, int role) const override {
        return role == Qt::DisplayRole ? datum_ : QVariant();
    }

private:
    QVariant datum_;
};

// What `act` writes to standard output.
template <typename Act>
QByteArray standard_output_of(Act act) {
    QTemporaryFile file;
    [&] { QVERIFY(file.open()); }();
    std::fflush(stdout);
    const int saved = dup(STDOUT_FILENO);
    dup2(file.handle(), STDOUT_FILENO);
    act();
    std::fflush(stdout);
    dup2(saved, STDOUT_FILENO);
    close(saved);
    file.seek(0);
    return file.readAll();
}

// A delegate that can be asked what it lays out.
template <typename Delegate>
class Open : public Delegate {
public:
    using Delegate::Delegate;
    using Delegate::initStyleOption;
};

QVariant value_not_set() { return QVariant::fromValue(ValueNotSet{}); }

}  // namespace

class DelegatesTest : public QObject {
    Q_OBJECT

private slots:
    void text_by_type_data();
    void text_by_type();
    void the_text_of_a_megabyte_is_whole();
    void a_type_without_a_rule_prints_the_fallback_line();
    void an_unchanged_name_is_not_written();
    void a_name_is_edited_whole_however_long();
    void a_changed_name_is_written_under_the_edit_role();
    void a_refused_name_is_told_data();
    void a_refused_name_is_told();
    void a_lost_name_is_told_with_its_key_data();
    void a_lost_name_is_told_with_its_key();
    void an_editor_without_user_property_is_read_by_the_default_property_of_the_type();
    void a_damaged_cell_is_told_once_and_not_through_the_paint();
    void a_megabyte_paints_like_a_kilobyte_data();
    void a_megabyte_paints_like_a_kilobyte();
    void what_a_cell_shows_is_the_beginning_of_the_text_data();
    void what_a_cell_shows_is_the_beginning_of_the_text();
    void control_characters_are_seen();
    void no_text_is_read_in_another_order_than_it_has();
    void a_text_that_is_cut_ends_in_an_ellipsis_data();
    void a_text_that_is_cut_ends_in_an_ellipsis();
    void each_cell_has_its_own_icon();
};

void DelegatesTest::text_by_type_data() {
    QTest::addColumn<QVariant>("datum");
    QTest::addColumn<QString>("text");
    QTest::newRow("text") << QVariant(QStringLiteral("a b")) << "a b";
    QTest::newRow("text like markup") << QVariant(QStringLiteral("<b>x</b>\t\"q\"")) << "<b>x</b>\t\"q\"";
    QTest::newRow("empty text") << QVariant(QString()) << "";
    QTest::newRow("42") << QVariant(42U) << "0x0000002a (42)";
    QTest::newRow("the largest of 32 bits") << QVariant(4294967295U) << "0xffffffff (4294967295)";
    QTest::newRow("42 of 64 bits") << QVariant(qulonglong(42)) << "0x000000000000002a (42)";
    QTest::newRow("0 of 64 bits") << QVariant(qulonglong(0)) << "0x0000000000000000 (0)";
    QTest::newRow("the largest of 64 bits")
        << QVariant(qulonglong(18446744073709551615ULL)) << "0xffffffffffffffff (18446744073709551615)";
    QTest::newRow("no bytes") << QVariant(QByteArray()) << "(zero-length binary value)";
    QTest::newRow("one byte") << QVariant(QByteArray(1, '\x0f')) << "0f";
    QTest::newRow("three bytes") << QVariant(QByteArray::fromHex("01ab00")) << "01 ab 00";
    QTest::newRow("no texts") << QVariant(QStringList()) << "";
    QTest::newRow("an empty text in the middle")
        << QVariant(QStringList{QStringLiteral("a"), QString(), QStringLiteral("b")}) << "a  b";
    QTest::newRow("not set") << value_not_set() << "(value not set)";
}

void DelegatesTest::text_by_type() {
    QFETCH(QVariant, datum);
    QFETCH(QString, text);
    const ValueDelegate delegate(nullptr);
    QString shown;
    QCOMPARE(standard_output_of([&] { shown = delegate.displayText(datum, QLocale(QLocale::German)); }), QByteArray());
    QCOMPARE(shown, text);
}

void DelegatesTest::the_text_of_a_megabyte_is_whole() {
    const ValueDelegate delegate(nullptr);
    const QByteArray bytes(1 << 20, '\x7e');
    const QString text = delegate.displayText(bytes, QLocale());
    QCOMPARE(text.size(), (3 << 20) - 1);
    QVERIFY(text.endsWith(QStringLiteral("7e 7e")));
    const QString letters(1 << 20, QLatin1Char('x'));
    QCOMPARE(delegate.displayText(letters, QLocale()), letters);
}

void DelegatesTest::a_type_without_a_rule_prints_the_fallback_line() {
    const ValueDelegate delegate(nullptr);
    QStringList shown;
    const auto show_twice = [&] {
        for (const double number : {1.5, 2.5})
            shown.append(delegate.displayText(QVariant(number), QLocale()));
    };
    QCOMPARE(standard_output_of(show_twice), QByteArray("fallback: rendering 'double' as string\n").repeated(2));
    QCOMPARE(shown, QStringList({QStringLiteral("1.5"), QStringLiteral("2.5")}));
}

void DelegatesTest::an_unchanged_name_is_not_written() {
    NotingModel model(QStringLiteral("name"));
    model.refuses = true;
    QLineEdit editor(QStringLiteral("name"));
    ValueDelegate(nullptr).setModelData(&editor, &model, model.index(0, 0));
    KeyDelegate(nullptr).setModelData(&editor, &model, model.index(0, 0));
    QVERIFY(model.written.isEmpty());
}

void DelegatesTest::a_name_is_edited_whole_however_long() {
    NotingModel model(QString(65535, QLatin1Char('n')));
    const ValueDelegate delegate(nullptr);
    QWidget parent;
    QWidget* const editor = delegate.createEditor(&parent, QStyleOptionViewItem(), model.index(0, 0));
    delegate.setEditorData(editor, model.index(0, 0));
    delegate.setModelData(editor, &model, model.index(0, 0));
    QVERIFY(model.written.isEmpty());
}

void DelegatesTest::a_changed_name_is_written_under_the_edit_role() {
    NotingModel model(QStringLiteral("name"));
    QLineEdit editor(QStringLiteral("Name"));
    ValueDelegate(nullptr).setModelData(&editor, &model, model.index(0, 0));
    QCOMPARE(model.written, QVariantList{QStringLiteral("Name")});
    QCOMPARE(model.roles, QList<int>{Qt::EditRole});
}

void DelegatesTest::a_refused_name_is_told_data() {
    QTest::addColumn<bool>("is_key");
    QTest::addColumn<QString>("text");
    QTest::newRow("value") << false << "The specified value name already exists.";
    QTest::newRow("key") << true << "The specified key name already exists.";
}

void DelegatesTest::a_refused_name_is_told() {
    QFETCH(bool, is_key);
    QFETCH(QString, text);
    QWidget window;
    NotingModel model(QStringLiteral("name"));
    model.refuses = true;
    QLineEdit editor(QStringLiteral("other"));
    std::unique_ptr<QStyledItemDelegate> delegate;
    if (is_key)
        delegate = std::make_unique<KeyDelegate>(&window);
    else
        delegate = std::make_unique<ValueDelegate>(&window);
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    delegate->setModelData(&editor, &model, model.index(0, 0));
    // The view is not done with the editor yet.
    QVERIFY(!hand.is_done());
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, text);
    QCOMPARE(hand.parent, &window);
    QCOMPARE(hand.buttons, QMessageBox::StandardButtons(QMessageBox::Ok));
    QCOMPARE(model.data(model.index(0, 0), Qt::DisplayRole).toString(), QStringLiteral("name"));
}

void DelegatesTest::a_lost_name_is_told_with_its_key_data() {
    QTest::addColumn<bool>("is_key");
    QTest::addColumn<QString>("key");
    QTest::newRow("value") << false << "TOP\\HIVE\\shown";
    QTest::newRow("key") << true << "name";
}

void DelegatesTest::a_lost_name_is_told_with_its_key() {
    QFETCH(bool, is_key);
    QFETCH(QString, key);
    FailureReport::instance().set_shown_key(QStringLiteral("TOP\\HIVE\\shown"));
    QWidget window;
    NotingModel model(QStringLiteral("name"));
    model.throws = true;
    QLineEdit editor(QStringLiteral("other"));
    const KeyDelegate keys(&window);
    const ValueDelegate values(&window);
    const NameDelegate& delegate = is_key ? static_cast<const NameDelegate&>(keys) : values;
    // Twice, unlike what is met while painting: each is a name that is not there now.
    for (int i = 0; i < 2; i++) {
        delegate.setModelData(&editor, &model, model.index(0, 0));
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        delegate.tell_refused_names();
        QVERIFY(hand.is_done());
        QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: as asked").arg(key));
        QCOMPARE(hand.parent, &window);
        // What would have come from the event loop has been told.
        QVERIFY(hand.nothing_comes());
    }
}

void DelegatesTest::an_editor_without_user_property_is_read_by_the_default_property_of_the_type() {
    NotingModel model(QStringLiteral("name"));
    QWidget editor;
    editor.setProperty("text", QStringLiteral("other"));
    KeyDelegate(nullptr).setModelData(&editor, &model, model.index(0, 0));
    QCOMPARE(model.written, QVariantList{QStringLiteral("other")});
}

void DelegatesTest::a_damaged_cell_is_told_once_and_not_through_the_paint() {
    DamagedModel model;
    QTableView table;
    ValueDelegate delegate(&table);
    table.setModel(&model);
    table.setItemDelegate(&delegate);
    table.resize(400, 300);
    FailureReport::instance().set_shown_key(QStringLiteral("TOP\\HIVE\\damaged"));
    // Its values stay where they are while another key's branch is opened.
    FailureReport::instance().set_current_key(QStringLiteral("TOP\\HIVE\\sound"));
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    table.show();
    QVERIFY(QTest::qWaitForWindowExposed(&table));
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("The key \"TOP\\HIVE\\damaged\" cannot be read: index"));

    // A cell says so itself.
    class Painted : public ValueDelegate {
    public:
        using ValueDelegate::initStyleOption;
        using ValueDelegate::ValueDelegate;
    };
    QStyleOptionViewItem shown;
    Painted(&table).initStyleOption(&shown, model.index(0, 1));
    QCOMPARE(shown.text, QStringLiteral("(cannot be read)"));
    QVERIFY(shown.features & QStyleOptionViewItem::HasDisplay);

    // Nine cells, painted twice: no further box.
    table.viewport()->repaint();
    QVERIFY(hand.nothing_comes());

    // The painter is as it was after a cell that threw.
    QPixmap pixmap(50, 20);
    pixmap.fill(Qt::white);
    QPainter painter(&pixmap);
    QStyleOptionViewItem option;
    option.rect = QRect(0, 0, 50, 20);
    delegate.paint(&painter, option, model.index(0, 0));
    QVERIFY(painter.isActive());
    painter.fillRect(option.rect, Qt::black);
    painter.end();
    QCOMPARE(pixmap.toImage().pixelColor(25, 10), QColor(Qt::black));
}

void DelegatesTest::a_megabyte_paints_like_a_kilobyte_data() {
    QTest::addColumn<QVariant>("small");
    QTest::addColumn<QVariant>("large");
    QTest::newRow("bytes") << QVariant(QByteArray(1 << 10, 'x')) << QVariant(QByteArray(1 << 20, 'x'));
    QTest::newRow("text") << QVariant(QString(512, QLatin1Char('x'))) << QVariant(QString(1 << 19, QLatin1Char('x')));
    QTest::newRow("texts") << QVariant(QStringList(64, QString(7, QLatin1Char('x'))))
                           << QVariant(QStringList(1 << 16, QString(7, QLatin1Char('x'))));
}

void DelegatesTest::a_megabyte_paints_like_a_kilobyte() {
    QFETCH(QVariant, small);
    QFETCH(QVariant, large);
    const ValueDelegate delegate(nullptr);
    QPixmap pixmap(400, 20);
    QPainter painter(&pixmap);
    QStyleOptionViewItem option;
    option.rect = QRect(0, 0, 400, 20);
    const auto fastest = [&](const QVariant& datum) {
        const OneDatumModel model(datum);
        qint64 best = std::numeric_limits<qint64>::max();
        for (int i = 0; i < 50; i++) {
            QElapsedTimer timer;
            timer.start();
            delegate.paint(&painter, option, model.index(0, 0));
            [[maybe_unused]] const QSize size = delegate.sizeHint(option, model.index(0, 0));
            best = std::min(best, timer.nsecsElapsed());
        }
        return best;
    };
    const qint64 of_small = fastest(small);
    const qint64 of_large = fastest(large);
    qInfo("1 KiB: %lld ns, 1 MiB: %lld ns", static_cast<long long>(of_small), static_cast<long long>(of_large));
    QVERIFY2(of_large <= 2 * of_small, "a row of 1 MiB paints more than twice as slowly as one of 1 KiB");
}

void DelegatesTest::what_a_cell_shows_is_the_beginning_of_the_text_data() {
    QTest::addColumn<QVariant>("datum");
    QTest::newRow("bytes") << QVariant(QByteArray(5000, '\x5a'));
    QTest::newRow("text") << QVariant(QString(5000, QLatin1Char('w')));
    QTest::newRow("texts") << QVariant(QStringList(900, QStringLiteral("abcde")));
}

void DelegatesTest::what_a_cell_shows_is_the_beginning_of_the_text() {
    QFETCH(QVariant, datum);
    // What reaches the style is not to be seen from outside, so the pixels are compared with a plain
    // delegate's.
    class PlainDelegate : public QStyledItemDelegate {
    public:
        QString displayText(const QVariant& value, const QLocale& locale) const override {
            return ValueDelegate(nullptr).displayText(value, locale);
        }
    };
    const auto painted = [&](const QStyledItemDelegate& delegate) {
        const OneDatumModel model(datum);
        QImage image(300, 20, QImage::Format_RGB32);
        image.fill(Qt::white);
        QPainter painter(&image);
        QStyleOptionViewItem option;
        option.rect = image.rect();
        option.textElideMode = Qt::ElideRight;  // as the table's
        delegate.paint(&painter, option, model.index(0, 0));
        painter.end();
        return image;
    };
    QCOMPARE(painted(ValueDelegate(nullptr)), painted(PlainDelegate()));
}

// A name must not look like the one without them.
void DelegatesTest::control_characters_are_seen() {
    const QString text =
        QStringLiteral("a\nb\r\n\tc") + QChar(QChar::Null) + QStringLiteral("\u007f\u0085\u2028\u2029\u200b");
    const QString seen = QStringLiteral("a\u21b5b\u2190\u21b5\tc\ufffd\ufffd\ufffd\u21b5\u21b5\u200b");
    const OneDatumModel model(text);
    QStyleOptionViewItem option;
    option.rect = QRect(0, 0, 400, 20);
    Open<ValueDelegate>(nullptr).initStyleOption(&option, model.index(0, 0));
    QCOMPARE(option.text, seen);
    Open<KeyDelegate>(nullptr).initStyleOption(&option, model.index(0, 0));
    QCOMPARE(option.text, seen);
    // What is copied and spoken is the text itself.
    QCOMPARE(ValueDelegate(nullptr).displayText(text, QLocale()), text);
}

// "invoice" and an override would read "invoiceexe.pdf".
void DelegatesTest::no_text_is_read_in_another_order_than_it_has() {
    const QString stored =
        QStringLiteral("invoice\u202efdp.exe\u202a\u202b\u202c\u202d|\u2066\u2067\u2068\u2069|\u2065");
    const QString seen = QStringLiteral("invoice\ufffdfdp.exe\ufffd\ufffd\ufffd\ufffd|\ufffd\ufffd\ufffd\ufffd|\u2065");
    QCOMPARE(with_visible_controls(stored), seen);
}

void DelegatesTest::a_text_that_is_cut_ends_in_an_ellipsis_data() {
    QTest::addColumn<QVariant>("datum");
    QTest::addColumn<qsizetype>("length");
    constexpr qsizetype all = ValueDelegate::shortest_cut;
    QTest::newRow("text that fits") << QVariant(QString(all, QLatin1Char('\n'))) << all;
    QTest::newRow("text one longer") << QVariant(QString(all + 1, QLatin1Char('\n'))) << all + 1;
    QTest::newRow("bytes that fit") << QVariant(QByteArray(85, 'x')) << qsizetype{85 * 3 - 1};
    QTest::newRow("bytes one more") << QVariant(QByteArray(86, 'x')) << all + 1;
    QTest::newRow("texts that fit") << QVariant(QStringList(all / 2, QStringLiteral("a"))) << all - 1;
    QTest::newRow("texts one more") << QVariant(QStringList(all / 2 + 1, QStringLiteral("a"))) << all + 1;
}

void DelegatesTest::a_text_that_is_cut_ends_in_an_ellipsis() {
    QFETCH(QVariant, datum);
    QFETCH(qsizetype, length);
    const OneDatumModel model(datum);
    QStyleOptionViewItem option;
    option.rect = QRect(0, 0, 400, 20);
    Open<ValueDelegate>(nullptr).initStyleOption(&option, model.index(0, 0));
    QCOMPARE(option.text.size(), length);
    QCOMPARE(option.text.endsWith(QChar(0x2026)), length > ValueDelegate::shortest_cut);
}

// One delegate paints all cells in turn, and what it takes from one must not stay for the next.
void DelegatesTest::each_cell_has_its_own_icon() {
    QPixmap red(16, 16);
    red.fill(Qt::red);
    QStandardItemModel model(1, 2);
    model.setData(model.index(0, 0), QString(300, QLatin1Char('n')), Qt::DisplayRole);
    model.setData(model.index(0, 0), QIcon(red), Qt::DecorationRole);
    model.setData(model.index(0, 1), QString(300, QLatin1Char('d')), Qt::DisplayRole);
    const ValueDelegate delegate(nullptr);
    const auto red_pixels = [&](int column) {
        QImage image(300, 20, QImage::Format_RGB32);
        image.fill(Qt::white);
        QPainter painter(&image);
        QStyleOptionViewItem option;
        option.rect = image.rect();
        option.state = QStyle::State_Enabled;
        option.decorationSize = red.size();
        delegate.paint(&painter, option, model.index(0, column));
        painter.end();
        int count = 0;
        for (int y = 0; y < image.height(); y++) {
            for (int x = 0; x < image.width(); x++)
                count += image.pixelColor(x, y) == Qt::red ? 1 : 0;
        }
        return count;
    };
    QCOMPARE(red_pixels(0), 16 * 16);
    QCOMPARE(red_pixels(1), 0);
    QCOMPARE(red_pixels(0), 16 * 16);
}

UI_TEST_MAIN(DelegatesTest)
#include "delegates_test.moc"
