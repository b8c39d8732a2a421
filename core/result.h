// Result codes of every exported function: plain numbers, 0 for success.
#ifndef CORVANE_CORE_RESULT_H
#define CORVANE_CORE_RESULT_H

typedef int AEEResult;

namespace hvx {
enum result_code : int {
  RESULT_OK = 0,
  RESULT_NOT_READY = 1,        // not initialised, no allowed mode, or the mode could not be held
  RESULT_UNSUPPORTED = 4,      // this function or combination of arguments is not supported
  RESULT_NOT_NOW = 13,         // the platform recommends against compute now
  RESULT_BAD_POINTER = 14,     // bad pointer, alignment or length
  RESULT_NOT_IMPLEMENTED = 20, // not implemented, or an unknown power level
  RESULT_NO_MEMORY = 29,       // a working block could not be allocated
  RESULT_LOOP_START = -1,      // parallel loop: no workers, failed prolog, no callback
  RESULT_LOOP_EPILOG = -2,     // parallel loop: failed epilog
};
}

#endif
