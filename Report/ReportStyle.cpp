#include "Report/ReportStyle.h"

namespace ventrik
{

const std::string_view reportStyle = R"css(
:root { color-scheme: light dark; --page: #ffffff; --text: #1d2530; --faint: #5d6875;
  --line: #d5dae0; --head: #f1f4f7; --accent: #2563a8; --warning: #fff3d6; }
@media (prefers-color-scheme: dark) { :root { --page: #15191f; --text: #e4e8ed; --faint: #9aa5b1;
  --line: #353d47; --head: #1f252d; --accent: #6ea8e5; --warning: #4a3a12; } }
* { box-sizing: border-box; }
body { margin: 0 auto; padding: 2rem 1.5rem; max-width: 64rem; background: var(--page);
  color: var(--text); font: 15px/1.45 system-ui, sans-serif; }
h1 { margin: 0; font-size: 2rem; }
h2 { margin: 2.5rem 0 .5rem; padding-bottom: .3rem; border-bottom: 2px solid var(--accent); }
h3 { margin: 1.4rem 0 .4rem; }
.subtitle { margin: .2rem 0 1.4rem; color: var(--faint); }
.note { margin: .4rem 0; color: var(--faint); font-size: .87rem; }
.warning { padding: .5rem .8rem; border-radius: .3rem; background: var(--warning); }
table { border-collapse: collapse; width: 100%; margin: .4rem 0; font-size: .87rem; }
th, td { padding: .22rem .6rem .22rem 0; text-align: left; vertical-align: top;
  border-bottom: 1px solid var(--line); overflow-wrap: break-word; }
thead th { background: var(--head); color: var(--faint); padding-left: .3rem; font-weight: 600; }
tbody td:first-child { padding-left: .3rem; }
.number, .time, .name { white-space: nowrap; font-variant-numeric: tabular-nums; }
.values td { overflow-wrap: anywhere; }
.wide { overflow-x: auto; }
.place { color: var(--faint); }
.values th { width: 45%; font-weight: normal; color: var(--faint); padding-left: .3rem; }
.facts th { width: 9rem; }
.serving td { white-space: nowrap; }
.bar { width: 40%; }
.bar div { height: .8rem; margin-top: .25rem; min-width: 1px; background: var(--accent); }
.doubt { display: block; color: #b3541e; }
.columns { columns: 2 24rem; column-gap: 2.5rem; }
.group { break-inside: avoid-column; }
.group h3:first-child { margin-top: .4rem; }
details { margin: .3rem 0 .3rem .6rem; }
summary { font-weight: 600; cursor: pointer; }
figure { margin: .8rem 0 1.4rem; break-inside: avoid; }
figcaption { margin-bottom: .25rem; font-weight: 600; font-size: .9rem; }
svg { display: block; width: 100%; height: auto; border-radius: .2rem; }
footer { margin-top: 2rem; color: var(--faint); font-size: .8rem; }
@page { margin: 14mm 12mm; }
@media print {
  :root { color-scheme: light; --page: #ffffff; --text: #1d2530; --faint: #5d6875;
    --line: #d5dae0; --head: #f1f4f7; --accent: #2563a8; --warning: #fff3d6; }
  * { print-color-adjust: exact; -webkit-print-color-adjust: exact; }
  body { max-width: none; padding: 0; font-size: 10.5pt; }
  h2, h3, figcaption, summary { break-after: avoid; }
  p { break-inside: avoid; }
  .charts .note { break-after: avoid; }
  table { font-size: 8.5pt; }
  .cells { font-size: 7.5pt; }
  .columns { columns: 2 14rem; column-gap: 2rem; }
  tr { break-inside: avoid; }
  thead { display: table-header-group; }
}
)css";

} // namespace ventrik
