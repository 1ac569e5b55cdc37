# The chart of docs/performance.md and README.md. Variables: data, image. On a ground of its own, so
# that it can be read on a light and on a dark page.
set terminal svg size 900,420 font "Helvetica,Arial,sans-serif,13" background "#ffffff"
set output image
set title "Cycles a unit at 256 units on a Cortex-M0+: less is better"
set yrange [0:60]
set xrange [-0.6:11.6]
set xtics rotate by -35 scale 0 nomirror
set ytics nomirror
set grid ytics linecolor "#dddddd"
set border 3
set key top left reverse Left
set boxwidth 0.18
set style fill solid 1 border
over(y) = y > 60 ? 57 : NaN
plot data using ($0-0.3):2:xtic(1) with boxes linecolor rgb "#1b6ca8" title "strutil", \
  data using ($0-0.1):4 with boxes linecolor rgb "#d9822b" title "newlib", \
  data using ($0-0.1):3 with boxes fill empty linecolor rgb "#d9822b" notitle, \
  data using ($0+0.1):6 with boxes linecolor rgb "#5a9e6f" title "picolibc, built for speed", \
  data using ($0+0.1):5 with boxes fill empty linecolor rgb "#5a9e6f" notitle, \
  data using ($0+0.3):8 with boxes linecolor rgb "#999999" title "the obvious loop", \
  NaN with boxes fill empty linecolor rgb "#444444" title "hollow: reads past the end of the text", \
  data using ($0-0.12):(over($4)):(sprintf("%.0f", $4)) with labels right notitle, \
  data using ($0+0.22):(over($6)):(sprintf("%.0f", $6)) with labels left notitle
