// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesPage.h"

namespace cadrel::app {

const std::string_view NotesPage::Style = R"(
:root { color-scheme: light dark; --paper: #fbfaf8; --ink: #1d1f22; --dim: #5f646b; --line: #dddad4; --card: #fff;
  --kept: #7d93ad; --moved: #d38a1f; --lifted: #c8453b; --inserted: #2f9460; --doubled: #8a5bbf; --version: #3b78c4;
  --trimmed: #c7568f; --replaced: #16909f; --retimed: #8d7d12; --transition: #855a3f; --accent: #3b78c4; }
@media screen and (prefers-color-scheme: dark) {
  :root { --paper: #17191c; --ink: #e4e5e7; --dim: #969ca5; --line: #33373d; --card: #1f2226;
    --kept: #64799a; --moved: #e0a13f; --lifted: #e26a60; --inserted: #4db582; --doubled: #a983d8; --version: #6ba3e6;
    --trimmed: #e57fb2; --replaced: #3fbdcc; --retimed: #bdab35; --transition: #bb8d6d; --accent: #6ba3e6; } }
* { box-sizing: border-box; }
body { margin: 0; padding: 28px; background: var(--paper); color: var(--ink); font: 15px/1.45 system-ui, sans-serif; }
main { max-width: 1180px; margin: 0 auto; }
h1 { font-size: 25px; margin: 0 0 2px; } h2 { font-size: 18px; margin: 34px 0 2px; }
p { margin: 0 0 12px; overflow-wrap: anywhere; } .dim { color: var(--dim); } .titles { font-size: 17px; font-weight: 500; margin: 0 0 4px; }
.numbers { display: flex; flex-wrap: wrap; gap: 10px; margin: 16px 0 22px; padding: 0; list-style: none; }
.numbers li { background: var(--card); border: 1px solid var(--line); border-radius: 6px; padding: 7px 13px; }
.numbers b { display: block; font: 600 17px ui-monospace, monospace; } .numbers span { font-size: 13px; color: var(--dim); }
.strip { background: var(--card); border: 1px solid var(--line); border-radius: 6px; padding: 10px 14px; }
.strip div { display: flex; justify-content: space-between; gap: 16px; font-size: 13px; color: var(--dim); }
.strip .tc, td.tc { font-family: ui-monospace, monospace; font-variant-numeric: tabular-nums; white-space: nowrap; }
.steps td:nth-child(3) { white-space: normal; }
.strip .reels { position: relative; display: block; height: 15px; overflow: hidden; font-size: 11px; }
.reels b { position: absolute; padding-left: 3px; font-weight: 500; }
svg { display: block; width: 100%; height: 190px; margin: 4px 0; cursor: pointer; }
svg:focus-visible, tr:focus-visible, button:focus-visible, summary:focus-visible { outline: 2px solid var(--accent); outline-offset: 1px; }
.base { fill: var(--line); } .reel { stroke: var(--ink); stroke-width: 1.5; vector-effect: non-scaling-stroke; }
.kept { --hue: var(--kept); } .trimmed { --hue: var(--trimmed); } .lifted { --hue: var(--lifted); }
.inserted { --hue: var(--inserted); } .replaced { --hue: var(--replaced); } .moved { --hue: var(--moved); }
.doubled { --hue: var(--doubled); } .retimed { --hue: var(--retimed); } .version { --hue: var(--version); }
.transition { --hue: var(--transition); }
svg [data-rows] { fill: var(--hue); }
path.kept { fill-opacity: .34; stroke-opacity: .34; } path.moved, path.doubled { fill-opacity: .62; stroke-opacity: .62; }
svg .thin, path.moved, path.doubled { stroke: var(--hue); stroke-width: 1; vector-effect: non-scaling-stroke; }
svg .on { fill-opacity: 1; stroke: var(--ink); stroke-opacity: 1; stroke-width: 1; vector-effect: non-scaling-stroke; }
svg [data-rows]:hover { fill-opacity: .95; } svg .off { display: none; }
.tools { display: flex; flex-wrap: wrap; gap: 6px 14px; align-items: center; margin: 14px 0 6px; font-size: 14px; }
.tools label { display: inline-flex; gap: 5px; align-items: center; }
.tools i { width: 11px; height: 11px; border-radius: 3px; background: var(--hue); }
.tools button { font: inherit; padding: 2px 10px; background: var(--card); color: inherit; border: 1px solid var(--line);
  border-radius: 5px; }
ol.largest li { break-inside: avoid; }
.wide { overflow-x: auto; } table { width: 100%; border-collapse: collapse; margin-top: 10px; }
.steps { table-layout: fixed; min-width: 780px; } .steps th:nth-child(1) { width: 52px; } .steps th:nth-child(2) { width: 108px; }
.steps th:nth-child(3) { width: 300px; } .steps th:nth-child(5), .steps th:nth-child(6) { width: 118px; }
.overview { width: auto; } .overview td, .overview th { padding: 2px 18px 2px 10px; } .overview a, .steps a { color: inherit; }
th { text-align: left; font-size: 13px; font-weight: 500; color: var(--dim); border-bottom: 1px solid var(--line);
  padding: 4px 10px; }
td { padding: 6px 10px; border-bottom: 1px solid var(--line); vertical-align: top; }
td.tc { font-size: 13.5px; } .num { text-align: right !important; }
tr.k td { padding-top: 2px; padding-bottom: 2px; font-size: 12.5px; color: var(--dim); }
tr.on td { background: color-mix(in srgb, var(--accent) 16%, transparent); }
tbody tr[id] { scroll-margin-top: 20px; cursor: pointer; }
.tag { display: inline-block; font-size: 12px; padding: 0 7px; border-radius: 9px; margin-right: 7px;
  background: color-mix(in srgb, var(--hue) 26%, transparent); white-space: nowrap; }
.tag.sound { --hue: var(--kept); }
details.sound { margin: 3px 0 2px; font-size: 14px; } details.sound summary { cursor: pointer; }
details.sound ul { margin: 3px 0 5px; padding-left: 20px; list-style: none; } details.sound small { color: var(--dim); }
details.sound .tc { display: inline-block; min-width: 8.5em; font: 12.5px ui-monospace, monospace; }
.change { margin: 0 0 2px; overflow-wrap: break-word; } .change small { color: var(--dim); }
ol.largest { columns: 2; column-gap: 40px; padding-left: 24px; margin: 8px 0; font-size: 14px; }
ol.largest a { color: inherit; }
[hidden] { display: none !important; }
@media screen and (max-width: 1040px) { .steps { min-width: 0; } .steps th:nth-child(1) { width: 44px; }
  .steps th:nth-child(3) { width: 184px; }
  .steps th:nth-child(5), .steps th:nth-child(6) { width: 112px; } .steps td, .steps th { padding-left: 6px; padding-right: 6px; } }
@media screen and (max-width: 760px) { body { padding: 12px; } ol.largest { columns: 1; } td, th { padding-left: 4px; padding-right: 4px; } }
@media screen and (max-width: 900px) { .steps, .steps tbody { display: block; } .steps thead { display: none; }
  .steps tr { display: grid; grid-template-columns: 34px 106px 1fr auto auto; column-gap: 14px; padding: 6px 0; border-bottom: 1px solid var(--line); }
  .steps td, .steps tr.k td { padding: 0; border: 0; } .steps td:nth-child(5) { grid-area: 1 / 4; } .steps td:nth-child(6) { grid-area: 1 / 5; }
  .steps td:nth-child(4) { grid-column: 3 / 6; }
  .steps td:nth-child(5):not(:empty)::before { content: "length "; } .steps td:nth-child(6):not(:empty)::before { content: "offset "; }
  .steps td.num::before { font: 12px system-ui, sans-serif; color: var(--dim); } }
@media screen and (max-width: 600px) { .steps tr { grid-template-columns: 28px 1fr auto auto; column-gap: 10px; }
  .steps td.num::before { display: block; }
  .steps td:nth-child(5) { grid-area: 1 / 3; } .steps td:nth-child(6) { grid-area: 1 / 4; }
  .steps td:nth-child(3), .steps td:nth-child(4) { grid-column: 2 / 5; } }
@media print { :root { color-scheme: light; --paper: #fff; --card: #fff; } .wide { overflow: visible; } body { padding: 0; font-size: 10pt; }
  .tools { margin: 4px 0; font-size: 8pt; } .tools button, .tools span, .tools input, .tools label:has(input:not(:checked)) { display: none; }
  * { print-color-adjust: exact; -webkit-print-color-adjust: exact; } tr { break-inside: avoid; } tr:has(details.sound) { break-inside: auto; }
  tr:has(details.sound) :is(p, li, summary) { break-inside: avoid; } details.sound summary, .change:has(+ details.sound) { break-after: avoid; } h2, h2 + p, thead { break-after: avoid; }
  .steps { min-width: 0; } .steps th:nth-child(1) { width: 40px; } .steps th:nth-child(2) { width: 84px; }
  .steps th:nth-child(3) { width: 150px; }
  .steps th:nth-child(5), .steps th:nth-child(6) { width: 88px; }
  svg { height: 150px; } table { font-size: 9pt; } td, th { padding: 2px 5px; } th { font-size: 8pt; } td.tc { font-size: 8pt; }
  tr.k td { font-size: 7.5pt; } .tag { font-size: 7.5pt; } ol.largest, details.sound { font-size: 8pt; } details.sound .tc { font-size: 7.5pt; }
  details.sound ul { margin: 1px 0 2px; padding-left: 6px; } }
)";

const std::string_view NotesPage::Script = R"(
const svg = document.querySelector('svg'), whole = svg.viewBox.baseVal.width;
const rows = [...document.querySelectorAll('tr[id]')], steps = rows.filter(row => !row.classList.contains('k'));
const marks = [...svg.querySelectorAll('[data-rows]')];
const rowsOf = mark => mark.dataset.rows ? mark.dataset.rows.split(' ') : [];
const marksOf = id => [...svg.querySelectorAll(`[data-rows~="${id}"]`)];
const reelNumbers = [...document.querySelectorAll('.reels')].map(strip =>
  [...strip.querySelectorAll('b')].sort((a, b) => a.dataset.at - b.dataset.at));
let left = 0, width = whole, at = -1;
function show() {
  width = Math.min(whole, Math.max(whole / 2000, width));
  left = Math.min(whole - width, Math.max(0, left));
  svg.setAttribute('viewBox', `${left} 0 ${width} 190`);
  reelNumbers.forEach(strip => strip.forEach((number, i) => {
    const at = (number.dataset.at - left) / width, end = i + 1 < strip.length ? (strip[i + 1].dataset.at - left) / width : 1;
    number.style.left = `${at * 100}%`;
    number.hidden = false;
    number.hidden = at < 0 || at > 1 || (end - at) * number.parentElement.clientWidth < number.offsetWidth;
  }));
}
function zoom(factor, middle = left + width / 2) {
  const share = (middle - left) / width;
  width = Math.min(whole, width * factor);
  left = middle - share * width;
  show();
}
function choose(id, scrolls) {
  document.querySelectorAll('.on').forEach(e => e.classList.remove('on'));
  const row = document.getElementById(id);
  if (!row) return;
  at = rows.indexOf(row);
  row.classList.add('on');
  if (scrolls) row.scrollIntoView({ block: 'center' });
  marksOf(id).forEach(e => e.classList.add('on'));
}
function reveal(id) {
  const mark = marksOf(id)[0];
  if (!mark || width === whole) return;
  const box = mark.getBBox();
  if (box.x < left || box.x + box.width > left + width) { left = box.x + box.width / 2 - width / 2; show(); }
}
function step(way) {
  for (let i = at + way; i >= 0 && i < rows.length; i += way)
    if (!rows[i].hidden && !rows[i].classList.contains('k')) { choose(rows[i].id, true); reveal(rows[i].id); return; }
}
svg.addEventListener('click', e => {
  const ids = rowsOf(e.target).filter(id => !document.getElementById(id).hidden);
  if (ids.length) choose(ids[(ids.indexOf(rows[at]?.id) + 1) % ids.length], true);
});
svg.addEventListener('wheel', e => {
  if (!e.ctrlKey && !e.shiftKey) return;
  e.preventDefault();
  const box = svg.getBoundingClientRect();
  zoom(e.deltaY > 0 ? 1.25 : 0.8, left + (e.clientX - box.left) / box.width * width);
}, { passive: false });
rows.forEach(row => row.addEventListener('click', () => { choose(row.id, false); reveal(row.id); }));
document.addEventListener('keydown', e => {
  if (e.ctrlKey || e.altKey || e.metaKey) return;
  const act = { '+': () => zoom(0.6), '=': () => zoom(0.6), '-': () => zoom(1.7), '0': () => zoom(1e9),
    'n': () => step(1), 'p': () => step(-1) }[e.key];
  if (act) { act(); e.preventDefault(); return; }
  if (document.activeElement === svg && (e.key === 'ArrowLeft' || e.key === 'ArrowRight')) {
    left += (e.key === 'ArrowLeft' ? -0.2 : 0.2) * width; show(); e.preventDefault();
  }
  if (e.key === 'Enter' && document.activeElement.matches('tr[id]')) document.activeElement.click();
});
const sounds = [...document.querySelectorAll('details.sound')];
const unfold = all => sounds.forEach(sound => { sound.open = all; });
let before = null;
document.querySelectorAll('[data-sound]').forEach(b => b.addEventListener('click',
  () => unfold(sounds.some(sound => !sound.open))));
addEventListener('beforeprint', () => { before ??= sounds.map(sound => sound.open); unfold(true); });
addEventListener('afterprint', () => { before?.forEach((open, i) => { sounds[i].open = open; }); before = null; });
const boxes = [...document.querySelectorAll('.tools input')];
function filter() {
  const shown = new Set(boxes.filter(b => b.checked).map(b => b.value));
  const left = new Set();
  rows.forEach(row => {
    row.hidden = !row.dataset.kinds.split(' ').some(kind => shown.has(kind));
    if (row.hidden) left.add(row.id);
  });
  marks.forEach(mark => mark.classList.toggle('off',
    !shown.has(mark.classList[0]) || rowsOf(mark).every(id => left.has(id))));
  const note = document.querySelector('.left'), off = boxes.filter(b => !b.checked);
  note.hidden = off.length === 0;
  const kinds = off.map(b => b.parentElement.textContent.trim());
  const list = kinds.length > 1 ? `${kinds.slice(0, -1).join(', ')} or ${kinds.at(-1)}` : kinds[0];
  note.textContent = `Left out: lines that are only ${list}, ` +
    `and ${off.length > 1 ? 'those colours' : 'that colour'} in the picture. ${steps.filter(row => !row.hidden).length} of ${steps.length} steps are shown.`;
}
boxes.forEach(box => box.addEventListener('change', filter));
show();
addEventListener('resize', show);
addEventListener('beforeprint', show);
document.querySelectorAll('[data-zoom]').forEach(b => b.addEventListener('click', () => zoom(+b.dataset.zoom)));
document.querySelectorAll('a[href^="#s"]').forEach(a => a.addEventListener('click', e => {
  e.preventDefault(); e.stopPropagation(); choose(a.hash.slice(1), true); reveal(a.hash.slice(1)); }));
)";

} // namespace cadrel::app
