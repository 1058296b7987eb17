#pragma once

#include <string_view>

// The style sheet of the page. Each state colour has at least 4.5:1 contrast with the text on it
// and with the page, in light and in dark.
inline constexpr std::string_view kPageStyle = R"(:root {
  color-scheme: light dark;
  --page: #fff; --panel: #f5f6f8; --line: #d5d9e0; --text: #1b1f27; --quiet: #59616e;
  --link: #0b57c4; --ok: #1d7a3a; --failed: #b3261e; --ended: #5b6472; --open: #8a5a00;
  --no-start: #6b3fa0; --on-state: #fff;
}
@media (prefers-color-scheme: dark) {
  :root {
    --page: #14171c; --panel: #1d2128; --line: #363c47; --text: #e6e8ec; --quiet: #a2aab6;
    --link: #8ab8ff; --ok: #6fd08c; --failed: #ff8a80; --ended: #b4bcc8; --open: #f0b95a;
    --no-start: #c6a3f5; --on-state: #14171c;
  }
}
* { box-sizing: border-box; }
body {
  margin: 0 auto; max-width: 74rem; padding: 1rem; background: var(--page); color: var(--text);
  font: 1rem/1.5 system-ui, sans-serif; overflow-wrap: anywhere;
}
h1 { font-size: 1.6rem; line-height: 1.25; margin: .5rem 0 .25rem; }
h2 { font-size: 1.2rem; margin: 2rem 0 .6rem; }
h3 { font-size: 1rem; margin: 0; display: inline; }
h4 { font-size: .95rem; margin: 1.1rem 0 .3rem; }
header p { margin: .15rem 0; }
.quiet { color: var(--quiet); }
a { color: var(--link); }
:focus-visible { outline: 2px solid var(--link); outline-offset: 2px; }
.scroll { overflow-x: auto; border: 1px solid var(--line); border-radius: 6px; }
table { border-collapse: collapse; font-size: .92rem; }
.scroll table { width: 100%; }
th, td { text-align: left; vertical-align: top; padding: .35rem .6rem; }
.scroll th, .scroll td { overflow-wrap: normal; white-space: nowrap; }
.scroll td:nth-of-type(n+4) { white-space: normal; min-width: 6rem; }
.scroll th[scope="row"] { white-space: normal; min-width: 6rem; max-width: 14rem; overflow-wrap: anywhere; }
.scroll thead { background: var(--panel); }
tbody tr { border-top: 1px solid var(--line); }
caption { text-align: left; font-weight: 600; padding: .6rem 0 .2rem; }
.changes, .facts { width: 100%; table-layout: fixed; }
.changes thead { position: absolute; left: -999rem; }
.changes col.kind { width: 5.5rem; }
.changes col.name { width: 38%; }
.changes td.kind { color: var(--quiet); }
.changes th { font-weight: 400; }
.changes .added td.kind { color: var(--ok); }
.changes .removed td.kind { color: var(--failed); }
.facts th { width: 8.5rem; font-weight: 400; color: var(--quiet); }
.state, .level { white-space: nowrap; font-weight: 600; }
.state.ok { color: var(--ok); } .state.failed { color: var(--failed); }
.state.ended { color: var(--ended); } .state.open { color: var(--open); }
.state.no-start { color: var(--no-start); }
.level.error { color: var(--failed); } .level.warning { color: var(--open); }
.level.note { color: var(--quiet); }
.legend { list-style: none; display: flex; flex-wrap: wrap; gap: .2rem 1.4rem; padding: 0;
  margin: .6rem 0; font-size: .88rem; }
.legend span + span { color: var(--quiet); }
.findings { padding-left: 1.2rem; }
.findings code { color: var(--quiet); font-size: .85rem; }
.messages bdi { white-space: pre-wrap; }
details { border: 1px solid var(--line); border-left: .35rem solid var(--ended);
  border-radius: 6px; margin: .5rem 0; background: var(--page); }
details.ok { border-left-color: var(--ok); } details.failed { border-left-color: var(--failed); }
details.open { border-left-color: var(--open); }
details.no-start { border-left-color: var(--no-start); }
summary { padding: .5rem .8rem; cursor: pointer; }
summary:hover { background: var(--panel); }
details > div { padding: 0 .8rem .8rem; scroll-margin-top: 4rem; }
svg { display: block; min-width: 46rem; width: 100%; height: auto; font: 12px system-ui, sans-serif; }
svg text { fill: var(--text); }
.lane { fill: var(--panel); }
.lane-name { font-weight: 600; }
.tick { stroke: var(--line); pointer-events: none; }
svg .tick-label { fill: var(--quiet); }
.bar rect { fill: var(--ended); }
.bar.ok rect { fill: var(--ok); } .bar.failed rect { fill: var(--failed); }
.bar.open rect { fill: var(--open); } .bar.no-start rect { fill: var(--no-start); }
svg .mark { fill: var(--on-state); font-weight: 700; }
.bar:hover rect, .bar:focus-visible rect { stroke: var(--text); stroke-width: 2; }
@media (max-width: 40rem) {
  body { padding: .7rem; }
  .changes col.kind { width: 4.8rem; }
  .facts th { width: 6.5rem; }
  th, td { padding: .3rem .35rem; }
}
@media print {
  body { max-width: none; }
  .scroll { overflow: visible; border: 0; }
  details { break-inside: avoid-page; }
  details::details-content { display: block; content-visibility: visible; }
}
)";
