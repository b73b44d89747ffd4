# Of what the machine has told: a line for each second of each way, "way phase seconds error delay": since the start, by
# how many microseconds the clock is ahead of the outside's, and the way there and back. Of a second's observations it
# is that with the shortest way: network and machines have falsified it least. Times are read with TZ=UTC.

function epoch(date, time) {
  gsub(/[-:]/, " ", date)
  gsub(/[-:]/, " ", time)
  return mktime(date " " time)
}

function finish(    i) {
  for (i = marks; i > 0 && second < begin[i]; --i) {
  }
  if (count > 0 && i > 0 && phase[i] != "end") {
    printf "%s %s %d %.1f %.1f\n", way[i], phase[i], second - start[way[i]], -offset * 1e6, delay * 1e6
  }
  count = 0
}

$1 == "mark" {
  way[++marks] = $2
  phase[marks] = $3
  begin[marks] = int($4) + ($3 == "start")
  if ($3 == "start") {
    start[$2] = int($4)
  }
}

$1 == "seen" {
  if (epoch($2, $3) != second) {
    finish()
    second = epoch($2, $3)
  }
  if (count++ == 0 || $14 < delay) {
    offset = $13
    delay = $14
  }
}

END { finish() }
