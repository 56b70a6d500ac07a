/* Marks the functions and data that libvelm exports; everything else is hidden. */
#ifndef VELM_API_H
#define VELM_API_H

#if defined(VELM_BUILDING_LIBRARY)
#define VELM_API __attribute__((visibility("default")))
#else
#define VELM_API
#endif

#ifdef __cplusplus
#define VELM_EXTERN_C_BEGIN extern "C" {
#define VELM_EXTERN_C_END }
#else
#define VELM_EXTERN_C_BEGIN
#define VELM_EXTERN_C_END
#endif

#endif /* VELM_API_H */
