// Thread-specific storage keys of the DSP's operating system.
#ifndef CORVANE_PLATFORM_QURT_H
#define CORVANE_PLATFORM_QURT_H

#ifdef __cplusplus
extern "C" {
#endif

int qurt_tls_create_key(int* key, void (*destructor)(void*));
int qurt_tls_delete_key(int key);
void* qurt_tls_get_specific(int key);
int qurt_tls_set_specific(int key, const void* value);

#ifdef __cplusplus
}
#endif
#endif
