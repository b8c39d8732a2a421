// Start-up: a static initialiser makes the process-local start-up record, whose
// constructor brings the DSP side up; its destructor, run at process end, takes it down.
#include "HAP.h"
#include "core/hvx_modes.h"
#include "core/nstd.h"
#include "dspCV.h"

namespace {

bool initializeDSP() {
  static const dspCV_Attribute attributes[] = {
      {DSP_TOTAL_MCPS, 1000},
      {DSP_MCPS_PER_THREAD, 500},
      {PEAK_BUS_BANDWIDTH_MBPS, 12000},
      {BUS_USAGE_PERCENT, 100},
  };
  if (dspCV_initQ6_with_attributes(attributes, nstd::array_size(attributes)) != 0) return false;
  if (dspCV_hvx_power_on() != 0) {
    dspCV_deinitQ6();
    return false;
  }
  return true;
}

struct PLS_Data {
  bool success;
  PLS_Data() : success(false) { success = initializeDSP(); }
  ~PLS_Data() {
    if (success) {
      dspCV_hvx_power_off();
      dspCV_deinitQ6();
    }
  }
};

// A typed record in process-local storage; the address of ctor tags its type.
template <class T> struct PLS {
  static constexpr uintptr_t INVALID_KEY_VALUE = static_cast<uintptr_t>(-1);
  static uintptr_t next_key;

  static uintptr_t type() { return reinterpret_cast<uintptr_t>(&PLS<T>::ctor); }
  static int ctor(void* /*context*/, void* data) {
    if (data == nullptr) return -1;
    new (data) T();
    return 0;
  }
  static void dtor(void* data) { static_cast<T*>(data)->~T(); }

  static int construct(uintptr_t& key) {
    key = next_key++;
    void* record = nullptr;
    return HAP_pls_add(type(), key, sizeof(T), ctor, nullptr, dtor, &record);
  }
  static T* get(uintptr_t key) {
    void* record = nullptr;
    return HAP_pls_lookup(type(), key, &record) == 0 ? static_cast<T*>(record) : nullptr;
  }
  static T* getOrCreate(uintptr_t key) {
    if (T* record = get(key)) return record;
    void* record = nullptr;
    return HAP_pls_add(type(), key, sizeof(T), ctor, nullptr, dtor, &record) == 0 ? static_cast<T*>(record)
                                                                                  : nullptr;
  }
};
template <class T> uintptr_t PLS<T>::next_key = 0;

class DspInit {
 public:
  DspInit() : pls_key(PLS<PLS_Data>::INVALID_KEY_VALUE) { PLS<PLS_Data>::construct(pls_key); }
  bool isInitialized() const {
    const PLS_Data* data = PLS<PLS_Data>::get(pls_key);
    return data != nullptr && data->success;
  }

 private:
  uintptr_t pls_key;
};

DspInit dsp_init;

}  // namespace

namespace hvx {
bool IsInitialized() { return dsp_init.isInitialized(); }
}  // namespace hvx
