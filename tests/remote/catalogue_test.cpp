// The method table against the interface catalogue: buffer counts and primary buffer sizes
// of every method, typed out here independently of the table, and the description record
// corvane_slim derived from the table.
#include <gtest/gtest.h>

#include <iterator>
#include <set>
#include <string>
#include <vector>

#include "remote.h"
#include "remote/corvane.h"
#include "remote/slim_tables.h"
#include "remote/wire_plan.h"

namespace {

using corvane::remote::kMethods;
using corvane::remote::kPlans;

struct catalogue_row {
  int number;
  const char* name;
  int in_bufs, out_bufs, prim_in, prim_out, params;
};

// Number, name, input buffers, output buffers, primary input and output sizes [bytes],
// parameter count.
const catalogue_row kCatalogue[] = {
    {0, "identity", 2, 1, 44, 0, 3},
    {1, "vadd_mm", 4, 1, 25, 0, 7},
    {2, "vsub_mm", 4, 1, 25, 0, 7},
    {3, "vmul_mm", 3, 1, 21, 0, 6},
    {4, "vmul_scale", 2, 1, 17, 0, 5},
    {5, "vdiv_mm", 3, 1, 21, 0, 6},
    {6, "vdiv_scale", 2, 1, 17, 0, 5},
    {7, "hvx_sum", 2, 1, 20, 0, 5},
    {8, "deinterleave2C", 2, 2, 84, 0, 5},
    {9, "deinterleave3C", 2, 3, 88, 0, 6},
    {10, "deinterleave4C", 2, 4, 92, 0, 7},
    {11, "convertScaleAbs", 2, 1, 96, 0, 6},
    {12, "get_kernel_execution_time", 1, 2, 5, 16, 4},
    {13, "DoesNothing_ButLooksCool", 0, 0, 0, 0, 0},
    {14, "DoesNothing_ButLooksCool_ProEdition", 0, 0, 0, 0, 0},
    {15, "load", 0, 0, 0, 0, 0},
    {16, "init", 1, 0, 4, 0, 1},
    {17, "deinit", 0, 0, 0, 0, 0},
    {18, "setmode", 1, 0, 4, 0, 1},
    {19, "sobel8u", 3, 1, 28, 0, 6},
    {20, "sobel16s", 3, 1, 32, 0, 7},
    {21, "sobel32f", 3, 1, 32, 0, 7},
    {22, "conv3x3a328u", 4, 1, 36, 0, 8},
    {23, "cornerMinEigenVal", 8, 7, 76, 4, 13},
    {24, "houghlines", 3, 2, 36, 4, 8},
    {25, "median3x3", 3, 1, 32, 0, 7},
    {26, "warp_perspective", 3, 1, 160, 0, 9},
    {27, "warp_affine", 3, 1, 160, 0, 9},
    {28, "remap", 4, 1, 148, 0, 14},
    {29, "resize", 2, 2, 88, 0, 6},
    {30, "ppht_lines", 2, 2, 40, 4, 11},
    {31, "cvtColor", 2, 1, 84, 0, 5},
    {32, "cornerMinEigenVal_v2", 3, 1, 92, 0, 7},
    {33, "cornerMinEigenValFP", 3, 1, 92, 0, 7},
    {34, "cornerHarris", 3, 1, 96, 0, 8},
    {35, "gaussianBlur", 2, 1, 84, 0, 5},
    {36, "goodFeaturesToTrack", 3, 8, 312, 4, 23},
    {37, "LSC", 4, 1, 24, 0, 6},
    {38, "morphOp", 2, 1, 104, 0, 10},
    {39, "morphologyEx", 2, 2, 144, 0, 12},
    {40, "boxfilter", 3, 1, 136, 0, 10},
    {41, "median_blur_3x3", 2, 1, 44, 0, 3},
    {42, "pyrDown", 2, 1, 80, 0, 4},
    {43, "pyrUp", 2, 2, 120, 0, 6},
    {44, "clearHist", 1, 1, 40, 0, 2},
    {45, "calcHist_8u1d", 3, 1, 88, 0, 6},
    {46, "calcHist", 4, 1, 88, 0, 6},
    {47, "thresh", 2, 1, 92, 0, 7},
    {48, "integrate", 2, 1, 24, 0, 6},
    {49, "filter2D", 3, 1, 88, 0, 6},
    {50, "sobel", 2, 1, 100, 0, 9},
    {51, "trackLK", 7, 4, 80, 0, 16},
    {52, "opticalFlow", 7, 3, 396, 0, 27},
};

TEST(MethodTable, ReproducesTheCatalogue) {
  ASSERT_EQ(std::size(kCatalogue), size_t(corvane::remote::kMethodCount));
  for (const catalogue_row& row : kCatalogue) {
    SCOPED_TRACE(std::to_string(row.number) + " " + row.name);
    const auto& plan = kPlans[row.number];
    EXPECT_STREQ(kMethods[row.number].name, row.name);
    EXPECT_EQ(plan.in_bufs, row.in_bufs);
    EXPECT_EQ(plan.out_bufs, row.out_bufs);
    EXPECT_EQ(plan.prim_in_size, row.prim_in);
    EXPECT_EQ(plan.prim_out_size, row.prim_out);
    EXPECT_EQ(plan.count, row.params);
  }
}

// Offsets of a few layouts worked by hand: padding behind bytes, 8-aligned doubles, the
// method word of escaped methods, two length words for an inrout sequence.
TEST(MethodTable, PlacesFieldsByTheLayoutRules) {
  const auto& vadd = kPlans[corvane::remote::method::vadd_mm];  // seq, u8, seq, u8, seq, rout seq, u8
  const int vadd_offsets[] = {0, 4, 8, 12, 16, 20, 24};
  for (int i = 0; i < 7; ++i) EXPECT_EQ(vadd.params[i].in_off, vadd_offsets[i]) << i;

  const auto& csa = kPlans[corvane::remote::method::convertScaleAbs];
  EXPECT_EQ(csa.params[4].in_off, 80);  // alpha
  EXPECT_EQ(csa.params[5].in_off, 88);
  EXPECT_EQ(csa.prim_in_align, 8);

  const auto& cvt = kPlans[corvane::remote::method::cvtColor];
  EXPECT_EQ(cvt.base, 4);
  EXPECT_EQ(cvt.params[0].in_off, 4);
  EXPECT_EQ(cvt.params[2].in_off, 44);  // code, a byte
  EXPECT_EQ(cvt.params[3].in_off, 48);  // the next descriptor, 4-aligned

  const auto& hough = kPlans[corvane::remote::method::houghlines];
  EXPECT_EQ(hough.params[6].in_off, 24);   // numLines, inrout scalar: in the primary input...
  EXPECT_EQ(hough.params[6].out_off, 0);   // ...and in the primary output
  EXPECT_EQ(hough.params[7].in_off, 28);   // pLines: input length, then output length
  EXPECT_EQ(hough.params[7].in_buf, 1);
  EXPECT_EQ(hough.params[7].out_buf, 0);

  const auto& timing = kPlans[corvane::remote::method::get_kernel_execution_time];
  EXPECT_EQ(timing.params[0].out_off, 0);
  EXPECT_EQ(timing.params[1].out_off, 8);
  EXPECT_EQ(timing.params[3].in_off, 4);  // reset behind the msg length word
}

TEST(MethodTable, ExportedFunctionArgumentCounts) {
  EXPECT_EQ(kPlans[corvane::remote::method::identity].num_args, 3);
  EXPECT_EQ(kPlans[corvane::remote::method::vadd_mm].num_args, 11);     // four sequences of two
  EXPECT_EQ(kPlans[corvane::remote::method::trackLK].num_args, 22);
  EXPECT_EQ(kPlans[corvane::remote::method::load].num_args, 0);
}

// ---- The description record ----

std::string slim_string(int entry) { return corvane_slim.strings + corvane_slim.methodStrings[entry]; }

void collect_type(const corvane_slim_type* t, std::set<const corvane_slim_type*>& types,
                  std::set<const corvane_slim_struct_type*>& structs);

void collect_struct(const corvane_slim_struct_type* s, std::set<const corvane_slim_type*>& types,
                    std::set<const corvane_slim_struct_type*>& structs) {
  if (!structs.insert(s).second) return;
  for (int i = 0; i < s->nMembers; ++i) collect_type(s->members[i], types, structs);
}

void collect_type(const corvane_slim_type* t, std::set<const corvane_slim_type*>& types,
                  std::set<const corvane_slim_struct_type*>& structs) {
  if (!types.insert(t).second) return;
  if (t->type == CORVANE_SLIM_STRUCT || t->type == CORVANE_SLIM_STRUCT_WITH_SEQUENCE)
    collect_struct(t->param.structType, types, structs);
  if (t->type == CORVANE_SLIM_SEQUENCE) collect_type(t->param.seqSimple.seqType, types, structs);
  if (t->type == CORVANE_SLIM_ARRAY) collect_type(t->param.array.arrayType, types, structs);
}

TEST(Slim, SharedRecordsComeToTheirCounts) {
  const auto& sizes = corvane::remote::slim::kSizes;
  EXPECT_EQ(sizes.methods, 44);
  EXPECT_EQ(sizes.parameters, 25);
  EXPECT_EQ(sizes.parameterArrays, 301);
  EXPECT_EQ(sizes.types, 9);
  EXPECT_EQ(sizes.typeArrays, 15);
  EXPECT_EQ(sizes.structTypes, 5);

  // The same counts, reached by walking the exported record.
  std::set<const corvane_slim_method*> methods;
  std::set<const corvane_slim_parameter*> params;
  std::set<const corvane_slim_type*> types;
  std::set<const corvane_slim_struct_type*> structs;
  ASSERT_EQ(corvane_slim.nMethods, 53);
  EXPECT_EQ(corvane_slim.nIIds, 0);
  for (int m = 0; m < corvane_slim.nMethods; ++m) {
    const corvane_slim_method* method = corvane_slim.methodArray[m];
    methods.insert(method);
    for (int i = 0; i < method->numParams; ++i) {
      const corvane_slim_parameter* p = method->params[i];
      params.insert(p);
      if (p->type == CORVANE_SLIM_STRUCT || p->type == CORVANE_SLIM_STRUCT_WITH_SEQUENCE)
        collect_struct(p->param.structType, types, structs);
      if (p->type == CORVANE_SLIM_SEQUENCE) collect_type(p->param.seqSimple.seqType, types, structs);
    }
  }
  EXPECT_EQ(methods.size(), 44u);
  EXPECT_EQ(params.size(), 25u);
  EXPECT_EQ(types.size(), 9u);
  EXPECT_EQ(structs.size(), 5u);
}

TEST(Slim, MethodRecordsMatchTheCatalogue) {
  for (const catalogue_row& row : kCatalogue) {
    SCOPED_TRACE(row.name);
    const corvane_slim_method* m = corvane_slim.methodArray[row.number];
    EXPECT_EQ(m->uScalars, REMOTE_SCALARS_MAKE(0, row.in_bufs, row.out_bufs));
    EXPECT_EQ(m->primInSize, row.prim_in);
    EXPECT_EQ(m->primROutSize, row.prim_out);
    EXPECT_EQ(m->numParams, row.params);
    EXPECT_EQ(slim_string(corvane_slim.methodStringArray[row.number]), row.name);
  }
  // Methods that differ only by name share one record.
  EXPECT_EQ(corvane_slim.methodArray[0], corvane_slim.methodArray[41]);   // identity, median_blur_3x3
  EXPECT_EQ(corvane_slim.methodArray[13], corvane_slim.methodArray[17]);  // no arguments
  EXPECT_NE(corvane_slim.methodArray[4], corvane_slim.methodArray[6]);    // same kinds, other order
}

TEST(Slim, ParameterRecordsDescribeKindAndDirection) {
  const corvane_slim_method* identity = corvane_slim.methodArray[0];
  const corvane_slim_parameter* desc = identity->params[0];
  EXPECT_EQ(desc->type, CORVANE_SLIM_STRUCT);
  EXPECT_EQ(desc->nativeSize, 36);
  EXPECT_EQ(desc->param.structType->nMembers, 9);
  EXPECT_EQ(identity->params[1]->type, CORVANE_SLIM_STRUCT_WITH_SEQUENCE);
  EXPECT_EQ(identity->params[1]->mode, CORVANE_SLIM_IN);
  EXPECT_EQ(identity->params[2]->mode, CORVANE_SLIM_ROUT);
  EXPECT_EQ(identity->params[1]->param.structType, identity->params[2]->param.structType);

  const corvane_slim_method* hough = corvane_slim.methodArray[24];
  const corvane_slim_parameter* lines = hough->params[7];
  EXPECT_EQ(lines->type, CORVANE_SLIM_SEQUENCE);
  EXPECT_EQ(lines->mode, CORVANE_SLIM_INROUT);
  EXPECT_EQ(lines->param.seqSimple.seqType->nativeSize, 16);  // fcvLine
  EXPECT_EQ(lines->param.seqSimple.seqType->param.structType->nMembers, 2);

  const corvane_slim_parameter* border = corvane_slim.methodArray[26]->params[8];
  EXPECT_EQ(border->type, CORVANE_SLIM_STRUCT);
  const corvane_slim_type* val = border->param.structType->members[0];
  EXPECT_EQ(val->type, CORVANE_SLIM_ARRAY);
  EXPECT_EQ(val->param.array.nItems, 32);
}

TEST(Slim, MethodStringsListNamesAndMembersDepthFirst) {
  const int first = corvane_slim.methodStringArray[0];
  const std::vector<std::string> want = {"identity", "desc",       "stride",       "cols",       "rows",
                                         "channels", "depth",      "border_left",  "border_right", "border_top",
                                         "border_bottom", "src",   "mem",          "dst",        "mem"};
  for (size_t i = 0; i < want.size(); ++i) EXPECT_EQ(slim_string(first + int(i)), want[i]) << i;
  // Each name is kept once in the blob.
  EXPECT_EQ(corvane_slim.methodStrings[first + 12], corvane_slim.methodStrings[first + 14]);
  const int median = corvane_slim.methodStringArray[41];
  EXPECT_EQ(corvane_slim.methodStrings[median + 1], corvane_slim.methodStrings[first + 1]);  // "desc"
}

}  // namespace
