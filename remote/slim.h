// Layouts of the interface description record corvane_slim: constant tables that tell the
// transport's generic tools every method, its parameters and their types. Field names are
// the transport's; the record names carry the library's prefix so that the public header
// adds no generic names such as Type or Method.
#ifndef CORVANE_REMOTE_SLIM_H
#define CORVANE_REMOTE_SLIM_H

#include <stdint.h>

typedef struct corvane_slim_type corvane_slim_type;
typedef struct corvane_slim_struct_type corvane_slim_struct_type;
typedef struct corvane_slim_sequence_type corvane_slim_sequence_type;
typedef struct corvane_slim_union_type corvane_slim_union_type;

// Values of corvane_slim_type::type and corvane_slim_parameter::type.
enum {
  CORVANE_SLIM_PRIMITIVE = 2,
  CORVANE_SLIM_STRING = 4,
  CORVANE_SLIM_STRUCT = 6,
  CORVANE_SLIM_ARRAY = 8,
  CORVANE_SLIM_SEQUENCE = 9,
  CORVANE_SLIM_STRUCT_WITH_SEQUENCE = 22,
};

// Values of corvane_slim_parameter::mode.
enum { CORVANE_SLIM_IN = 0, CORVANE_SLIM_ROUT = 3, CORVANE_SLIM_INROUT = 4 };

typedef struct corvane_slim_prim {
  uint8_t bFloating;
  uint8_t bSigned;
} corvane_slim_prim;

typedef struct corvane_slim_array {
  const corvane_slim_type* arrayType;
  int32_t nItems;
} corvane_slim_array;

typedef struct corvane_slim_seq_simple {
  const corvane_slim_type* seqType;
  int32_t nMaxLen;
} corvane_slim_seq_simple;

// What a type or parameter record holds, by its type code.
typedef union corvane_slim_type_param {
  corvane_slim_prim prim;                          // 2
  uint32_t stringMaxLen;                           // 4
  const corvane_slim_struct_type* structType;      // 6, 22
  corvane_slim_array array;                        // 8
  corvane_slim_seq_simple seqSimple;               // 9
  const corvane_slim_sequence_type* seqComplex;    // unused here
  const corvane_slim_union_type* unionType;        // unused here
#ifdef __cplusplus
  struct array_tag {};
  struct sequence_tag {};
  constexpr corvane_slim_type_param() : stringMaxLen(0) {}
  constexpr corvane_slim_type_param(uint8_t floating, uint8_t is_signed) : prim{floating, is_signed} {}
  constexpr explicit corvane_slim_type_param(const corvane_slim_struct_type* s) : structType(s) {}
  constexpr corvane_slim_type_param(array_tag, const corvane_slim_type* t, int32_t n) : array{t, n} {}
  constexpr corvane_slim_type_param(sequence_tag, const corvane_slim_type* t, int32_t n) : seqSimple{t, n} {}
#endif
} corvane_slim_type_param;

struct corvane_slim_type {
  int32_t nativeSize;
  corvane_slim_type_param param;
  uint8_t type;
  uint8_t nativeAlignment;
};

typedef struct corvane_slim_parameter {
  int32_t nativeSize;
  corvane_slim_type_param param;
  uint8_t type;
  uint8_t nativeAlignment;
  uint8_t mode;
  uint8_t bNotNil;
} corvane_slim_parameter;

struct corvane_slim_struct_type {
  int32_t nMembers;
  const corvane_slim_type* const* members;
  int32_t inSize;
  int32_t routSizePrimIn;
  int32_t routSizePrimROut;
  uint8_t inAlignment;
  uint8_t routAlignmentPrimIn;
  uint8_t routAlignmentPrimROut;
};

// Layouts for nested sequences and unions; this interface has neither.
struct corvane_slim_sequence_type {
  const corvane_slim_type* seqType;
  uint32_t nMaxLen;
  uint32_t inSize;
  uint32_t routSizePrimIn;
  uint32_t routSizePrimROut;
};

struct corvane_slim_union_type {
  const corvane_slim_type* descriptor;
  uint32_t nCases;
  const int64_t* caseValues;
  const corvane_slim_type* const* cases;
  int32_t inSize;
  int32_t routSizePrimIn;
  int32_t routSizePrimROut;
  uint8_t inAlignment;
  uint8_t routAlignmentPrimIn;
  uint8_t routAlignmentPrimROut;
  uint8_t inCaseAlignment;
  uint8_t routCaseAlignmentPrimIn;
  uint8_t routCaseAlignmentPrimROut;
  uint8_t nativeCaseAlignment;
  uint8_t bDefaultCase;
};

typedef struct corvane_slim_method {
  uint32_t uScalars;  // the scalars word of a call, with method number 0
  int32_t primInSize;
  int32_t primROutSize;
  int maxArgs;  // arguments of the exported function
  int numParams;
  const corvane_slim_parameter* const* params;
  uint8_t primInAlignment;
  uint8_t primROutAlignment;
} corvane_slim_method;

typedef struct corvane_slim_interface {
  int nMethods;
  const corvane_slim_method* const* methodArray;  // by method number
  int nIIds;
  const uint32_t* iids;
  const uint16_t* methodStringArray;  // per method: its first entry in methodStrings
  const uint16_t* methodStrings;      // offsets into strings
  const char* strings;                // NUL-terminated names, one after the other
} corvane_slim_interface;

#endif
