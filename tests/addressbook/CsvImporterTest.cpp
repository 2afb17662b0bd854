#include "addressbook/CsvImporter.h"

#include "RowName.h"

#include "ImportExpectations.h"

#include <QFile>

namespace {

class CsvRows : public ::testing::TestWithParam<ParseCase> {};

TEST_P(CsvRows, Parse) {
    expectContacts(CsvImporter::parse(GetParam().text), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    Rules, CsvRows,
    ::testing::Values(
        ParseCase{"PlainRows",
                  "first name,last name,e-mail,groups\r\nAda,Lovelace,ada@example.org,Friends\r\n",
                  {{"Ada", "Lovelace", {"ada@example.org"}, 0, {"Friends"}}}},
        ParseCase{
            "HeaderNamesIgnoreCaseAndPunctuation",
            "Groups,E_MAIL,Last-Name,FIRSTNAME,Phone\nFriends,ada@example.org,Lovelace,Ada,1\n",
            {{"Ada", "Lovelace", {"ada@example.org"}, 0, {"Friends"}}}},
        ParseCase{"AlternativeHeaderNames",
                  "Given Name,Surname,Email Address,Categories\nAda,Lovelace,ada@example.org,A\n",
                  {{"Ada", "Lovelace", {"ada@example.org"}, 0, {"A"}}}},
        ParseCase{
            "QuotedFieldsWithCommasAndQuotes",
            "first name,last name,email,groups\n\"Ada, Countess\",\"\"\"Lady\"\" Lovelace\","
            "ada@example.org,\"Friends;Work\"\n",
            {{"Ada, Countess", "\"Lady\" Lovelace", {"ada@example.org"}, 0, {"Friends", "Work"}}}},
        ParseCase{"EmbeddedLineBreak",
                  "first name,last name,email,groups\n\"Ada\nAugusta\",Lovelace,ada@example.org,\n",
                  {{"Ada Augusta", "Lovelace", {"ada@example.org"}, 0, {}}}},
        ParseCase{
            "SeveralAddressesFirstIsPrimary",
            "first name,last name,email\nAda,L,\"ada@example.org; ADA@example.org;a2@ex.org\"\n",
            {{"Ada", "L", {"ada@example.org", "a2@ex.org"}, 0, {}}}},
        ParseCase{"BlankRowsAndShortRows",
                  "first name,last name,email,groups\n\n,,,\nAda,L,ada@example.org\n",
                  {{"Ada", "L", {"ada@example.org"}, 0, {}}}},
        ParseCase{"FullNameColumnWhenNamesAreBlank",
                  "name,email\nGrace Brewster Hopper,grace@example.com\n",
                  {{"Grace Brewster", "Hopper", {"grace@example.com"}, 0, {}}}},
        ParseCase{"NoTrailingLineBreakAndLoneCr",
                  "first name,email\rAda,ada@example.org\rAlan,alan@example.org",
                  {{"Ada", nullptr, {"ada@example.org"}, 0, {}},
                   {"Alan", nullptr, {"alan@example.org"}, 0, {}}}},
        ParseCase{"SpacesAroundQuotesTolerated",
                  "first name,email\n \"Ada\" , \"ada@example.org\"\n",
                  {{"Ada", nullptr, {"ada@example.org"}, 0, {}}}},
        ParseCase{"Windows1252Text",
                  "first name,last name,email\nJ\xfcrgen,M\xfcller,j@example.de\n",
                  {{"J\xc3\xbcrgen", "M\xc3\xbcller", {"j@example.de"}, 0, {}}}},
        ParseCase{"ByteOrderMark",
                  "\xef\xbb\xbf\x65mail,first name\nada@example.org,Ada\n",
                  {{"Ada", nullptr, {"ada@example.org"}, 0, {}}}},
        ParseCase{"HeaderOnly", "first name,last name,email,groups\n", {}}),
    RowName());

class CsvFaults : public ::testing::TestWithParam<BadCase> {};

TEST_P(CsvFaults, RefusedWithTheLine) {
    expectRefused(&CsvImporter::parse, GetParam());
}

INSTANTIATE_TEST_SUITE_P(
    Rules, CsvFaults,
    ::testing::Values(
        BadCase{"NoEmailColumn", "first name,last name\nAda,Lovelace\n", 1,
                "line 1: the header row names no e-mail column (expected \"first name\", "
                "\"last name\", \"e-mail\" and \"groups\")"},
        BadCase{"UnclosedQuote", "first name,email\nAda,ada@example.org\n\"Alan,alan@x.org\n", 3,
                "line 3: the quoted field that opens here is not closed"},
        BadCase{"QuoteInsideField", "first name,email\nA\"da,ada@example.org\n", 2,
                "line 2: a double quote stands inside a field that does not begin with one"},
        BadCase{"TextAfterClosingQuote", "first name,email\n\"Ada\"x,ada@example.org\n", 2,
                "line 2: text follows the closing quote of a field"},
        BadCase{"TooManyFields", "first name,email\nAda,ada@example.org,extra\n", 2,
                "line 2: this row has 3 fields but the header has 2"},
        BadCase{"BadAddressAfterAMultiLineField",
                "first name,email\n\"Ada\nAugusta\",ada@example.org\nAlan,alan(at)example.org\n", 4,
                "line 4: \"alan(at)example.org\" is not an e-mail address"},
        BadCase{"ControlCharacterInAGroup",
                "first name,email,groups\nMarie,marie@example.org,Friends\x12\n", 2,
                "line 2: a name cannot hold a control character"},
        BadCase{"EmptyFile", "", 0, "the file is empty"}),
    RowName());

TEST(CsvFiles, ContactsFile) {
    QFile file(QStringLiteral(PELMO_TEST_DATA "/contacts.csv"));
    ASSERT_TRUE(file.open(QIODevice::ReadOnly));
    expectContacts(CsvImporter::parse(file.readAll()),
                   {{"Ada", "Lovelace", {"ada@example.org"}, 0, {"Friends", "Mathematicians"}},
                    {"Babbage, Jr.",
                     "Charles \"Difference\" Engine",
                     {"charles@example.org", "cb@example.org"},
                     0,
                     {"Friends"}},
                    {"Grace", "Hopper", {"grace@example.com"}, 0, {"Navy Friends"}},
                    {"Alan", "Turing", {"alan@example.org"}, 0, {}}});
}

} // namespace
