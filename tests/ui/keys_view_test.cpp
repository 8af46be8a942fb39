// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The key tree: its context menu, and keys made, named, renamed and deleted through the shared actions.

#include "hive_reader.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QLineEdit>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");

QString joined(const QStringList& names) { return names.join(QLatin1Char(' ')); }

// The subkeys of a path below the hive's root as they stand in the file, read without the program.
QString subkeys_in_file(const Scene& scene, const char* path) {
    const testkit::Hive hive = testkit::read_hive(scene.file_bytes());
    const testkit::Key* key = hive.find(std::string(path));
    QStringList names;
    for (const testkit::Key& child : key->children)
        names.append(QString::fromStdU16String(child.name));
    return joined(names);
}

}  // namespace

class KeysViewTest : public QObject {
    Q_OBJECT

private slots:
    void the_context_menu_of_a_key();
    void a_right_click_on_a_branch_is_about_its_key();
    void no_context_menu_below_the_last_key();
    void a_new_key_is_named_in_place();
    void a_new_key_keeps_its_proposed_name();
    void a_key_that_cannot_be_made_changes_nothing();
    void a_new_key_needs_no_focus();
    void deletion_asks_data();
    void deletion_asks();
    void what_is_deleted_was_asked_about_data();
    void what_is_deleted_was_asked_about();
    void closing_the_question_deletes_nothing();
    void a_branch_is_deleted_with_all_below();
    void a_refused_deletion_is_told_and_changes_nothing();
    void a_rename_in_place();
    void an_escaped_rename_writes_nothing();
    void a_rename_to_a_sibling_s_name_is_told();
    void actions_of_the_other_view_do_nothing_here();
    void typing_passes_over_a_key_without_a_name();
    void typing_from_a_closed_branch_ends();
    void typing_goes_round_the_end();
    void one_letter_again_and_again_goes_from_match_to_match();
    void an_asterisk_opens_all_below();
    void an_asterisk_tells_what_it_cannot_open();
    void an_asterisk_tells_a_branch_that_cannot_be_counted_and_opens_the_others();
    void an_asterisk_on_a_hive_without_end_ends();
};

void KeysViewTest::the_context_menu_of_a_key() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    bool shown = with_context_menu(*stage.keys, stage.keys->visualRect(stage.key(alpha)).center(), [](QMenu& menu) {
        QCOMPARE(joined(texts_of(menu)), QStringLiteral("New Delete Rename"));
        QCOMPARE(menu.actions()[0]->menu()->actions(), QList<QAction*>{shared_actions().new_key_action});
        QCOMPARE(menu.actions()[1], shared_actions().delete_action);
        QCOMPARE(menu.actions()[2], shared_actions().rename_action);
        QCOMPARE(menu.parentWidget(), nullptr);
    });
    QVERIFY(shown);
}

void KeysViewTest::a_right_click_on_a_branch_is_about_its_key() {
    const Scene scene;
    Stage stage(scene);
    stage.keys->expand(stage.key(alpha));
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->setFocus();
    const QModelIndex deep = stage.key(alpha + QStringLiteral("\\Deep"));
    const QRect name = stage.keys->visualRect(deep);
    const QPoint branch(name.left() - stage.keys->indentation() / 2, name.center().y());
    QCOMPARE(stage.keys->indexAt(branch), deep);
    QTest::mousePress(stage.keys->viewport(), Qt::RightButton, {}, branch);
    DialogHand hand;
    hand.then_press(QMessageBox::Yes);
    QVERIFY(with_context_menu(*stage.keys, branch, [](QMenu& menu) { menu.actions()[1]->trigger(); }));
    QVERIFY(hand.is_done());
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Leaf Zeta"));
    // The other button opens the branch and leaves the current key.
    stage.select_key(alpha);
    const QRect root = stage.keys->visualRect(stage.key(QStringLiteral("MACHINE\\SYSTEM")));
    QTest::mouseClick(stage.keys->viewport(), Qt::LeftButton, {},
                      QPoint(root.left() - stage.keys->indentation() / 2, root.center().y()));
    QCOMPARE(stage.status(), alpha);
}

void KeysViewTest::no_context_menu_below_the_last_key() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE"));
    const QPoint below(20, stage.keys->viewport()->height() - 5);
    QVERIFY(!stage.keys->indexAt(below).isValid());
    QVERIFY(!with_context_menu(*stage.keys, below, [](QMenu&) {}));
}

void KeysViewTest::a_new_key_is_named_in_place() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.keys->setFocus();
    shared_actions().new_key_action->trigger();
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Leaf New Key #1 Zeta"));
    QCOMPARE(stage.keys->currentIndex(), stage.key(alpha + QStringLiteral("\\New Key #1")));
    QCOMPARE(qobject_cast<QLineEdit*>(QApplication::focusWidget())->text(), QStringLiteral("New Key #1"));
    stage.press_in_editor(QStringLiteral("aaa"), Qt::Key_Return);
    QTRY_COMPARE(joined(stage.subkeys(alpha)), QStringLiteral("aaa Deep Leaf Zeta"));
    QTRY_COMPARE(stage.keys->currentIndex(), stage.key(alpha + QStringLiteral("\\aaa")));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\aaa"));
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("aaa Deep Leaf Zeta"));
}

void KeysViewTest::a_new_key_keeps_its_proposed_name() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    shared_actions().new_key_action->trigger();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    QTRY_VERIFY(!qobject_cast<QLineEdit*>(QApplication::focusWidget()));
    stage.select_key(alpha);
    shared_actions().new_key_action->trigger();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Leaf New Key #1 New Key #2 Zeta"));
}

void KeysViewTest::a_key_that_cannot_be_made_changes_nothing() {
    const Scene scene;
    Stage stage(scene);
    // Directly below a hive's root none can be made; the action is disabled there, the slot refuses as well.
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM"));
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    stage.keys->run_new_key_action(false);
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("The key could not be created."));
    QCOMPARE(stage.keys->currentIndex(), stage.key(QStringLiteral("MACHINE\\SYSTEM")));
    QVERIFY(!stage.keys->findChild<QLineEdit*>());
    QCOMPARE(scene.bytes(), before);
}

void KeysViewTest::a_new_key_needs_no_focus() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.values->setFocus();
    shared_actions().new_key_action->trigger();
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Leaf New Key #1 Zeta"));
}

void KeysViewTest::deletion_asks_data() {
    QTest::addColumn<QMessageBox::StandardButton>("answer");
    QTest::addColumn<QString>("left");
    QTest::newRow("yes") << QMessageBox::Yes << "Deep Zeta";
    QTest::newRow("no") << QMessageBox::No << "Deep Leaf Zeta";
}

void KeysViewTest::deletion_asks() {
    QFETCH(QMessageBox::StandardButton, answer);
    QFETCH(QString, left);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->setFocus();
    DialogHand hand;
    hand.then_press(answer);
    QTest::keyClick(stage.keys, Qt::Key_Delete);
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Question);
    QCOMPARE(hand.title, QStringLiteral("Confirm Key Removal"));
    QCOMPARE(hand.text, QStringLiteral("Are you sure you want to delete this key and its subkeys?"));
    QCOMPARE(hand.parent, stage.keys);
    QCOMPARE(hand.buttons, QMessageBox::Yes | QMessageBox::No);
    QCOMPARE(joined(stage.subkeys(alpha)), left);
    QCOMPARE(subkeys_in_file(scene, "Alpha"), left);
    QVERIFY(stage.keys->currentIndex().isValid());
    QCOMPARE(stage.status(),
             answer == QMessageBox::Yes ? alpha + QStringLiteral("\\Zeta") : alpha + QStringLiteral("\\Leaf"));
}

void KeysViewTest::what_is_deleted_was_asked_about_data() {
    QTest::addColumn<QString>("asked");
    QTest::addColumn<QString>("meanwhile");
    QTest::addColumn<QString>("left");
    QTest::addColumn<QString>("current");
    QTest::addColumn<QStringList>("values");  // of the key that is current then, and not of one that has gone
    QTest::newRow("a sibling became current")
        << "Leaf"
        << "Deep"
        << "Deep Zeta"
        << "Deep" << QStringList{QStringLiteral("(Default)"), QStringLiteral("A"), QStringLiteral("b")};
    QTest::newRow("a key below became current") << "Deep"
                                                << "Deep\\Deeper"
                                                << "Leaf Zeta"
                                                << "Leaf" << QStringList{QStringLiteral("(Default)")};
}

void KeysViewTest::what_is_deleted_was_asked_about() {
    QFETCH(const QString, asked);
    QFETCH(const QString, meanwhile);
    const auto in_alpha = [](const QString& name) { return alpha + QLatin1Char('\\') + name; };
    const Scene scene;
    Stage stage(scene);
    stage.select_key(in_alpha(asked));
    stage.keys->setFocus();
    DialogHand hand;
    hand.then([&](QWidget* question) {
        stage.select_key(in_alpha(meanwhile));
        QTest::mouseClick(qobject_cast<QMessageBox*>(question)->button(QMessageBox::Yes), Qt::LeftButton);
    });
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QTEST(subkeys_in_file(scene, "Alpha"), "left");
    QFETCH(const QString, current);
    QCOMPARE(stage.status(), in_alpha(current));
    QTEST(stage.value_names(), "values");
}

void KeysViewTest::closing_the_question_deletes_nothing() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then([](QWidget* dialog) { QTest::keyClick(dialog, Qt::Key_Escape); });
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(scene.bytes(), before);
}

void KeysViewTest::a_branch_is_deleted_with_all_below() {
    const Scene scene;
    Stage stage(scene);
    stage.keys->expandAll();
    stage.select_key(alpha + QStringLiteral("\\Deep"));
    stage.keys->setFocus();
    DialogHand hand;
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Leaf Zeta"));
    // The last key of a branch leaves its parent current.
    for (int i = 0; i < 2; i++) {
        stage.return_to(*stage.keys);
        stage.keys->setCurrentIndex(stage.model->index(0, 0, stage.key(alpha)));
        hand.then_press(QMessageBox::Yes);
        shared_actions().delete_action->trigger();
        QVERIFY(hand.is_done());
    }
    QCOMPARE(stage.keys->currentIndex(), stage.key(alpha));
    QCOMPARE(stage.status(), alpha);
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QString());
}

void KeysViewTest::a_refused_deletion_is_told_and_changes_nothing() {
    Scene scene;
    scene.damage_key("Alpha\\Deep\\Deeper");
    Stage stage(scene);
    const QModelIndex deep = stage.key(alpha + QStringLiteral("\\Deep"));
    stage.keys->setCurrentIndex(deep);
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
    shared_actions().delete_action->trigger();
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.text, QStringLiteral("The key could not be deleted."));
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Leaf Zeta"));
    QCOMPARE(stage.keys->currentIndex(), stage.key(alpha + QStringLiteral("\\Deep")));
    QCOMPARE(stage.values->model()->rowCount(), 3);
    QCOMPARE(scene.bytes(), before);

    // And the next gesture works.
    stage.return_to(*stage.keys);
    stage.select_key(alpha + QStringLiteral("\\Zeta"));
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Leaf"));
}

void KeysViewTest::a_rename_in_place() {
    const Scene scene;
    Stage stage(scene);
    for (const char* name : {"Lead", "zz", "AA"}) {
        const QString old_name = stage.keys->currentIndex().parent() == stage.key(alpha)
                                     ? stage.keys->currentIndex().data(Qt::DisplayRole).toString()
                                     : QStringLiteral("Leaf");
        stage.select_key(alpha + QLatin1Char('\\') + old_name);
        stage.keys->setFocus();
        shared_actions().rename_action->trigger();
        stage.press_in_editor(QString::fromLatin1(name), Qt::Key_Return);
        QTRY_COMPARE(stage.keys->currentIndex().data(Qt::DisplayRole).toString(), QString::fromLatin1(name));
        QTRY_VERIFY(stage.keys->hasFocus());
    }
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("AA Deep Zeta"));
    QCOMPARE(stage.keys->selectionModel()->selectedIndexes(), QModelIndexList{stage.keys->currentIndex()});
}

void KeysViewTest::an_escaped_rename_writes_nothing() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    QTest::keyClick(stage.keys, Qt::Key_F2);
    stage.press_in_editor(QStringLiteral("other"), Qt::Key_Escape);
    QTRY_VERIFY(stage.keys->hasFocus());
    QCOMPARE(scene.bytes(), before);
    // Confirmed unchanged, nothing is written either.
    shared_actions().rename_action->trigger();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    QTRY_VERIFY(stage.keys->hasFocus());
    QCOMPARE(scene.bytes(), before);
}

void KeysViewTest::a_rename_to_a_sibling_s_name_is_told() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    shared_actions().rename_action->trigger();
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    stage.press_in_editor(QStringLiteral("zeta"), Qt::Key_Return);
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The specified key name already exists."));
    QCOMPARE(hand.parent, &stage.window);
    QTRY_VERIFY(!QApplication::activeModalWidget());
    QTRY_VERIFY(!stage.keys->findChild<QLineEdit*>());
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Leaf Zeta"));
    QCOMPARE(scene.bytes(), before);
}

void KeysViewTest::actions_of_the_other_view_do_nothing_here() {
    const Scene scene;
    Stage stage(scene);
    const DialogHand hand;
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    // Nothing is selected in the table, so there is nothing to ask about there.
    stage.values->setFocus();
    QVERIFY(stage.values->hasFocus());
    stage.values->setCurrentIndex(QModelIndex());
    const QByteArray before = scene.bytes();
    shared_actions().delete_action->setEnabled(true);
    shared_actions().rename_action->setEnabled(true);
    shared_actions().delete_action->trigger();
    shared_actions().rename_action->trigger();
    QVERIFY(hand.nothing_comes());
    QVERIFY(!stage.keys->findChild<QLineEdit*>());
    QCOMPARE(scene.bytes(), before);
}

void KeysViewTest::typing_passes_over_a_key_without_a_name() {
    Scene scene;
    scene.damage_key("Alpha\\Leaf");
    Stage stage(scene);
    DialogHand hand;
    // The damaged key itself, as it comes into sight.
    hand.then_press(QMessageBox::Ok);
    stage.keys->expand(stage.key(alpha));
    stage.select_key(alpha + QStringLiteral("\\Deep"));
    QTRY_VERIFY(hand.is_done());
    stage.return_to(*stage.keys);
    QTest::keyClicks(stage.keys, QStringLiteral("ze"));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    QVERIFY(hand.nothing_comes());
    // Round the end, past it again.
    stage.keys->keyboardSearch(QStringLiteral("ta"));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
}

void KeysViewTest::typing_from_a_closed_branch_ends() {
    const Scene scene;
    Stage stage(scene);
    stage.keys->expand(stage.key(alpha));
    stage.select_key(alpha + QStringLiteral("\\Leaf"));
    stage.keys->collapse(stage.key(alpha));
    stage.return_to(*stage.keys);
    QTest::keyClicks(stage.keys, QStringLiteral("q"));
    stage.select_key(alpha);
    // Every letter begins anew; one again and again goes from match to match.
    const int interval = QApplication::keyboardInputInterval();
    QApplication::setKeyboardInputInterval(0);
    for (const char* name : {"MACHINE\\SYSTEM\\Beta", "MACHINE\\SYSTEM\\Beta"}) {
        QTest::keyClicks(stage.keys, QStringLiteral("b"));
        QCOMPARE(stage.status(), QString::fromLatin1(name));
    }
    QApplication::setKeyboardInputInterval(interval);
}

void KeysViewTest::typing_goes_round_the_end() {
    const Scene scene;
    Stage stage(scene);
    stage.keys->expand(stage.key(alpha));
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Beta"));
    stage.return_to(*stage.keys);
    QTest::keyClicks(stage.keys, QStringLiteral("de"));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Deep"));
}

void KeysViewTest::one_letter_again_and_again_goes_from_match_to_match() {
    testkit::HiveLayout hive;
    for (const char* name : {"Bat", "Bee", "Bb"})
        hive.root.add(name);
    const Scene scene(hive);
    Stage stage(scene);
    const QString root = QStringLiteral("MACHINE\\SYSTEM");
    stage.keys->expand(stage.key(root));
    stage.select_key(root);
    stage.return_to(*stage.keys);
    for (const char* name : {"Bat", "Bb", "Bee", "Bat"}) {
        stage.keys->keyboardSearch(QStringLiteral("b"));
        QCOMPARE(stage.status(), root + QLatin1Char('\\') + QString::fromLatin1(name));
    }
}

void KeysViewTest::an_asterisk_opens_all_below() {
    const Scene scene;
    Stage stage(scene);
    stage.keys->setFocus();
    stage.select_key(QStringLiteral("MACHINE"));
    QTest::keyClick(stage.keys, Qt::Key_Asterisk);
    for (const QString& branch :
         {QStringLiteral("MACHINE"), QStringLiteral("MACHINE\\SYSTEM"), alpha, alpha + QStringLiteral("\\Deep")}) {
        QVERIFY2(stage.keys->isExpanded(stage.key(branch)), qPrintable(branch));
    }
    QVERIFY(stage.keys->visualRect(stage.key(alpha + QStringLiteral("\\Deep\\Deeper"))).isValid());
}

void KeysViewTest::an_asterisk_tells_what_it_cannot_open() {
    // Below what the window shows: it is told as the tree measures its rows.
    constexpr int sound_keys = 100;
    testkit::HiveLayout hive;
    for (int i = 0; i < sound_keys; i++)
        hive.root.add("a" + std::to_string(1000 + i));
    hive.root.add("damaged");
    hive.root.add("last").add("below");
    Scene scene(hive);
    scene.damage_key("damaged");
    Stage stage(scene);
    const QString root = QStringLiteral("MACHINE\\SYSTEM");
    stage.select_key(root);
    stage.return_to(*stage.keys);
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    QTest::keyClick(stage.keys, Qt::Key_Asterisk);
    QTRY_VERIFY(hand.is_done());
    QVERIFY2(hand.text.startsWith(QStringLiteral("The key \"%1\\#%2\" cannot be read: ").arg(root).arg(sound_keys)),
             qPrintable(hand.text));
    QVERIFY(stage.keys->isExpanded(stage.key(root)));
    QVERIFY(stage.keys->isExpanded(stage.model->index(sound_keys + 1, 0, stage.key(root))));
}

// A model that cannot count the keys below one, for as long as a gesture takes.
class UncountableModel : public RegModel {
public:
    int rowCount(const QModelIndex& parent = QModelIndex()) const override {
        if (fails && parent == uncountable)
            throw std::runtime_error("not now");
        return RegModel::rowCount(parent);
    }

    QModelIndex uncountable;
    bool fails = false;
};

void KeysViewTest::an_asterisk_tells_a_branch_that_cannot_be_counted_and_opens_the_others() {
    testkit::HiveLayout hive;
    hive.root.add("first").add("below");
    hive.root.add("second").add("below");
    const Scene scene(hive);
    Stage stage(scene, std::make_unique<UncountableModel>());
    auto& model = static_cast<UncountableModel&>(*stage.model);
    const QString root = QStringLiteral("MACHINE\\SYSTEM");
    model.uncountable = stage.key(root + QStringLiteral("\\first"));
    stage.select_key(root);
    stage.return_to(*stage.keys);
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    model.fails = true;
    QTest::keyClick(stage.keys, Qt::Key_Asterisk);
    model.fails = false;
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The key \"%1\\first\" cannot be read: not now").arg(root));
    QVERIFY(!stage.keys->isExpanded(model.uncountable));
    QVERIFY(stage.keys->isExpanded(stage.key(root + QStringLiteral("\\second"))));
    QVERIFY(hand.nothing_comes());
}

void KeysViewTest::an_asterisk_on_a_hive_without_end_ends() {
    // Each step lists the next one twice, so that the rows double on each of the forty levels.
    constexpr int levels = 40;
    testkit::HiveLayout ladder;
    testkit::KeyLayout* step = &ladder.root;
    for (int i = 0; i < levels; i++) {
        step->add("twin");
        step = &step->add("step");
    }
    const Scene scene(ladder, [](testkit::LaidHive& laid) {
        std::string path;
        for (int i = 0; i < levels; i++) {
            const uint32_t index = laid.at(path).index;
            laid.put32(index, 12, laid.get32(index, 4));
            path += path.empty() ? "step" : "\\step";
        }
    });
    Stage stage(scene);
    stage.keys->setFocus();
    stage.select_key(QStringLiteral("MACHINE"));
    QTest::keyClick(stage.keys, Qt::Key_Asterisk);
    const QModelIndex root = stage.key(QStringLiteral("MACHINE\\SYSTEM"));
    QVERIFY(stage.keys->isExpanded(root));
    QVERIFY(stage.keys->isExpanded(stage.model->index(0, 0, root)));
}

UI_TEST_MAIN(KeysViewTest)
#include "keys_view_test.moc"
