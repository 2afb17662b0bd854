#include "addressbook/VCardImporter.h"

#include "RowName.h"

#include "ImportExpectations.h"

#include <QFile>

namespace {

QByteArray dataFile(const char* name) {
    QFile file(QStringLiteral(PELMO_TEST_DATA "/") + QLatin1String(name));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

class VCardCards : public ::testing::TestWithParam<ParseCase> {};

TEST_P(VCardCards, Parse) {
    expectContacts(VCardImporter::parse(GetParam().text), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    Rules, VCardCards,
    ::testing::Values(
        ParseCase{"NameFromN",
                  "BEGIN:VCARD\r\nVERSION:3.0\r\nN:Lovelace;Ada;;;\r\nFN:Countess\r\n"
                  "EMAIL:ada@example.org\r\nEND:VCARD\r\n",
                  {{"Ada", "Lovelace", {"ada@example.org"}, 0, {}}}},
        ParseCase{"FnWhenNIsMissing",
                  "BEGIN:VCARD\nVERSION:4.0\nFN:Ada King Lovelace\nEMAIL:ada@example.org\n"
                  "END:VCARD\n",
                  {{"Ada King", "Lovelace", {"ada@example.org"}, 0, {}}}},
        ParseCase{"FnWhenNIsBlank",
                  "BEGIN:VCARD\nVERSION:3.0\nN:;;;;\nFN:Cher\nEMAIL:cher@example.org\nEND:VCARD\n",
                  {{"Cher", nullptr, {"cher@example.org"}, 0, {}}}},
        ParseCase{"FirstEmailIsPrimaryWithoutPreference",
                  "BEGIN:VCARD\nVERSION:3.0\nFN:A B\nEMAIL:one@example.org\n"
                  "EMAIL:two@example.org\nEND:VCARD\n",
                  {{"A", "B", {"one@example.org", "two@example.org"}, 0, {}}}},
        ParseCase{"TypePrefInAList",
                  "BEGIN:VCARD\nVERSION:3.0\nFN:A B\nEMAIL;TYPE=internet:one@example.org\n"
                  "EMAIL;TYPE=\"internet,pref\":two@example.org\nEND:VCARD\n",
                  {{"A", "B", {"one@example.org", "two@example.org"}, 1, {}}}},
        ParseCase{"TypePrefRepeated",
                  "BEGIN:VCARD\nVERSION:3.0\nFN:A B\nEMAIL;TYPE=internet:one@example.org\n"
                  "EMAIL;TYPE=internet;TYPE=PREF:two@example.org\nEND:VCARD\n",
                  {{"A", "B", {"one@example.org", "two@example.org"}, 1, {}}}},
        ParseCase{"LowestPrefWins",
                  "BEGIN:VCARD\nVERSION:4.0\nFN:A B\nEMAIL;PREF=50:one@example.org\n"
                  "EMAIL;PREF=3:two@example.org\nEMAIL;PREF=7:three@example.org\nEND:VCARD\n",
                  {{"A", "B", {"one@example.org", "two@example.org", "three@example.org"}, 1, {}}}},
        ParseCase{"BarePrefOf21",
                  "BEGIN:VCARD\r\nVERSION:2.1\r\nN:B;A\r\nEMAIL;INTERNET:one@example.org\r\n"
                  "EMAIL;PREF;INTERNET:two@example.org\r\nEND:VCARD\r\n",
                  {{"A", "B", {"one@example.org", "two@example.org"}, 1, {}}}},
        ParseCase{"DuplicateAddressKeptOnce",
                  "BEGIN:VCARD\nVERSION:3.0\nFN:A B\nEMAIL:a@example.org\n"
                  "EMAIL;TYPE=pref:A@EXAMPLE.ORG\nEND:VCARD\n",
                  {{"A", "B", {"a@example.org"}, 0, {}}}},
        ParseCase{"FoldedLinesWithSpaceAndTab",
                  "BEGIN:VCARD\r\nVERSION:4.0\r\nFN:Grace Ho\r\n pper\r\nEMAIL:gr\r\n\tace@exa\r\n"
                  " mple.com\r\nEND:VCARD\r\n",
                  {{"Grace", "Hopper", {"grace@example.com"}, 0, {}}}},
        ParseCase{"CategoriesAreGroups",
                  "BEGIN:VCARD\nVERSION:3.0\nFN:A B\nCATEGORIES:Friends, Work ,friends,,"
                  "Chess\\, Go\nCATEGORIES:Later\nEND:VCARD\n",
                  {{"A", "B", {}, -1, {"Friends", "Work", "Chess, Go", "Later"}}}},
        ParseCase{"NameListsOf40",
                  "BEGIN:VCARD\nVERSION:4.0\nN:van Dyke,Jr;Mary,Ann;;;\nEND:VCARD\n",
                  {{"Mary Ann", "van Dyke Jr", {}, -1, {}}}},
        ParseCase{"EscapesOf30",
                  "BEGIN:VCARD\nVERSION:3.0\nN:O\\;Brien;Se\\,an;;;\nEND:VCARD\n",
                  {{"Se,an", "O;Brien", {}, -1, {}}}},
        ParseCase{"BackslashIsTextIn21",
                  "BEGIN:VCARD\nVERSION:2.1\nN:Back\\slash\\;Name;Al\nEND:VCARD\n",
                  {{"Al", "Back\\slash;Name", {}, -1, {}}}},
        ParseCase{"QuotedPrintableLatin1",
                  "BEGIN:VCARD\r\nVERSION:2.1\r\nN;CHARSET=ISO-8859-1;ENCODING=QUOTED-PRINTABLE:"
                  "M=FCller;J=FCrgen\r\nEND:VCARD\r\n",
                  {{"J\xc3\xbcrgen", "M\xc3\xbcller", {}, -1, {}}}},
        ParseCase{"QuotedPrintableSoftBreakAndBareEncoding",
                  "BEGIN:VCARD\r\nVERSION:2.1\r\nFN;CHARSET=UTF-8;QUOTED-PRINTABLE:Ren=C3=\r\n"
                  "=A9e Dupont=\r\n\r\nNOTE;QUOTED-PRINTABLE:no colon =\r\non this line\r\n"
                  "END:VCARD\r\n",
                  {{"Ren\xc3\xa9\x65", "Dupont", {}, -1, {}}}},
        ParseCase{"UnlabelledLatin1Bytes",
                  "BEGIN:VCARD\nVERSION:2.1\nN:M\xfcller;J\xfcrgen\nEND:VCARD\n",
                  {{"J\xc3\xbcrgen", "M\xc3\xbcller", {}, -1, {}}}},
        ParseCase{"GroupPrefixAndLowerCaseNames",
                  "begin:vcard\nversion:3.0\nitem1.email;type=internet:a@example.org\nfn:A B\n"
                  "end:vcard\n",
                  {{"A", "B", {"a@example.org"}, 0, {}}}},
        ParseCase{"ByteOrderMarkAndBlankLines",
                  "\xef\xbb\xbf\nBEGIN:VCARD\nVERSION:3.0\n\nFN:A B\nEND:VCARD\n\n",
                  {{"A", "B", {}, -1, {}}}},
        ParseCase{"CardWithoutNameOrAddressIsLeftOut",
                  "BEGIN:VCARD\nVERSION:4.0\nTEL:+1 555 0100\nEND:VCARD\n"
                  "BEGIN:VCARD\nVERSION:4.0\nEMAIL:only@example.org\nEND:VCARD\n",
                  {{nullptr, nullptr, {"only@example.org"}, 0, {}}}},
        ParseCase{"GroupCardAddsItsMembers",
                  "BEGIN:VCARD\nVERSION:3.0\nUID:AAA\nFN:Ada L\nEND:VCARD\n"
                  "BEGIN:VCARD\nVERSION:3.0\nX-ADDRESSBOOKSERVER-KIND:group\nFN:Team\n"
                  "X-ADDRESSBOOKSERVER-MEMBER:urn:uuid:aaa\nX-ADDRESSBOOKSERVER-MEMBER:"
                  "urn:uuid:missing\nEND:VCARD\n",
                  {{"Ada", "L", {}, -1, {"Team"}}}}),
    RowName());

class VCardFaults : public ::testing::TestWithParam<BadCase> {};

TEST_P(VCardFaults, RefusedWithTheLine) {
    expectRefused(&VCardImporter::parse, GetParam());
}

INSTANTIATE_TEST_SUITE_P(
    Rules, VCardFaults,
    ::testing::Values(
        BadCase{"LineWithoutColon", "BEGIN:VCARD\nVERSION:3.0\nFN Ada\nEND:VCARD\n", 3,
                "line 3: this line has no \":\" between a property and its value"},
        BadCase{"BadAddress", "BEGIN:VCARD\nVERSION:3.0\nFN:A\nEMAIL:a.example.org\nEND:VCARD\n", 4,
                "line 4: \"a.example.org\" is not an e-mail address"},
        BadCase{"TwoAts", "BEGIN:VCARD\nVERSION:3.0\nEMAIL:a@b@example.org\nEND:VCARD\n", 3,
                "line 3: \"a@b@example.org\" is not an e-mail address"},
        BadCase{"NoEnd", "BEGIN:VCARD\nVERSION:3.0\nFN:A\nBEGIN:VCARD\n", 4,
                "line 4: a card begins here before the previous one has ended"},
        BadCase{"MissingEndAtEof", "BEGIN:VCARD\nVERSION:3.0\nFN:A\n", 1,
                "line 1: this card has no END:VCARD"},
        BadCase{"PropertyOutsideACard", "FN:Ada\n", 1,
                "line 1: \"FN:Ada\" stands outside BEGIN:VCARD and END:VCARD"},
        BadCase{"NotAVCard", "BEGIN:VCALENDAR\n", 1,
                "line 1: \"BEGIN:VCALENDAR\" does not begin a vCard"},
        BadCase{"UnknownVersion", "BEGIN:VCARD\nVERSION:5.0\nEND:VCARD\n", 2,
                "line 2: vCard version \"5.0\" is not supported (2.1, 3.0 and 4.0 are)"},
        BadCase{"UnknownCharset",
                "BEGIN:VCARD\r\nVERSION:2.1\r\nN;CHARSET=X-NOSUCH:A;B\r\nEND:VCARD\r\n", 3,
                "line 3: the character set \"X-NOSUCH\" is not known"},
        BadCase{"FoldedLineCountsFromItsStart",
                "BEGIN:VCARD\nVERSION:3.0\nFN:A\nEMAIL:not\n an-address\nEND:VCARD\n", 4,
                "line 4: \"notan-address\" is not an e-mail address"},
        BadCase{"ControlCharacterInAName",
                "BEGIN:VCARD\nVERSION:3.0\nN:Lovelace;Ada\x1e\x1e;;;\nEND:VCARD\n", 3,
                "line 3: a name cannot hold a control character"},
        BadCase{"EmptyFile", "", 0, "the file holds no vCard"}),
    RowName());

TEST(VCardFiles, Version21) {
    expectContacts(VCardImporter::parse(dataFile("v21.vcf")),
                   {{"J\xc3\xbcrgen",
                     "M\xc3\xbcller",
                     {"juergen@example.de", "j.mueller@example.de"},
                     1,
                     {"Friends", "Work"}},
                    {"Ren\xc3\xa9\x65", "\xc3\x89lise", {"renee@example.fr"}, 0, {}}});
}

TEST(VCardFiles, Version30) {
    expectContacts(VCardImporter::parse(dataFile("v30.vcf")),
                   {{"Ada",
                     "Lovelace",
                     {"ada@work.example", "ada@example.org"},
                     1,
                     {"Friends", "Mathematicians"}},
                    {"Charles",
                     "Babbage",
                     {"charles@example.org"},
                     0,
                     {"Friends, old and new", "Engineers"}}});
}

TEST(VCardFiles, Version40) {
    expectContacts(
        VCardImporter::parse(dataFile("v40.vcf")),
        {{"Grace", "Hopper", {"grace@navy.example", "grace@example.com"}, 1, {"Pioneers"}},
         {"Alan", "Turing", {"alan@example.org"}, 0, {"Friends", "Pioneers"}}});
}

} // namespace
