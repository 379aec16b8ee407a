// haze_preview: takes haze, fog and smog out of camera preview frames in real time.
//
// The library inverts the haze model  I = J * t + A * (1 - t)  (I: hazy sample, J: haze-free one,
// A: atmospheric light, t: transmission) with an estimate in the manner of the dark-channel-prior
// paper of 2009, in place on YUV 4:2:0 frames. A camera pipeline needs three calls:
//
//   InitHazePreviewFormat(kInputFormatNv21, 1280, 720);   // once
//   RemoveHazePreview(frame, 1280, 720, 0, level);        // once per frame
//   ReleaseHazePreview();                                 // at the end
//
// The stages of that path are exported too, for callers that hold other image layouts.
//
// Images    Plain pointers with a width and a height in pixels; rows are packed (a row starts
//           width x bytes-per-pixel after the one above). Callers own every buffer that they pass.
//           Sources and destinations do not overlap unless a function says that it works in place.
// Frames    NV21: width x height luma bytes, then height / 2 rows of width bytes holding
//           interleaved V, U pairs. Planar (I420): luma, then a U plane, then a V plane of
//           (width / 2) x (height / 2) bytes each. Either way width * height * 3 / 2 bytes; one
//           half-resolution sample belongs to each 2 x 2 block of luma bytes. Sizes are even.
//           Samples are full-range BT.601.
// Errors    No function reports one and nothing is logged. Pointers are trusted. Sizes, radii and
//           slots outside the stated limits are answered by leaving every output untouched, unless
//           a function states another result; nothing outside the caller's buffers is read or
//           written.
// Threads   The session (one per process) and the argument globals of the threaded stages are
//           unguarded: one caller at a time. Functions that say "reentrant" touch only their
//           arguments and may run on any number of threads at once.
// Stripes   A threaded stage keeps its pointers in globals with eight slots, and its sizes in
//           globals that all slots share. The caller names a slot (0 ... 7); the stage stores its
//           arguments there, starts one POSIX thread for each stripe of the image, joins them in
//           order, and leaves the globals as they are. Thread k of slot s gets a pointer to an int
//           that holds s * 10 + k; a worker given any other slot or stripe does nothing. Workers
//           return null and may be run by callers that filled the globals themselves. All stripes
//           but the last have size / threads rows, made even by clearing the lowest bit; the last
//           takes what remains. What a thread that cannot be started would have done, the caller
//           does. Concurrent calls of one stage need distinct slots and equal sizes.
// Bytes     Every result is the same to the bit on all targets, with vector units and without.
#ifndef HAZE_PREVIEW_H
#define HAZE_PREVIEW_H

#define HAZE_PREVIEW_VERSION_MAJOR 0
#define HAZE_PREVIEW_VERSION_MINOR 1
#define HAZE_PREVIEW_VERSION_PATCH 0
#define HAZE_PREVIEW_VERSION_STRING "0.1.0"

#if defined(__GNUC__)
#define HAZE_PREVIEW_API __attribute__((visibility("default")))
#else
#define HAZE_PREVIEW_API
#endif

// ---------------------------------------------------------------------------------------------
// Session: frame format, working memory and the cached estimate
// ---------------------------------------------------------------------------------------------

// Layout of a frame's chroma. Any 32-bit value may be passed: 3 means planar, all others mean NV21.
enum INPUT_FORMAT : int {
  kInputFormatNv21 = 0,
  kInputFormatPlanar = 3,
};

// Opens the session: stores `format` in gPerviewFormat (on every call) and, if there is no working
// memory yet, allocates width * height * 4 bytes, the product taken in 32-bit arithmetic.
//
// An open session keeps its block: a second call only changes the format, so call
// ReleaseHazePreview first when the frames grow. If the allocation fails the session stays closed
// and a later call tries again. The cached estimate and the frame parity are left as they are.
HAZE_PREVIEW_API void InitHazePreviewFormat(INPUT_FORMAT format, int width, int height);

// Closes the session: frees the working memory. Format, cached estimate and frame parity keep their
// values, so the next session starts where this one stopped. Without a session it does nothing.
HAZE_PREVIEW_API void ReleaseHazePreview();

// Format in force, 3 (planar) until the host sets one. Written by InitHazePreviewFormat.
extern HAZE_PREVIEW_API INPUT_FORMAT gPerviewFormat;

// Working memory, null while no session is open. With HW = W / 2, HH = H / 2, Q = HW * HH and
// B = 3 * (W * H / 4) a frame of W x H uses it as
//
//   [0, B)          not used by the frame path
//   [B, B + Q)      half-resolution minimum of B, G and R
//   [B + Q, +2Q)    half-resolution maximum of B, G and R, then the transmission map
//   [B + 2Q, +3Q)   64 x 64 mean of the minimum
//   [B + 3Q, 4WH)   column sums of that mean: HW elements of `short`
//
// A host may put in a block of its own from malloc. Its size is trusted: at least W * H * 4 bytes
// for every frame. ReleaseHazePreview frees it.
extern HAZE_PREVIEW_API unsigned char* gHazePreviewMemory;

// Transmission map of the last estimate frame: code of half-resolution row r, column c at
// [r * 640 + c] whatever the frame's width. Bytes past a row's last column are never written.
// Written by RemoveHazePreview.
extern HAZE_PREVIEW_API unsigned char gPreT[640 * 360];

// Atmospheric light (B, G, R) of the last estimate frame. Written by RemoveHazePreview.
extern HAZE_PREVIEW_API unsigned char gPreAA[3];

// Frame parity: 0 makes the next frame an estimate frame, any other value a reuse frame.
extern HAZE_PREVIEW_API int gPreFrameNum;

// Dehazes one frame in place: the whole frame path.
//
// An estimate frame (gPreFrameNum 0, which becomes 1)
//   1. takes the half-resolution minimum and maximum of B, G and R, reading chroma as NV21 whatever
//      the format (xYCrCb2BGRMaxMinPreviewNeon_NV21);
//   2. averages the minimum over 64 x 64 pixels (AverageFilterShort64_u8);
//   3. takes the grey light A = (largest maximum + largest mean) >> 1 over every second row and
//      column. With an odd half width each further sampled row starts one byte further right, so
//      the last samples lie past the end of their map, in the region that follows it;
//   4. computes the transmission map (CalculateTChannelPreviewNeonFloat) with
//      strength = dehazeLevel * 7 / 117 and invA = 1 / A, both in single precision. A = 0 gives
//      +infinity;
//   5. recovers the frame in its own format (HazeRemoving3Preview if gPerviewFormat is 3, else
//      HazeRemoving3Preview_NV21) and keeps map and light in gPreT and gPreAA.
// A reuse frame (any other gPreFrameNum, which becomes (gPreFrameNum + 1) % 2) only recovers, with
// the kept map and light and always in the NV21 layout.
//
// width, height   even, from 128 x 128 to 1280 x 720
// recoverArg      has no effect
// dehazeLevel     amount of haze removal. 117 is a strength of 7; 0 and below give the lightest
//                 recovery, t = 0.99 everywhere, as long as A > 0.
//
// Returns at once, with frame, cached estimate and parity as they were, if no session is open, the
// size is odd or outside the limits, or width * height * 4 exceeds the block that
// InitHazePreviewFormat allocated. Runs on the caller's thread and allocates nothing.
HAZE_PREVIEW_API void RemoveHazePreview(unsigned char* frame, int width, int height, int recoverArg,
                                        int dehazeLevel);

// Does nothing and touches neither buffer; kept for callers of the two-buffer form.
HAZE_PREVIEW_API void RemoveHazePreview(unsigned char* source, unsigned char* destination,
                                        int width, int height);

// ---------------------------------------------------------------------------------------------
// Channel extraction
// ---------------------------------------------------------------------------------------------

// Half-resolution minimum and maximum of the colour channels of an NV21 frame. With Y the top-left
// luma byte of a 2 x 2 block and Cr, Cb its chroma less 128 (BT.601, 14 fractional bits):
//
//   B = clamp(Y + ((29049 * Cb + 8192) >> 14))
//   G = clamp(Y + ((8192 - 11698 * Cr - 5636 * Cb) >> 14))
//   R = clamp(Y + ((22987 * Cr + 8192) >> 14))        clamp to 0 ... 255
//   minOut = min(B, G, R), maxOut = max(B, G, R)
//
// luma            width x height bytes; only even rows and columns matter
// chroma          height / 2 rows of width bytes, V (Cr) before U (Cb)
// minOut, maxOut  (width / 2) x (height / 2) bytes each
// width, height   of the full-resolution frame, even; below 2 nothing is written
//
// Reentrant.
HAZE_PREVIEW_API void xYCrCb2BGRMaxMinPreviewNeon_NV21(unsigned char* luma, unsigned char* chroma,
                                                       unsigned char* minOut, unsigned char* maxOut,
                                                       int width, int height);

// Half-resolution BGR of an NV21 frame: for each 2 x 2 block B, G and R as above, from its top-left
// luma byte and its chroma pair.
//
// luma            width x height bytes; only even rows and columns matter
// vu              rows of interleaved V, U pairs, one row for two of luma
// bgr             3 bytes per block, rows packed
// width, height   of the full-resolution frame; below 1 nothing is written
//
// Odd sizes end in a block of one column or row: ceil(width / 2) x ceil(height / 2) pixels, with as
// many chroma pairs. Reentrant.
HAZE_PREVIEW_API void xYCrCb2BGRPreview_NV21(unsigned char* luma, unsigned char* vu,
                                             unsigned char* bgr, int width, int height);

// The same for even sizes. Odd ones are rounded down, and the read positions in luma and chroma
// then fall back by one byte per row. Reentrant.
HAZE_PREVIEW_API void xYCrCb2BGRPreviewNeon_NV21(unsigned char* luma, unsigned char* vu,
                                                 unsigned char* bgr, int width, int height);

// The same from planar chroma, for stripes of a frame: the V plane is looked for
// gZoomOutHPreview * gZoomOutWPreview / 4 bytes behind `uPlane`, whatever the stripe's own size.
// Set both to the size of the frame (ZoomOutImgPreview does).
//
// uPlane   rows of ceil(width / 2) bytes, one row for two of luma
HAZE_PREVIEW_API void xYCrCb2BGRPreview(unsigned char* luma, unsigned char* uPlane,
                                        unsigned char* bgr, int width, int height);

// ---------------------------------------------------------------------------------------------
// Colour conversions
//
// BT.601, full range, with 14 fractional bits; >> rounds towards minus infinity. Sizes below 1
// write nothing. All reentrant.
// ---------------------------------------------------------------------------------------------

// BGR to YCrCb, 3 bytes per pixel each:
//
//   y  = (9617 * G + 1868 * B + 4899 * R + 8192) >> 14
//   Cr = (11682 * (R - y) + 128 * 16384 + 8192) >> 14
//   Cb = (9241 * (B - y) + 128 * 16384 + 8192) >> 14
//
// Chroma is not clamped: the few colours for which it reaches 256, pure red among them, store 0.
HAZE_PREVIEW_API void BGR2YCrCbPreview(unsigned char* bgr, unsigned char* ycrcb, int width,
                                       int height);

// YCrCb to BGR, 3 bytes per pixel each, by the formula of xYCrCb2BGRMaxMinPreviewNeon_NV21.
HAZE_PREVIEW_API void YCrCb2BGRPreview(unsigned char* ycrcb, unsigned char* bgr, int width,
                                       int height);

// BGR to a layout of 2 bytes per pixel: Y at even bytes; after it Cb at even columns and Cr at odd
// ones. The chroma of a 2 x 2 block is that of its top-left pixel, clamped to 0 ... 255.
HAZE_PREVIEW_API void xBGR2YCrCbPreview(unsigned char* bgr, unsigned char* yc, int width,
                                        int height);

// Splits 4 interleaved bytes per pixel into 4 planes of width * height bytes, one after the other.
HAZE_PREVIEW_API void split_4componentPreview(unsigned char* src, unsigned char* planes, int width,
                                              int height);

// ---------------------------------------------------------------------------------------------
// Channel maps: minimum and maximum of the three bytes of each pixel
//
// src is w x h pixels of 3 bytes, maps are w x h bytes. Sizes below 1 write nothing.
// ---------------------------------------------------------------------------------------------

// Both maps on the caller's thread. Reentrant.
HAZE_PREVIEW_API void CalculateMaxMinChannel(unsigned char* src, unsigned char* dstMin,
                                             unsigned char* dstMax, int w, int h);

// Both maps by eight threads. Returns the result of joining the last one, 0.
HAZE_PREVIEW_API int CalculateMaxMinChannelPreview(unsigned char* src, unsigned char* dstMin,
                                                   unsigned char* dstMax, int w, int h, int slot);

// Worker of CalculateMaxMinChannelPreview, stripes 0 ... 7, and its arguments.
HAZE_PREVIEW_API void* CalMaxMinThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gCalMaxMinSrcPreview[8];
extern HAZE_PREVIEW_API unsigned char* gCalMaxMinDstMinPreview[8];
extern HAZE_PREVIEW_API unsigned char* gCalMaxMinDstMaxPreview[8];
extern HAZE_PREVIEW_API int gCalMaxMinWPreview;
extern HAZE_PREVIEW_API int gCalMaxMinHPreview;

// The minimum map alone by four threads. Returns the result of joining the last one, 0.
HAZE_PREVIEW_API int CalculateMinChannelPreview(unsigned char* src, unsigned char* dst, int w,
                                                int h, int slot);

// Worker of CalculateMinChannelPreview, stripes 0 ... 3, and its arguments.
HAZE_PREVIEW_API void* CalMCThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gCalMCSrcPreview[8];
extern HAZE_PREVIEW_API unsigned char* gCalMCDstPreview[8];
extern HAZE_PREVIEW_API int gCalMCWPreview;
extern HAZE_PREVIEW_API int gCalMCHPreview;

// ---------------------------------------------------------------------------------------------
// Integer box filters
// ---------------------------------------------------------------------------------------------

// Mean over a 64 x 64 window: rows y - 32 ... y + 31 and columns x - 32 ... x + 31 as far as they
// lie in the image; dst = floor(sum / number of pixels in the window).
//
// src, dst       width x height bytes each
// width, height  at least 64
// radius         has no effect
// scratch        `width` elements; holds column sums, on return those of the last row's window
//                (the last 33 rows)
//
// Reentrant.
HAZE_PREVIEW_API void AverageFilterShort64_u8(unsigned char* src, unsigned char* dst, int width,
                                              int height, int radius, short* scratch);

// Mean over a (2 * radius + 1)^2 window as far as it lies in the image;
// dst = floor(sum / number of pixels in the window).
//
// src, dst       width x height bytes each
// width, height  at least 2 * radius + 1
// radius         at least 1
// scratch        `width` elements; holds column sums, on return those of the last row's window
//                (the last radius + 1 rows)
//
// Reentrant.
HAZE_PREVIEW_API void AverageFilter_u8(unsigned char* src, unsigned char* dst, int width,
                                       int height, int radius, int* scratch);

// ---------------------------------------------------------------------------------------------
// Float box filters and guided filter
//
// Means over the (2 * radius + 1)^2 window as far as it lies in the plane, by running sums: column
// sums are carried from row to row, and the sum of a row's window from pixel to pixel, so rounding
// accumulates and the order of operations is part of the result. Products are rounded before they
// are added. Each output is the sum divided by the number of pixels in the window.
//
// Planes are width x height floats. width and height are at least 2 * radius + 1, radius at least
// 1. Numbers should be zero or have normal squares (magnitudes from 2^-63): smaller ones may count
// as zero on 32-bit ARM. If memory is short nothing is written. All reentrant.
// ---------------------------------------------------------------------------------------------

// dst = mean of src
HAZE_PREVIEW_API void AverageFilter_fPreview(float* src, float* dst, int width, int height,
                                             int radius);

// dst = mean of src * src
HAZE_PREVIEW_API void AverageFilter_f_2Preview(float* src, float* dst, int width, int height,
                                               int radius);

// dst = mean of a * b
HAZE_PREVIEW_API void AverageFilter_fPreview(float* a, float* b, float* dst, int width, int height,
                                             int radius);

// The means of a and of b
HAZE_PREVIEW_API void AverageFilter_f_Out2Preview(float* a, float* b, float* meanA, float* meanB,
                                                  int width, int height, int radius);

// The means of a, of b, of a * b and of b * b
HAZE_PREVIEW_API void AverageFilter_f_Out4Preview(float* a, float* b, float* meanA, float* meanB,
                                                  float* meanAB, float* meanBB, int width,
                                                  int height, int radius);

// Refines plane p along the edges of guide I, after the guided-filter paper of 2010, into
// transmission codes. With m(x) the mean of x over the window:
//
//   slope  = min(1, |m(I * p) - m(I) * m(p)| / (|m(p * p) - m(I) * m(I)| + 1e-4))
//   offset = m(p) - slope * m(I)
//   v      = max(I, m(offset) + I * m(slope))
//   out    = 158 if v > 0.99, else trunc(200 * v - 40), at least 0
//
// The second moment is that of p, not of the guide, and v never falls below the guide. Single
// precision but for the slope's division, which is double.
//
// out   w * h codes. Allocates four planes.
HAZE_PREVIEW_API void GuidedFilterPreview(float* p, float* I, unsigned char* out, int w, int h,
                                          int r);

// ---------------------------------------------------------------------------------------------
// Transmission map
//
// A map stores t in [0.4, 0.99] as the code T = trunc(200 * t - 40), so T is 40 ... 158 and
// t = (T + 40) / 200. The images are taken as flat arrays of width * height bytes.
// ---------------------------------------------------------------------------------------------

// Transmission codes from the smoothed minimum channel S and the minimum channel M:
//
//   t = 1 - min(strength * S, M) * invA, clamped to [0.4, 0.99], in single precision.
//
// Where t is not a number (invA infinite and the minimum 0) the code is 0 in the leading multiple
// of eight pixels and 40 in the up to seven pixels after it.
//
// meanMap, minMap  S and M, width * height bytes each
// transmission     width * height codes
// strength         any value; one below the smallest normal number counts as 0 in groups of eight
// invA             1 / A for a light A in 0 ... 255 (+infinity for 0); likewise
//
// Reentrant. Below 1 x 1 nothing is written.
HAZE_PREVIEW_API void CalculateTChannelPreviewNeonFloat(unsigned char* meanMap,
                                                        unsigned char* minMap,
                                                        unsigned char* transmission, int width,
                                                        int height, float strength, float invA);

// The same but for one lane defect that callers may rely on: in the leading multiple of eight
// pixels, pixel i with i % 8 in 4 ... 7 takes M from pixel i - 4. Reentrant.
HAZE_PREVIEW_API void CalculateTChannelPreviewNeon(unsigned char* meanMap, unsigned char* minMap,
                                                   unsigned char* transmission, int width,
                                                   int height, float strength, float invA);

// The same map with integer arguments, computed by eight threads:
//
//   t = (256 - min(strengthQ8 * S, 256 * M) / atmosphericLight) / 256, clamped to [0.4, 0.99],
//
// in single precision. Where t is not a number (light and minimum both 0) the code is 0.
//
// strengthQ8        strength in units of 1 / 256
// atmosphericLight  A, 0 ... 255
HAZE_PREVIEW_API void CalculateTChannelPreview(unsigned char* meanMap, unsigned char* minMap,
                                               unsigned char* transmission, int width, int height,
                                               int strengthQ8, int atmosphericLight, int slot);

// Worker of CalculateTChannelPreview, stripes 0 ... 7, and its arguments.
HAZE_PREVIEW_API void* CalTThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gCalTSrcPreview[8];   // S
extern HAZE_PREVIEW_API unsigned char* gCalTSrc1Preview[8];  // M
extern HAZE_PREVIEW_API unsigned char* gCalTDstPreview[8];   // codes
extern HAZE_PREVIEW_API int gAlpha[8];                       // strengthQ8
extern HAZE_PREVIEW_API int gAA[8];                          // atmosphericLight
extern HAZE_PREVIEW_API int gCalTWPreview;                   // width
extern HAZE_PREVIEW_API int gCalTHPreview;                   // height

// ---------------------------------------------------------------------------------------------
// Dark channel: square minimum filter with histogram
//
// dst(x, y) is the minimum of src over rows y - r ... y + r and columns x - r ... x + r as far as
// they lie in the image, after the dark-channel-prior paper of 2009 (src being a minimum map). Any
// r >= 0 will do. Sizes below 1, negative radii and failed allocations write nothing.
// ---------------------------------------------------------------------------------------------

// On the caller's thread. hist[v] grows by the number of outputs equal to v, v = 0 ... 255; zero it
// first. Reentrant.
HAZE_PREVIEW_API void CalculateDarkChannelPreview(unsigned char* src, unsigned char* dst, int* hist,
                                                  int w, int h, int r);

// By four threads for the rows, then four for the columns. hist is overwritten. A thread that gets
// no memory searches every window of its stripe.
HAZE_PREVIEW_API void CalculateDarkChannel_MultiThreadPreview(unsigned char* src,
                                                              unsigned char* dst, int* hist, int w,
                                                              int h, int r, int slot);

// Minimum over the samples i - r ... i + r of a line of n contiguous bytes as far as they exist.
// Output i goes to dst[i * dstStride]. Reentrant.
HAZE_PREVIEW_API void getMinChannelPreview(unsigned char* src, unsigned char* dst, int n,
                                           int dstStride, int r);

// The same, and hist[output] grows by one for each output. Reentrant.
HAZE_PREVIEW_API void getMCandHistPreview(unsigned char* src, unsigned char* dst, int* hist, int n,
                                          int dstStride, int r);

// The same as getMinChannelPreview with outputs side by side; `rows` has no effect. Reentrant.
HAZE_PREVIEW_API void getMinChannel_horPreview(unsigned char* src, unsigned char* dst, int n,
                                               int rows, int r);

// Minimum down the columns of a stripe `cols` wide and h rows high, in images whose rows lie
// gCalDCWPreview bytes apart. hist[output] grows by one for each output.
HAZE_PREVIEW_API void getMinChannel_verPreview(unsigned char* src, unsigned char* dst, int cols,
                                               int h, int r, int* hist);

// Worker of the row pass, from gCalDCSrcPreview to gCalDCDstPreview: row stripes 0 ... 3.
HAZE_PREVIEW_API void* CalDCThread_horPreview(void* arg);

// Worker of the column pass: column stripes 0 ... 3. Its histogram is the 256 counters of
// gHistPreview from (slot * 4 + stripe) * 256 on, which it sets to zero first.
HAZE_PREVIEW_API void* CalDCThread_verPreview(void* arg);

// Arguments and results of both workers. After CalculateDarkChannel_MultiThreadPreview the source
// is its temporary image, which is gone.
extern HAZE_PREVIEW_API unsigned char* gCalDCSrcPreview[8];
extern HAZE_PREVIEW_API unsigned char* gCalDCDstPreview[8];
extern HAZE_PREVIEW_API int gCalDCWPreview;  // width
extern HAZE_PREVIEW_API int gCalDCHPreview;  // height
extern HAZE_PREVIEW_API int gCalDCRPreview;  // radius
extern HAZE_PREVIEW_API unsigned int gHistPreview[8 * 4 * 256];

// ---------------------------------------------------------------------------------------------
// Atmospheric light
// ---------------------------------------------------------------------------------------------

// Atmospheric light of an image: the mean colour (truncated) of the pixels whose dark channel
// equals one bright bin of its histogram. Among the brightest bins that together hold 0.1 % of the
// pixels it is the most populated one, the brighter of equals. (255, 255, 255) if no pixel lies in
// that bin.
//
// dark   w * h bytes             img   w * h pixels of 3 bytes
// hist   256 bins of `dark`      A     3 bytes in the channel order of img
//
// Sizes below 1 write nothing. Reentrant.
HAZE_PREVIEW_API void EstimateAPreview(unsigned char* dark, unsigned char* img, int* hist,
                                       unsigned char* A, int w, int h);

// Sum, modulo 2^32, of every second byte of every second row of a w x h plane, by eight threads.
//
// Stripe k starts at row k * ceil(h / 8); its samples are every second row from there. With an odd
// w each further row of a stripe is sampled from one byte further right; what that carries past the
// end of the plane is left out. The globals below belong to the call; there are no slots, so one
// call at a time. Sizes below 1 give 0.
HAZE_PREVIEW_API int CalSumThreadPreview(unsigned char* src, int w, int h);

// Worker of CalSumThreadPreview: `arg` points to an int k. Calls CalSum(k) and returns null.
HAZE_PREVIEW_API void* CalSumThreadIntermate(void* arg);

// Adds the samples of stripe k, 0 ... 7, to gCalSumSum[k].
HAZE_PREVIEW_API void CalSum(int k);

extern HAZE_PREVIEW_API unsigned char* pCalSumGSrc;
extern HAZE_PREVIEW_API int gCalSumWidth;
extern HAZE_PREVIEW_API int gCalSumHeight;
extern HAZE_PREVIEW_API int gCalSumSum[8];

// Maxima of two w x h planes over the same samples, by eight threads. Sizes below 1 leave *maxH and
// *maxA alone. One call at a time.
HAZE_PREVIEW_API void CalMaxThreadPreview(unsigned char* pH, unsigned char* pA, int w, int h,
                                          unsigned char* maxH, unsigned char* maxA);

// Worker of CalMaxThreadPreview: `arg` points to an int k. Calls CalMax(k) and returns null.
HAZE_PREVIEW_API void* CalMaxPthreadIntermate(void* arg);

// Raises gCalMaxMaxH[k] and gCalMaxMaxA[k] to the samples of stripe k, 0 ... 7.
HAZE_PREVIEW_API void CalMax(int k);

extern HAZE_PREVIEW_API unsigned char* gCalMaxpH;
extern HAZE_PREVIEW_API unsigned char* gCalMaxpA;
extern HAZE_PREVIEW_API int gCalMaxWidth;
extern HAZE_PREVIEW_API int gCalMaxHeight;
extern HAZE_PREVIEW_API unsigned char gCalMaxMaxH[8];
extern HAZE_PREVIEW_API unsigned char gCalMaxMaxA[8];

// ---------------------------------------------------------------------------------------------
// Float transmission
// ---------------------------------------------------------------------------------------------

// Transmission of a colour image with a known light. With the strength s = level / 10 for levels
// 0 ... 9 and 0.3 for all others:
//
//   tRaw = max over the channels c of clamp(1 - s / A[c] * src[c]), clamp to [0.4, 1]
//   t    = maximum of tRaw over the 15 x 15 window as far as it lies in the image
//
// which is 1 - s * (dark channel of the image over its light), bounded below.
//
// src       w * h pixels of 3 bytes
// A         3 bytes in the same order, from 1 on; 0 makes the transmission of a byte 0 no number
// t, tRaw   w * h floats
//
// Sizes below 1 and failed allocations write nothing. Reentrant.
HAZE_PREVIEW_API void EstimateTPreview(unsigned char* src, unsigned char* A, float* t, float* tRaw,
                                       int w, int h, int level);

// Maximum over the samples i - r ... i + r of a line of n contiguous floats as far as they exist;
// of equal samples (zeros of either sign) the last. Samples must be numbers. Output i goes to
// dst[i * dstStride]. Sizes below 1, negative radii and failed allocations write nothing.
// Reentrant.
HAZE_PREVIEW_API void getMaxChannelPreview(float* src, float* dst, int n, int dstStride, int r);

// The same with outputs side by side; `rows` has no effect. Reentrant.
HAZE_PREVIEW_API void getMaxChannel_horPreview(float* src, float* dst, int n, int rows, int r);

// The same down the columns of a w x h plane. Reentrant.
HAZE_PREVIEW_API void getMaxChannel_verPreview(float* src, float* dst, int w, int h, int r);

// ---------------------------------------------------------------------------------------------
// Recovery
// ---------------------------------------------------------------------------------------------

// Tone curve of recovered luma: monotone, lifts the dark and middle range (128 -> 141), tops out at
// 250. Constant.
extern HAZE_PREVIEW_API const unsigned char LutTablePreview[256];

// Recovers an NV21 frame in place from a half-resolution map of transmission codes and the
// atmospheric light. Each map sample governs its 2 x 2 luma block and its chroma pair. With
// f = 200 / (T + 40), that is 1 / t, rounded to single precision:
//
//   Y' = LutTablePreview[clamp(trunc(Ay + (Y - Ay) * f))]
//   V' = clamp(trunc(Av + (V - Av) * f))
//   U' = clamp(trunc(Au + (U - Au) * f))              clamp to 0 ... 255
//
// around the light's own luma and chroma by the weights of BT.601, each truncated to a byte:
//
//   Ay = (0.587 * G + 0.114 * B) + 0.299 * R          (in this order, double precision)
//   Au = 128 + 0.564 * (B - Ay),  Av = 128 + 0.713 * (R - Ay)
//
// The rounding of that sum makes Ay one less than A for the grey lights A = 23, 46, 57, 59, 92,
// 114, 118, 127, 184, 205, 223, 228, 236, 241, 249 and 254.
//
// frame          width * height * 3 / 2 bytes, rewritten
// transmission   (width / 2) x (height / 2) codes; codes of 160 and above follow the same formula
// light          B, G, R
// width, height  even; below 2 nothing is written
// recoverArg     has no effect
//
// Reentrant; needs 128 KiB of the calling thread's stack for its tables.
HAZE_PREVIEW_API void HazeRemoving3Preview_NV21(unsigned char* frame, unsigned char* transmission,
                                                unsigned char* light, int width, int height,
                                                int recoverArg);

// The same for a planar frame: luma, then the U plane, then the V plane. Reentrant; needs 128 KiB
// of the calling thread's stack.
HAZE_PREVIEW_API void HazeRemoving3Preview(unsigned char* frame, unsigned char* transmission,
                                           unsigned char* light, int width, int height,
                                           int recoverArg);

// The result of HazeRemoving3Preview_NV21, through global tables that the call fills for its slot
// and by eight threads. Codes of 160 and above leave their block as it is. One caller at a time,
// whatever the slot.
HAZE_PREVIEW_API void HazeRemoving3Preview2_NV21(unsigned char* frame, unsigned char* transmission,
                                                 unsigned char* light, int width, int height,
                                                 int slot);

// The second half of that: recovers a frame with the tables that the slot holds already. Stripes
// are split in rows of blocks, height / 2.
HAZE_PREVIEW_API void CalculateRemovePreview(unsigned char* frame, unsigned char* transmission,
                                             int width, int height, int slot);

// Worker of CalculateRemovePreview, stripes 0 ... 7, and its arguments.
HAZE_PREVIEW_API void* CalRemoveThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gCalRemoveSrcPreview[8];    // frame
extern HAZE_PREVIEW_API unsigned char* gCalRemoveScalePreview[8];  // transmission codes
extern HAZE_PREVIEW_API int gCalRemoveWPreview;
extern HAZE_PREVIEW_API int gCalRemoveHPreview;

// Recovered values (0 ... 255) of luma, V and U: slot s, code T, sample v at
// [(s * 160 + T) * 256 + v]. Written by HazeRemoving3Preview2_NV21.
extern HAZE_PREVIEW_API unsigned int gTable1[8 * 160 * 256];
extern HAZE_PREVIEW_API unsigned int gTable2[8 * 160 * 256];
extern HAZE_PREVIEW_API unsigned int gTable3[8 * 160 * 256];

// Recovers an NV21 frame in place like HazeRemoving3Preview_NV21, but from (width / 2) x (height /
// 2) float transmissions t and by division: A + (sample - A) / t in single precision. t is taken as
// it is; a result that is no number counts as 0. Reentrant.
HAZE_PREVIEW_API void HazeRemoving3Preview_NV21_f(unsigned char* frame, float* transmission,
                                                  unsigned char* light, int width, int height,
                                                  int recoverArg);

// ---------------------------------------------------------------------------------------------
// Recovery through reciprocals
//
// From (w / 2) x (h / 2) float transmissions t in [1/256, 1], one per 2 x 2 block. Each sample has
// an index into the reciprocals k[n] = 65536 / n (truncated; k[0] = 65536):
//
//   top-left luma and chroma   t * 255
//   top-right                  (t + right) * 128 - 1
//   bottom-left                (t + below) * 128 - 1
//   bottom-right               (t + right + below + below_right) * 64 - 1
//
// truncated, with the transmissions of the neighbouring blocks; at the right and bottom borders the
// nearest block that exists. Indices beyond 0 ... 255 are cut to that range. A sample becomes
//
//   J = clamp(A + ((k * (sample - A)) >> 8))   >> rounding towards minus infinity
//
// with A the light's luma or chroma as in HazeRemoving3Preview_NV21; luma then passes through
// LutTablePreview. Lights are B, G, R. w and h are even; below 2 nothing is written. `ignored` has
// no effect. Reentrant unless said otherwise.
// ---------------------------------------------------------------------------------------------

// Recovers a planar frame in place: of each block only the top-left luma. The other three take the
// mean (truncated) of the two or four recovered ones around them. The last column and row of blocks
// are recovered pixel by pixel, so that their top-left luma is recovered twice.
HAZE_PREVIEW_API void HazeRemovingPreview(unsigned char* frame, float* t, unsigned char* A, int w,
                                          int h, int ignored);

// Recovers every sample of a planar frame in place.
HAZE_PREVIEW_API void HazeRemoving1Preview(unsigned char* frame, float* t, unsigned char* A, int w,
                                           int h, int ignored);

// The same in single precision: J = A + (sample - A) * (k / 256), truncated and clamped, around a
// light whose luma and chroma keep their fractions.
HAZE_PREVIEW_API void HazeRemoving2Preview(unsigned char* frame, float* t, unsigned char* A, int w,
                                           int h, int ignored);

// Recovers every luma sample of a packed frame of 2 bytes per pixel (Y0, Cr, Y1, Cb) into another
// one. The chroma of a block's upper row is recovered into both rows; the lower row's is not read.
//
// src, dst   2 * w * h bytes each
HAZE_PREVIEW_API void HazeRemovingPreview(unsigned char* src, float* t, unsigned char* A,
                                          unsigned char* dst, int w, int h);

// The six-argument HazeRemovingPreview on a stripe of a planar frame, with the luma and chroma of
// the light given. Nothing of the next stripe is read.
//
// luma, chroma   the stripe's first rows of luma and of the U plane; the V plane is looked for
//                w * h / 4 bytes behind `chroma`, h being the stripe's height
// t              the stripe's first row of transmissions
HAZE_PREVIEW_API void HazeRemovingThreadPreview(unsigned char* luma, unsigned char* chroma,
                                                float* t, unsigned char AY, unsigned char ACb,
                                                unsigned char ACr, int w, int h);

// Worker for stripes 0 ... 3 of a planar frame: HazeRemovingThreadPreview with the arguments of its
// slot, which the caller fills. Because V is looked for relative to the stripe, the stripes of one
// frame write to each other's chroma rows: run them one after the other.
HAZE_PREVIEW_API void* HRThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gHRSrcPreview[8];  // frame
extern HAZE_PREVIEW_API float* gHRScalePreview[8];        // transmissions
extern HAZE_PREVIEW_API unsigned char gAYPreview[8];      // luma and chroma of the light
extern HAZE_PREVIEW_API unsigned char gACbPreview[8];
extern HAZE_PREVIEW_API unsigned char gACrPreview[8];
extern HAZE_PREVIEW_API int gHRWPreview;   // width of the frame
extern HAZE_PREVIEW_API int gHRHWPreview;  // height of the frame

// Lifts dark and middle tones of the first byte of every 2-byte pixel, in place:
//
//   v * ln(v + 1) / ln(2 + 8 * v / 230) * 0.42308129542259015, truncated, at most 255
//
// 0 stays 0 and 255 becomes 250. The second bytes are left as they are. Reentrant.
HAZE_PREVIEW_API void ImproveBrightnessPreview(unsigned char* buf, int w, int h);

// ---------------------------------------------------------------------------------------------
// Zoom
// ---------------------------------------------------------------------------------------------

// Half-resolution BGR of a frame in the format gPerviewFormat, by eight threads
// (xYCrCb2BGRPreview for planar frames, else xYCrCb2BGRPreview_NV21).
//
// With R = (height / 8) rounded down to an even number, stripe k is rows k * R ... (k + 1) * R - 1,
// except that stripe 3 ends at row height - 4 * R - 1, inside or after stripe 4. Rows from 8 * R
// on, where stripe 3 does not reach them, are not converted: the last rows of dst are left as they
// were.
//
// dst             (width / 2) x (height / 2) pixels of 3 bytes
// width, height   even; with odd ones nothing is written
HAZE_PREVIEW_API void ZoomOutImgPreview(unsigned char* src, unsigned char* dst, int width,
                                        int height, int slot);

// Worker of ZoomOutImgPreview, stripes 0 ... 7, and its arguments.
HAZE_PREVIEW_API void* ZoomOutThreadPreview(void* arg);
extern HAZE_PREVIEW_API unsigned char* gZoomOutSrcPreview[8];
extern HAZE_PREVIEW_API unsigned char* gZoomOutDstPreview[8];
extern HAZE_PREVIEW_API int gZoomOutWPreview;
extern HAZE_PREVIEW_API int gZoomOutHPreview;

// Doubles a float plane in both directions: between neighbours their mean (a + b) * 0.5, first
// along the rows, then down the columns; the last sample and row are repeated.
//
// src             width x height floats
// dst             2 * width x 2 * height floats
//
// Sizes below 1 and failed allocations write nothing. Reentrant.
HAZE_PREVIEW_API void ZoomIn_Linear_fPreview(const float* src, float* dst, int width, int height);

#endif  // HAZE_PREVIEW_H
