/**
 * @file version.h
 * The version of these headers; tw_version() in systems.h tells that of the library which is
 * loaded.
 *
 * Semantic versioning (CHANGELOG.md): programs built against one version run with every later one
 * of the same first number.  The build and the packages take the version from here.
 */
#ifndef TIDEWATER_VERSION_H
#define TIDEWATER_VERSION_H

#define TIDEWATER_VERSION_MAJOR 1 /**< rises when a program that works has to be changed */
#define TIDEWATER_VERSION_MINOR 0 /**< rises when something is added */
#define TIDEWATER_VERSION_PATCH 0 /**< rises when something is mended */

/** The three numbers as text. */
#define TIDEWATER_VERSION "1.0.0"

#endif
