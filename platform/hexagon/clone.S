// int corvane_rt_clone(unsigned flags, void* stack, int* parent_tid, int* child_tid, void* tls)
// Generic clone argument order. The caller has stored the child's entry and its argument
// in the first two words at `stack`. The child starts on that stack after trap0 with
// r0 = 0, so it cannot return through the caller's frame: it calls entry(argument) and
// ends its own thread with exit (93).
        .text
        .globl  corvane_rt_clone
        .hidden corvane_rt_clone
        .type   corvane_rt_clone,@function
        .p2align 4
corvane_rt_clone:
        r6 = #220
        trap0(#1)
        p0 = cmp.eq(r0, #0)
        if (!p0) jumpr r31
        r2 = memw(r29 + #0)
        r0 = memw(r29 + #4)
        r31 = #0
        r30 = #0
        callr   r2
        r0 = #0
        r6 = #93
        trap0(#1)
        .size   corvane_rt_clone, .-corvane_rt_clone
