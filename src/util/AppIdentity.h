#pragma once

/**
 * The names under which Pelmo keeps its files: the settings in
 * ~/.config/<organisation>/<application>.conf and the data folder
 * ~/.local/share/<organisation>/<application>/. Changing them loses every user's settings,
 * contacts and log.
 */
inline constexpr char kOrganisationName[] = "Orvale Software";
inline constexpr char kApplicationName[] = "Pelmo";
