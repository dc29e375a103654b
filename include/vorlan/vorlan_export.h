/* Symbol visibility for the shared library: only what carries VORLAN_API is exported. */
#ifndef VORLAN_EXPORT_H
#define VORLAN_EXPORT_H

#if defined(_WIN32)
#  if defined(VORLAN_BUILDING_LIBRARY)
#    define VORLAN_API __declspec(dllexport)
#  else
#    define VORLAN_API __declspec(dllimport)
#  endif
#else
#  define VORLAN_API __attribute__((visibility("default")))
#endif

#endif
