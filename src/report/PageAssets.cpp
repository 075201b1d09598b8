#include "report/PageAssets.h"

namespace report {

// Colours of the outcomes, shared by the totals, the bars and the rows:
// surveyed green, inactive grey, the failures in warm tones, a stopped
// partition amber, an interrupted one blue.
char const* const pageStyle = R"css(
:root{--s:#2e7d32;--i:#9e9e9e;--c:#c62828;--l:#ef6c00;--f:#8e24aa;--t:#f9a825;--x:#1565c0;
--line:#d7dbe0;--muted:#5f6b7a;--head:#f3f5f8}
*{box-sizing:border-box}
[hidden]{display:none !important}
body{margin:0;font:14px/1.45 system-ui,-apple-system,"Segoe UI",sans-serif;color:#1d2733;background:#fff}
header{padding:18px 24px 14px;background:#1f2d3d;color:#fff}
header h1{margin:0 0 4px;font-size:21px;font-weight:600}
header h1 span{font-weight:400;color:#c7d2de}
.run{margin:0 0 12px;color:#c7d2de}
.run b{color:#fff;font-weight:600}
.totals{display:flex;flex-wrap:wrap;gap:8px;margin:0;padding:0;list-style:none}
.totals li{padding:6px 12px;border-radius:6px;background:#2c3e52;border-left:5px solid #6b7c8f}
.totals li b{display:block;font-size:19px;line-height:1.2}
.totals li[title]{cursor:pointer}
.totals .s{border-color:var(--s)}.totals .i{border-color:var(--i)}.totals .c{border-color:var(--c)}
.totals .l{border-color:var(--l)}.totals .f{border-color:var(--f)}.totals .t{border-color:var(--t)}
.totals .x{border-color:var(--x)}
main{padding:8px 24px 24px}
h2{font-size:17px;margin:18px 0 8px}
table{border-collapse:collapse;width:100%}
th,td{padding:4px 8px;border-bottom:1px solid var(--line);text-align:left;vertical-align:top}
thead th{position:sticky;top:0;background:var(--head);font-weight:600;white-space:nowrap;z-index:1}
.machines td,.machines th{vertical-align:middle}
.machines th[scope=row]{white-space:nowrap}
.machines .bar-cell{width:45%}
.bar{display:flex;height:16px;border-radius:3px;overflow:hidden;background:#eef1f4;min-width:120px}
.bar i{display:block;height:100%}
.bar .s,.key.s{background:var(--s)}.bar .i,.key.i{background:var(--i)}
.bar .c,.key.c{background:var(--c)}.bar .l,.key.l{background:var(--l)}
.bar .f,.key.f{background:var(--f)}.bar .t,.key.t{background:var(--t)}
.bar .x,.key.x{background:var(--x)}
.key{display:inline-block;width:10px;height:10px;border-radius:2px;margin:0 4px 0 12px}
.controls .key{margin-left:4px}
.legend{color:var(--muted);font-size:13px}
.code{font-weight:600;text-align:center}
.code0{color:var(--s)}.code4{color:var(--l)}.code8{color:var(--c)}
.num{text-align:right;font-variant-numeric:tabular-nums}
.parts{table-layout:fixed}
.parts td{overflow-wrap:anywhere}
.parts col.m{width:13%}.parts col.id{width:5%}.parts col.h{width:13%}.parts col.ip{width:9%}
.parts col.o{width:10%}.parts col.st{width:16%}.parts col.sec{width:6%}.parts col.d{width:7%}
.parts col.r{width:21%}
.parts td:nth-child(2),.parts td:nth-child(7){text-align:right;font-variant-numeric:tabular-nums}
.parts tr.s td:nth-child(5){color:var(--s)}.parts tr.i td:nth-child(5){color:#616161}
.parts tr.c td:nth-child(5){color:var(--c)}.parts tr.l td:nth-child(5){color:var(--l)}
.parts tr.f td:nth-child(5){color:var(--f)}.parts tr.t td:nth-child(5){color:#b07800}
.parts tr.x td:nth-child(5){color:var(--x)}
.parts td:nth-child(5){font-weight:600;white-space:nowrap}
.parts td:empty::after{content:"\2013";color:#b0b8c2}
.parts th:nth-child(2),.parts th:nth-child(7){text-align:right}
.parts tbody tr:target{background:#fff8d6}
details summary{cursor:pointer;color:#0b57a4}
details pre{margin:4px 0 0;white-space:pre-wrap;font:12px/1.35 ui-monospace,monospace;background:#f6f7f9;
padding:6px;border-radius:4px}
a{color:#0b57a4}
.controls{display:flex;flex-wrap:wrap;align-items:center;gap:6px 14px;margin:0 0 8px;padding:8px 10px;
background:var(--head);border-radius:6px}
.controls label{white-space:nowrap}
.controls input[type=search]{min-width:240px;padding:3px 6px}
#count{color:var(--muted);margin-left:auto}
thead button{font:inherit;font-weight:600;background:none;border:0;padding:0;cursor:pointer;color:inherit}
thead th[aria-sort=ascending] button::after{content:" \25B2"}
thead th[aria-sort=descending] button::after{content:" \25BC"}
#more{margin:10px 0}
footer{padding:12px 24px;color:var(--muted);font-size:12px;border-top:1px solid var(--line)}
)css";

// With script on, the browser keeps the table inside <noscript> as plain
// text instead of building tens of thousands of rows: the script reads the
// rows from that text once, sorts and filters arrays, and shows a page of
// the matching rows at a time in a table of its own. The cells are the
// page's own escaped markup, so they are shown as they are.
char const* const pageScript = R"js(
(function () {
  "use strict";
  var PAGE = 200;
  var source = document.getElementById("rows");
  var live = document.getElementById("live");
  var form = document.getElementById("filters");
  var search = document.getElementById("q");
  var machineChoice = document.getElementById("machine");
  var countText = document.getElementById("count");
  var more = document.getElementById("more");

  var markup = source.textContent;
  var bodyStart = markup.indexOf("<tbody>") + "<tbody>".length;
  var bodyEnd = markup.lastIndexOf("</tbody>");
  var head = markup.slice(markup.indexOf("<table"), bodyStart);
  var rowTexts = markup.slice(bodyStart, bodyEnd).split("</tr>");
  rowTexts.pop();
  var cells = rowTexts.map(function (row) { return row.split("<td>"); });
  var outcomeOf = cells.map(function (row) { return /class=(\w+)/.exec(row[0])[1]; });
  var columnKeys = [];
  var searchTexts = null;
  var order = cells.map(function (row, index) { return index; });
  var shown = PAGE;

  live.innerHTML = head + "</tbody></table>";
  var table = live.firstChild;
  table.id = "parts";
  var body = table.tBodies[0];
  source.parentNode.removeChild(source);

  var entities = { "&amp;": "&", "&lt;": "<", "&gt;": ">", "&quot;": "\"", "&#39;": "'" };
  function textOf(cell) {
    return cell.replace(/<summary>[^<]*<\/summary>/g, "").replace(/<[^>]*>/g, "")
      .replace(/&(?:amp|lt|gt|quot|#39);/g, function (entity) { return entities[entity]; });
  }
  function numberOrNull(text) {
    return text !== "" && isFinite(text) ? Number(text) : null;
  }
  function ipKey(text) {
    var parts = text.split(".");
    if (parts.length !== 4 || !parts.every(function (p) { return /^\d{1,3}$/.test(p); })) {
      return text;
    }
    return parts.map(function (p) { return ("00" + p).slice(-3); }).join(".");
  }
  function keysOf(column, type) {
    if (!columnKeys[column]) {
      columnKeys[column] = cells.map(function (row) {
        var text = textOf(row[column + 1]).trim();
        if (type === "number") { return numberOrNull(text); }
        if (type === "ip") { return ipKey(text); }
        return text.toLowerCase();
      });
    }
    return columnKeys[column];
  }
  function isEmpty(key) {
    return key === null || key === "";
  }
  // Numbers before texts.
  function compareKeys(a, b) {
    if (a === b) { return 0; }
    if (typeof a !== typeof b) { return typeof a === "number" ? -1 : 1; }
    return a < b ? -1 : 1;
  }
  function sortBy(header, column) {
    var ascending = header.getAttribute("aria-sort") !== "ascending";
    var keys = keysOf(column, header.getAttribute("data-type"));
    var direction = ascending ? 1 : -1;
    order = cells.map(function (row, index) { return index; });
    order.sort(function (a, b) {
      var ka = keys[a], kb = keys[b];
      // Empty cells last, whichever way the column runs.
      var empty = isEmpty(ka) - isEmpty(kb);
      if (empty !== 0) { return empty; }
      return direction * compareKeys(ka, kb) || a - b;
    });
    Array.prototype.forEach.call(table.tHead.rows[0].cells, function (cell) {
      cell.removeAttribute("aria-sort");
    });
    header.setAttribute("aria-sort", ascending ? "ascending" : "descending");
    shown = PAGE;
    render();
  }
  function chosenOutcomes() {
    var chosen = {};
    Array.prototype.forEach.call(form.querySelectorAll("input[name=o]"), function (box) {
      chosen[box.value] = box.checked;
    });
    return chosen;
  }
  function matcher() {
    var chosen = chosenOutcomes();
    var query = search.value.trim().toLowerCase();
    var machine = machineChoice.value;
    var machines = machine === "" ? null : keysOf(0, "machine");
    if (query !== "" && !searchTexts) {
      searchTexts = cells.map(function (row) {
        return row.slice(1).map(textOf).join("\n").toLowerCase();
      });
    }
    return function (index) {
      return chosen[outcomeOf[index]] &&
        (machines === null || machines[index] === machine.toLowerCase()) &&
        (query === "" || searchTexts[index].indexOf(query) !== -1);
    };
  }
  function render() {
    var matches = matcher();
    var page = [];
    var matched = 0;
    for (var k = 0; k < order.length; k++) {
      if (!matches(order[k])) { continue; }
      if (matched < shown) { page.push(rowTexts[order[k]]); }
      matched++;
    }
    body.innerHTML = page.join("</tr>") + (page.length ? "</tr>" : "");
    var listed = Math.min(matched, shown);
    countText.textContent = (listed < matched ? "showing " + listed + " of " : "") +
      matched + " of " + cells.length + " partitions";
    more.hidden = listed >= matched;
  }
  var pending = null;
  function renderSoon() {
    clearTimeout(pending);
    pending = setTimeout(function () { shown = PAGE; render(); }, 120);
  }
  function showMachine(identity) {
    machineChoice.value = identity;
    shown = PAGE;
    render();
    table.scrollIntoView();
  }

  Array.prototype.forEach.call(table.tHead.rows[0].cells, function (header, column) {
    var button = document.createElement("button");
    button.type = "button";
    button.textContent = header.textContent;
    button.title = "Sort by " + header.textContent;
    header.textContent = "";
    header.appendChild(button);
    button.addEventListener("click", function () { sortBy(header, column); });
  });
  form.addEventListener("change", function () { shown = PAGE; render(); });
  form.addEventListener("submit", function (event) { event.preventDefault(); });
  search.addEventListener("input", renderSoon);
  more.querySelector("button").addEventListener("click", function () {
    shown += PAGE * 5;
    render();
  });
  Array.prototype.forEach.call(document.querySelectorAll("a[data-machine]"), function (link) {
    link.addEventListener("click", function (event) {
      event.preventDefault();
      showMachine(link.getAttribute("data-machine"));
    });
  });
  Array.prototype.forEach.call(document.querySelectorAll(".totals li[data-outcome]"), function (item) {
    item.title = "Show only these partitions";
    item.addEventListener("click", function () {
      Array.prototype.forEach.call(form.querySelectorAll("input[name=o]"), function (box) {
        box.checked = box.value === item.className;
      });
      shown = PAGE;
      render();
      table.scrollIntoView();
    });
  });
  form.hidden = false;
  render();
}());
)js";

} // namespace report
