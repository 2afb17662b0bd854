// How long the address book takes with 10,000 contacts: importing a vCard file and a Google
// CSV file of that many into an empty book (a user moving to Pelmo; it should stay well under
// a second), importing the same vCard file again (every card then merges), reading the vCard
// file alone (the share of parsing), and the search filter over that many persons, which runs
// on every key press.

#include "addressbook/AddressBook.h"
#include "addressbook/ContactsFile.h"
#include "addressbook/PersonFilter.h"

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>
#include <benchmark/benchmark.h>

#include <memory>

namespace {

constexpr int kContacts = 10000;

const char* const kFirst[] = {"Ada", "Zoë", "Jürgen", "Marie", "Ángel", "Grace", "Łukasz"};
const char* const kLast[] = {"Lovelace", "Åström", "Müller", "Curie", "Hopper", "Wałęsa"};

QString firstName(int i) {
    return QString::fromUtf8(kFirst[i % std::size(kFirst)]);
}

QString lastName(int i) {
    return QString::fromUtf8(kLast[i % std::size(kLast)]) + QString::number(i);
}

// Every contact has one or two addresses and is in one or two of 40 groups.
QByteArray vCards() {
    QByteArray out;
    for (int i = 0; i < kContacts; ++i) {
        out += "BEGIN:VCARD\r\nVERSION:3.0\r\n";
        out += QStringLiteral("N:%1;%2;;;\r\nFN:%2 %1\r\n").arg(lastName(i), firstName(i)).toUtf8();
        out += QStringLiteral("EMAIL;TYPE=pref:p%1@example.org\r\n").arg(i).toUtf8();
        if (i % 2 == 0)
            out += QStringLiteral("EMAIL:w%1@work.example\r\n").arg(i).toUtf8();
        out += QStringLiteral("CATEGORIES:Group %1,Club %2\r\n").arg(i % 40).arg(i % 7).toUtf8();
        out += "END:VCARD\r\n";
    }
    return out;
}

QByteArray googleCsv() {
    QByteArray out = "Name,Given Name,Family Name,Group Membership,E-mail 1 - Type,"
                     "E-mail 1 - Value,E-mail 2 - Type,E-mail 2 - Value\r\n";
    for (int i = 0; i < kContacts; ++i)
        out += QStringLiteral("%1 %2,%1,%2,Group %3 ::: * myContacts,Home,p%4@example.org,Work,"
                              "w%4@work.example\r\n")
                   .arg(firstName(i), lastName(i))
                   .arg(i % 40)
                   .arg(i)
                   .toUtf8();
    return out;
}

struct Files {
    QTemporaryDir folder;
    QString vcf = folder.filePath(QStringLiteral("contacts.vcf"));
    QString csv = folder.filePath(QStringLiteral("contacts.csv"));

    Files() {
        for (const auto& [path, bytes] : {std::pair{vcf, vCards()}, std::pair{csv, googleCsv()}}) {
            QFile file(path);
            if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size())
                std::abort();
        }
    }
};

Files& files() {
    static Files made;
    return made;
}

void importIntoEmptyBook(benchmark::State& state, const QString& path) {
    int run = 0;
    ImportSummary summary;
    for (auto _ : state) {
        state.PauseTiming();
        const QString bookPath =
            files().folder.filePath(QStringLiteral("book%1.sqlite").arg(++run));
        auto book = std::make_unique<AddressBook>(bookPath);
        state.ResumeTiming();
        summary = book->importFile(path);
    }
    state.counters["added"] = summary.personsAdded;
}

void ImportVCardIntoEmptyBook(benchmark::State& state) {
    importIntoEmptyBook(state, files().vcf);
}
BENCHMARK(ImportVCardIntoEmptyBook)->Unit(benchmark::kMillisecond);

void ImportGoogleCsvIntoEmptyBook(benchmark::State& state) {
    importIntoEmptyBook(state, files().csv);
}
BENCHMARK(ImportGoogleCsvIntoEmptyBook)->Unit(benchmark::kMillisecond);

void ImportTheSameVCardAgain(benchmark::State& state) {
    AddressBook book(files().folder.filePath(QStringLiteral("again.sqlite")));
    book.importFile(files().vcf);
    ImportSummary summary;
    for (auto _ : state)
        summary = book.importFile(files().vcf);
    state.counters["unchanged"] = summary.personsUnchanged;
}
BENCHMARK(ImportTheSameVCardAgain)->Unit(benchmark::kMillisecond);

// The share of reading the file in an import, against the imports above.
void ParseVCardOnly(benchmark::State& state) {
    qsizetype read = 0;
    for (auto _ : state)
        read = ContactsFile::read(files().vcf).contacts.size();
    state.counters["contacts"] = static_cast<double>(read);
}
BENCHMARK(ParseVCardOnly)->Unit(benchmark::kMillisecond);

// The query of a user who has typed part of a first name and part of an address.
void FilterPersons(benchmark::State& state) {
    AddressBook book(files().folder.filePath(QStringLiteral("filter.sqlite")));
    book.importFile(files().vcf);
    const QList<Person> persons = book.persons();
    qsizetype found = 0;
    for (auto _ : state)
        found = PersonFilter::filter(persons, QStringLiteral("jür WORK.ex")).size();
    state.counters["persons"] = static_cast<double>(persons.size());
    state.counters["found"] = static_cast<double>(found);
}
BENCHMARK(FilterPersons)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
