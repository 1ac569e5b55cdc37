@ What checks the counter: each name ends in the cycles that its lines add up to, and the bytes that
@ it pushes.
        .syntax unified
        .cpu    cortex-m0plus
        .thumb

        .macro  function name
        .section .text.\name, "ax"
        .align  2
        .global \name
        .thumb_func
        .type   \name, %function
\name:
        .endm

        function branches_13_0
        movs    r0, #3                          @ 1
1:      subs    r0, #1                          @ 1, three times
        bne     1b                              @ 2 + 2 + 1
        b       2f                              @ 2
2:      bx      lr                              @ 2

        function memory_26_220
        push    {r4, r5, lr}                    @ 1 + 3
        sub     sp, #208                        @ 1
        str     r0, [sp, #200]                  @ 2
        ldr     r4, [r0]                        @ 2
        strb    r4, [r0, #4]                    @ 2
        ldmia   r0!, {r1, r2, r3}               @ 1 + 3
        stmia   r0!, {r1, r2}                   @ 1 + 2
        muls    r1, r2                          @ 1
        add     sp, #208                        @ 1
        pop     {r4, r5, pc}                    @ 3 + 3

        function calls_22_0
        mov     r12, lr                         @ 1
        bl      1f                              @ 3
        adr     r1, 2f                          @ 1
        adds    r1, #1                          @ 1
        mov     r3, r1                          @ 1
        blx     r3                              @ 2
        mrs     r0, primask                     @ 3
        dsb                                     @ 3
        mov     pc, r12                         @ 2
        .align  2
2:      adds    r0, #1                          @ 1
1:      bx      lr                              @ 2, twice
