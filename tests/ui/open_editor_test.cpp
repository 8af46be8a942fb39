// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// Commands that come while a name is being typed in the tree or the table: the name goes to the row it was typed for,
// before anything moves that row.

#include "hive_reader.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QActionGroup>
#include <QCheckBox>
#include <QDialogButtonBox>
#include <QLineEdit>
#include <QSemaphore>
#include <QThread>

#include <atomic>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");
const QString beta = QStringLiteral("MACHINE\\SYSTEM\\Beta");
const QString deep = QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep");
const QString leaf = QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Leaf");

QString joined(const QStringList& names) { return names.join(QLatin1Char(' ')); }

// Names of subkeys or values as they stand in the file, in alphabetical order, read without the program.
template <typename Named>
QString names_of(const std::vector<Named>& all) {
    QStringList names;
    for (const Named& each : all)
        names.append(QString::fromStdU16String(each.name));
    names.sort(Qt::CaseInsensitive);
    return joined(names);
}

QString subkeys_in_file(const Scene& scene, const char* path) {
    const testkit::Hive hive = testkit::read_hive(scene.file_bytes());
    return names_of(hive.find(std::string(path))->children);
}

QString values_in_file(const Scene& scene, const char* path) {
    const testkit::Hive hive = testkit::read_hive(scene.file_bytes());
    return names_of(hive.find(std::string(path))->values);
}

// The type of a value in the file, -1 where it is not there.
int type_in_file(const Scene& scene, const char* path, const char* name) {
    const testkit::Hive hive = testkit::read_hive(scene.file_bytes());
    const testkit::Value* value = testkit::find_value(*hive.find(std::string(path)), name);
    return value != nullptr ? static_cast<int>(value->type) : -1;
}

// A model that notes what is open over the window while a key is renamed in it.
class WitnessModel : public RegModel {
public:
    bool setData(const QModelIndex& index, const QVariant& value, int role) override {
        renames++;
        renamed_behind_a_dialog = renamed_behind_a_dialog || QApplication::activeModalWidget();
        if (throws)
            throw std::runtime_error("as asked");
        return RegModel::setData(index, value, role);
    }

    // While it is gated, a search looks at no name before the gate opens.
    QVariant data(const QModelIndex& index, int role) const override {
        if (is_gated && QThread::currentThread() != thread())
            gate.acquire();
        return RegModel::data(index, role);
    }

    std::atomic<bool> is_gated{false};
    mutable QSemaphore gate;
    int renames = 0;
    bool renamed_behind_a_dialog = false;
    bool throws = false;
};

QLineEdit* editor_in(const QWidget& view) {
    for (QLineEdit* editor : view.findChildren<QLineEdit*>()) {
        if (!editor->isHidden())
            return editor;
    }
    return nullptr;
}

void type_in(const QWidget& view, const QString& name) {
    QLineEdit* editor = editor_in(view);
    QVERIFY2(editor, "no editor is open");
    editor->selectAll();
    QTest::keyClicks(editor, name);
}

DialogHand::Step ask(const QString& term, bool values) {
    return [term, values](QWidget* dialog) {
        dialog->findChild<QLineEdit*>()->setText(term);
        find_by_text<QCheckBox>(*dialog, QStringLiteral("Find keys"))->setChecked(!values);
        find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->setChecked(values);
        press(*dialog, QDialogButtonBox::Ok);
    };
}

// As text that is dragged out of an editor does: it takes the keyboard along and leaves the editor open.
void take_the_keyboard_from(QAbstractItemView& view) {
    QLineEdit* editor = editor_in(view);
    editor->removeEventFilter(view.itemDelegate());
    view.window()->setFocus();
    QVERIFY(!editor->hasFocus());
    QCOMPARE(editor_in(view), editor);
}

// The window with a hit on the key Leaf, whose next one is its later sibling, and Leaf's name in an editor.
void search_up_to_leaf(Stage& stage) {
    DialogHand hand;
    hand.then(ask(QStringLiteral("a"), false));
    stage.window.show_find_dialog();
    for (int hits = 0; hits < 10 && stage.status() != leaf; hits++)
        stage.window.find_next();
    QCOMPARE(stage.status(), leaf);
    stage.return_to(*stage.keys);
    shared_actions().rename_action->trigger();
}

// A new value of Alpha below all others, its name in an editor.
void name_a_new_value(Stage& stage, const QString& name) {
    stage.select_key(alpha);
    stage.return_to(*stage.values);
    shared_actions().new_string_action->trigger();
    type_in(*stage.values, name);
}

// Types another name for the key Leaf, whose editor stays open.
void name_leaf_anew(Stage& stage, const QString& name) {
    stage.select_key(leaf);
    stage.return_to(*stage.keys);
    shared_actions().rename_action->trigger();
    type_in(*stage.keys, name);
}

// A value of Deep's, and in an editor another value's name for it.
void type_a_refused_value_name(Stage& stage) {
    stage.select_key(deep);
    stage.return_to(*stage.values);
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    shared_actions().rename_action->trigger();
    type_in(*stage.values, QStringLiteral("b"));
}

const QString alpha_s_values = QStringLiteral("bytes dword list Path qword reversed text unreadable");

}  // namespace

class OpenEditorTest : public QObject {
    Q_OBJECT

private slots:
    void find_next_renames_the_key_before_it_searches();
    void a_refused_name_is_told_before_the_search();
    void find_asks_after_the_name_is_stored();
    void refresh_names_the_value_before_it_sorts();
    void refresh_keeps_the_value_current();
    void refresh_leaves_the_actions_to_the_key_that_has_the_keyboard();
    void find_next_names_the_value_before_it_sorts();
    void a_second_new_value_leaves_the_first_its_name();
    void a_new_key_leaves_the_value_its_name();
    void a_new_value_leaves_the_key_its_name();
    void a_new_key_leaves_the_key_its_name();
    void the_editor_of_a_value_stores_the_name_first();
    void another_key_s_values_do_not_get_the_name();
    void an_editor_without_the_keyboard_is_finished_too();
    void closing_the_window_stores_the_name();
    void closing_the_window_tells_a_refused_name();
    void leaving_behind_a_refused_name_ends_the_command_data();
    void leaving_behind_a_refused_name_ends_the_command();
    void a_refused_name_is_told_when_its_editor_is_closed();
    void a_key_chosen_behind_a_refused_name_is_the_one_that_shows();
    void a_menu_comes_after_a_refused_name();
    void the_end_of_the_program_stores_the_name();
    void a_rename_that_throws_leaves_the_views_able_to_rename();
    void commands_behind_a_dialog_do_nothing();
    void a_hit_is_selected_where_its_key_stands_now();
};

void OpenEditorTest::find_next_renames_the_key_before_it_searches() {
    const Scene scene;
    Stage stage(scene, std::make_unique<WitnessModel>());
    auto& model = static_cast<WitnessModel&>(*stage.model);
    search_up_to_leaf(stage);
    type_in(*stage.keys, QStringLiteral("zzz"));
    model.is_gated = true;
    DialogHand hand;
    int renames_before = 0;
    hand.then_while_searching([&](QWidget*) {
        renames_before = model.renames;
        model.gate.release(1000);
    });
    QTest::keyClick(editor_in(*stage.keys), Qt::Key_F3);
    QVERIFY(hand.is_done());
    QCOMPARE(renames_before, 1);
    QVERIFY(!model.renamed_behind_a_dialog);
    QVERIFY(!editor_in(*stage.keys));
    QCOMPARE(joined(stage.subkeys(alpha)), QStringLiteral("Deep Zeta zzz"));
    // The next hit stands one row higher than before the rename, and is what goes with Delete.
    QCOMPARE(stage.keys->currentIndex(), stage.key(alpha + QStringLiteral("\\Zeta")));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    stage.return_to(*stage.keys);
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep zzz"));
}

void OpenEditorTest::a_refused_name_is_told_before_the_search() {
    const Scene scene;
    Stage stage(scene);
    search_up_to_leaf(stage);
    const QByteArray before = scene.bytes();
    type_in(*stage.keys, QStringLiteral("Deep"));
    DialogHand hand;
    bool is_searching = true;
    hand.then([&](QWidget* dialog) {
        is_searching = false;
        for (const QDialog* other : stage.window.findChildren<QDialog*>())
            is_searching = is_searching || other->accessibleName() == QStringLiteral("Searching...");
        QCOMPARE(qobject_cast<QMessageBox*>(dialog)->text(), QStringLiteral("The specified key name already exists."));
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QTest::keyClick(editor_in(*stage.keys), Qt::Key_F3);
    QVERIFY(hand.is_done());
    QVERIFY(!is_searching);
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    QCOMPARE(scene.bytes(), before);
}

void OpenEditorTest::find_asks_after_the_name_is_stored() {
    const Scene scene;
    Stage stage(scene, std::make_unique<WitnessModel>());
    const auto& model = static_cast<const WitnessModel&>(*stage.model);
    name_leaf_anew(stage, QStringLiteral("zzz"));
    DialogHand hand;
    hand.then([](QWidget* dialog) { QTest::keyClick(dialog, Qt::Key_Escape); });
    QTest::keyClick(editor_in(*stage.keys), Qt::Key_F, Qt::ControlModifier);
    QVERIFY(hand.is_done());
    QCOMPARE(model.renames, 1);
    QVERIFY(!model.renamed_behind_a_dialog);
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Zeta zzz"));
}

void OpenEditorTest::refresh_names_the_value_before_it_sorts() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("aaa"));
    QTest::keyClick(editor_in(*stage.values), Qt::Key_F5);
    QVERIFY(!editor_in(*stage.values));
    QCOMPARE(joined(stage.value_names()), QStringLiteral("(Default) aaa ") + alpha_s_values);
    QCOMPARE(values_in_file(scene, "Alpha"), QStringLiteral("aaa ") + alpha_s_values);
    QCOMPARE(type_in_file(scene, "Alpha", "aaa"), 1);
    QCOMPARE(type_in_file(scene, "Alpha", "unreadable"), 4);
    QVERIFY(stage.values->hasFocus());
}

void OpenEditorTest::refresh_keeps_the_value_current() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("aaa"));
    QTest::keyClick(editor_in(*stage.values), Qt::Key_F5);
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("aaa")));
    DialogHand hand;
    hand.then_press(QMessageBox::Yes);
    QTest::keyClick(stage.values, Qt::Key_Delete);
    QVERIFY(hand.is_done());
    QCOMPARE(values_in_file(scene, "Alpha"), alpha_s_values);
}

void OpenEditorTest::refresh_leaves_the_actions_to_the_key_that_has_the_keyboard() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("aaa"));
    QTest::keyClick(editor_in(*stage.values), Qt::Key_Return);
    const int row = stage.values->currentIndex().row();
    stage.keys->setFocus();
    const SharedActions& actions = shared_actions();
    QVERIFY(!actions.delete_action->isEnabled());
    stage.window.refresh_views();
    QVERIFY2(stage.values->currentIndex().row() != row, "the value has not moved");
    // A key at this depth can be neither deleted nor renamed.
    QVERIFY(stage.keys->hasFocus());
    QVERIFY(!actions.delete_action->isEnabled());
    QVERIFY(!actions.rename_action->isEnabled());
}

void OpenEditorTest::find_next_names_the_value_before_it_sorts() {
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask(QStringLiteral("re"), true));
    stage.window.show_find_dialog();
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("reversed")));
    name_a_new_value(stage, QStringLiteral("aaa"));
    QTest::keyClick(editor_in(*stage.values), Qt::Key_F3);
    QVERIFY(!editor_in(*stage.values));
    QCOMPARE(stage.status(), alpha);
    QCOMPARE(joined(stage.value_names()), QStringLiteral("(Default) aaa ") + alpha_s_values);
    QCOMPARE(values_in_file(scene, "Alpha"), QStringLiteral("aaa ") + alpha_s_values);
    QCOMPARE(type_in_file(scene, "Alpha", "aaa"), 1);
}

void OpenEditorTest::a_second_new_value_leaves_the_first_its_name() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("foo"));
    // Pressed in a menu, which does not take the keyboard from the editor.
    shared_actions().new_dword_action->trigger();
    QCOMPARE(editor_in(*stage.values)->text(), QStringLiteral("New Value #1"));
    stage.press_in_editor(QStringLiteral("number"), Qt::Key_Return);
    QTRY_VERIFY(!editor_in(*stage.values));
    QCOMPARE(type_in_file(scene, "Alpha", "foo"), 1);
    QCOMPARE(type_in_file(scene, "Alpha", "number"), 4);
    QCOMPARE(joined(stage.value_names()),
             QStringLiteral("(Default) ") + alpha_s_values + QStringLiteral(" foo number"));
}

void OpenEditorTest::a_new_key_leaves_the_value_its_name() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("foo"));
    shared_actions().new_key_action->trigger();
    QCOMPARE(type_in_file(scene, "Alpha", "foo"), 1);
    QCOMPARE(editor_in(*stage.keys)->text(), QStringLiteral("New Key #1"));
    stage.press_in_editor(QStringLiteral("made"), Qt::Key_Return);
    QTRY_COMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Leaf made Zeta"));
}

void OpenEditorTest::a_new_value_leaves_the_key_its_name() {
    const Scene scene;
    Stage stage(scene);
    name_leaf_anew(stage, QStringLiteral("zzz"));
    shared_actions().new_dword_action->trigger();
    QVERIFY(!editor_in(*stage.keys));
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Zeta zzz"));
    stage.press_in_editor(QStringLiteral("number"), Qt::Key_Return);
    QTRY_COMPARE(type_in_file(scene, "Alpha\\zzz", "number"), 4);
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\zzz"));
}

void OpenEditorTest::a_new_key_leaves_the_key_its_name() {
    const Scene scene;
    Stage stage(scene);
    name_leaf_anew(stage, QStringLiteral("zzz"));
    shared_actions().new_key_action->trigger();
    stage.press_in_editor(QStringLiteral("made"), Qt::Key_Return);
    QTRY_COMPARE(subkeys_in_file(scene, "Alpha\\zzz"), QStringLiteral("made"));
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\zzz\\made"));
}

void OpenEditorTest::the_editor_of_a_value_stores_the_name_first() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("foo"));
    QString name;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        name = dialog->findChild<QLineEdit*>()->text();
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    stage.values->value_double_clicked(stage.values->currentIndex());
    QVERIFY(hand.is_done());
    QCOMPARE(name, QStringLiteral("foo"));
    QCOMPARE(type_in_file(scene, "Alpha", "foo"), 1);
}

void OpenEditorTest::another_key_s_values_do_not_get_the_name() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("foo"));
    // By code, as a hit of a search is selected: the keyboard stays in the editor.
    stage.select_key(beta);
    QVERIFY(!editor_in(*stage.values));
    QCOMPARE(type_in_file(scene, "Alpha", "foo"), 1);
    QCOMPARE(values_in_file(scene, "Beta"), QString());
    QCOMPARE(joined(stage.value_names()), QStringLiteral("(Default)"));
}

void OpenEditorTest::an_editor_without_the_keyboard_is_finished_too() {
    const Scene scene;
    Stage stage(scene);
    name_a_new_value(stage, QStringLiteral("aaa"));
    take_the_keyboard_from(*stage.values);
    stage.window.refresh_views();
    QVERIFY(!editor_in(*stage.values));
    QCOMPARE(values_in_file(scene, "Alpha"), QStringLiteral("aaa ") + alpha_s_values);
}

void OpenEditorTest::closing_the_window_stores_the_name() {
    const Scene scene;
    Stage stage(scene, std::make_unique<WitnessModel>());
    auto& model = static_cast<WitnessModel&>(*stage.model);
    name_leaf_anew(stage, QStringLiteral("zzz"));
    take_the_keyboard_from(*stage.keys);
    bool was_visible = false;
    connect(&model, &QAbstractItemModel::layoutChanged, &model, [&] { was_visible = stage.window.isVisible(); });
    QVERIFY(stage.window.close());
    QVERIFY(was_visible);
    QCOMPARE(model.renames, 1);
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Zeta zzz"));
}

void OpenEditorTest::closing_the_window_tells_a_refused_name() {
    const Scene scene;
    Stage stage(scene);
    name_leaf_anew(stage, QStringLiteral("Deep"));
    take_the_keyboard_from(*stage.keys);
    bool was_visible = false;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        was_visible = stage.window.isVisible();
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QVERIFY(stage.window.close());
    QVERIFY(hand.is_done());
    QVERIFY(was_visible);
    QVERIFY(!stage.window.isVisible());
}

void OpenEditorTest::leaving_behind_a_refused_name_ends_the_command_data() {
    QTest::addColumn<QAction*>("action");
    QTest::newRow("a new value") << shared_actions().new_string_action;
    QTest::newRow("a new key") << shared_actions().new_key_action;
}

void OpenEditorTest::leaving_behind_a_refused_name_ends_the_command() {
    QFETCH(QAction*, action);
    const Scene scene;
    Stage stage(scene);
    type_a_refused_value_name(stage);
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then([&](QWidget* box) {
        QVERIFY(stage.window.close());
        QTest::keyClick(box, Qt::Key_Return);
    });
    action->trigger();
    QVERIFY(hand.is_done());
    QVERIFY(!stage.window.isVisible());
    QVERIFY(!editor_in(*stage.keys));
    QVERIFY(!editor_in(*stage.values));
    QCOMPARE(scene.bytes(), before);
}

// The view goes on with an editor that it has committed, and the box's event loop may end it.
void OpenEditorTest::a_refused_name_is_told_when_its_editor_is_closed() {
    const Scene scene;
    Stage stage(scene);
    type_a_refused_value_name(stage);
    QPointer<QWidget> editor = editor_in(*stage.values);
    bool was_open = true;
    DialogHand hand;
    hand.then([&](QWidget* box) {
        was_open = editor_in(*stage.values) != nullptr;
        stage.select_key(beta);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        QTest::keyClick(box, Qt::Key_Return);
    });
    QTest::keyClick(editor, Qt::Key_Return);
    QTRY_VERIFY(hand.is_done());
    QVERIFY(!was_open);
    QTRY_VERIFY(!QApplication::activeModalWidget());
    QTRY_VERIFY(!editor);
    QCOMPARE(stage.status(), beta);
    // The views have got over it.
    stage.select_key(deep);
    stage.return_to(*stage.values);
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("zzz"), Qt::Key_Return);
    QTRY_COMPARE(values_in_file(scene, "Alpha\\Deep"), QStringLiteral(" b zzz"));
}

void OpenEditorTest::a_key_chosen_behind_a_refused_name_is_the_one_that_shows() {
    const Scene scene;
    Stage stage(scene);
    type_a_refused_value_name(stage);
    DialogHand hand;
    QStringList shown;
    hand.then([&](QWidget* box) {
        shown = stage.value_names();
        QCOMPARE(qobject_cast<QMessageBox*>(box)->text(), QStringLiteral("The specified value name already exists."));
        stage.select_key(alpha);
        QTest::keyClick(box, Qt::Key_Return);
    });
    stage.select_key(beta);
    QTRY_VERIFY(hand.is_done());
    QTRY_VERIFY(!QApplication::activeModalWidget());
    QCOMPARE(joined(shown), QStringLiteral("(Default)"));
    QCOMPARE(stage.status(), alpha);
    QCOMPARE(joined(stage.value_names()), QStringLiteral("(Default) ") + alpha_s_values);
}

void OpenEditorTest::a_menu_comes_after_a_refused_name() {
    const Scene scene;
    Stage stage(scene);
    for (QAbstractItemView* view :
         {static_cast<QAbstractItemView*>(stage.values), static_cast<QAbstractItemView*>(stage.keys)}) {
        type_a_refused_value_name(stage);
        bool is_menu_open = true;
        DialogHand hand;
        hand.then([&](QWidget* box) {
            is_menu_open = QApplication::activePopupWidget() != nullptr;
            QTest::keyClick(box, Qt::Key_Return);
        });
        const QPoint point = view->visualRect(view->currentIndex()).center();
        QVERIFY(with_context_menu(*view, point, [&](QMenu&) { QVERIFY(hand.is_done()); }));
        QVERIFY(!is_menu_open);
    }
}

void OpenEditorTest::the_end_of_the_program_stores_the_name() {
    const Scene scene;
    Stage stage(scene);
    name_leaf_anew(stage, QStringLiteral("zzz"));
    // Not by way of the window, which stays open.
    QTimer::singleShot(0, qApp, [] { QCoreApplication::exit(0); });
    QCOMPARE(QApplication::exec(), 0);
    QVERIFY(stage.window.isVisible());
    QVERIFY(!editor_in(*stage.keys));
    QCOMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Zeta zzz"));
}

void OpenEditorTest::a_rename_that_throws_leaves_the_views_able_to_rename() {
    const Scene scene;
    Stage stage(scene, std::make_unique<WitnessModel>());
    auto& model = static_cast<WitnessModel&>(*stage.model);
    stage.select_key(leaf);
    // Twice: a name that is lost is told each time.
    for (int i = 0; i < 2; i++) {
        stage.return_to(*stage.keys);
        shared_actions().rename_action->trigger();
        type_in(*stage.keys, QStringLiteral("zzz"));
        model.throws = true;
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        QTest::keyClick(editor_in(*stage.keys), Qt::Key_Return);
        QTRY_VERIFY(hand.is_done());
        QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: as asked").arg(leaf));
        QTRY_VERIFY(!editor_in(*stage.keys));
    }
    model.throws = false;
    stage.return_to(*stage.keys);
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("zzz"), Qt::Key_Return);
    QTRY_COMPARE(subkeys_in_file(scene, "Alpha"), QStringLiteral("Deep Zeta zzz"));
}

void OpenEditorTest::commands_behind_a_dialog_do_nothing() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.return_to(*stage.values);
    stage.values->setCurrentIndex(stage.value(QStringLiteral("bytes")));
    const QByteArray before = scene.bytes();
    QStringList shown;
    DialogHand hand;
    // A screen reader presses menu items without asking whether a dialog is open.
    hand.then([&](QWidget* question) {
        shared_actions().new_key_action->trigger();
        shared_actions().new_string_action->trigger();
        shared_actions().rename_action->trigger();
        shared_actions().delete_action->trigger();
        stage.window.show_find_dialog();
        stage.window.find_next();
        stage.window.refresh_views();
        stage.values->value_double_clicked(stage.values->currentIndex());
        shown = stage.value_names();
        QCOMPARE(QApplication::activeModalWidget(), question);
        QVERIFY(!editor_in(*stage.values));
        QTest::keyClick(question, Qt::Key_Escape);
    });
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(joined(shown), QStringLiteral("(Default) ") + alpha_s_values);
    QCOMPARE(scene.bytes(), before);
}

void OpenEditorTest::a_hit_is_selected_where_its_key_stands_now() {
    const Scene scene;
    Stage stage(scene);
    const QModelIndex old = stage.key(alpha + QStringLiteral("\\Zeta"));
    QCOMPARE(KeysView::index_now(old), old);
    QVERIFY(stage.model->setData(stage.key(leaf), QStringLiteral("zzz"), Qt::EditRole));
    const QModelIndex now = stage.key(alpha + QStringLiteral("\\Zeta"));
    QVERIFY(now != old);
    QCOMPARE(KeysView::index_now(old), now);
    QCOMPARE(KeysView::index_now(QModelIndex()), QModelIndex());
}

UI_TEST_MAIN(OpenEditorTest)
#include "open_editor_test.moc"
