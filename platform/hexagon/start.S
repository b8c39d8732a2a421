// Program entry. The kernel leaves sp at argc, argv[], envp[] and auxv; the C start-up
// takes that address, on a stack aligned for it, with no return address or frame.
        .text
        .globl  _start
        .hidden _start
        .type   _start,@function
        .p2align 4
_start:
        r0 = r29
        r29 = and(r29, #-64)
        r31 = #0
        r30 = #0
        call    corvane_rt_start
        trap0(#0)
        .size   _start, .-_start
