// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Searches of the window, and what the window does beside them: for the thread sanitizer above all.

#include "stage.h"
#include "ui_test.h"

#include <QCheckBox>
#include <QHelpEvent>
#include <QLineEdit>
#include <QScrollBar>
#include <QThread>

#include <atomic>
#include <functional>
#include <limits>
#include <vector>

namespace {

constexpr int branches = 40;
constexpr int leaves = 40;
constexpr int values_of_branch = 30;
constexpr int rounds = 6;
constexpr int gestures = 2;
constexpr int keys_a_step = 60;

const QString root_path = QStringLiteral("MACHINE\\SYSTEM");

// More keys than the hive keeps handles, so that window and worker take each other's away.
testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    for (int i = 0; i < branches; i++) {
        testkit::KeyLayout& branch = hive.root.add("Branch " + std::to_string(100 + i));
        for (int j = 0; j < values_of_branch; j += 3) {
            branch.set("text " + std::to_string(j), 1, testkit::text_data(std::string(200, 'x')));
            branch.set("bytes " + std::to_string(j), 3, testkit::pattern(300));
            // Eight bytes are no DWORD: its data cannot be read.
            branch.set("unreadable " + std::to_string(j), 4, testkit::pattern(8));
        }
        for (int j = 0; j < leaves; j++)
            branch.add("Leaf " + std::to_string(j)).set("value", 4, testkit::pattern(4));
    }
    hive.root.add("Last");
    return hive;
}

// A model whose search goes along with the window: it is free to run over the next keys while a step is made, and
// not to be through before the first one. What passes between the threads here orders nothing, since an order would
// hide from the sanitizer what it is to find.
class PacedModel : public RegModel {
public:
    QVariant data(const QModelIndex& index, int role) const override {
        if (QThread::currentThread() != thread()) {
            while (visited.load(std::memory_order_relaxed) >= granted.load(std::memory_order_relaxed))
                QThread::yieldCurrentThread();
            visited.fetch_add(1, std::memory_order_relaxed);
        }
        return RegModel::data(index, role);
    }

    void grant(int more) { granted.store(visited.load(std::memory_order_relaxed) + more, std::memory_order_relaxed); }
    void let_go() { granted.store(std::numeric_limits<int>::max(), std::memory_order_relaxed); }

    mutable std::atomic<int> visited = 0;  // keys that a search has come to
    std::atomic<int> granted = 0;
};

// Asks for a cell in the way of a mouse that rests on it, and of a screen reader.
void ask_about(const Stage& stage, const QModelIndex& index) {
    const QPoint point = stage.values->visualRect(index).center();
    QHelpEvent asked(QEvent::ToolTip, point, stage.values->viewport()->mapToGlobal(point));
    QCoreApplication::sendEvent(stage.values->viewport(), &asked);
    QCOMPARE(index.data(Qt::AccessibleTextRole).isValid(), index.data(Qt::DisplayRole).isValid());
}

// What a user does in the window, in steps. By what the views have for it: the search's dialog is modal, and keeps
// mouse and keyboard from them.
std::vector<std::function<void()>> gesture(Stage& stage, int number) {
    const QModelIndex root = stage.model->index(0, 0, stage.model->index(0, 0));
    const QModelIndex branch = stage.model->index((number * 7) % branches, 0, root);
    const QModelIndex other = stage.model->index((number * 11) % branches, 0, root);
    const auto value = [&stage, number] { return stage.values->model()->index(1 + number % values_of_branch, 0); };
    return {
        [&stage, branch] { stage.keys->setExpanded(branch, !stage.keys->isExpanded(branch)); },
        [&stage, other] {
            stage.keys->scrollTo(other);
            stage.keys->viewport()->repaint();
        },
        [branch] { QVERIFY(!branch.data(Qt::AccessibleTextRole).toString().isEmpty()); },
        [&stage, branch] {
            stage.keys->setCurrentIndex(branch);
            QCOMPARE(stage.values->model()->rowCount(), 1 + values_of_branch);
        },
        [&stage] { stage.window.repaint(); },
        [&stage] {
            stage.values->verticalScrollBar()->setValue(stage.values->verticalScrollBar()->maximum());
            stage.values->viewport()->repaint();
        },
        [&stage] { stage.values->model()->sort(0, Qt::AscendingOrder); },
        [&stage, value] { stage.values->setCurrentIndex(value()); },
        [&stage, value] { ask_about(stage, value()); },
        [&stage, value] { ask_about(stage, value().siblingAtColumn(1)); },
        [&stage, value] { ask_about(stage, value().siblingAtColumn(2)); },
        [&stage] { stage.values->viewport()->repaint(); },
    };
}

DialogHand::Step ask_for(const QString& term) {
    return [term](QWidget* dialog) {
        dialog->findChild<QLineEdit*>()->setText(term);
        find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->setChecked(true);
        press(*dialog, QDialogButtonBox::Ok);
    };
}

}  // namespace

class SearchThreadsTest : public QObject {
    Q_OBJECT

private slots:
    void the_window_goes_on_beside_its_search();
};

void SearchThreadsTest::the_window_goes_on_beside_its_search() {
    const Scene scene{layout()};
    Stage stage(scene, std::make_unique<PacedModel>());
    auto& model = static_cast<PacedModel&>(*stage.model);
    // Few rows to paint: every round is worth more than every row.
    stage.window.resize(480, 180);
    stage.keys->expand(stage.key(root_path));
    int number = 0;
    int steps = 0;
    int accompanied = 0;
    for (int round = 0; round < rounds; round++) {
        const bool is_cancelled = round % 3 == 0;
        const bool is_hit = round % 3 == 1;
        DialogHand hand;
        hand.then(ask_for(is_hit ? QStringLiteral("last") : QStringLiteral("not there")));
        hand.then_while_searching([&](QWidget* dialog) {
            for (int i = 0; i < gestures; i++) {
                for (const auto& step : gesture(stage, number++)) {
                    const int before = model.visited.load(std::memory_order_relaxed);
                    model.grant(keys_a_step);
                    step();
                    steps++;
                    accompanied += model.visited.load(std::memory_order_relaxed) > before ? 1 : 0;
                }
            }
            if (is_cancelled)
                QTest::keyClick(dialog, Qt::Key_Escape);
            model.let_go();
            if (!is_cancelled) {
                // To the end of the search as well, and behind it.
                for (const auto& step : gesture(stage, number++))
                    step();
            }
        });
        if (!is_cancelled && !is_hit)
            hand.then_press(QMessageBox::Ok);
        model.grant(0);
        stage.window.show_find_dialog();
        QVERIFY(hand.is_done());
        QVERIFY(hand.nothing_comes());
        if (is_hit)
            QCOMPARE(stage.status(), root_path + QStringLiteral("\\Last"));
    }
    qInfo("%d of %d steps had the search beside them", accompanied, steps);
    QVERIFY(accompanied >= rounds);
}

UI_TEST_MAIN(SearchThreadsTest)
#include "search_threads_test.moc"
