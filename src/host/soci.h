// SOCI as this layer uses it. Debian's package is configured for Boost types, whose headers it doesn't bring; no record
// holds a Boost type, so its configuration header is stood in for by the two settings that matter here. They change no
// class of the library.
#pragma once

#define SOCICONFIG_H_INCLUDED
#define SOCI_HAVE_CXX11
#define SOCI_HAVE_VISIBILITY_SUPPORT
#include <soci/soci.h>
#include <soci/sqlite3/soci-sqlite3.h>
