// HVX units, contexts, the worker pool and DSP start-up, as the kernels call them.
#ifndef CORVANE_PLATFORM_DSPCV_H
#define CORVANE_PLATFORM_DSPCV_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef enum {
  DSP_TOTAL_MCPS = 0,
  DSP_MCPS_PER_THREAD = 1,
  PEAK_BUS_BANDWIDTH_MBPS = 2,
  BUS_USAGE_PERCENT = 3,
} dspCV_AttributeID;

typedef struct {
  dspCV_AttributeID ID;
  int value;
} dspCV_Attribute;

typedef enum {
  DSPCV_HVX_MODE_DONT_CARE = 0,
  DSPCV_HVX_MODE_64B = 1,
  DSPCV_HVX_MODE_128B = 2,
} dspCV_hvx_mode_t;

typedef struct {
  int numUnits;
  int tempReserve;
  dspCV_hvx_mode_t mode;
  int VLEN;
  int numThreads;
} dspCV_hvx_config_t;

typedef enum { COMPUTE_RECOMMENDATION = 0 } dspCV_ConcurrencyAttributeID;
enum { COMPUTE_RECOMMENDATION_OK = 0, COMPUTE_RECOMMENDATION_NOT_OK = 1 };

typedef struct {
  dspCV_ConcurrencyAttributeID ID;
  int value;
} dspCV_ConcurrencyAttribute;

// Completion token of the worker pool: wait returns once `jobs` jobdone calls were seen.
typedef struct {
  volatile unsigned int done;
  unsigned int jobs;
} dspCV_synctoken_t;

typedef void (*dspCV_worker_callback_t)(void*);
typedef struct {
  dspCV_worker_callback_t fptr;
  void* dptr;
} dspCV_worker_job_t;

int dspCV_initQ6_with_attributes(const dspCV_Attribute* attributes, unsigned int count);
int dspCV_deinitQ6(void);

int dspCV_hvx_num_reserved(void);
int dspCV_hvx_reserve(int num_units);
int dspCV_hvx_unreserve(void);
int dspCV_hvx_lock(dspCV_hvx_mode_t mode, unsigned int wait);
int dspCV_hvx_unlock(void);
int dspCV_hvx_power_on(void);
int dspCV_hvx_power_off(void);

int dspCV_concurrency_query(dspCV_ConcurrencyAttribute* attributes, int count);
int dspCV_hvx_prepare_mt_job(dspCV_hvx_config_t* config);
int dspCV_hvx_cleanup_mt_job(dspCV_hvx_config_t* config);
void dspCV_worker_pool_synctoken_init(dspCV_synctoken_t* token, unsigned int jobs);
int dspCV_worker_pool_submit(dspCV_worker_job_t job);
void dspCV_worker_pool_synctoken_jobdone(dspCV_synctoken_t* token);
void dspCV_worker_pool_synctoken_wait(dspCV_synctoken_t* token);
unsigned int dspCV_atomic_inc_return(unsigned int* target);

#ifdef __cplusplus
}
#endif
#endif
