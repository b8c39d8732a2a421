// The public interface of the library: the records that travel in a remote call and
// one exported function per method, with plain linkage.
#ifndef CORVANE_REMOTE_CORVANE_H
#define CORVANE_REMOTE_CORVANE_H

#include <stdint.h>

#include "remote.h"
#include "slim.h"

#ifndef __cplusplus
#include <stdbool.h>
#endif

typedef int AEEResult;

#if defined(__GNUC__)
#define CORVANE_API __attribute__((visibility("default")))
#else
#define CORVANE_API
#endif

// Where the bytes of an image are.
typedef struct corvane_mbuf {
  unsigned char* mem;
  int memLen;
} corvane_mbuf;

// How an image is laid out: nine int32, 36 bytes on the wire.
typedef struct corvane_mbufd {
  int32_t stride;  // bytes from one row to the next
  int32_t cols;    // pixels in a row, the whole stored width
  int32_t rows;    // rows, the whole stored height
  int32_t channels;
  int32_t depth;   // 0 u8, 1 i8, 2 u16, 3 i16, 4 i32, 5 f32
  int32_t border_left;
  int32_t border_right;
  int32_t border_top;
  int32_t border_bottom;
} corvane_mbufd;

// A constant border value carried by value.
typedef struct corvane_border_value_info {
  unsigned char val[32];
} corvane_border_value_info;

typedef struct corvane_point2f {
  float x;
  float y;
} corvane_point2f;

// A line segment as FastCV reports it.
typedef struct fcvLine {
  corvane_point2f start;
  corvane_point2f end;
} fcvLine;

#ifdef __cplusplus
extern "C" {
#endif

// The transport's entry: decodes one call, checks every buffer length and runs the method.
CORVANE_API int corvane_skel_invoke(uint32_t _sc, remote_arg* _pra);

// The description of the whole interface for the transport's generic tools.
CORVANE_API extern const corvane_slim_interface corvane_slim;

// One function per method, in method-number order. A sequence is a pointer and its
// length in elements; rout and inrout scalars are pointers; an inrout sequence is its
// output pointer and output length.
CORVANE_API AEEResult corvane_identity(const corvane_mbufd* desc, const corvane_mbuf* src, corvane_mbuf* dst);
CORVANE_API AEEResult corvane_vadd_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
    int src2Len, uint8_t src2Depth, const uint8_t* mask, int maskLen, uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_vsub_mm(const uint8_t* srnc1, int srnc1Len, uint8_t src1Depth, const uint8_t* src2,
    int src2Len, uint8_t src2Depth, const uint8_t* mask, int maskLen, uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_vmul_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
    int src2Len, uint8_t src2Depth, uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_vmul_scale(const uint8_t* src, int srcLen, uint8_t srcDepth, int32_t scale,
    uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_vdiv_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
    int src2Len, uint8_t src2Depth, uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_vdiv_scale(int32_t scale, const uint8_t* src, int srcLen, uint8_t srcDepth,
    uint8_t* dst, int dstLen, uint8_t dstDepth);
CORVANE_API AEEResult corvane_hvx_sum(const uint8_t* src, int srcLen, int32_t* dst, int dstLen, int32_t data_size,
    int32_t depth, int32_t cn);
CORVANE_API AEEResult corvane_deinterleave2C(const corvane_mbufd* input_desc, const corvane_mbuf* input,
    const corvane_mbufd* outputs_desc, corvane_mbuf* output0, corvane_mbuf* output1);
CORVANE_API AEEResult corvane_deinterleave3C(const corvane_mbufd* input_desc, const corvane_mbuf* input,
    const corvane_mbufd* outputs_desc, corvane_mbuf* output0, corvane_mbuf* output1, corvane_mbuf* output2);
CORVANE_API AEEResult corvane_deinterleave4C(const corvane_mbufd* input_desc, const corvane_mbuf* input,
    const corvane_mbufd* outputs_desc, corvane_mbuf* output0, corvane_mbuf* output1, corvane_mbuf* output2,
    corvane_mbuf* output3);
CORVANE_API AEEResult corvane_convertScaleAbs(const corvane_mbufd* desc_in, const corvane_mbufd* desc_out,
    const corvane_mbuf* src, corvane_mbuf* dst, double alpha, double beta);
CORVANE_API AEEResult corvane_get_kernel_execution_time(uint64_t* time, uint64_t* cycles, char* msg, int msgLen,
    uint8_t reset);
CORVANE_API AEEResult corvane_DoesNothing_ButLooksCool(void);
CORVANE_API AEEResult corvane_DoesNothing_ButLooksCool_ProEdition(void);
CORVANE_API AEEResult corvane_load(void);
CORVANE_API AEEResult corvane_init(uint32_t mode);
CORVANE_API AEEResult corvane_deinit(void);
CORVANE_API AEEResult corvane_setmode(uint32_t mode);
CORVANE_API AEEResult corvane_sobel8u(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
    int32_t height, uint8_t* outp, int outpLen, uint32_t sobelmode);
CORVANE_API AEEResult corvane_sobel16s(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
    int32_t height, int16_t* outp, int outpLen, uint32_t sobelmode, uint32_t bordermode);
CORVANE_API AEEResult corvane_sobel32f(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
    int32_t height, int32_t* outp, int outpLen, uint32_t sobelmode, uint32_t bordermode);
CORVANE_API AEEResult corvane_conv3x3a328u(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
    int32_t height, const uint8_t* mask, int maskLen, int32_t shift, uint8_t* outp, int outpLen, int32_t stride_o);
CORVANE_API AEEResult corvane_cornerMinEigenVal(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
    int32_t height, int32_t borderType, int32_t blockSize, int32_t* outpX2, int outpX2Len, int32_t* outpXY,
    int outpXYLen, int32_t* outpY2, int outpY2Len, int32_t* outpA, int outpALen, int32_t* outpB, int outpBLen,
    int32_t* outpC, int outpCLen, int32_t* dspUsec);
CORVANE_API AEEResult corvane_houghlines(const uint8_t* inp, int inpLen, uint32_t width, uint32_t height,
    uint32_t stride, float threshold, uint32_t maxLines, uint32_t* numLines, fcvLine* pLines, int pLinesLen);
CORVANE_API AEEResult corvane_median3x3(const uint8_t* inp, int inpLen, uint32_t width, uint32_t height,
    uint32_t stride, uint8_t* outp, int outpLen, uint32_t borderType, uint32_t borderValue);
CORVANE_API AEEResult corvane_warp_perspective(const corvane_mbufd* src_desc, const corvane_mbuf* src_buf,
    const corvane_mbufd* dst_desc, corvane_mbuf* dst_buf, const corvane_mbufd* delta_desc,
    const corvane_mbuf* delta_buf, int32_t interpolation, int32_t borderType,
    const corvane_border_value_info* borderValue);
CORVANE_API AEEResult corvane_warp_affine(const corvane_mbufd* src_desc, const corvane_mbuf* src_buf,
    const corvane_mbufd* dst_desc, corvane_mbuf* dst_buf, const corvane_mbufd* delta_desc,
    const corvane_mbuf* delta_buf, int32_t interpolation, int32_t borderType,
    const corvane_border_value_info* borderValue);
CORVANE_API AEEResult corvane_remap(const corvane_mbufd* src_desc, const corvane_mbuf* src_buf,
    const corvane_mbufd* dst_desc, corvane_mbuf* dst_buf, const corvane_mbuf* xy_integer,
    const corvane_mbuf* xy_fractional, int32_t xy_stride, int32_t x_offset, int32_t y_offset, int32_t block_width,
    int32_t block_height, int32_t interpolation, int32_t borderType, const corvane_border_value_info* borderValue);
CORVANE_API AEEResult corvane_resize(const corvane_mbufd* input_desc, const corvane_mbuf* input,
    const corvane_mbufd* output_desc, corvane_mbuf* output, uint32_t interpolation, corvane_mbuf* wb);
CORVANE_API AEEResult corvane_ppht_lines(uint8_t* data, int dataLen, uint32_t numberOfPoints, uint32_t maskWidth,
    uint32_t maskHeight, uint32_t numberOfR, uint32_t numberOfTheta, const uint8_t* sincos_lut, int sincos_lutLen,
    int32_t threshold, int32_t minLineLength, int32_t maxGap, uint32_t* numberOfLines);
CORVANE_API AEEResult corvane_cvtColor(const corvane_mbufd* _inputDesc, const corvane_mbuf* _input, uint8_t code,
    const corvane_mbufd* _outputDesc, corvane_mbuf* _output);
CORVANE_API AEEResult corvane_cornerMinEigenVal_v2(const corvane_mbufd* in_desc, const corvane_mbuf* Dx,
    const corvane_mbuf* Dy, const corvane_mbufd* out_desc, corvane_mbuf* corner_response, int32_t blockSize,
    int32_t borderType);
CORVANE_API AEEResult corvane_cornerMinEigenValFP(const corvane_mbufd* in_desc, const corvane_mbuf* Dx,
    const corvane_mbuf* Dy, const corvane_mbufd* out_desc, corvane_mbuf* corner_response, int32_t blockSize,
    int32_t borderType);
CORVANE_API AEEResult corvane_cornerHarris(const corvane_mbufd* in_desc, const corvane_mbuf* Dx,
    const corvane_mbuf* Dy, const corvane_mbufd* out_desc, corvane_mbuf* corner_response, int32_t blockSize, float k,
    int32_t borderType);
CORVANE_API AEEResult corvane_gaussianBlur(const corvane_mbufd* desc_in, const corvane_mbufd* desc_out,
    const corvane_mbuf* src, corvane_mbuf* dst, int32_t kernel_size);
CORVANE_API AEEResult corvane_goodFeaturesToTrack(const corvane_mbufd* _imageDesc, const corvane_mbuf* _image,
    const corvane_mbufd* _maskDesc, const corvane_mbuf* _mask, float qualityLevel, float minDistance,
    int32_t blockSize, uint8_t useHarrisDetector, float HarrisK, int32_t maxCorners, const corvane_mbufd* _derivDesc,
    corvane_mbuf* _derivX, corvane_mbuf* _derivY, const corvane_mbufd* _eigenValueDesc, corvane_mbuf* _eigenValue,
    corvane_mbuf* _eigenValueDilate, const corvane_mbufd* _tempCornersDesc, corvane_mbuf* _tempCorners,
    const corvane_mbufd* _gridDesc, corvane_mbuf* _grid, const corvane_mbufd* _cornersDesc, corvane_mbuf* _corners,
    int32_t* numberOfCorners);
CORVANE_API AEEResult corvane_LSC(const uint8_t* src, int srcLen, uint8_t* dst, int dstLen, uint32_t width,
    uint32_t height, const uint8_t* gain024, int gain024Len, const uint8_t* gain135, int gain135Len);
CORVANE_API AEEResult corvane_morphOp(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
    const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t kernel, int32_t iterations, int32_t kernelShape,
    int32_t borderType, int32_t borderValue, uint32_t op);
CORVANE_API AEEResult corvane_morphologyEx(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
    const corvane_mbufd* tmpDesc, corvane_mbuf* tmp, const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t kernel,
    int32_t iterations, int32_t kernelShape, int32_t borderType, int32_t borderValue, uint32_t op);
CORVANE_API AEEResult corvane_boxfilter(const corvane_mbufd* input_desc, const corvane_mbuf* input, int32_t ddepth,
    int32_t kernel_width, int32_t kernel_height, uint8_t normalize, const corvane_mbufd* temp_desc,
    const corvane_mbuf* temp, const corvane_mbufd* output_desc, corvane_mbuf* output);
CORVANE_API AEEResult corvane_median_blur_3x3(const corvane_mbufd* desc, const corvane_mbuf* src, corvane_mbuf* dst);
CORVANE_API AEEResult corvane_pyrDown(const corvane_mbufd* src_desc, const corvane_mbuf* src,
    const corvane_mbufd* dst_desc, corvane_mbuf* dst);
CORVANE_API AEEResult corvane_pyrUp(const corvane_mbufd* src_desc, const corvane_mbuf* src,
    const corvane_mbufd* buf_desc, corvane_mbuf* buf, const corvane_mbufd* dst_desc, corvane_mbuf* dst);
CORVANE_API AEEResult corvane_clearHist(const corvane_mbufd* input_desc, corvane_mbuf* input);
CORVANE_API AEEResult corvane_calcHist_8u1d(const corvane_mbufd* input_desc, const corvane_mbuf* input,
    const corvane_mbufd* output_desc, corvane_mbuf* output, int32_t channel, const uint8_t* ranges, int rangesLen);
CORVANE_API AEEResult corvane_calcHist(const corvane_mbufd* in_desc, const corvane_mbuf* input,
    const corvane_mbufd* out_desc, corvane_mbuf* output, const uint8_t* channels, int channelsLen,
    const uint8_t* ranges, int rangesLen);
CORVANE_API AEEResult corvane_thresh(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
    const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t threshold, int32_t max, uint32_t op);
CORVANE_API AEEResult corvane_integrate(const uint8_t* inp, int inpLen, int32_t srcStride, int32_t srcWidth,
    int32_t srcHeight, uint32_t* outp, int outpLen, int32_t dstStride);
CORVANE_API AEEResult corvane_filter2D(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
    const corvane_mbufd* dstDesc, corvane_mbuf* dst, const int16_t* kernel, int kernelLen, int32_t delta);
CORVANE_API AEEResult corvane_sobel(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
    const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t ddepth, int32_t dx, int32_t dy, int32_t ksize,
    int32_t borderType);
CORVANE_API AEEResult corvane_trackLK(const uint8_t* prevImg, int prevImgLen, const uint8_t* nextImg, int nextImgLen,
    uint32_t width, uint32_t height, float* featureXY, int featureXYLen, float* featureXY_out, int featureXY_outLen,
    float* featureXY_estimate, int featureXY_estimateLen, int32_t* featureStatus, int featureStatusLen,
    int32_t featureNum, uint32_t windowWidth, uint32_t windowHeight, int32_t maxLevel, int32_t maxIterations,
    float maxEpsilon, int32_t use_initial_estimate, int32_t terminationCriteria);
CORVANE_API AEEResult corvane_opticalFlow(const corvane_mbufd* prevImgDesc, const corvane_mbuf* prevImg,
    const corvane_mbufd* prevDerivDesc, const corvane_mbuf* prevDeriv, const corvane_mbufd* nextImgDesc,
    const corvane_mbuf* nextImg, const corvane_mbufd* prevPtsDesc, const corvane_mbuf* prevPts,
    const corvane_mbufd* windowBufDesc, const corvane_mbuf* windowBuf, const corvane_mbufd* derivWindowBufDesc,
    const corvane_mbuf* derivWindowBuf, const corvane_mbufd* naxtPtsDesc, corvane_mbuf* naxtPts,
    const corvane_mbufd* statusDesc, corvane_mbuf* status, const corvane_mbufd* errDesc, corvane_mbuf* err,
    int32_t winWidth, int32_t winHeight, int32_t maxCount, float epsilon, int32_t level, int32_t maxLevel,
    int32_t flags, float minEigThreshold, int32_t numberOfPoints1);


#ifdef __cplusplus
}
#endif
#endif
