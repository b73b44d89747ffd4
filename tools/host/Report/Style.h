/// @file
/// How a page looks: CSS.
#pragma once

#include <string_view>

namespace vantelhost {

constexpr std::string_view pageStyle = R"(
:root { color-scheme: light dark; --ink: #1c2430; --paper: #fff; --faint: #5b6672; --line: #d5dae0;
  --data: #2b6cb0; }
@media (prefers-color-scheme: dark) {
  :root { --ink: #dde3ea; --paper: #14181d; --faint: #96a1ad; --line: #38414b;
    --data: #63a4ea; }
}
body { color: var(--ink); background: var(--paper); font: 15px/1.5 system-ui, sans-serif;
  max-width: 62rem; margin: 2rem auto; padding: 0 1rem; }
h1 { font-size: 1.6rem; margin-bottom: 0; overflow-wrap: anywhere; }
h2 { font-size: 1.15rem; margin: 2.2rem 0 .4rem; border-bottom: 1px solid var(--line); }
p { margin: .4rem 0; color: var(--faint); }
p.note { color: var(--ink); border-left: 4px solid #e08e0b; padding: .3rem .8rem; }
figure { margin: .6rem 0; }
figure svg { display: block; width: 100%; height: auto; overflow: visible; }
figure .narrow { display: none; max-width: 30rem; }
@media screen and (max-width: 58rem) {
  figure .narrow { display: block; }
  figure .wide { display: none; }
}
figure svg [stroke="black"] { stroke: var(--ink); }
figure svg [fill="black"] { fill: var(--ink); }
figure svg [color="black"] { color: var(--ink); }
figure svg [stroke='rgb( 43, 108, 176)'] { stroke: var(--data); }
figure svg [fill='rgb( 43, 108, 176)'] { fill: var(--data); }
figure svg [color='rgb( 43, 108, 176)'] { color: var(--data); }
figure svg .gridline { stroke: var(--line); }
.table { overflow-x: auto; margin: .6rem 0; }
dl { display: grid; grid-template-columns: repeat(auto-fill, minmax(6.2rem, 1fr));
  gap: .3rem .7rem; margin: .6rem 0; font-size: .9rem; font-variant-numeric: tabular-nums; }
dt { color: var(--faint); font-weight: 600; }
dd { margin: 0; }
table { border-collapse: collapse; font-size: .9rem; font-variant-numeric: tabular-nums; }
th, td { text-align: left; vertical-align: top; padding: .2rem .6rem .2rem 0;
  border-bottom: 1px solid var(--line); white-space: nowrap; }
td:last-child { white-space: normal; min-width: 7.5rem; }
th { color: var(--faint); font-weight: 600; }
.legend { list-style: none; padding: 0; margin: .2rem 0; display: flex; flex-wrap: wrap;
  gap: .1rem 1.4rem; font-size: .9rem; }
.legend span { display: inline-block; width: .9em; height: .9em; margin-right: .5em;
  print-color-adjust: exact; -webkit-print-color-adjust: exact; }
.legend [style="background:#2b6cb0"] { background: var(--data) !important; }
@media print {
  :root { color-scheme: light; --ink: #000; --paper: #fff; --faint: #444; --line: #bbb; }
  body { max-width: none; margin: 0; font-size: 11px; }
  figure, tr { break-inside: avoid; }
  h2 { break-after: avoid; }
}
)";

} // namespace vantelhost
