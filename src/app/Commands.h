#pragma once

#include <QStringList>

#include <functional>

class AddressBook;
class PelmoController;

/**
 * The command-line mode: `pelmo COMMAND ARGS...`. Each command takes its own arguments (the
 * command name removed) and answers the process exit status: 0 on success, 1 when the work
 * failed, 2 on a usage error. Commands never wait for input they were not given.
 */
namespace Commands {

/** Runs the command named by args[0]; prints the usage and answers 2 when it is unknown. */
int run(const QStringList& args);

/** The usage text for every command. */
QString usage();

/**
 * `contacts import FILE`: adds a vCard or CSV file to the address book, all of it or nothing.
 * `contacts list [--group NAME]`: prints every person, or a group's members in order, one
 * "First Last <address>" per line.
 */
int contacts(const QStringList& args);

int relink(const QStringList& args);

/**
 * `send [options]`: one mailing run without a window, printing every status line. 0 when every
 * copy was accepted, 1 when any was not (refused, login failed, run halted), 2 on a usage error.
 */
int send(const QStringList& args);

/**
 * `front-page`: the address and the title (an empty line when unknown) of the page the web
 * browser shows; 1, with the alert on standard error, when there is none.
 */
int frontPage(const QStringList& args);

/**
 * `default-client`: prints the desktop id of the application that opens links to e-mail
 * addresses (an empty line when none); 0 when it is Pelmo, else 1. `default-client --set` makes
 * it Pelmo: 0, or 1 with the reason on standard error.
 */
int defaultClient(const QStringList& args);

/**
 * `check-update`: asks whether a newer Pelmo has been published, printing each step. 0 when the
 * answer came (up to date, or an update exists), 1 when the check failed.
 */
int checkUpdate(const QStringList& args);

/**
 * Runs work on a controller over the console, with the user's address book, settings and
 * keyring and the activity log open; startUp first when asked (it prints "Ready."). A settings
 * failure is printed after "pelmo COMMAND: " and answers 1.
 */
int onConsole(const char* command, bool startUp,
              const std::function<int(PelmoController&, AddressBook&)>& work);

/** Asks the controller for the browser's front page and waits for it; false after an alert. */
bool askFrontPage(PelmoController& controller);

} // namespace Commands
