@ The least that one unit at a time costs, eight steps a turn, and the loops that check the count.
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

@ w is the prefix of the wide twin, x the suffix of loads and stores, s the bytes of a unit.
        .macro  both w, x, s
        function \w\()StrLen                    @ 4 a unit
        movs    r3, r0
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r2, [r3, #\k * \s]
        cmp     r2, #0
        beq     .L\w\()StrLen2_\k
        .endr
        adds    r3, #8 * \s
        b       1b
        .irp    k, 7, 6, 5, 4, 3, 2, 1
.L\w\()StrLen2_\k:
        adds    r3, #\s
        .endr
.L\w\()StrLen2_0:
        subs    r0, r3, r0
        .if     \s == 2
        lsrs    r0, r0, #1
        .endif
        bx      lr

        function \w\()StrCopy                   @ 6 a unit
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r2, [r1, #\k * \s]
        str\x   r2, [r0, #\k * \s]
        cmp     r2, #0
        beq     2f
        .endr
        adds    r0, #8 * \s
        adds    r1, #8 * \s
        b       1b
2:      bx      lr

        function \w\()StrChr                    @ 5 a unit: (unit - c) * unit is 0 for c and for 0
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r2, [r0, #\k * \s]
        subs    r3, r2, r1
        muls    r3, r2
        beq     .L\w\()StrChr2_\k
        .endr
        adds    r0, #8 * \s
        b       1b
        .irp    k, 7, 6, 5, 4, 3, 2, 1
.L\w\()StrChr2_\k:
        adds    r0, #\s
        .endr
.L\w\()StrChr2_0:
        cmp     r2, #0
        bne     3f
        movs    r0, #0
3:      bx      lr

        function \w\()StrCmp                    @ 7 a unit: b - a + (a == 0) is 0 for equal units but 0
        push    {r4, lr}
        movs    r4, r0
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r2, [r0, #\k * \s]
        ldr\x   r3, [r1, #\k * \s]
        rsbs    r2, r2, #0
        adcs    r2, r3
        bne     .L\w\()StrCmp2_\k
        .endr
        adds    r0, #8 * \s
        adds    r1, #8 * \s
        b       1b
        .irp    k, 7, 6, 5, 4, 3, 2, 1
.L\w\()StrCmp2_\k:
        adds    r0, #\s
        .endr
.L\w\()StrCmp2_0:
        subs    r4, r0, r4
        ldr\x   r2, [r0]
        subs    r2, r2, r3
        beq     4f
        .if     \s == 2
        lsrs    r4, r4, #1
        .endif
        adds    r0, r4, #1
        cmp     r2, #0
        bgt     3f
        rsbs    r0, r0, #0
3:      pop     {r4, pc}
4:      movs    r0, #0
        pop     {r4, pc}

        .endm

        both    , b, 1
        both    W, h, 2

@ What checks the counter: each name ends in the cycles that its lines add up to.
        function branches_13                    @ branches
        movs    r0, #3                          @ 1
1:      subs    r0, #1                          @ 1, three times
        bne     1b                              @ 2 + 2 + 1
        b       2f                              @ 2
2:      bx      lr                              @ 2

        function memory_22                      @ memory
        push    {r4, r5, lr}                    @ 1 + 3
        ldr     r4, [r0]                        @ 2
        strb    r4, [r0, #4]                    @ 2
        ldmia   r0!, {r1, r2, r3}               @ 1 + 3
        stmia   r0!, {r1, r2}                   @ 1 + 2
        muls    r1, r2                          @ 1
        pop     {r4, r5, pc}                    @ 3 + 3

        function calls_22                       @ calls and what else is rare
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
