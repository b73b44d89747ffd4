# Of points and of what the machine has told: a row of the table for each way. In microseconds and seconds.

# The seconds from which on all errors before the silence are at most so large.
function settled(way, limit,    i, from) {
  for (i = 1; i <= count[way]; ++i) {
    if ((phase[way, i] == "start" || phase[way, i] == "steady") && isSure(way, i)) {
      if (amount(error[way, i]) > limit) {
        from = ""
      } else if (from == "") {
        from = at[way, i] " s"
      }
    }
  }
  return from == "" ? "never" : from
}

function amount(value) {
  return value < 0 ? -value : value
}

# An observation is wrong by half of what the way was longer than the shortest of all: those of more than 125 us are
# not judged.
function isSure(way, i) {
  return delay[way, i] <= shortest + 250
}

# The errors of a phase, sorted by amount, become "sorted"; their sum "sum".
function collect(way, name,    i, j, n, value) {
  n = 0
  sum = 0
  for (i = 1; i <= count[way]; ++i) {
    if (phase[way, i] == name && isSure(way, i)) {
      sum += error[way, i]
      value = amount(error[way, i])
      for (j = n++; j > 0 && sorted[j] > value; --j) {
        sorted[j + 1] = sorted[j]
      }
      sorted[j + 1] = value
    }
  }
  return n
}

function rms(n,    i, squares) {
  for (i = 1; i <= n; ++i) {
    squares += sorted[i] ^ 2
  }
  return sqrt(squares / n)
}

function highest(way, name,    n) {
  n = collect(way, name)
  return sorted[n]
}

# How fast the clock is by itself, in ppm: the slope of a line.
function rate(way,    i, n, x, y, xx, xy) {
  for (i = 1; i <= count[way]; ++i) {
    if (phase[way, i] == "free" && at[way, i] < 0) {
      ++n
      x += at[way, i]
      y += error[way, i]
      xx += at[way, i] ^ 2
      xy += at[way, i] * error[way, i]
    }
  }
  return (n * xy - x * y) / (n * xx - x ^ 2)
}

function row(way,    n, mean) {
  n = collect(way, "steady")
  mean = sum / n
  printf "| %s | %.0f ppm | %s | %s | %.0f | %.0f | %.0f | %.0f | ", name[way], rate(way), settled(way, 1000),
    settled(way, 100), rms(n), sorted[int(n * 0.99 + 0.999)], mean, sqrt(rms(n) ^ 2 - mean ^ 2)
  printf "%.0f | %.0f | %.0f | %s |\n", highest(way, "silence"), highest(way, "return"), highest(way, "killed"),
    steps[way] == "" ? "none" : steps[way]
}

BEGIN {
  name["pairs"] = "vantel-host and chronyd"
  name["servo"] = "ptp4l's own servo"
  name["ntp"] = "NTP client"
}

$1 == "mark" { now = $3 == "free" || $3 == "end" ? "" : $2 }
$1 == "step" && now != "" { steps[now] = steps[now] sprintf("%s%.0f", steps[now] == "" ? "" : ", ", $3 * 1e6) }

$1 in name {
  i = ++count[$1]
  phase[$1, i] = $2
  at[$1, i] = $3
  error[$1, i] = $4
  delay[$1, i] = $5
  if (shortest == "" || $5 < shortest) {
    shortest = $5
  }
}

END {
  print "| the clock follows | by itself | within 1 ms | within 100 us | rms | 99 % | mean | spread | silence | return | killed | steps |"
  print "|---|---|---|---|---|---|---|---|---|---|---|---|"
  row("pairs")
  row("servo")
  row("ntp")
}
