// Sizes of the tables behind corvane_slim, for checks of the library itself.
#ifndef CORVANE_REMOTE_SLIM_TABLES_H
#define CORVANE_REMOTE_SLIM_TABLES_H

namespace corvane {
namespace remote {
namespace slim {

struct table_sizes {
  int methods;          // distinct method records
  int parameters;       // distinct parameter records
  int parameterArrays;  // entries of the shared parameter-pointer array
  int types;            // distinct type records
  int typeArrays;       // entries of the structure-member array
  int structTypes;
  int methodStrings;    // entries of methodStrings
  int strings;          // bytes of the name blob
};

extern const table_sizes kSizes;

}  // namespace slim
}  // namespace remote
}  // namespace corvane

#endif
