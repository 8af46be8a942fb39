// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The find dialog and the search behind it: hits, resuming, cancelling, and a key that throws.

#include "stage.h"
#include "ui_test.h"

#include <QCheckBox>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QProgressBar>
#include <QRadioButton>
#include <QSemaphore>
#include <QThread>
#include <QThreadPool>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");

// A model that a search cannot get through before the gate opens.
class GatedModel : public RegModel {
public:
    QVariant data(const QModelIndex& index, int role) const override {
        if (QThread::currentThread() != thread()) {
            entered.release();
            gate.acquire();
        }
        return RegModel::data(index, role);
    }

    // Whether the worker has looked at its last key. The pool's own count of busy threads lags behind the
    // task's end, so what is compared is the walk: nothing may be asked after the moment of this call.
    bool is_left_alone() const {
        const int seen = entered.available();
        return QThreadPool::globalInstance()->waitForDone() && entered.available() == seen;
    }

    mutable QSemaphore entered;
    mutable QSemaphore gate;
};

struct Search {
    QString term;
    bool keys = true;
    bool values = false;
    QString kind = QStringLiteral("Find substring");
};

// Fills in the find dialog and presses Ok.
DialogHand::Step ask(const Search& search) {
    return [search](QWidget* dialog) {
        dialog->findChild<QLineEdit*>()->setText(search.term);
        find_by_text<QCheckBox>(*dialog, QStringLiteral("Find keys"))->setChecked(search.keys);
        find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->setChecked(search.values);
        find_by_text<QRadioButton>(*dialog, search.kind)->setChecked(true);
        QTest::mouseClick(dialog->findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok), Qt::LeftButton);
    };
}

void escape(QWidget* dialog) { QTest::keyClick(dialog, Qt::Key_Escape); }

// For where a search could go on instead, and tell its end in a box of its own.
void escape_the_question(QWidget* dialog) {
    QCOMPARE(dialog->windowTitle(), QStringLiteral("Find"));
    QVERIFY(dialog->findChild<QLineEdit*>());
    escape(dialog);
}

// What is found, in order: the path of the key, and behind a colon the name of the value.
QStringList all_hits(Stage& stage, const Search& search) {
    QStringList hits;
    DialogHand hand;
    hand.then(ask(search)).then_press(QMessageBox::Ok);
    stage.window.show_find_dialog();
    constexpr int most = 100;
    while (!hand.is_done() && hits.size() < most) {
        QString hit = stage.status();
        if (stage.values->currentIndex().isValid())
            hit += QLatin1Char(':') + stage.cell(stage.values->currentIndex().row(), 0);
        hits.append(hit);
        stage.window.find_next();
    }
    return hits;
}

}  // namespace

class SearchTest : public QObject {
    Q_OBJECT

private slots:
    void the_dialog();
    void the_dialog_comes_back_as_it_was_data();
    void the_dialog_comes_back_as_it_was();
    void a_cancelled_dialog_changes_nothing();
    void hits_data();
    void hits();
    void a_hit_is_opened_and_selected();
    void a_hit_is_seen_though_it_was_current();
    void a_hit_far_down_is_seen();
    void return_held_down_answers_no_dialog_that_it_has_opened();
    void the_end_is_told_and_find_next_asks_again();
    void an_empty_tree_is_searched_to_its_end();
    void the_searching_dialog();
    void cancel_returns_when_the_worker_has_ended_data();
    void cancel_returns_when_the_worker_has_ended();
    void a_value_hit_is_a_row_of_the_sorted_table();
    void a_key_that_throws_is_told_and_passed();
    void cancelled_and_started_again_fifty_times();
    void the_end_of_the_program_ends_the_search();
    void a_search_without_a_start_goes_on_and_does_not_begin_one();
};

void SearchTest::the_dialog() {
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    hand.then([](QWidget* dialog) {
        QCOMPARE(dialog->windowTitle(), QStringLiteral("Find"));
        QCOMPARE(dialog->parentWidget(), nullptr);
        QCOMPARE(dialog->findChild<QLabel*>()->text(), QStringLiteral("Search term:"));
        QCOMPARE(dialog->findChild<QLineEdit*>()->text(), QString());
        QCOMPARE(QApplication::focusWidget(), dialog->findChild<QLineEdit*>());
        QVERIFY(find_by_text<QCheckBox>(*dialog, QStringLiteral("Find keys"))->isChecked());
        QVERIFY(!find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->isChecked());
        QVERIFY(find_by_text<QRadioButton>(*dialog, QStringLiteral("Find substring"))->isChecked());
        QCOMPARE(dialog->findChildren<QRadioButton*>().size(), 3);
        QCOMPARE(dialog->width(), 360);
        QCOMPARE(dialog->maximumHeight(), dialog->height());
        QCOMPARE(dialog->findChild<QDialogButtonBox*>()->standardButtons(),
                 QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
        escape(dialog);
    });
    // Before any search "Find next" asks as well.
    stage.window.find_next();
    QVERIFY(hand.is_done());
}

void SearchTest::the_dialog_comes_back_as_it_was_data() {
    QTest::addColumn<QString>("kind");
    QTest::addColumn<bool>("keys");
    QTest::addColumn<bool>("values");
    QTest::newRow("substring, keys") << "Find substring" << true << false;
    QTest::newRow("whole string, values") << "Find whole string" << false << true;
    QTest::newRow("wildcards, both") << "Use wildcards" << true << true;
    QTest::newRow("neither") << "Find substring" << false << false;
}

void SearchTest::the_dialog_comes_back_as_it_was() {
    QFETCH(QString, kind);
    QFETCH(bool, keys);
    QFETCH(bool, values);
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask({QStringLiteral("not there"), keys, values, kind})).then_press(QMessageBox::Ok);
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
    hand.then([&](QWidget* dialog) {
        QCOMPARE(dialog->findChild<QLineEdit*>()->text(), QStringLiteral("not there"));
        QCOMPARE(find_by_text<QCheckBox>(*dialog, QStringLiteral("Find keys"))->isChecked(), keys);
        QCOMPARE(find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->isChecked(), values);
        QVERIFY(find_by_text<QRadioButton>(*dialog, kind)->isChecked());
        escape(dialog);
    });
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
}

void SearchTest::a_cancelled_dialog_changes_nothing() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    DialogHand hand;
    hand.then([](QWidget* dialog) {
        dialog->findChild<QLineEdit*>()->setText(QStringLiteral("Zeta"));
        QTest::mouseClick(dialog->findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Cancel), Qt::LeftButton);
    });
    stage.window.show_find_dialog();
    QCOMPARE(stage.status(), alpha);
    hand.then([](QWidget* dialog) {
        QCOMPARE(dialog->findChild<QLineEdit*>()->text(), QString());
        escape(dialog);
    });
    stage.window.find_next();
    QVERIFY(hand.is_done());
}

void SearchTest::hits_data() {
    QTest::addColumn<QString>("term");
    QTest::addColumn<bool>("keys");
    QTest::addColumn<bool>("values");
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QString>("found");
    const QString part = QStringLiteral("Find substring");
    const QString whole = QStringLiteral("Find whole string");
    const QString wild = QStringLiteral("Use wildcards");
    QTest::newRow("part of a name") << "EEP" << true << false << part << "Deep Deep\\Deeper";
    QTest::newRow("a whole name") << "deep" << true << false << whole << "Deep";
    QTest::newRow("a pattern") << "?e*" << true << false << wild << "Deep Deep\\Deeper Leaf Zeta \\Beta";
    QTest::newRow("a pattern is for the whole name") << "?ee" << true << false << wild << "";
    QTest::newRow("a key before its values, they before its subkeys")
        << "d" << true << true << part
        << ":(Default) :dword :qword :reversed :unreadable Deep Deep:(Default) Deep\\Deeper "
           "Deep\\Deeper:(Default) "
           "Leaf:(Default) "
           "Zeta:(Default) \\Beta:(Default)";
    QTest::newRow("keys are not searched for values") << "dword" << true << false << part << "";
    QTest::newRow("values in the order of the table") << "a" << false << true << wild << "Deep:A";
    QTest::newRow("neither") << "a" << false << false << part << "";
}

void SearchTest::hits() {
    QFETCH(QString, term);
    QFETCH(bool, keys);
    QFETCH(bool, values);
    QFETCH(QString, kind);
    QFETCH(QString, found);
    const Scene scene;
    Stage stage(scene);
    QStringList below_alpha;
    for (QString hit : all_hits(stage, {term, keys, values, kind})) {
        // Short in the table above: below Alpha, or from the hive's root on.
        hit.remove(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\"));
        hit.remove(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
        hit.remove(QStringLiteral("MACHINE\\SYSTEM"));
        below_alpha.append(hit);
    }
    QCOMPARE(below_alpha.join(QLatin1Char(' ')), found);
}

void SearchTest::a_hit_is_opened_and_selected() {
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask({QStringLiteral("deep")}));
    stage.window.show_find_dialog();
    const QModelIndex deep = stage.key(alpha + QStringLiteral("\\Deep"));
    QCOMPARE(stage.keys->currentIndex(), deep);
    for (QModelIndex step = deep; step.isValid(); step = step.parent())
        QVERIFY(stage.keys->isExpanded(step));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QVERIFY(!stage.values->currentIndex().isValid());
    QVERIFY(stage.keys->viewport()->rect().intersects(stage.keys->visualRect(deep)));
}

void SearchTest::a_hit_is_seen_though_it_was_current() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key").add("found");
    for (int i = 0; i < 200; i++)
        key.set("v" + std::to_string(i), 4, testkit::pattern(4));
    const Scene scene(hive);
    Stage stage(scene);
    const QString branch = QStringLiteral("MACHINE\\SYSTEM\\Key");
    const auto is_in_sight = [](const QAbstractItemView& view) {
        return view.viewport()->rect().contains(view.visualRect(view.currentIndex()).center());
    };
    for (const Search& search : {Search{QStringLiteral("found")}, Search{QStringLiteral("v99"), false, true}}) {
        stage.select_key(branch);
        DialogHand hand;
        hand.then(ask(search));
        stage.window.show_find_dialog();
        const QModelIndex hit = stage.keys->currentIndex();
        QCOMPARE(stage.status(), branch + QStringLiteral("\\found"));
        stage.values->scrollToTop();
        stage.keys->setCurrentIndex(hit);
        stage.keys->collapse(stage.key(branch));
        hand.then(ask(search));
        stage.window.show_find_dialog();
        QVERIFY(hand.is_done());
        QCOMPARE(stage.keys->currentIndex(), hit);
        QVERIFY(stage.keys->isExpanded(stage.key(branch)));
        QVERIFY(is_in_sight(*stage.keys));
        QCOMPARE(stage.values->currentIndex().isValid(), search.values);
        QVERIFY(!search.values || is_in_sight(*stage.values));
    }
}

void SearchTest::a_hit_far_down_is_seen() {
    testkit::HiveLayout hive;
    testkit::KeyLayout* key = &hive.root;
    for (int level = 0; level < 30; level++)
        key = &key->add("k");
    key->add("found");
    const Scene scene(hive);
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask({QStringLiteral("found")}));
    stage.window.show_find_dialog();
    QVERIFY(stage.status().endsWith(QStringLiteral("\\found")));
    const QRect row = stage.keys->visualRect(stage.keys->currentIndex());
    QVERIFY(stage.keys->viewport()->rect().contains(QRect(row.topLeft(), QSize(40, row.height()))));
}

void SearchTest::return_held_down_answers_no_dialog_that_it_has_opened() {
    const Scene scene;
    Stage stage(scene);
    QTest::keyClick(stage.keys, Qt::Key_Return);
    const auto hold = [](QWidget* widget) {
        QKeyEvent repeated(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier, QStringLiteral("\r"), true);
        QApplication::sendEvent(widget, &repeated);
    };
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        hold(dialog->findChild<QLineEdit*>());
        QVERIFY(dialog->isVisible());
        dialog->findChild<QLineEdit*>()->setText(QStringLiteral("not there"));
        QTest::keyClick(dialog->findChild<QLineEdit*>(), Qt::Key_Return);
    });
    hand.then([&](QWidget* dialog) {
        auto* box = qobject_cast<QMessageBox*>(dialog);
        QVERIFY(box);
        hold(box->button(QMessageBox::Ok));
        QVERIFY(dialog->isVisible());
        QTest::keyClick(box->button(QMessageBox::Ok), Qt::Key_Return);
    });
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
}

void SearchTest::the_end_is_told_and_find_next_asks_again() {
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")}));
    stage.window.show_find_dialog();
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    hand.then_press(QMessageBox::Ok);
    stage.return_to(*stage.keys);
    QTest::keySequence(&stage.window, QKeySequence(QKeySequence::FindNext));
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Information);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("Finished searching."));
    QCOMPARE(hand.parent, &stage.window);
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    hand.then([](QWidget* dialog) {
        QCOMPARE(dialog->findChild<QLineEdit*>()->text(), QStringLiteral("zeta"));
        escape(dialog);
    });
    stage.window.find_next();
    QVERIFY(hand.is_done());
}

void SearchTest::an_empty_tree_is_searched_to_its_end() {
    MainWindow window;
    RegModel model;
    window.set_model(&model);
    window.show();
    DialogHand hand;
    hand.then(ask({QStringLiteral("a")})).then_press(QMessageBox::Ok);
    window.show_find_dialog();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("Finished searching."));
    hand.then(escape_the_question);
    window.find_next();
    QVERIFY(hand.is_done());
}

void SearchTest::the_searching_dialog() {
    const Scene scene;
    Stage stage(scene, std::make_unique<GatedModel>());
    auto& model = static_cast<GatedModel&>(*stage.model);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")})).then_while_searching([&](QWidget* dialog) {
        QCOMPARE(dialog->windowTitle(), QStringLiteral("Find"));
        QCOMPARE(dialog->parentWidget(), &stage.window);
        QVERIFY(dialog->isModal());
        QCOMPARE(dialog->findChild<QLabel*>()->text(), QStringLiteral("Searching..."));
        const auto* busy = dialog->findChild<QProgressBar*>();
        QCOMPARE(busy->minimum(), 0);
        QCOMPARE(busy->maximum(), 0);
        QCOMPARE(dialog->findChild<QDialogButtonBox*>()->standardButtons(),
                 QDialogButtonBox::StandardButtons(QDialogButtonBox::Cancel));
        model.gate.release(1000);
    });
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    QVERIFY(hand.nothing_comes());
}

void SearchTest::cancel_returns_when_the_worker_has_ended_data() {
    QTest::addColumn<bool>("by_button");
    QTest::newRow("the button") << true;
    QTest::newRow("Escape") << false;
}

void SearchTest::cancel_returns_when_the_worker_has_ended() {
    QFETCH(bool, by_button);
    const Scene scene;
    Stage stage(scene, std::make_unique<GatedModel>());
    auto& model = static_cast<GatedModel&>(*stage.model);
    stage.select_key(alpha);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")})).then_while_searching([&](QWidget* dialog) {
        model.entered.acquire();
        if (by_button)
            QTest::mouseClick(dialog->findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Cancel), Qt::LeftButton);
        else
            escape(dialog);
        model.gate.release(1000);
    });
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
    QVERIFY(model.is_left_alone());
    QCoreApplication::processEvents();
    QCOMPARE(stage.status(), alpha);
    QVERIFY(!stage.values->currentIndex().isValid());
    QVERIFY(hand.nothing_comes());
    hand.then(escape_the_question);
    stage.window.find_next();
    QVERIFY(hand.is_done());
    QCOMPARE(stage.status(), alpha);
}

void SearchTest::a_value_hit_is_a_row_of_the_sorted_table() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha + QStringLiteral("\\Deep"));
    QVERIFY(stage.values->model()->setData(stage.value(QStringLiteral("A")), QStringLiteral("zzz"), Qt::EditRole));
    QCOMPARE(stage.value_row(QStringLiteral("zzz")), 1);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zzz"), false, true}));
    stage.window.show_find_dialog();
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Deep"));
    QCOMPARE(stage.values->currentIndex().row(), 2);
    QCOMPARE(stage.cell(2, 0), QStringLiteral("zzz"));
}

void SearchTest::a_key_that_throws_is_told_and_passed() {
    Scene scene;
    scene.damage_key("Alpha\\Leaf");
    Stage stage(scene);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")})).then_press(QMessageBox::Ok);
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.text, QStringLiteral("The search could not go on: The key \"MACHINE\\SYSTEM\\Alpha\\#1\" cannot be "
                                       "read: ROpenSubKey failed"));
    QCOMPARE(hand.format, Qt::PlainText);
    QVERIFY(hand.nothing_comes());
    // The tree that a hit opens shows the damaged key too, which is not told again.
    stage.window.find_next();
    QTRY_COMPARE(stage.keys->currentIndex().data(Qt::DisplayRole).toString(), QStringLiteral("Zeta"));
    stage.keys->viewport()->repaint();
    QVERIFY(hand.nothing_comes());
}

void SearchTest::cancelled_and_started_again_fifty_times() {
    const Scene scene;
    Stage stage(scene, std::make_unique<GatedModel>());
    auto& model = static_cast<GatedModel&>(*stage.model);
    DialogHand hand;
    for (int i = 0; i < 50; i++) {
        hand.then(ask({QStringLiteral("not there"), true, true})).then_while_searching([&](QWidget* dialog) {
            model.entered.acquire();
            // The window paints and expands while the worker is in the middle of a key.
            stage.keys->setExpanded(stage.key(alpha), i % 2 == 0);
            stage.window.repaint();
            escape(dialog);
            model.gate.release(1000);
        });
        stage.window.show_find_dialog();
        QVERIFY(hand.is_done());
        QVERIFY(model.is_left_alone());
        model.gate.acquire(model.gate.available());
        model.entered.acquire(model.entered.available());
    }
}

void SearchTest::the_end_of_the_program_ends_the_search() {
    const Scene scene;
    Stage stage(scene, std::make_unique<GatedModel>());
    auto& model = static_cast<GatedModel&>(*stage.model);
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")})).then_while_searching([&](QWidget*) {
        model.entered.acquire();
        model.gate.release(1000);
        QCoreApplication::exit(7);
    });
    QTimer::singleShot(0, &stage.window, &MainWindow::show_find_dialog);
    QCOMPARE(QCoreApplication::exec(), 7);
    QVERIFY(hand.is_done());
    QVERIFY(model.is_left_alone());
}

// A model that seems empty to the window, and not to its search.
class HidingModel : public RegModel {
public:
    QModelIndex index(int row, int column, const QModelIndex& parent = QModelIndex()) const override {
        const bool is_asked_by_window = QThread::currentThread() == thread();
        return hides && is_asked_by_window && !parent.isValid() ? QModelIndex() : RegModel::index(row, column, parent);
    }

    bool hides = false;
};

void SearchTest::a_search_without_a_start_goes_on_and_does_not_begin_one() {
    const Scene scene;
    Stage stage(scene, std::make_unique<HidingModel>());
    auto& model = static_cast<HidingModel&>(*stage.model);
    model.begin_find(stage.key(alpha));
    model.hides = true;
    DialogHand hand;
    hand.then(ask({QStringLiteral("zeta")}));
    stage.window.show_find_dialog();
    QVERIFY(hand.is_done());
    model.hides = false;
    QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    // It was the model's own search that went on: "Find next" asks.
    hand.then(escape_the_question);
    stage.window.find_next();
    QVERIFY(hand.is_done());
}

UI_TEST_MAIN(SearchTest)
#include "search_test.moc"
