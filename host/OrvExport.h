// Symbol visibility of the host libraries.
#pragma once

#if defined(_WIN32)
#if defined(ORV_CORE_BUILD)
#define ORV_CORE_API __declspec(dllexport)
#else
#define ORV_CORE_API __declspec(dllimport)
#endif
#if defined(ORV_JTAG_BUILD)
#define ORV_JTAG_API __declspec(dllexport)
#else
#define ORV_JTAG_API __declspec(dllimport)
#endif
#if defined(ORV_UTIL_BUILD)
#define ORV_UTIL_API __declspec(dllexport)
#else
#define ORV_UTIL_API __declspec(dllimport)
#endif
#else
#define ORV_CORE_API __attribute__((visibility("default")))
#define ORV_JTAG_API __attribute__((visibility("default")))
#define ORV_UTIL_API __attribute__((visibility("default")))
#endif
