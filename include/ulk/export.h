// Export macros of the ULK interface.
//
// ULK_API marks the classes and functions that libulk exports; everything else
// in the library is hidden. ULK_PLUGIN_EXPORT marks a plug-in's entry points
// (ulkStartUp_v1, ulkNewModel_v1, ...) as exported C functions the library
// finds by name.
#ifndef ULK_EXPORT_H
#define ULK_EXPORT_H

#if defined(_WIN32)
#  if defined(ULK_BUILDING_LIBRARY)
#    define ULK_API __declspec(dllexport)
#  else
#    define ULK_API __declspec(dllimport)
#  endif
#  define ULK_PLUGIN_EXPORT extern "C" __declspec(dllexport)
#else
#  define ULK_API __attribute__((visibility("default")))
#  define ULK_PLUGIN_EXPORT extern "C" __attribute__((visibility("default")))
#endif

#endif  // ULK_EXPORT_H
