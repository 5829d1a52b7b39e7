// Which build of the row kernels runs. Every kernel is a plain integer loop
// written once and compiled twice: for the x86-64 baseline (SSE2, the
// portable build) and for AVX2, where the compiler may use wider vectors.
// Both builds compute the same bits; the AVX2 one is chosen once, where the
// processor and system support it.
#pragma once

#if defined(__x86_64__) && (defined(__GNUC__) || defined(__clang__))
#define FRINGE_WIDE_KERNELS 1
// Marks the AVX2 build of a kernel's entry.
#define FRINGE_WIDE_TARGET __attribute__((target("avx2")))
#else
#define FRINGE_WIDE_KERNELS 0
#define FRINGE_WIDE_TARGET
#endif

// A kernel body: inlined into each build's entry, so that each entry's
// loops are vectorised for that entry's target.
#define FRINGE_KERNEL_BODY __attribute__((always_inline)) inline

namespace Project {

// True when the AVX2 builds of the kernels are to run.
bool UseWideKernels();

// Tests: run the portable builds even where the AVX2 ones could, so that
// both are held against the literal stages on one machine.
void ForcePortableKernels(bool force);

}  // namespace Project
