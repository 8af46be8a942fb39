// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The values table: values made, named and deleted, and what is refused.

#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QDialogButtonBox>
#include <QLineEdit>
#include <QStandardItemModel>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");
const QString deep = QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep");
const QString beta = QStringLiteral("MACHINE\\SYSTEM\\Beta");

// Takes the row away, and then refuses to.
class ReturningModel : public QStandardItemModel {
public:
    using QStandardItemModel::QStandardItemModel;
    bool removeRows(int row, int /*count*/, const QModelIndex& /*parent*/) override {
        insertRow(row, takeRow(row));
        return false;
    }
};

// A key with values under names that 8 bits do not carry, and one of a type without a name.
testkit::HiveLayout odd_values() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key");
    const auto set_wide = [&key](const char16_t* name, uint32_t type, const testkit::Bytes& data) {
        testkit::ValueLayout& wide = key.set("wide", type, data);
        wide.name = name;
        wide.wide_name = true;
    };
    set_wide(u"\u65e5\u672c", 1, testkit::text_data("text"));
    key.set("odd", 12, {1, 2});
    set_wide(u"\u5217", 7, {'a', 0, 0, 0, 0, 0});
    set_wide(u"\u6570", 4, {1, 0, 0, 0});
    set_wide(u"\u5927", 11, {1, 0, 0, 0, 0, 0, 0, 0});
    return hive;
}

const QString odd_key = QStringLiteral("MACHINE\\SYSTEM\\Key");

}  // namespace

class ValuesViewChangesTest : public QObject {
    Q_OBJECT

private slots:
    void a_new_value_is_named_in_place_data();
    void a_new_value_is_named_in_place();
    void a_value_that_cannot_be_made_is_told();
    void deletion_asks_data();
    void deletion_asks();
    void what_is_deleted_was_asked_about();
    void nothing_is_deleted_for_a_value_that_has_gone();
    void deleting_the_default_value_leaves_it_unset();
    void a_rename_in_place();
    void a_rename_to_another_value_s_name_is_told();
    void actions_of_the_other_view_do_nothing_here();
    void a_refused_edit_is_told_data();
    void a_refused_edit_is_told();
    void a_refused_creation_is_told_data();
    void a_refused_creation_is_told();
    void a_refused_deletion_is_told_and_keeps_the_row();
    void a_deletion_refused_after_its_row_went_keeps_the_row();
    void the_first_value_beside_the_unset_default_can_be_renamed();
};

void ValuesViewChangesTest::a_new_value_is_named_in_place_data() {
    QTest::addColumn<QAction*>("action");
    QTest::addColumn<quint32>("type");
    QTest::addColumn<QVariant>("data");
    const SharedActions& actions = shared_actions();
    QTest::newRow("string") << actions.new_string_action << 1U << QVariant(QString());
    QTest::newRow("expandable") << actions.new_expand_string_action << 2U << QVariant(QString());
    QTest::newRow("binary") << actions.new_binary_action << 3U << QVariant(QByteArray(""));
    QTest::newRow("dword") << actions.new_dword_action << 4U << QVariant(0U);
    // The two zeros of an empty list read as one empty text.
    QTest::newRow("multi-string") << actions.new_multi_string_action << 7U << QVariant(QStringList{QString()});
    QTest::newRow("qword") << actions.new_qword_action << 11U << QVariant(qulonglong(0));
}

void ValuesViewChangesTest::a_new_value_is_named_in_place() {
    QFETCH(QAction*, action);
    QFETCH(quint32, type);
    QFETCH(QVariant, data);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    // Not gated by the focus.
    stage.keys->setFocus();
    action->trigger();
    const int last = stage.values->model()->rowCount() - 1;
    QCOMPARE(stage.values->currentIndex(), stage.values->model()->index(last, 0));
    QCOMPARE(qobject_cast<QLineEdit*>(QApplication::focusWidget())->text(), QStringLiteral("New Value #1"));
    stage.press_in_editor(QStringLiteral("AAA"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("AAA")));
    const auto value = stored(stage, QStringLiteral("AAA"));
    QCOMPARE(value->type, type);
    QCOMPARE(value->data, data);
    // It keeps its row until the next sort.
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b AAA"));
    stage.window.refresh_views();
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A AAA b"));
}

void ValuesViewChangesTest::a_value_that_cannot_be_made_is_told() {
    const Scene scene;
    Stage stage(scene);
    const DialogHand hand;
    // Without a key there is nothing to make and nothing to tell.
    stage.select_key(QStringLiteral("MACHINE"));
    stage.values->run_new_value_action(shared_actions().new_string_action);
    QVERIFY(hand.nothing_comes());
    // The action that makes keys belongs to the group too.
    stage.select_key(beta);
    stage.values->run_new_value_action(shared_actions().new_key_action);
    QCOMPARE(stage.value_names().size(), 1);
}

void ValuesViewChangesTest::deletion_asks_data() {
    QTest::addColumn<QMessageBox::StandardButton>("answer");
    QTest::addColumn<QString>("left");
    QTest::newRow("yes") << QMessageBox::Yes << "(Default) b";
    QTest::newRow("no") << QMessageBox::No << "(Default) A b";
}

void ValuesViewChangesTest::deletion_asks() {
    QFETCH(QMessageBox::StandardButton, answer);
    QFETCH(QString, left);
    const Scene scene;
    Stage stage(scene);
    stage.select_value(deep, QStringLiteral("A"));
    DialogHand hand;
    hand.then_press(answer);
    QTest::keyClick(stage.values, Qt::Key_Delete);
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Question);
    QCOMPARE(hand.title, QStringLiteral("Confirm Value Removal"));
    QCOMPARE(hand.text, QStringLiteral("Are you sure you want to delete this value?"));
    QCOMPARE(hand.parent, stage.values);
    QCOMPARE(hand.buttons, QMessageBox::Yes | QMessageBox::No);
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), left);
    QCOMPARE(stage.values->currentIndex().row(), 1);
    QVERIFY(shared_actions().rename_action->isEnabled());
    // The key itself is where it was.
    QCOMPARE(stage.keys->currentIndex(), stage.key(deep));
}

void ValuesViewChangesTest::what_is_deleted_was_asked_about() {
    const Scene scene;
    Stage stage(scene);
    stage.select_value(deep, QStringLiteral("A"));
    DialogHand hand;
    hand.then([&](QWidget* question) {
        stage.values->setCurrentIndex(stage.value(QStringLiteral("b")));
        QTest::mouseClick(qobject_cast<QMessageBox*>(question)->button(QMessageBox::Yes), Qt::LeftButton);
    });
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) b"));
    QVERIFY(stored(stage, QStringLiteral("b")));
    QVERIFY(!stored(stage, QStringLiteral("A")));
}

void ValuesViewChangesTest::nothing_is_deleted_for_a_value_that_has_gone() {
    const Scene scene;
    Stage stage(scene);
    stage.select_value(deep, QStringLiteral("A"));
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then([&](QWidget* question) {
        stage.select_key(alpha);
        stage.values->setCurrentIndex(stage.value(QStringLiteral("bytes")));
        QTest::mouseClick(qobject_cast<QMessageBox*>(question)->button(QMessageBox::Yes), Qt::LeftButton);
    });
    bool was_told = false;
    hand.then([&](QWidget* box) {
        was_told = true;
        QTest::keyClick(box, Qt::Key_Return);
    });
    shared_actions().delete_action->trigger();
    QVERIFY(!was_told);
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("bytes")));
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::deleting_the_default_value_leaves_it_unset() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QCOMPARE(stage.cell(0, 2), QStringLiteral("set"));
    DialogHand hand;
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QVERIFY(!stored(stage, QString()));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QVERIFY(stage.values->model()->index(0, 2).data().typeId() >= QMetaType::User);
    QVERIFY(!shared_actions().rename_action->isEnabled());
    // Deleting what is not set changes nothing and says nothing.
    stage.return_to(*stage.values);
    const QByteArray before = scene.bytes();
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QVERIFY(hand.nothing_comes());
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::a_rename_in_place() {
    const Scene scene;
    Stage stage(scene);
    stage.select_value(deep, QStringLiteral("A"));
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("zzz"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("zzz")));
    QVERIFY(!stored(stage, QStringLiteral("A")));
    QCOMPARE(stored(stage, QStringLiteral("zzz"))->data, QVariant(2U));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) zzz b"));
    // The unnamed value cannot be renamed: no editor opens.
    QTRY_VERIFY(stage.values->hasFocus());
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QTest::keyClick(stage.values, Qt::Key_F2);
    QVERIFY(stage.values->hasFocus());
}

void ValuesViewChangesTest::a_rename_to_another_value_s_name_is_told() {
    const Scene scene;
    Stage stage(scene);
    stage.select_value(deep, QStringLiteral("A"));
    const QByteArray before = scene.bytes();
    shared_actions().rename_action->trigger();
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    stage.press_in_editor(QStringLiteral("b"), Qt::Key_Return);
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The specified value name already exists."));
    QCOMPARE(hand.parent, &stage.window);
    QTRY_VERIFY(!stage.values->findChild<QLineEdit*>());
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::actions_of_the_other_view_do_nothing_here() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.values->setCurrentIndex(stage.value(QStringLiteral("text")));
    QVERIFY(shared_actions().delete_action->isEnabled());
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    // The tree asks about its key instead; the answer is no.
    DialogHand hand;
    hand.then_press(QMessageBox::No);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.title, QStringLiteral("Confirm Key Removal"));
    shared_actions().rename_action->trigger();
    QVERIFY(!stage.values->findChild<QLineEdit*>());
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::a_refused_edit_is_told_data() {
    QTest::addColumn<QString>("name");
    QTest::newRow("a name in UTF-16") << QString::fromUtf8("日本");
    QTest::newRow("a type without a name") << QStringLiteral("odd");
    QTest::newRow("a list") << QString::fromUtf8("列");
    QTest::newRow("32 bits") << QString::fromUtf8("数");
    QTest::newRow("64 bits") << QString::fromUtf8("大");
}

void ValuesViewChangesTest::a_refused_edit_is_told() {
    QFETCH(QString, name);
    const Scene scene(odd_values());
    Stage stage(scene);
    stage.select_key(odd_key);
    const QByteArray before = scene.bytes();
    DialogHand hand;
    // Left alone, there is nothing to refuse.
    hand.then([](QWidget* dialog) { press(*dialog, QDialogButtonBox::Ok); });
    double_click(stage, stage.value(name));
    QVERIFY(hand.is_done());
    QVERIFY(hand.nothing_comes());
    hand.then([](QWidget* dialog) {
        QTest::keyClicks(QApplication::focusWidget(), QStringLiteral("ab"));
        press(*dialog, QDialogButtonBox::Ok);
    });
    hand.then_press(QMessageBox::Ok);
    stage.values->value_double_clicked(stage.value(name));
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("The value could not be changed."));
    QCOMPARE(hand.parent, stage.values);
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::a_refused_creation_is_told_data() {
    QTest::addColumn<bool>("is_default");
    QTest::newRow("the default value") << true;
    QTest::newRow("a new value") << false;
}

void ValuesViewChangesTest::a_refused_creation_is_told() {
    QFETCH(bool, is_default);
    Scene scene(odd_values());
    // Whether a record that cannot be read has the new value's name cannot be known.
    scene.damage_value("Key", 0);
    Stage stage(scene);
    stage.select_key(odd_key);
    const QByteArray before = scene.bytes();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("odd")));
    const QStringList shown = stage.value_names();
    // The record itself is told too, at a time of its own, and once in all rows of this test.
    QStringList told;
    QTimer presser;
    connect(&presser, &QTimer::timeout, &presser, [&] {
        if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
            told.append(box->text());
            QTest::mouseClick(box->button(QMessageBox::Ok), Qt::LeftButton);
        } else if (QWidget* dialog = QApplication::activeModalWidget()) {
            press(*dialog, QDialogButtonBox::Ok);
        }
    });
    presser.start(1);
    if (is_default)
        stage.values->value_double_clicked(stage.values->model()->index(0, 0));
    else
        shared_actions().new_string_action->trigger();
    QCOMPARE(told.count(QStringLiteral("The value could not be created.")), 1);
    QCOMPARE(stage.value_names(), shown);
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("odd")));
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::a_refused_deletion_is_told_and_keeps_the_row() {
    const Scene scene(odd_values());
    Stage stage(scene);
    stage.select_key(odd_key);
    stage.values->setFocus();
    const QModelIndex wide = stage.value(QString::fromUtf8("日本"));
    stage.values->setCurrentIndex(wide);
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.text, QStringLiteral("The value could not be deleted."));
    QCOMPARE(stage.values->currentIndex(), stage.value(QString::fromUtf8("日本")));
    QCOMPARE(stage.values->selectionModel()->selectedIndexes(), QModelIndexList{stage.values->currentIndex()});
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewChangesTest::a_deletion_refused_after_its_row_went_keeps_the_row() {
    const Scene scene;
    Stage stage(scene);
    ReturningModel model(3, 3);
    stage.values->setModel(&model);
    stage.values->setFocus();
    for (int row = 0; row < model.rowCount(); row++) {
        const QModelIndex asked = model.index(row, 1);
        stage.return_to(*stage.values);
        stage.values->setCurrentIndex(asked);
        shared_actions().delete_action->setEnabled(true);
        DialogHand hand;
        hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
        shared_actions().delete_action->trigger();
        QVERIFY(hand.is_done());
        QCOMPARE(hand.text, QStringLiteral("The value could not be deleted."));
        QCOMPARE(stage.values->currentIndex(), model.index(row, 0));
        QCOMPARE(stage.values->selectionModel()->selectedIndexes(), QModelIndexList{model.index(row, 0)});
    }
}

void ValuesViewChangesTest::the_first_value_beside_the_unset_default_can_be_renamed() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(beta);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QVERIFY(!shared_actions().rename_action->isEnabled());
    shared_actions().new_string_action->trigger();
    QVERIFY(shared_actions().rename_action->isEnabled());
    stage.press_in_editor(QStringLiteral("first"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("first")));
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("first")));
}

UI_TEST_MAIN(ValuesViewChangesTest)
#include "values_view_changes_test.moc"
