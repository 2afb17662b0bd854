// How long dropping the already-mailed persons from a group selection takes when both lists
// are long, against two peers run in the same process: building the case-folded set of the
// sent addresses (the least any filter must do), and the plain walk of the sent list for each
// person on a list 50 times shorter.

#include "addressbook/AddressBook.h"
#include "controller/PelmoView.h"
#include "controller/RecipientSelection.h"
#include "controller/SentRecipients.h"

#include <QGuiApplication>
#include <QSet>
#include <QTemporaryDir>
#include <benchmark/benchmark.h>

#include "RatioMain.h"

#include <cstdio>
#include <memory>
#include <string>

namespace {

constexpr int kLarge = 100000;
constexpr int kSmall = 2000;

class SilentView : public PelmoView {
public:
    QString subject() const override { return {}; }
    void setSubject(const QString&) override {}
    QString to() const override { return {}; }
    void setTo(const QString&) override {}
    QString name() const override { return {}; }
    void setName(const QString&) override {}
    QString webPageOrFile() const override { return {}; }
    void setWebPageOrFile(const QString&) override {}
    void setStatus(const QString&) override {}
    void setProgressCounting(double, double, double) override {}
    void setProgressBusy() override {}
    void setProgressValue(double) override {}
    double progressMaximum() const override { return 0; }
    void startProgressAnimation() override {}
    void stopProgressAnimation() override {}
    QString sendButtonTitle() const override { return {}; }
    void setSendButtonTitle(const QString&) override {}
    void showRecipientsWindow() override {}
    void alert(const QString&, const QString&) override {}
    void beep() override {}
};

// n persons; every second one was mailed, its address sent in another letter case, and the
// sent list is filled up to n with addresses of nobody in the selection.
struct Lists {
    QList<Person> persons;
    QStringList sent;
};

Lists makeLists(int n) {
    Lists lists;
    for (int i = 0; i < n; ++i) {
        const QString address = QStringLiteral("person.%1@example.org").arg(i);
        lists.persons.append(
            Person{i + 1, QStringLiteral("First"), QString::number(i), {address}, 0});
        if (i % 2 == 0)
            lists.sent.append(address.toUpper());
    }
    for (int i = 0; lists.sent.size() < n; ++i)
        lists.sent.append(QStringLiteral("other.%1@example.net").arg(i));
    return lists;
}

struct Fixture {
    QTemporaryDir folder;
    SilentView view;
    SentRecipients sent;
    std::unique_ptr<AddressBook> book;
    std::unique_ptr<RecipientSelection> selection;

    explicit Fixture(const QStringList& addresses) {
        book = std::make_unique<AddressBook>(folder.filePath(QStringLiteral("book.sqlite")));
        selection = std::make_unique<RecipientSelection>(*book, view, sent);
        for (const QString& address : addresses)
            sent.addRecipient(address);
    }
};

void FilterPeopleByRecipients(benchmark::State& state) {
    const Lists lists = makeLists(static_cast<int>(state.range(0)));
    Fixture fixture(lists.sent);
    qsizetype kept = 0;
    for (auto _ : state) {
        fixture.selection->setPeople(lists.persons);
        fixture.selection->filterPeopleByRecipients();
        kept = fixture.selection->getPeople()->size();
    }
    state.counters["kept"] = static_cast<double>(kept);
}
BENCHMARK(FilterPeopleByRecipients)->Arg(kLarge)->Unit(benchmark::kMillisecond);

void BuildFoldedSet(benchmark::State& state) {
    const Lists lists = makeLists(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        QSet<QString> folded;
        folded.reserve(lists.sent.size());
        for (const QString& address : lists.sent)
            folded.insert(address.toCaseFolded());
        benchmark::DoNotOptimize(folded);
    }
}
BENCHMARK(BuildFoldedSet)->Arg(kLarge)->Unit(benchmark::kMillisecond);

void PlainWalkFilter(benchmark::State& state) {
    const Lists lists = makeLists(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        QList<Person> kept;
        for (const Person& person : lists.persons) {
            bool mailed = false;
            for (const QString& address : lists.sent) {
                if (address.compare(person.primaryEmail(), Qt::CaseInsensitive) == 0) {
                    mailed = true;
                    break;
                }
            }
            if (!mailed)
                kept.append(person);
        }
        benchmark::DoNotOptimize(kept);
    }
}
BENCHMARK(PlainWalkFilter)->Arg(kSmall)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    return runWithRatios<QGuiApplication>(argc, argv, [](Timings& seconds) {
        const double filter = seconds["FilterPeopleByRecipients"];
        const double set = seconds["BuildFoldedSet"];
        const double walk = seconds["PlainWalkFilter"];
        if (filter <= 0 || set <= 0 || walk <= 0)
            return;
        const double scale = double(kLarge) / kSmall;
        std::printf("\nfilterPeopleByRecipients, %d persons against %d sent addresses: %.1f ms\n",
                    kLarge, kLarge, filter * 1e3);
        std::printf("  %.2f times the cost of building the case-folded set of the sent list\n",
                    filter / set);
        std::printf("  the plain walk takes %.1f ms at %d; at %d it would take about %.0f s "
                    "(%.0f times the filter)\n",
                    walk * 1e3, kSmall, kLarge, walk * scale * scale,
                    walk * scale * scale / filter);
    });
}
