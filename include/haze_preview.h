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
// slot              0 ... 7: where the arguments are kept during the call, see CalTThreadPreview
//
// With R = (height / 8) rounded down to an even number, thread k of the first seven takes R rows
// from row k * R and the last one takes all that remain. Rows of a thread that cannot be started
// are computed by the caller. One caller at a time, whatever the slot.
HAZE_PREVIEW_API void CalculateTChannelPreview(unsigned char* meanMap, unsigned char* minMap,
                                               unsigned char* transmission, int width, int height,
                                               int strengthQ8, int atmosphericLight, int slot);

// One thread of CalculateTChannelPreview: computes stripe k of the map described by slot s of the
// globals below. `arg` points to an int holding s * 10 + k, s and k 0 ... 7; with any other value
// nothing is written. Returns null. Callers may fill the globals and run stripes themselves.
HAZE_PREVIEW_API void* CalTThreadPreview(void* arg);

// Arguments of CalTThreadPreview, by slot, and the image size shared by all slots. Written by
// CalculateTChannelPreview and left as they are when it returns.
extern HAZE_PREVIEW_API unsigned char* gCalTSrcPreview[8];   // S
extern HAZE_PREVIEW_API unsigned char* gCalTSrc1Preview[8];  // M
extern HAZE_PREVIEW_API unsigned char* gCalTDstPreview[8];   // codes
extern HAZE_PREVIEW_API int gAlpha[8];                       // strengthQ8
extern HAZE_PREVIEW_API int gAA[8];                          // atmosphericLight
extern HAZE_PREVIEW_API int gCalTWPreview;                   // width
extern HAZE_PREVIEW_API int gCalTHPreview;                   // height

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

#endif  // HAZE_PREVIEW_H
