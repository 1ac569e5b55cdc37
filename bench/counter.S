@ What checks the counter: the name has the cycles that the lines add up to, and the bytes pushed.
        .syntax unified
        .cpu    cortex-m0plus
        .thumb
        .global counted_60_220
        .thumb_func
        .type   counted_60_220, %function
counted_60_220:
        push    {r4, r5, lr}                    @ 1 + 3
        sub     sp, #208                        @ 1
        str     r0, [sp, #200]                  @ 2
        ldr     r4, [r0]                        @ 2
        strb    r4, [r0, #4]                    @ 2
        ldmia   r0!, {r1, r2, r3}               @ 1 + 3
        stmia   r0!, {r1, r2}                   @ 1 + 2
        muls    r1, r2                          @ 1
        movs    r0, #3                          @ 1
1:      subs    r0, #1                          @ 1, three times
        bne     1b                              @ 2 + 2 + 1
        b       2f                              @ 2
2:      bl      4f                              @ 3
        adr     r1, 3f                          @ 1
        adds    r1, #1                          @ 1
        mov     r3, r1                          @ 1
        blx     r3                              @ 2
        mrs     r0, primask                     @ 3
        dsb                                     @ 3
        mov     r1, pc                          @ 1
        adds    r1, #2                          @ 1
        mov     pc, r1                          @ 2
        add     sp, #208                        @ 1
        pop     {r4, r5, pc}                    @ 3 + 3
        .align  2
3:      adds    r0, #1                          @ 1
4:      bx      lr                              @ 2, twice
